// Cases that every survey format must meet, one table row per format.

#include <gtest/gtest.h>
#include <sys/resource.h>

#include <algorithm>
#include <csignal>
#include <filesystem>
#include <optional>
#include <sstream>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SrvFile.h"
#include "survey/SurveyFiles.h"
#include "survey/SurveyTestSupport.h"
#include "survey/WsiFile.h"

namespace zv {
namespace {

using test::Fixture;
using test::TempDir;

using FileFn = bool (*)(Ui&, WorkArea&, const std::string&);

struct Format {
  const char* name;
  FileFn write;
  FileFn read;
  bool keepsDescriptions;
};

const Format kFormats[] = {
    {"CTL", WriteControlFile, ReadControlFile, true},
    {"PAC", WritePointsChainsFile, ReadPointsChainsFile, true},
    {"PRJ", WriteProjectFile, ReadProjectFile, true},
    {"WSI", WriteWsiFile, ReadWsiFile, false},
    {"SRV", WriteSrvFile, ReadSrvFile, true},
};

double Metres(double value, const std::string& unit) {
  return Distances_Convert(value, unit, "M");
}

// A point stored at the next point's AC line used to take the units of a
// project section between them, and a control file dropped it altogether.
TEST(SurveyTaggedSections, ProjectSectionsEndThePointBeforeThem) {
  using ReadFn = bool (*)(Ui&, WorkArea&, std::istream&, const std::string&);
  struct Row {
    ReadFn read;
    const char* open;
    char coordinate;       // 'C' control or 'Y'-style computed tags
    bool headerPdToPoint;  // a PD line in a project section goes to the next point
  };
  const Row rows[] = {
      {ReadControlStream, "AC:OS", 'C', true},
      {ReadPointsChainsStream, "AC:PD", 'Y', false},
      {ReadProjectStream, "AC:SS", 'C', false},
      {ReadProjectStream, "AC:SS", 'Y', false},
  };
  for (const Row& r : rows) {
    auto tag = [&](char axis) {
      return std::string(1, axis) + (r.coordinate == 'C' ? 'C' : axis) + ":";
    };
    std::string text = std::string("AC:PR\r\nPD:job\r\nUL:M\r\n") + r.open + "\r\nPN:A1\r\n" +
                       tag('Y') + "100\r\n" + tag('X') + "200\r\n" + tag('Z') +
                       "10\r\nLT:45.3000\r\nPD:first\r\nAC:PR\r\nUL:F\r\nPD:note\r\n" + r.open +
                       "\r\nPN:B1\r\n" + tag('Y') + "300\r\nAC:PR\r\n" + r.open + "\r\nPN:C1\r\n" +
                       tag('Y') + "500\r\n";
    SCOPED_TRACE(text);
    ScriptedUi ui;
    WorkArea work;
    std::istringstream in(text);
    ASSERT_TRUE(r.read(ui, work, in, "mem"));
    const std::vector<SurveyPoint>& p = work.InputPoints;
    ASSERT_EQ(p.size(), 3u);
    EXPECT_EQ(p[0].PointName, "A1");
    EXPECT_EQ(p[0].HorizontalUnits, kMeters);
    EXPECT_EQ(p[0].VerticalUnits, kMeters);
    EXPECT_EQ(p[0].Northing, 100);
    EXPECT_EQ(p[0].Elevation, 10);
    EXPECT_EQ(p[0].DescriptionLines, r.headerPdToPoint ? "PD:job\r\nPD:first" : "PD:first");
    for (size_t i : {1u, 2u}) {
      EXPECT_EQ(p[i].PointName, i == 1 ? "B1" : "C1");
      EXPECT_EQ(p[i].HorizontalUnits, kUsSurveyFeet);
      EXPECT_EQ(p[i].Northing, i == 1 ? 300 : 500);
      EXPECT_EQ(p[i].Easting, kNoValue);
      EXPECT_EQ(p[i].Elevation, kNoValue);
      EXPECT_EQ(p[i].Latitude, kNoValue);
    }
    EXPECT_EQ(p[1].DescriptionLines, r.headerPdToPoint ? "PD:note" : "");
    EXPECT_EQ(work.InputHeader.HeaderExtraLines, r.headerPdToPoint ? "" : "PD:job\r\nPD:note");
    EXPECT_TRUE(ui.boxes.empty());
  }
}

// Two control files joined into one, the first in metres and the second in
// feet: every format writes each point in its own unit.
TEST(SurveyWriters, JoinedFileKeepsEachPointsUnit) {
  for (const Format& f : kFormats) {
    SCOPED_TRACE(f.name);
    ScriptedUi ui;
    WorkArea work;
    TempDir dir;
    ASSERT_TRUE(ReadControlFile(ui, work, Fixture("control/joined_units.CTL")));
    ASSERT_EQ(work.InputPoints.size(), 2u);
    EXPECT_NEAR(work.InputPoints[0].Latitude, test::Dms(45, 30, 0), 1e-12);
    EXPECT_EQ(work.InputPoints[1].Latitude, kNoValue);
    work.copyInputToOutput();
    std::string path = dir.file(std::string("out.") + f.name);
    ASSERT_TRUE(f.write(ui, work, path));
    ASSERT_TRUE(f.read(ui, work, path));
    EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
    const std::vector<SurveyPoint>& p = work.InputPoints;
    ASSERT_EQ(p.size(), 2u);
    const double feet = Metres(1, kUsSurveyFeet);
    const double want[2][3] = {{100, 200, 10}, {300 * feet, 400 * feet, 20 * feet}};
    for (size_t i = 0; i < 2; ++i) {
      EXPECT_EQ(p[i].PointName, i == 0 ? "A1" : "B1");
      EXPECT_NEAR(Metres(p[i].Northing, p[i].HorizontalUnits), want[i][0], 1e-3);
      EXPECT_NEAR(Metres(p[i].Easting, p[i].HorizontalUnits), want[i][1], 1e-3);
      EXPECT_NEAR(Metres(p[i].Elevation, p[i].VerticalUnits), want[i][2], 1e-3);
      if (f.keepsDescriptions) {
        EXPECT_EQ(p[i].DescriptionLines, i == 0 ? "PD:metric" : "PD:feet");
      }
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
  for (const Format& f : kFormats) {
    for (Case c : {MissingFolder, FolderTarget, DiskFull}) {
      SCOPED_TRACE(std::string(f.name) + " case " + std::to_string(c));
      ScriptedUi ui;
      WorkArea work;
      TempDir dir;
      SurveyPoint p;
      p.PointName = "1";
      p.Northing = p.Easting = p.Elevation = 1;
      p.HorizontalUnits = p.VerticalUnits = kMeters;
      work.OutputPoints.assign(20, p);
      std::string path = dir.file(c == MissingFolder ? "missing/out" : "out");
      if (c == FolderTarget) {
        std::filesystem::create_directory(path);
        dir.write("out/keep.txt", "x");
      }
      bool written;
      {
        std::optional<FileSizeLimit> limit;
        if (c == DiskFull) limit.emplace(64);
        written = f.write(ui, work, path);
      }
      EXPECT_FALSE(written);
      ASSERT_EQ(ui.boxes.size(), 1u);
      EXPECT_EQ(ui.boxes[0].title, "File Not Written");
      EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
      EXPECT_EQ(ui.boxes[0].text.rfind("The file '" + path + "' could not be written.\r\n", 0), 0u);
      EXPECT_GT(ui.boxes[0].text.size(), path.size() + 35);  // carries the reason
      // Nothing half-written is left: only the folder and what it held.
      int entries = 0;
      for ([[maybe_unused]] const auto& e :
           std::filesystem::recursive_directory_iterator(dir.path()))
        ++entries;
      EXPECT_EQ(entries, c == FolderTarget ? 2 : 0);
    }
  }
}

// Point names of 8 characters fit every format; a ninth character is cut by
// WSI, kept by SRV and refused when a tagged file is read back. Every change
// or risk is named in one warning.
TEST(SurveyWriters, PointNameWidths) {
  struct Row {
    const char* format;
    const char* name;
    bool readsBack;
    const char* readName;
    const char* warning;  // the line of the warning, "" for none
  };
  const char* kTagged =
      "1 point(s) have names longer than 8 characters and will not read back: "
      "'ABCDEFGHI'.";
  const Row rows[] = {
      {"CTL", "ABCDEFGH", true, "ABCDEFGH", ""},
      {"CTL", "ABCDEFGHI", false, "", kTagged},
      {"PAC", "ABCDEFGH", true, "ABCDEFGH", ""},
      {"PAC", "ABCDEFGHI", false, "", kTagged},
      {"PRJ", "ABCDEFGH", true, "ABCDEFGH", ""},
      {"PRJ", "ABCDEFGHI", false, "", kTagged},
      {"WSI", "ABCDEFGH", true, "ABCDEFGH", ""},
      {"WSI", "ABCDEFGHI", true, "ABCDEFGH",
       "1 point(s) had values cut to fit their columns: 'ABCDEFGHI'."},
      {"SRV", "ABCDEFGH", true, "ABCDEFGH", ""},
      {"SRV", "ABCDEFGHI", true, "ABCDEFGHI", ""},
  };
  for (const Row& r : rows) {
    SCOPED_TRACE(std::string(r.format) + " " + r.name);
    const Format& f = *std::find_if(std::begin(kFormats), std::end(kFormats), [&](const Format& x) {
      return std::string(x.name) == r.format;
    });
    ScriptedUi ui;
    WorkArea work;
    TempDir dir;
    SurveyPoint p;
    p.PointName = r.name;
    p.Northing = p.Easting = p.Elevation = 1;
    p.FeatureCode = "FE";
    p.HorizontalUnits = p.VerticalUnits = kMeters;
    work.OutputPoints = {p};
    std::string path = dir.file("out");
    ASSERT_TRUE(f.write(ui, work, path));
    if (*r.warning) {
      ASSERT_EQ(ui.boxes.size(), 1u);
      EXPECT_EQ(ui.boxes[0].title, "Check Output File");
      EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
      EXPECT_EQ(ui.boxes[0].text, "The file '" + path + "' was written, but:\r\n" + r.warning);
    } else {
      EXPECT_TRUE(ui.boxes.empty()) << ui.onlyText();
    }
    ui.boxes.clear();
    EXPECT_EQ(f.read(ui, work, path), r.readsBack);
    if (r.readsBack) {
      ASSERT_EQ(work.InputPoints.size(), 1u);
      EXPECT_EQ(work.InputPoints[0].PointName, r.readName);
    } else {
      EXPECT_NE(ui.onlyText().find("Point Name can not exceeed 8 characters."), std::string::npos);
    }
  }
}

}  // namespace
}  // namespace zv
