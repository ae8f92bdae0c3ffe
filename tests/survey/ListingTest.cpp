#include <gtest/gtest.h>

#include "platform/TextIo.h"
#include "support/TempDir.h"
#include "survey/Listing.h"
#include "survey/SurveyTestSupport.h"

namespace zv {
namespace {

using test::Fixture;
using Lines = std::vector<std::string>;

Lines FixtureLines(const std::string& name) {
  Lines lines;
  EXPECT_TRUE(ReadTextLines(Fixture("listing/" + name), lines));
  return lines;
}

std::string Numbers(int first, int last) {
  std::string out;
  for (int i = first; i <= last; ++i) {
    if (i > first) out += ',';
    out += std::to_string(i);
  }
  return out;
}

TEST(SurveyListing, RecordViewOfFixtures) {
  // Control records are separated by empty lines, other record codes not.
  Lines list = FixtureLines("control.lst");
  Lines record = ListToRecord(list);
  EXPECT_EQ(record, Lines({"PR:Job 12", "AC:PR  VR:VORN Zurevazidu 1.0.0  UL:M", "",
                           "AC:OS  PN:1  YC:1000.0000  XC:2000.0000  ZC:100.0000", "",
                           "AC:OS  PN:2  YC:1010.0000  XC:2010.0000  ZC:101.0000",
                           "       PD:Iron pin found in the north east corner of the lot  FE:IP"}));
  EXPECT_EQ(RecordToList(record), list);
  EXPECT_EQ(ListToRecord({"AC:OS", "PN:1", "AC:SS", "PN:2"}),
            Lines({"AC:OS  PN:1", "AC:SS  PN:2"}));

  // Long point lists wrap at commas below 80; back in the list view the
  // joined list is cut into PL lines below 78.
  record = ListToRecord(FixtureLines("long_point_list.lst"));
  EXPECT_EQ(
      record,
      Lines({"AC:PR", "BG:BEGIN CHAIN LIST", "AC:CH  FE:EP  PL:" + Numbers(1000, 1011) + ",",
             "       PL:" + Numbers(1012, 1024) + ",", "       PL:" + Numbers(1025, 1037) + ",",
             "       PL:1038,1039  CH:A", "EG:END CHAIN LIST", "CP:05/07/2024 9:05:03"}));
  EXPECT_EQ(RecordToList(record),
            Lines({"AC:PR", "BG:BEGIN CHAIN LIST", "AC:CH", "FE:EP", "PL:" + Numbers(1000, 1014),
                   "PL:" + Numbers(1015, 1029), "PL:" + Numbers(1030, 1039), "CH:A",
                   "EG:END CHAIN LIST", "CP:05/07/2024 9:05:03"}));
}

TEST(SurveyListing, ValuesSurviveBothViews) {
  const Lines cases[] = {
      // A comma in an earlier item of the line is not a place to wrap the list.
      {"AC:CH", "CD:a,b", "PL:" + std::string(70, 'p') + ",1,2"},
      // A list without commas is left whole (and does not hang).
      {"AC:CH", "PL:" + std::string(100, 'q')},
      // Two blanks inside a value are not an item separator.
      {"AC:OS", "PD:Iron pin  found here", "FE:IP"},
      // A list ending in "," followed by a new chain record is not continued.
      {"AC:CH", "PL:1,2,3,", "AC:CH", "PL:4,5"},
      {"AC:CH", "PL:1,2,"},
      // Tags that are not two letters, colons inside values.
      {"AC:PR", "NOTE:a", "CP:05/07/2024 9:05:03"},
  };
  for (const Lines& list : cases) EXPECT_EQ(RecordToList(ListToRecord(list)), list) << list[1];
  EXPECT_EQ(ListToRecord(cases[0])[0], "AC:CH  CD:a,b");
  // Lines without a colon are dropped.
  EXPECT_EQ(ListToRecord({"AC:OS", "no colon here", "PN:1"}), Lines({"AC:OS  PN:1"}));
  EXPECT_EQ(RecordToList({"", "AC:OS  PN:1", "text"}), Lines({"AC:OS", "PN:1"}));
}

TEST(SurveyListing, FileForms) {
  test::TempDir dir;
  std::string error;
  ASSERT_TRUE(ConvertListToRecord(Fixture("listing/control.lst"), dir.file("c.rec"), error));
  ASSERT_TRUE(ConvertRecordToList(dir.file("c.rec"), dir.file("c.lst"), error));
  EXPECT_EQ(test::ReadFile(dir.file("c.lst")), test::ReadFile(Fixture("listing/control.lst")));
  EXPECT_FALSE(ConvertListToRecord(dir.file("none.lst"), dir.file("x.rec"), error));
  EXPECT_NE(error.find("none.lst"), std::string::npos);
  EXPECT_EQ(ListingStem("/a/b.CTL.lst"), "/a/b.CTL");
  EXPECT_EQ(ListingStem("/a/b.CTL"), "/a/b.CTL");
}

}  // namespace
}  // namespace zv
