#include <gtest/gtest.h>

#include "support/TempDir.h"
#include "userformats/FlexStore.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;

TEST(FlexStoreTest, ReadsTheWorkedExampleSections) {
  TempDir dir;
  dir.write(kFlexInStoreName,
            CrLf({"[Office CSV]", "Delimiter=Comma", "Coordinate Type=Plane",
                  "Columns=Point ID,Northing,Easting,Orthometric Height,Feature Code,Attribute",
                  "Column Order=1,2,3,4,5,6", "Header=", "Ignore=#", "", "[Office Fixed]",
                  "Delimiter=Column Specific", "Coordinate Type=Plane",
                  "Columns=Point ID,Northing,Easting,Orthometric Height,Feature Code,Attribute",
                  "Column Order=1,11,25,39,49,57", "Header=PRJ", "Ignore=#"}));
  FlexStore store = FlexStore::Input(dir.path());
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Office CSV", "Office Fixed"}));
  FlexInFormat f = store.loadInput("office fixed");
  EXPECT_EQ(f.delimiter, kColumnSpecific);
  EXPECT_EQ(f.columns.size(), 6u);
  EXPECT_EQ(f.columns[5], "Attribute");
  EXPECT_EQ(f.order, (std::vector<std::string>{"1", "11", "25", "39", "49", "57"}));
  EXPECT_EQ(f.headerPrefix, "PRJ");
  EXPECT_EQ(f.ignorePrefix, "#");
  EXPECT_EQ(store.loadInput("Office CSV").headerPrefix, "");
  EXPECT_EQ(store.readValue("Office CSV", "Header", "none"), "none");  // empty reads as default
  EXPECT_TRUE(store.hasFormat("OFFICE CSV"));
  EXPECT_FALSE(store.hasFormat("Office"));
}

TEST(FlexStoreTest, SaveLoadAndDeleteOutputFormats) {
  TempDir dir;
  FlexStore store = FlexStore::Output(dir.path());
  FlexOutFormat f;
  f.delimiter = "Tab";
  f.coordinateType = kGeographic;
  f.columns = {"Point ID", "Latitude", "Longitude"};
  f.order = {"1", "2", "3"};
  f.decimalPlaces = {"", "5", "5"};
  f.writeHeader = true;
  f.headerPrefix = "#";
  ASSERT_TRUE(store.save("GNSS", f));
  FlexOutFormat other = f;
  other.writeHeader = false;
  ASSERT_TRUE(store.save("Other", other));

  FlexOutFormat back = store.loadOutput("GNSS");
  EXPECT_EQ(back.delimiter, "Tab");
  EXPECT_EQ(back.coordinateType, kGeographic);
  EXPECT_EQ(back.columns, f.columns);
  EXPECT_EQ(back.decimalPlaces, f.decimalPlaces);
  EXPECT_TRUE(back.writeHeader);
  EXPECT_EQ(back.headerPrefix, "#");
  EXPECT_FALSE(store.loadOutput("Other").writeHeader);
  EXPECT_NE(ReadFile(store.path()).find("Decimal Places=,5,5\r\n"), std::string::npos);

  ASSERT_TRUE(store.deleteFormat("gnss"));
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Other"}));

  // Names that would not read back as the same section are refused.
  for (std::string bad : {"", " lead", "trail ", "a]b", "two\nlines"}) {
    EXPECT_FALSE(store.save(bad, f)) << bad;
  }
  EXPECT_EQ(store.listFormats(), (std::vector<std::string>{"Other"}));
}

TEST(FlexStoreTest, WriteHeaderOtherThanOneIsOff) {
  TempDir dir;
  dir.write(kFlexOutStoreName, CrLf({"[A]", "Write Header=yes", "[B]", "Write Header=1"}));
  FlexStore store = FlexStore::Output(dir.path());
  EXPECT_FALSE(store.loadOutput("A").writeHeader);
  EXPECT_TRUE(store.loadOutput("B").writeHeader);
  EXPECT_FALSE(store.loadOutput("missing").writeHeader);
  EXPECT_TRUE(store.loadOutput("missing").columns.empty());
}

TEST(FlexStoreTest, ColumnVocabularyByCoordinateType) {
  EXPECT_EQ(FlexColumnNames(kPlane),
            (std::vector<std::string>{"Point ID", "Northing", "Easting", "Orthometric Height",
                                      "Feature Code", "Point Description", "Attribute", "Geometry",
                                      "Northing Error Estimate", "Easting Error Estimate",
                                      "Height Error Estimate", "Geoid Height", "Convergance Angle",
                                      "Scale Factor"}));
  std::vector<std::string> geo = FlexColumnNames(kGeographic);
  EXPECT_EQ(geo.size(), 14u);
  EXPECT_EQ(geo[1], "Latitude");
  EXPECT_EQ(geo[3], "Ellipsoid Height");
  EXPECT_FALSE(FlexColumnFromName("Convergence Angle"));
  EXPECT_FALSE(FlexColumnFromName("point id"));
  EXPECT_EQ(ResolveDelimiter("Semicolon"), ";");
  EXPECT_EQ(ResolveDelimiter("tab"), "tab");
}

}  // namespace
}  // namespace zv
