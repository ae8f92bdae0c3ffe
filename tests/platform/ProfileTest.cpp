#include <gtest/gtest.h>

#include "platform/Profile.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;

TEST(ProfileTest, NamesIgnoreLetterCaseValuesDoNot) {
  TempDir dir;
  std::string ini = dir.write("zones.ini",
                              "[State Plane 1983~North]\nFull Name = North Zone \n"
                              "Show In=\n[Other]\nkey=Value\n");
  EXPECT_EQ(ReadProfileValue(ini, "state plane 1983~NORTH", "full name", "x"), "North Zone");
  EXPECT_EQ(ReadProfileValue(ini, "State Plane 1983~North", "Show In", "1"), "1");   // empty
  EXPECT_EQ(ReadProfileValue(ini, "State Plane 1983~North", "Show Out", "1"), "1");  // missing
  EXPECT_EQ(ReadProfileValue(ini, "Missing", "key", "dflt"), "dflt");
  EXPECT_EQ(ReadProfileValue(dir.file("none.ini"), "Other", "key", "d"), "d");
  EXPECT_EQ(ReadProfileSections(ini),
            (std::vector<std::string>{"State Plane 1983~North", "Other"}));
  EXPECT_EQ(ReadProfileSectionsText(ini), std::string("State Plane 1983~North\0Other\0", 29));
}

TEST(ProfileTest, WritesUpdateInPlaceAppendAndKeepFileOrder) {
  TempDir dir;
  std::string ini = dir.write("d.ini", CrLf({"; catalog", "[NAD 27]", "Type=Horizontal",
                                             "Show In=1", "", "[NAVD 88]", "Type=Vertical"}));
  ASSERT_TRUE(WriteProfileValue(ini, "nad 27", "TYPE", "3D"));
  ASSERT_TRUE(WriteProfileValue(ini, "NAD 27", "NAD 83", "NADCON NAD 27 to NAD 83"));
  ASSERT_TRUE(WriteProfileValue(ini, "NGVD 29", "Type", "Vertical"));
  EXPECT_EQ(ReadFile(ini),
            CrLf({"; catalog", "[NAD 27]", "TYPE=3D", "Show In=1", "NAD 83=NADCON NAD 27 to NAD 83",
                  "", "[NAVD 88]", "Type=Vertical", "", "[NGVD 29]", "Type=Vertical"}));

  ASSERT_TRUE(DeleteProfileSection(ini, "navd 88"));
  EXPECT_EQ(ReadProfileSections(ini), (std::vector<std::string>{"NAD 27", "NGVD 29"}));
  EXPECT_EQ(ReadProfileValue(ini, "NGVD 29", "Type", ""), "Vertical");
  ASSERT_TRUE(DeleteProfileSection(ini, "never there"));
  EXPECT_FALSE(WriteProfileValue(dir.file("no/such/folder/x.ini"), "S", "k", "v"));
}

TEST(ProfileTest, LimitsOfValuesAndSectionLists) {
  TempDir dir;
  std::string ini = dir.file("big.ini");
  ASSERT_TRUE(WriteProfileValue(ini, "S", "long", std::string(26000, 'x')));
  EXPECT_EQ(ReadProfileValue(ini, "S", "long", "").size(), kProfileValueLimit);
  // 1200 names of 30 characters overflow the 30000-character list.
  std::string many;
  for (int i = 0; i < 1200; ++i) {
    many += "[Section number " + std::to_string(100000 + i) + " padding.]\r\nk=v\r\n";
  }
  dir.write("many.ini", many);
  std::string text = ReadProfileSectionsText(dir.file("many.ini"));
  EXPECT_LE(text.size() + 1, kProfileSectionsLimit);
  EXPECT_EQ(ReadProfileSections(dir.file("many.ini")).size(), 967u);
}

}  // namespace
}  // namespace zv
