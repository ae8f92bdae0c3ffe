#include <gtest/gtest.h>

#include <map>

#include "survey/SurveyModel.h"

namespace zv {
namespace {

TEST(SurveyModel, RecordCodeCategories) {
  // Every two-character code made of capitals and digits, counted by category.
  const std::string chars = "ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789";
  std::map<std::string, int> counts;
  for (char a : chars) {
    for (char b : chars) {
      std::string category = RecordCodeCategory(std::string{a, b});
      if (!category.empty()) ++counts[category];
    }
  }
  EXPECT_EQ(counts,
            (std::map<std::string, int>{
                {"Angle", 6}, {"Bearing", 1}, {"Math", 73}, {"PointID", 3}, {"Seconds", 4}}));

  EXPECT_EQ(RecordCodeCategory("BR"), "Bearing");
  EXPECT_EQ(RecordCodeCategory("OS"), "PointID");
  EXPECT_EQ(RecordCodeCategory("LT"), "Angle");
  EXPECT_EQ(RecordCodeCategory("EV"), "Seconds");
  EXPECT_EQ(RecordCodeCategory("W3"), "Math");
  EXPECT_EQ(RecordCodeCategory("ZZ"), "Math");
  EXPECT_EQ(RecordCodeCategory("AA"), "Math");
  // Only the first two characters count; letter case does.
  EXPECT_EQ(RecordCodeCategory("PN:1001"), "PointID");
  EXPECT_EQ(RecordCodeCategory("pn"), "");
  EXPECT_EQ(RecordCodeCategory("P"), "");
  EXPECT_EQ(RecordCodeCategory(""), "");
  EXPECT_EQ(RecordCodeCategory("GM"), "");
}

}  // namespace
}  // namespace zv
