// The writers of every survey format: one table of what they are given and
// the lines they write, and the cases every format must meet.

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <algorithm>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <functional>
#include <optional>

#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "survey/SurveyTestSupport.h"
#include "survey/TaggedFile.h"

namespace zv {
namespace {

using namespace test;

// A line matches a pattern equal to it, or starting with it when the pattern
// ends in '*'; "$VR" stands for the version line.
bool Matches(const std::string& line, std::string pattern) {
  if (size_t at = pattern.find("$VR"); at != std::string::npos)
    pattern.replace(at, 3, "VR:" + Version());
  if (!pattern.empty() && pattern.back() == '*') {
    pattern.pop_back();
    return line.rfind(pattern, 0) == 0;
  }
  return line == pattern;
}

void ExpectLines(const std::string& path, const std::vector<std::string>& want) {
  std::vector<std::string> got = SplitCrLf(ReadFile(path));
  EXPECT_EQ(got.size(), want.size());
  for (size_t i = 0; i < std::min(got.size(), want.size()); ++i)
    EXPECT_TRUE(Matches(got[i], want[i])) << "line " << i + 1 << ": " << got[i];
}

// The format of a fixture by its folder.
const Format& FormatOf(const std::string& fixture) {
  for (const Format* f : kWriters) {
    if (fixture.starts_with(f->folder)) return *f;
  }
  throw std::invalid_argument(fixture);
}

SurveyChain Chain(const std::string& pointList) {
  SurveyChain c;
  StartChain(c);
  c.PointListLines = pointList;
  return c;
}

struct WriteRow {
  const char* input;     // a fixture, copied to the output side
  const char* expected;  // a fixture with the lines written ("$VR", "*" as above),
                         // or "format/!title: text" of a refusal that writes nothing
  std::function<void(WorkArea&)> change = nullptr;  // of the output side before writing
  bool rereads = false;  // the written file reads back as the output side holds it
};

TEST(SurveyWriters, WriteAsLaidOut) {
  using W = WorkArea&;
  const WriteRow rows[] = {
      {"pac/full_point.PAC", "control/full_point.out.CTL"},
      // Written again, one more version line.
      {"control/full_point.CTL", "control/full_point.again.CTL", nullptr, true},
      {"pac/full_point.PAC", "control/feet.out.CTL",
       [](W w) { w.OutputHeader.HorizontalUnits = w.OutputHeader.VerticalUnits = kUsSurveyFeet; }},
      {"pac/full_point.PAC", "control/options.out.CTL",
       [](W w) { w.ConversionOptionsActive = w.OutputScaleFactor = true; }},
      {"control/height.CTL", "control/geographic.out.CTL",
       [](W w) {
         w.OutputHeader.HorizontalUnits = kFormatPacked;
         w.OutputHeader.VerticalUnits = kInternationalFeet;
       }},
      // Without a vertical unit: no UL line, no conversion.
      {"control/height.CTL", "control/geographic_no_unit.out.CTL",
       [](W w) {
         w.OutputHeader.HorizontalUnits = kFormatPacked;
         w.OutputHeader.VerticalUnits = "";
       }},
      // The first point is stored before the UL line: without a unit it keeps its values.
      {"control/units_after_points.CTL", "control/units_after_points.out.CTL",
       [](W w) { w.OutputHeader.HorizontalUnits = w.OutputHeader.VerticalUnits = kMeters; }},
      // Stale grid values of a point whose grid is missing are not written.
      {"control/grid_missing.CTL", "control/grid_missing.out.CTL",
       [](W w) { w.OutputPoints[0].GridMissing = w.OutputPoints[1].GridMissing = true; }},
      {"control/no_ac_lines.CTL", "control/south_east.out.CTL",
       [](W w) {
         SurveyPoint& p = w.OutputPoints[0];
         p.Latitude = Dms(33, 0, 0);
         p.LatitudeHemisphere = "S";
         p.Longitude = 0.1;
         p.LongitudeHemisphere = "E";
       }},
      {"pac/chains.PAC", "pac/chains.out.PAC", nullptr, true},
      // Control coordinates are written as computed ones.
      {"control/no_ac_lines.CTL", "pac/control.out.PAC"},
      // Only the chain lines that hold something; a stray line end writes no empty line.
      {"control/no_ac_lines.CTL", "pac/chain_lines.out.PAC",
       [](W w) {
         w.OutputPoints[0].GridMissing = true;
         SurveyChain full = Chain("PL:1,2\r\nPL:3");
         full.FeatureCode = "EP";
         full.Description = "CD:one\r\nCD:two";
         full.FGText = "F";
         full.ChainLines = "CH:x";
         full.ExtraLines = "CM:y\r\n";
         w.OutputChains = {Chain(""), full};
       }},
      {"project/record_codes.PRJ", "project/record_codes.out.PRJ", nullptr, true},
      {"project/mixed_flags.PRJ", "project/mixed_flags.out.PRJ", nullptr, true},
      {"project/mixed_flags.PRJ", "project/grid_missing.out.PRJ",
       [](W w) {
         w.OutputPoints[0].GridMissing = true;
         w.OutputPoints[0].Elevation = kNoValue;
       }},
      {"project/bare_record_code.PRJ", "project/bare_record_code.out.PRJ", nullptr, true},
      // Points of a points and chains file have no record code.
      {"pac/chains.PAC", "project/chains.out.PRJ", nullptr, true},
      {"srv/chains.srv", "srv/chains.out.SRV", nullptr, true},
      {"srv/us_feet.srv", "srv/us_feet.out.SRV"},
      // A point is written once, in its first chain; unknown ids are skipped; a
      // one-point chain is no chain; blanks in a chain name become "_".
      {"srv/five_points.srv", "srv/chain_blocks.out.SRV",
       [](W w) {
         w.OutputChains = {Chain("PL:1,2\r\nPL:9,3"), Chain("PL:3,4"), Chain("PL:5"),
                           Chain("PL:1,4"),           Chain("PL:2,4"), Chain("PL:3,1")};
         w.OutputChains[1].FGText = "CURB LINE";
         w.OutputChains[3].ChainLines = "CH:100";
         SurveyChain& named = w.OutputChains[4];
         named.ChainName = named.FeatureCode = "CL";
         named.CodeLetter = "X";
         named.IntegerAttribute = "3";
         named.Station = "1+00";
         named.Description = "CD:CENTER\r\nCD:LINE";
       }},
      {"pac/full_point.PAC", "srv/header.out.SRV",
       [](W w) {
         w.OutputHeader.HorizontalUnits = w.OutputHeader.VerticalUnits = kUsSurveyFeet;
         w.OutputPoints[0].CodeLetter = "U";
         w.OutputPoints[0].IntegerAttribute = "5";
         w.OutputPoints[0].FeatureCode = "";
       }},
      {"pac/full_point.PAC",
       "srv/!Plane Coordiantes Required: A Caice SRV File must contain plane coordinates.",
       [](W w) { w.OutputHeader.CoordinateSystem = "Geographic Coordinates"; }},
      {"pac/full_point.PAC",
       "srv/!VORN Zurevazidu: Point 1 has no point id and can not be written to a CAiCE SRV File.",
       [](W w) { w.OutputPoints[0].PointName = ""; }},
      {"pac/full_point.PAC",
       "wsi/!Plane Coordiantes Required: A Wisconsin Summary Index File must contain plane "
       "coordinates.",
       [](W w) { w.OutputHeader.CoordinateSystem = "Geographic Coordinates"; }},
      // Only the PD line outside BENCH MARKS is not part of the format's output.
      {"wsi/groups.wsi", "wsi/groups.out.WSI"},
      {"wsi/ellipsoid_heights.wsi", "wsi/ellipsoid_heights.out.WSI", nullptr, true},
      // A one-letter AH does not move AV; without an easting X and Y are
      // blank. Groups in order of first appearance, unnamed last; only BENCH
      // MARKS rows have description and OW/TY/NM lines.
      {"pac/chains.PAC", "wsi/columns.out.WSI",
       [](W w) {
         w.OutputPoints = {Point("1", 678.25, 1234.5, 99.125),
                           Point("NOEAST", 500, kNoValue, kNoValue), Point("3", 1, 1, 1),
                           Point("4", 1, 1, 1)};
         w.OutputPoints[0].FeatureCode = "EP";
         w.OutputPoints[0].ExtraLines = "AH:A\r\nCM:kept\r\nAV:B1";
         w.OutputPoints[1].GRText = w.OutputPoints[3].GRText = "BENCH MARKS";
         w.OutputPoints[2].GRText = "BENCH";
         w.OutputPoints[1].DescriptionLines = "PD:on rock";
         w.OutputPoints[1].ExtraLines = "NM:BM 2\r\nTY:DISK\r\nOW:CITY\r\nZZ:not written";
         w.OutputPoints[2].DescriptionLines = "PD:not written";
       }},
      // A header from another format; lengths converted to metres.
      {"pac/chains.PAC", "wsi/metres.out.WSI",
       [](W w) {
         w.OutputHeader.HeaderExtraLines = "CM:first\r\nUL:F\r\nHD:old";
         w.OutputHeader.HorizontalUnits = kUsSurveyFeet;
         w.OutputPoints = {Point("1", 2000, 1000, 100, kUsSurveyFeet)};
         w.OutputPoints[0].VerticalUnits = kInternationalFeet;
       }},
  };
  for (const WriteRow& r : rows) {
    SCOPED_TRACE(std::string(r.input) + " -> " + r.expected);
    ScriptedUi ui;
    WorkArea work;
    TempDir dir;
    ASSERT_TRUE(FormatOf(r.input).read(ui, work, Fixture(r.input)));
    work.copyInputToOutput();
    if (r.change) r.change(work);
    const std::string before = Describe(work, false);
    const Format& out = FormatOf(r.expected);
    const std::string refusal = strchr(r.expected, '/') + 1;
    std::string path = dir.file(std::string("out.") + out.name);
    // A tagged file written twice: nothing is converted twice.
    for (int pass = &out == &kSrv || &out == &kWsi; pass < 2; ++pass) {
      bool written = out.write(ui, work, path);
      if (refusal[0] == '!') {
        EXPECT_FALSE(written);
        EXPECT_EQ(Boxes(ui), "E " + refusal.substr(1));
        EXPECT_TRUE(std::filesystem::is_empty(dir.path()));
        break;
      }
      ASSERT_TRUE(written);
      ExpectLines(path, SplitCrLf(ReadFile(Fixture(r.expected))));
      EXPECT_TRUE(ui.boxes.empty()) << ui.boxes[0].text;
    }
    if (r.rereads) {
      ASSERT_TRUE(out.read(ui, work, path));
      EXPECT_EQ(Describe(work, false), before);
    }
  }
}

// Two control files joined into one, the first in metres and the second in
// feet: every format writes each point in its own unit.
TEST(SurveyWriters, JoinedFileKeepsEachPointsUnit) {
  for (const Format* f : kWriters) {
    SCOPED_TRACE(f->name);
    ScriptedUi ui;
    WorkArea work;
    TempDir dir;
    ASSERT_TRUE(ReadControlFile(ui, work, Fixture("control/joined_units.CTL")));
    ASSERT_EQ(work.InputPoints.size(), 2u);
    EXPECT_NEAR(work.InputPoints[0].Latitude, Dms(45, 30, 0), 1e-12);
    EXPECT_EQ(work.InputPoints[1].Latitude, kNoValue);
    work.copyInputToOutput();
    std::string path = dir.file(std::string("out.") + f->name);
    ASSERT_TRUE(f->write(ui, work, path));
    ASSERT_TRUE(f->read(ui, work, path));
    EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
    const std::vector<SurveyPoint>& p = work.InputPoints;
    ASSERT_EQ(p.size(), 2u);
    const double feet = Distances_Convert(1, kUsSurveyFeet, "M");
    const double want[2][3] = {{100, 200, 10}, {300 * feet, 400 * feet, 20 * feet}};
    for (size_t i = 0; i < 2; ++i) {
      EXPECT_EQ(p[i].PointName, i == 0 ? "A1" : "B1");
      EXPECT_NEAR(Distances_Convert(p[i].Northing, p[i].HorizontalUnits, "M"), want[i][0], 1e-3);
      EXPECT_NEAR(Distances_Convert(p[i].Easting, p[i].HorizontalUnits, "M"), want[i][1], 1e-3);
      EXPECT_NEAR(Distances_Convert(p[i].Elevation, p[i].VerticalUnits, "M"), want[i][2], 1e-3);
      if (f != &kWsi) {
        EXPECT_EQ(p[i].DescriptionLines, i == 0 ? "PD:metric" : "PD:feet");
      }
    }
  }
}

// Text fields on both sides of the in-place limit of the text field, and
// joined lines, survive every format: written, read back and written again,
// the file is the same but for its version and date lines.
TEST(SurveyWriters, TextFieldsOfEveryLengthRoundTrip) {
  auto withoutStamps = [](const std::string& path) {
    std::vector<std::string> lines = SplitCrLf(ReadFile(path));
    std::erase_if(lines, [](const std::string& l) {
      return l.starts_with("VR:") || l.starts_with("#VR:") || l.starts_with("CP:");
    });
    return lines;
  };
  for (const Format* f : kWriters) {
    SCOPED_TRACE(f->name);
    ScriptedUi ui;
    WorkArea work;
    TempDir dir;
    work.OutputHeader.CoordinateSystem = "State Plane 1983";
    work.OutputHeader.Zone = "Wisconsin Central 4802";
    work.OutputHeader.HorizontalUnits = work.OutputHeader.VerticalUnits = kMeters;
    work.OutputPoints = {Point("7", 1, 2, 3), Point("1234567", 4, 5, 6),
                         Point("12345678", 7, 8, 9)};
    const char* codes[] = {"EP", "CONTROL", "CONTROLPT"};
    const char* descriptions[] = {"", "PD:A", "PD:FIRST LINE\r\nPD:SECOND LINE"};
    for (size_t i = 0; i < 3; ++i) {
      work.OutputPoints[i].FeatureCode = codes[i];
      work.OutputPoints[i].DescriptionLines = descriptions[i];
    }
    work.OutputPoints[2].ExtraLines = "CM:a longer comment\r\nQQ:unknown";
    work.OutputChains = {Chain("PL:7,1234567,12345678")};
    std::string first = dir.file(std::string("first.") + f->name);
    std::string second = dir.file(std::string("second.") + f->name);
    ASSERT_TRUE(f->write(ui, work, first));
    ASSERT_TRUE(f->read(ui, work, first));
    work.copyInputToOutput();
    ASSERT_TRUE(f->write(ui, work, second));
    EXPECT_EQ(withoutStamps(second), withoutStamps(first));
    ASSERT_EQ(work.InputPoints.size(), 3u);
    for (size_t i = 0; i < 3; ++i) {
      EXPECT_EQ(work.InputPoints[i].PointName, work.OutputPoints[i].PointName);
      EXPECT_EQ(work.InputPoints[i].FeatureCode, codes[i]);
    }
  }
}

// Writes past `bytes` fail while it lives, as on a full disk.
class FileSizeLimit {
 public:
  explicit FileSizeLimit(rlim_t bytes) {
    getrlimit(RLIMIT_FSIZE, &old_);
    oldHandler_ = std::signal(SIGXFSZ, SIG_IGN);
    rlimit limit = old_;
    limit.rlim_cur = bytes;
    setrlimit(RLIMIT_FSIZE, &limit);
  }
  ~FileSizeLimit() {
    setrlimit(RLIMIT_FSIZE, &old_);
    std::signal(SIGXFSZ, oldHandler_);
  }
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;

 private:
  rlimit old_{};
  void (*oldHandler_)(int) = nullptr;
};

// A writer that loses its output must say so and return false: the file
// cannot be created (missing folder), the target is a folder, or the disk
// fills up while the file is written.
TEST(SurveyWriters, WriteFailuresAreReported) {
  enum Case { MissingFolder, FolderTarget, DiskFull };
  for (const Format* f : kWriters) {
    for (Case c : {MissingFolder, FolderTarget, DiskFull}) {
      SCOPED_TRACE(std::string(f->name) + " case " + std::to_string(c));
      ScriptedUi ui;
      WorkArea work;
      TempDir dir;
      work.OutputPoints.assign(20, Point("1", 1, 1, 1));
      std::string path = dir.file(c == MissingFolder ? "missing/out" : "out");
      if (c == FolderTarget) {
        std::filesystem::create_directory(path);
        dir.write("out/keep.txt", "x");
      }
      bool written;
      {
        std::optional<FileSizeLimit> limit;
        if (c == DiskFull) limit.emplace(64);
        written = f->write(ui, work, path);
      }
      EXPECT_FALSE(written);
      const std::string head =
          "E File Not Written: The file '" + path + "' could not be written.\r\n";
      const std::string boxes = Boxes(ui);
      EXPECT_TRUE(boxes.starts_with(head) && boxes.size() > head.size()) << boxes;  // and why
      // Nothing half-written is left: only the folder and what it held.
      EXPECT_EQ(std::distance(std::filesystem::recursive_directory_iterator(dir.path()), {}),
                c == FolderTarget ? 2 : 0);
    }
  }
}

// The "Check Output File" warning of a written file, "" for none.
std::string Warning(const ScriptedUi& ui, const std::string& path) {
  const std::string head = "E Check Output File: The file '" + path + "' was written, but:\r\n";
  const std::string boxes = Boxes(ui);
  EXPECT_TRUE(boxes.empty() || boxes.starts_with(head)) << boxes;
  return boxes.empty() ? "" : boxes.substr(head.size());
}

// Point names of 8 characters fit every format; a ninth character is cut by
// WSI, kept by SRV and refused when a tagged file is read back. Every change
// or risk is named in one warning.
TEST(SurveyWriters, PointNameWidths) {
  const char* kTagged =
      "1 point(s) have names longer than 8 characters and will not read back: 'ABCDEFGHI'.";
  const struct {
    const Format* format;
    const char* readName;  // "" when the file does not read back
    const char* warning;
  } rows[] = {{&kCtl, "", kTagged},
              {&kPac, "", kTagged},
              {&kPrj, "", kTagged},
              {&kWsi, "ABCDEFGH", "1 point(s) had values cut to fit their columns: 'ABCDEFGHI'."},
              {&kSrv, "ABCDEFGHI", ""}};
  for (const auto& r : rows) {
    for (const char* name : {"ABCDEFGH", "ABCDEFGHI"}) {
      bool fits = std::string(name).size() == 8;
      SCOPED_TRACE(std::string(r.format->name) + " " + name);
      ScriptedUi ui;
      WorkArea work;
      TempDir dir;
      work.OutputPoints = {Point(name, 1, 1, 1)};
      work.OutputPoints[0].FeatureCode = "FE";
      std::string path = dir.file("out");
      ASSERT_TRUE(r.format->write(ui, work, path));
      EXPECT_EQ(Warning(ui, path), fits ? "" : r.warning);
      ui.boxes.clear();
      std::string readName = fits ? name : r.readName;
      EXPECT_EQ(r.format->read(ui, work, path), !readName.empty());
      if (readName.empty()) {
        EXPECT_NE(ui.onlyText().find("Point Name can not exceeed 8 characters."),
                  std::string::npos);
      } else {
        ASSERT_EQ(work.InputPoints.size(), 1u);
        EXPECT_EQ(work.InputPoints[0].PointName, readName);
      }
    }
  }
}

// Blanks in ids and feature codes (the shipped WSI sample has remarks such as
// "CONTROL PT") become "_" and are named in one warning.
TEST(SrvFile, BlanksInNamesAndCodesAreWrittenAsUnderscores) {
  ScriptedUi ui;
  WorkArea work;
  TempDir dir;
  ASSERT_TRUE(ReadWsiFile(ui, work, std::string(ZV_SOURCE_DIR) + "/appdata/samples/sample.wsi"));
  work.copyInputToOutput();
  work.OutputPoints[1].PointName = "A 1";
  std::string path = dir.file("out.SRV");
  ASSERT_TRUE(WriteSrvFile(ui, work, path));
  EXPECT_EQ(Warning(ui, path),
            "7 point(s) had blanks in their point id or feature code, written as \"_\": '1001', "
            "'A 1', '1003', '1004', '1005', ...");
  size_t count = work.OutputPoints.size();
  ASSERT_TRUE(ReadSrvFile(ui, work, path));
  ASSERT_EQ(work.InputPoints.size(), count);
  EXPECT_EQ(work.InputPoints[0].FeatureCode, "CONTROL_PT");
  EXPECT_EQ(work.InputPoints[1].PointName, "A_1");
}

// Values wider than their columns are cut (numbers lose decimals first, and
// are left blank when even that is too wide); points without a unit are
// written as metres. One warning names the points.
TEST(WsiFile, OversizeValuesAreCutAndMissingUnitsNamed) {
  ScriptedUi ui;
  WorkArea work;
  TempDir dir;
  work.OutputPoints = {Point("1", 1234567890.1234, 1234567890.1234, 1e13), Point("2", 2, 1, 3),
                       Point("3", 6, 5, 7, "")};
  work.OutputPoints[0].FeatureCode = "FIFTEEN CHARS X";
  work.OutputPoints[1].ExtraLines = "AH:ABC\r\nAV:7";
  std::string path = dir.file("out.WSI");
  ASSERT_TRUE(WriteWsiFile(ui, work, path));
  ExpectLines(path, SplitCrLf(ReadFile(Fixture("wsi/oversize.out.WSI"))));
  EXPECT_EQ(Warning(ui, path),
            "2 point(s) had values cut to fit their columns: '1', '2'.\r\n1 point(s) had no unit "
            "and were taken as metres: '3'.");
}

}  // namespace
}  // namespace zv
