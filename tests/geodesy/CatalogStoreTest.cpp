#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <functional>
#include <random>

#include "geodesy/Angles.h"
#include "geodesy/CatalogStore.h"
#include "geodesy/Catalogs.h"
#include "geodesy/NgsTestSupport.h"
#include "platform/Error.h"
#include "platform/ProfileDocument.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "userformats/FlexStore.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;
using V = std::vector<std::string>;

const std::string kShipped = std::string(ZV_SOURCE_DIR) + "/appdata/";

// The bytes of a section: from its "[name]" line to the next section or the end.
std::pair<size_t, size_t> Span(const std::string& text, const std::string& section) {
  const size_t start = text.find("[" + section + "]");
  size_t end = text.find("\n[", start);
  end = end == std::string::npos ? text.size() : end + 1;
  return {start, end};
}

std::string Without(const std::string& text, const std::string& section) {
  auto [start, end] = Span(text, section);
  return text.substr(0, start) + text.substr(end);
}

// The key names of a section in file order.
V KeyNames(const std::string& path, const std::string& section) {
  V names;
  for (const auto& key : ProfileDocument::Load(path).keys(section)) names.push_back(key.first);
  return names;
}

// ---------------------------------------------------------------------------
// The document under the store: edits keep every byte they do not touch.

TEST(ProfileDocumentTest, EditsChangeOnlyTheirLines) {
  using Edit = std::function<bool(ProfileDocument&)>;
  const auto write = [](const char* section, ProfileKeys keys, V managed) -> Edit {
    return [=](ProfileDocument& d) {
      d.writeSection(section, keys, managed);
      return true;
    };
  };
  const auto set = [](const char* section, const char* key, const char* value) -> Edit {
    return [=](ProfileDocument& d) {
      d.setValue(section, key, value);
      return true;
    };
  };
  const struct {
    const char* what;
    std::string before;
    Edit edit;
    bool result;
    std::string after;
  } cases[] = {
      {"record keys in order at the first one; comment and other key stay",
       "; head\n[A]\nk1=1\n; note\nX=keep\nk2=2\n\n[B]\nk1=9\n",
       write("a", {{"k2", "5"}, {"k1", "1"}}, {"K1", "k2", "k3"}), true,
       "; head\n[A]\nk2=5\nk1=1\n; note\nX=keep\n\n[B]\nk1=9\n"},
      {"unchanged values keep their spelling and blanks", "[S]\r\n  KEY =  v \r\nother=1\r\n",
       write("s", {{"Key", "v"}}, {"Key"}), true, "[S]\r\n  KEY =  v \r\nother=1\r\n"},
      {"repeated and stale managed keys go", "[S]\nk=1\nold=x\nk=2\n",
       write("S", {{"k", "3"}}, {"k", "old"}), true, "[S]\nk=3\n"},
      {"mixed line ends kept; new lines take the first one", "[A]\r\nk=1\n[B]\rk=2",
       write("A", {{"k", "3"}}, {"k"}), true, "[A]\r\nk=3\r\n[B]\rk=2"},
      {"no managed key yet: after the last key", "[A]\n; c\nu=1\n\n[B]\n",
       write("A", {{"k", "2"}}, {"k"}), true, "[A]\n; c\nu=1\nk=2\n\n[B]\n"},
      {"appended after an unterminated last line", "[A]\nk=1",
       write("B", {{"k", "2"}, {"j", ""}}, {"k"}), true, "[A]\nk=1\n\n[B]\nk=2\nj=\n"},
      {"appended after a blank line without another", "[A]\r\nk=1\r\n\r\n", set("B", "k", "2"),
       true, "[A]\r\nk=1\r\n\r\n[B]\r\nk=2\r\n"},
      {"empty file", "", set("S", "k", "v"), true, "[S]\r\nk=v\r\n"},
      {"byte-order mark kept", "\xEF\xBB\xBF[A]\nk=1\n", set("a", "K", "2"), true,
       "\xEF\xBB\xBF[A]\nK=2\n"},
      {"value added after the last non-blank line", "[A]\nk=1\n\n[B]\n", set("A", "j", "2"), true,
       "[A]\nk=1\nj=2\n\n[B]\n"},
      {"line breaks in a value stay on its line", "[A]\n", set("A", "k", "x\ny\rz"), true,
       "[A]\nk=x y z\n"},
      {"remove: comments right above the next section stay", "[A]\nk=1\n\n; about B\n[B]\nk=2\n",
       [](ProfileDocument& d) { return d.removeSection("a"); }, true, "; about B\n[B]\nk=2\n"},
      {"remove the last section", "[A]\nk=1\n\n[B]\n; end\n",
       [](ProfileDocument& d) { return d.removeSection("B"); }, true, "[A]\nk=1\n\n"},
      {"remove the first of two of a name", "[A]\nk=1\n[a]\nk=2\n",
       [](ProfileDocument& d) { return d.removeSection("A"); }, true, "[a]\nk=2\n"},
      {"remove a missing section", "[A]\n", [](ProfileDocument& d) { return d.removeSection("B"); },
       false, "[A]\n"},
      {"rename in place", "[A]\r\nk=1\n[B]\n",
       [](ProfileDocument& d) { return d.renameSection("a", "C"); }, true, "[C]\r\nk=1\n[B]\n"},
      {"rename to another letter case", "[a]\n",
       [](ProfileDocument& d) { return d.renameSection("A", "A"); }, true, "[A]\n"},
      {"rename onto another section", "[A]\n[B]\n",
       [](ProfileDocument& d) { return d.renameSection("A", "b"); }, false, "[A]\n[B]\n"},
      {"rename to a name that reads back otherwise", "[A]\n",
       [](ProfileDocument& d) {
         return d.renameSection("A", "x]y") || d.renameSection("A", " A") ||
                d.renameSection("A", "") || d.renameSection("Z", "Y");
       },
       false, "[A]\n"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    ProfileDocument doc(c.before);
    EXPECT_EQ(c.edit(doc), c.result);
    EXPECT_EQ(doc.text(), c.after);
    EXPECT_EQ(ProfileDocument(doc.text()).text(), c.after);  // parses as it prints
  }
}

TEST(ProfileDocumentTest, ReadsKeysAndSavesOnce) {
  const ProfileDocument doc("[A]\n k = 1 \nk=2\nnot a key\n=empty name\n[B]\n");
  EXPECT_EQ(doc.keys("a"), (ProfileKeys{{"k", "1"}, {"k", "2"}, {"", "empty name"}}));
  EXPECT_TRUE(doc.keys("C").empty());
  TempDir dir;
  std::string error;
  EXPECT_FALSE(doc.save(dir.file("no/such/folder/x.ini"), &error));
  EXPECT_FALSE(error.empty());
  ASSERT_TRUE(doc.save(dir.file("x.ini")));
  EXPECT_EQ(ReadFile(dir.file("x.ini")), doc.text());
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 1);
}

// ---------------------------------------------------------------------------
// Typed values keep their text.

TEST(CatalogValuesTest, TypedViewsOfStoredTexts) {
  const std::pair<const char*, std::optional<bool>> flags[] = {
      {"1", true}, {"1.0", true}, {" 1", true}, {"0", false}, {"2", false}, {"yes", {}}, {"", {}}};
  for (const auto& [text, one] : flags) EXPECT_EQ(CatalogFlag{text}.isOne(), one) << text;
  EXPECT_EQ(CatalogFlag::Of(false).text, "0");

  const std::pair<double, const char*> numbers[] = {
      {0, "0"}, {250000, "250000"}, {0.99996, "0.99996"}, {1e-7, "0.0000001"}, {-1.5, "-1.5"}};
  for (const auto& [value, text] : numbers) {
    EXPECT_EQ(CatalogNumber::Of(value).text, text);
    EXPECT_EQ(CatalogNumber{text}.value(), value);
  }
  EXPECT_EQ(CatalogNumber{"1,5"}.value(), std::nullopt);

  ScriptedUi ui;
  const double r = (36 + 40.0 / 60) * kDegreesToRadians;
  EXPECT_EQ(CatalogAngle::Of(ui, r).text, "36.400000000");
  EXPECT_NEAR(*CatalogAngle{"36.400000000"}.radians(ui), r, 1e-15);
  EXPECT_EQ(CatalogAngle{"27.3x"}.radians(ui), std::nullopt);
  EXPECT_EQ(CatalogAngle{""}.radians(ui), std::nullopt);
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(CatalogAngle{"27.6000"}.radians(ui), std::nullopt);  // 60 minutes
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
}

// ---------------------------------------------------------------------------
// Zones, on a copy of the shipped zones.ini.

class ShippedZones : public ::testing::Test {
 protected:
  void SetUp() override {
    original = ReadFile(kShipped + "zones.ini");
    ASSERT_GT(original.size(), 100000u);
    path = dir.write("zones.ini", original);
    for (const char* name : {"datums.ini", "ellipsoids.ini"}) {
      dir.write(name, ReadFile(kShipped + name));
    }
  }
  std::string now() const { return ReadFile(path); }

  TempDir dir;
  std::string original, path;
  ZoneStore store = ZoneStore::In(dir.path());
  ScriptedUi ui;
};

TEST_F(ShippedZones, EveryZoneLoadsAndSavesBackByteForByte) {
  const auto all = store.loadAll();
  ASSERT_EQ(all.size(), 300u);
  for (const auto& [section, record] : all) {
    ASSERT_EQ(store.load(record.coordinateSystem, record.zone), record) << section;
    ASSERT_TRUE(store.save(record)) << section;
  }
  EXPECT_TRUE(now() == original);
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 3);
}

TEST_F(ShippedZones, SavingOneZoneKeepsEveryOtherByte) {
  const std::string cs = "State Plane 1983";
  const struct {
    const char* zone;
    std::function<void(ZoneRecord&)> change;
    V keys;  // the saved section's keys after the seven common ones
  } cases[] = {
      {"Arizona East 0201",
       [](ZoneRecord& z) {
         z.fullName = "Arizona East (edited)";
         z.scaleFactor = CatalogNumber::Of(0.99995);
       },
       {"Central Latitude", "Central Longitude", "False Northing", "False Easting", "Scale Factor",
        "Positive Latitude Direction", "Positive Longitude Direction", "Linear Units"}},
      {"Arizona Central 0202",
       [](ZoneRecord& z) {
         z.projection = kLambertTwoParallels;
         z.scaleFactor = {};  // not written for two parallels
         z.northernParallel.text = "34.300000000";
         z.southernParallel.text = "32.100000000";
       },
       {"Central Latitude", "Central Longitude", "False Northing", "False Easting",
        "Northern Parallel", "Southern Parallel", "Positive Latitude Direction",
        "Positive Longitude Direction", "Linear Units"}},
      {"Alabama West 0102",
       [](ZoneRecord& z) {
         z.projection = kObliqueMercator;
         z.azimuth.text = "323.075000000";
       },
       {"Central Latitude", "Central Longitude", "False Northing", "False Easting", "Scale Factor",
        "Azimuth", "Positive Latitude Direction", "Positive Longitude Direction", "Linear Units"}},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.zone);
    const std::string before = now();
    std::string section;
    std::optional<ZoneRecord> z = store.load(cs, c.zone, &section);
    ASSERT_TRUE(z);
    c.change(*z);
    ASSERT_TRUE(store.save(*z));
    const std::string after = now();
    auto [start, end] = Span(before, section);
    auto [start2, end2] = Span(after, section);
    EXPECT_EQ(after.substr(0, start2), before.substr(0, start));  // the section keeps its place
    EXPECT_EQ(after.substr(end2), before.substr(end));
    EXPECT_EQ(after.substr(end2 - 4, 4), "\r\n\r\n");  // its blank line after it too
    V keys = {"Full Name",      "Horizontal Datum", "Computational Ellipsoid",
              "Vertical Datum", "Projection",       "Show In",
              "Show Out"};
    keys.insert(keys.end(), c.keys.begin(), c.keys.end());
    EXPECT_EQ(KeyNames(path, section), keys);
    EXPECT_EQ(store.load(cs, c.zone), z);
  }
  // The first edit, line by line.
  const auto [start, end] = Span(now(), "State Plane 1983~Arizona East 0201");
  EXPECT_EQ(now().substr(start, end - start),
            test::Ini("[State Plane 1983~Arizona East 0201]|Full Name=Arizona East (edited)|"
                      "Horizontal Datum=NAD 83|Computational Ellipsoid=|Vertical Datum=NAVD 88|"
                      "Projection=Transverse Mercator|Show In=1|Show Out=1|"
                      "Central Latitude=31.000000000|Central Longitude=110.100000000|"
                      "False Northing=0|False Easting=700000|Scale Factor=0.99995|"
                      "Positive Latitude Direction=N|Positive Longitude Direction=W|"
                      "Linear Units=International Feet|"));
  EXPECT_EQ(ResolveZone(ui, dir.path(), cs, "Alabama West 0102").projection, kObliqueMercator);
}

TEST_F(ShippedZones, ANewZoneIsAppendedAsTheEditorWritesIt) {
  ZoneRecord z;
  z.coordinateSystem = "Local Grids";
  z.zone = "East";
  z.fullName = "East Zone";
  z.horizontalDatum = "NAD 83";
  z.verticalDatum = "NAVD 88";
  z.projection = kTransverseMercator;
  z.centralLatitude = CatalogAngle::Of(ui, (36 + 40.0 / 60) * kDegreesToRadians);
  z.centralLongitude = CatalogAngle::Of(ui, (88 + 20.0 / 60) * kDegreesToRadians);
  z.falseNorthing = CatalogNumber::Of(0);
  z.falseEasting = CatalogNumber::Of(250000);
  z.scaleFactor = CatalogNumber::Of(1 - 1.0 / 25000);
  z.northernParallel.text = "40";  // not used by the projection: not written
  z.latitudeDirection = "N";
  z.longitudeDirection = "W";
  z.linearUnits = kUsSurveyFeet;
  ASSERT_TRUE(store.save(z));
  EXPECT_EQ(now(), original + test::Ini("|[Local Grids~East]|Full Name=East Zone|"
                                        "Horizontal Datum=NAD 83|Computational Ellipsoid=|"
                                        "Vertical Datum=NAVD 88|Projection=Transverse Mercator|"
                                        "Show In=1|Show Out=1|Central Latitude=36.400000000|"
                                        "Central Longitude=88.200000000|False Northing=0|"
                                        "False Easting=250000|Scale Factor=0.99996|"
                                        "Positive Latitude Direction=N|"
                                        "Positive Longitude Direction=W|"
                                        "Linear Units=U.S. Survey Feet"));
  EXPECT_EQ(store.coordinateSystems().back(), "Local Grids");
  EXPECT_EQ(store.zones("Local Grids", ZoneSide::Output), V{"East"});
  const ZoneParameters p = ResolveZone(ui, dir.path(), "local grids", "EAST");
  EXPECT_EQ(p.k0, 0.99996);
  EXPECT_TRUE(ui.boxes.empty());

  // Names that cannot make a zone section are refused and nothing is written.
  const std::string saved = now();
  for (const auto& [cs, zone] : std::vector<std::pair<std::string, std::string>>{
           {"", "Z"}, {"CS", " "}, {"A~B", "Z"}, {"CS", "Z~2"}, {"CS", "Z]"}, {" CS", "Z"}}) {
    ZoneRecord bad = z;
    bad.coordinateSystem = cs;
    bad.zone = zone;
    EXPECT_FALSE(store.save(bad)) << cs << "~" << zone;
  }
  EXPECT_TRUE(now() == saved);
}

TEST_F(ShippedZones, RenameAndDeleteTouchOnlyTheirSection) {
  const std::string cs = "State Plane 1983";
  const std::string old = cs + "~Alabama West 0102";
  const ZoneRecord before = *store.load(cs, "Alabama West 0102");
  ASSERT_TRUE(store.rename(cs, "alabama west 0102", "Alabama 1983", "West"));
  const std::string newName = "Alabama 1983~West";
  std::string expected = original;
  expected.replace(expected.find("[" + old + "]") + 1, old.size(), newName);
  EXPECT_TRUE(now() == expected);
  ZoneRecord renamed = before;
  renamed.coordinateSystem = "Alabama 1983";
  renamed.zone = "West";
  EXPECT_EQ(store.load("Alabama 1983", "West"), renamed);
  EXPECT_EQ(store.load(cs, "Alabama West 0102"), std::nullopt);

  // Refused: onto another zone, names with "~", a missing zone.
  const struct {
    const char *cs, *zone, *newCs, *newZone;
  } refused[] = {
      {"Alabama 1983", "West", "state plane 1983", "ALABAMA EAST 0101"},
      {"Alabama 1983", "West", "Alabama~1983", "West"},
      {"Alabama 1983", "West", "Alabama 1983", ""},
      {"Nowhere", "West", "Alabama 1983", "East"},
  };
  for (const auto& r : refused) {
    EXPECT_FALSE(store.rename(r.cs, r.zone, r.newCs, r.newZone)) << r.newCs << "~" << r.newZone;
  }
  EXPECT_TRUE(now() == expected);
  EXPECT_TRUE(store.rename("Alabama 1983", "West", "ALABAMA 1983", "west"));  // letter case only

  ASSERT_TRUE(store.remove(cs, "Arizona East 0201"));
  EXPECT_FALSE(store.remove(cs, "Arizona East 0201"));
  expected = Without(original, old);
  expected = Without(expected, cs + "~Arizona East 0201");
  EXPECT_TRUE(Without(now(), "ALABAMA 1983~west") == expected);
  EXPECT_EQ(store.sections().size(), 299u);
}

TEST(ZoneStoreTest, MissingKeysLoadAsTheReadersSeeThem) {
  TempDir dir;
  dir.write("zones.ini", CrLf({"[CS ~ Sparse ]", "Projection=Transverse Mercator", "Show Out=no",
                               "[No Tilde]"}));
  const ZoneStore store = ZoneStore::In(dir.path());
  ZoneRecord expected;
  expected.coordinateSystem = "CS";
  expected.zone = "Sparse";
  expected.projection = kTransverseMercator;
  expected.showOut.text = "no";
  EXPECT_EQ(store.load("cs", "sparse"), expected);
  EXPECT_EQ(store.loadSection("No Tilde")->coordinateSystem, "No Tilde");
  EXPECT_EQ(store.findSection(" CS", "SPARSE "), "CS ~ Sparse");
  EXPECT_EQ(store.load("CS", "Other"), std::nullopt);
  // The list errors of the routines that show them.
  const auto error = [](const std::function<void()>& f) {
    try {
      f();
    } catch (const ZvError& e) {
      return std::to_string(e.number()) + " " + e.source() + " " + e.description();
    }
    return std::string("none");
  };
  EXPECT_EQ(error([&] { store.coordinateSystems(); }),
            "1 modMisc.LOAD_CS_ComboBoxList Error loading coordinate systems.");
  EXPECT_EQ(error([&] { store.zones("CS"); }),
            "1 modMisc.LOAD_Zones_ComboBoxList Error loading zones.");
  dir.write("zones.ini", CrLf({"[CS~A]", "Show Out=no", "[CS~B]", "Show In=0"}));
  EXPECT_EQ(store.zones("CS"), (V{"A", "B"}));
  EXPECT_EQ(store.zones("CS", ZoneSide::Input), V{"A"});
  EXPECT_EQ(error([&] { store.zones("CS", ZoneSide::Output); }),
            "13 modMisc.LOAD_Zones_ComboBoxList Type mismatch");
}

// A save killed at any moment leaves the old or the new file, never a part.
TEST_F(ShippedZones, AKilledSaveLeavesTheOldOrTheNewFile) {
  ZoneRecord edited = *store.load("State Plane 1927", "Texas North 4201");
  edited.fullName = "Texas North, edited";
  edited.falseEasting = CatalogNumber::Of(2000000.125);
  ASSERT_TRUE(store.save(edited));
  const std::string changed = now();
  dir.write("zones.ini", original);
  const ZoneRecord first = *store.load("State Plane 1927", "Texas North 4201");

  std::mt19937 rng(20240611);
  std::uniform_int_distribution<int> pause(0, 6000);
  for (int round = 0; round < 40; ++round) {
    const pid_t child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
      for (bool flip = true;; flip = !flip) store.save(flip ? edited : first);
    }
    usleep(static_cast<useconds_t>(1000 + pause(rng)));
    kill(child, SIGKILL);
    int status = 0;
    waitpid(child, &status, 0);
    ASSERT_TRUE(WIFSIGNALED(status));
    const std::string text = now();
    ASSERT_TRUE(text == original || text == changed) << "round " << round << ", " << text.size();
    const std::optional<ZoneRecord> z = store.load("State Plane 1927", "Texas North 4201");
    ASSERT_TRUE(z == first || z == edited);
    ASSERT_EQ(store.sections().size(), 300u);
  }
  // The next save clears what killed saves left behind.
  ASSERT_TRUE(store.save(first));
  EXPECT_TRUE(now() == original);
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(dir.path()), {}), 3);
}

// ---------------------------------------------------------------------------
// Datums and ellipsoids.

TEST(DatumStoreTest, TransformationsAreTheKeysNamedAfterOtherDatums) {
  TempDir dir;
  const std::string path = dir.write(
      "datums.ini",
      test::Ini("[NAD 27]|Full Name=NAD 1927|Type=Horizontal|Ellipsoid=Clarke 1866|Show In=1|"
                "Show Out=1|nad 83=NADCON NAD 27 to NAD 83|Old Key=kept|NGVD 29=|NAD 27=self||"
                "[NAD 83]|Type=Horizontal||[NGVD 29]|Type=Vertical|Ellipsoid=stale|Show In=1|"
                "Show Out=0|NAVD 88=VERTCON NGVD 29 to NAVD 88||[NAVD 88]|Type=Vertical"));
  const DatumStore store(path);
  DatumRecord nad27 = *store.load("nad 27");
  EXPECT_EQ(nad27.name, "NAD 27");  // as the file spells it
  EXPECT_EQ(nad27.transformations, (ProfileKeys{{"nad 83", "NADCON NAD 27 to NAD 83"}}));
  EXPECT_EQ(nad27.method("NAD 83"), "NADCON NAD 27 to NAD 83");
  EXPECT_EQ(nad27.method("Old Key"), "");
  EXPECT_EQ(store.method("NAD 27", "old key"), "kept");  // the key itself, as the driver reads it
  const DatumRecord nad83 = *store.load("NAD 83");
  EXPECT_EQ(nad83.showIn.text + "|" + nad83.ellipsoid, "|");
  EXPECT_EQ(store.loadAll().size(), 4u);

  // Saving the loaded record changes nothing; a removed row loses its key.
  const std::string before = ReadFile(path);
  ASSERT_TRUE(store.save(nad27));
  EXPECT_TRUE(ReadFile(path) == before);
  nad27.transformations = {{"NGVD 29", "NADCON test"}};
  ASSERT_TRUE(store.save(nad27));
  EXPECT_EQ(KeyNames(path, "NAD 27"), (V{"Full Name", "Type", "Ellipsoid", "Show In", "Show Out",
                                         "NGVD 29", "Old Key", "NAD 27"}));
  // A vertical datum writes no ellipsoid.
  ASSERT_TRUE(store.save(*store.load("NGVD 29")));
  EXPECT_EQ(KeyNames(path, "NGVD 29"), (V{"Full Name", "Type", "Show In", "Show Out", "NAVD 88"}));
  EXPECT_EQ(KeyNames(path, "NAD 83"), V{"Type"});

  ASSERT_TRUE(store.rename("NAVD 88", "NAVD 1988"));
  EXPECT_FALSE(store.rename("NAVD 1988", "nad 83"));
  ASSERT_TRUE(store.remove("NAD 83"));
  EXPECT_FALSE(store.remove("NAD 83"));
  EXPECT_EQ(store.sections(), (V{"NAD 27", "NGVD 29", "NAVD 1988"}));
}

TEST(CatalogStoreTest, ShippedDatumsAndEllipsoidsSaveBackByteForByte) {
  TempDir dir;
  for (const char* name : {"datums.ini", "ellipsoids.ini"}) {
    dir.write(name, ReadFile(kShipped + name));
  }
  const DatumStore datums = DatumStore::In(dir.path());
  const EllipsoidStore ellipsoids = EllipsoidStore::In(dir.path());
  for (const DatumRecord& d : datums.loadAll()) ASSERT_TRUE(datums.save(d)) << d.name;
  for (const EllipsoidRecord& e : ellipsoids.loadAll()) ASSERT_TRUE(ellipsoids.save(e)) << e.name;
  for (const char* name : {"datums.ini", "ellipsoids.ini"}) {
    EXPECT_TRUE(ReadFile(dir.file(name)) == ReadFile(kShipped + name)) << name;
  }
  EXPECT_EQ(datums.load("NAVD 88")->method("NAD 83 Ellipsoid"), "GEOID09 NAVD 88 to NAD 83");
}

TEST(EllipsoidStoreTest, NewEllipsoidWithPlainNumbers) {
  TempDir dir;
  const std::string path = dir.write("ellipsoids.ini", "; ellipsoids\n");
  const EllipsoidStore store(path);
  EllipsoidRecord e;
  e.name = "Tiny";
  e.fullName = "Test";
  e.semimajorAxis.text = "6378137";
  e.semiminorAxis.text = "6378136.9999";
  e.flattening = CatalogNumber::Of(0.0001 / 6378137);
  e.eccentricity.text = "0.0056";
  e.show = CatalogFlag::Of(true);
  ASSERT_TRUE(store.save(e));
  EXPECT_EQ(ReadFile(path),
            "; ellipsoids\n\n[Tiny]\nFull Name=Test\nSemimajor Axis=6378137\n"
            "Semiminor Axis=6378136.9999\nFlattening=0.00000000001567855942887398\n"
            "Eccentricity=0.0056\nShow=1\n");
  EXPECT_EQ(store.load("tiny"), e);
  EXPECT_FALSE(store.save(EllipsoidRecord{}));
  EXPECT_EQ(store.load("Other"), std::nullopt);
}

// The flex store saves a format with the same one write.
TEST(CatalogStoreTest, FlexFormatSaveKeepsTheOtherFormats) {
  TempDir dir;
  const std::string before = "; formats\n[A]\nDelimiter=Comma\nExtra=1\n\n[B]\nDelimiter=Tab\n";
  const std::string path = dir.write(kFlexInStoreName, before);
  const FlexStore store = FlexStore::Input(dir.path());
  FlexInFormat f = store.loadInput("A");
  f.columns = {"Point ID", "Northing"};
  ASSERT_TRUE(store.save("A", f));
  EXPECT_EQ(ReadFile(path),
            "; formats\n[A]\nDelimiter=Comma\nCoordinate Type=\n"
            "Columns=Point ID,Northing\nColumn Order=\nHeader=\nIgnore=\nExtra=1\n\n"
            "[B]\nDelimiter=Tab\n");
}

}  // namespace
}  // namespace zv
