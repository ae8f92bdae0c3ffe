// The readers of every survey format: one table of inputs and what they read
// as (or the message they give), and the cases a table row can not hold; the
// record and list views of the listings.

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <sstream>

#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"
#include "survey/Listing.h"
#include "survey/SurveyTestSupport.h"
#include "survey/TaggedFile.h"

namespace zv {
namespace {

using namespace test;

struct ReadRow {
  const Format* format;
  std::string input;  // "@name": a fixture; "!": a missing file; else the text
  bool reads;
  // Reads: Describe() of the result, then "!title: text" per box shown; ""
  // for a fixture: the fixture's ".read" file. Fails: "title: text" of the
  // only box. '@' stands for the path.
  std::string want;
  Answer answer = Answer::Cancel;  // to a question
};

std::vector<ReadRow> ReadRows() {
  const std::string ctl =
      "Invalid VORN Control File: Invalid VORN Control File '@'.\r\nError on line ";
  const std::string pac =
      "Invalid VORN Points and Chains File: Invalid VORN Points and Chains File";
  const std::string srv = ": Invalid CAiCE SRV File '@.  An error occurred on line '";
  const std::string ngs = "Invalid NGS Data Sheet: Invalid NGS Data Sheet '@'.\r\nError on line ";
  std::string longFile = "AC:PR\r\nAC:OS\r\n";
  for (int i = 0; i < 40000; ++i) longFile += "CM:note\r\n";
  std::vector<ReadRow> rows = {
      // Control files.
      {&kCtl, "!", false, "File Not Found: The file '@' can not be found."},
      {&kCtl, "@control/computed_coordinates.CTL", false,
       ctl + "4.\r\nAn VORN Control File can not contain computed coordinates."},
      {&kCtl, "@control/blank_line.CTL", false,
       ctl + "3.\r\nAn VORN Control File can not contain blank lines."},
      {&kCtl, "@control/bad_easting.CTL", false, ctl + "5.\r\nEasting Coordinate must be numeric."},
      // Not trimmed: a blank and 8 digits are 9 characters.
      {&kCtl, "@control/long_point_name.CTL", false,
       ctl + "3.\r\nPoint Name can not exceeed 8 characters."},
      // Degrees too large for the angle routine.
      {&kCtl, "@control/angle_overflow.CTL", false, ctl + "4.\r\nLatitude must be numeric."},
      {&kCtl, longFile + "ZC:high\r\n", false,
       ctl + "40003.\r\nElevation Coordinate must be numeric."},
      {&kCtl, std::string("AC:PR\r\nPN:a\0b\r\n", 15), false,
       ctl + "2.\r\nAn VORN Control File can not contain binary data."},
      {&kCtl, "AC:PR\r\nAC:OS\r\nYC:", false, ctl + "3.\r\nNorthing Coordinate must be numeric."},
      // Minutes out of range: the angle routine's message, the value absent.
      {&kCtl, "@control/bad_angle_minutes.CTL", true, ""},
      // Without AC:PR the first AC line stores an empty first point.
      {&kCtl, "@control/no_project_section.CTL", true, ""},
      // Point tags between AC:PR and the first AC line belong to the first
      // point; unknown tags there are header lines.
      {&kCtl, "@control/tags_before_first_point.CTL", true, ""},
      // Only the first two characters of the AC value are compared.
      {&kCtl, "@control/project_prefix.CTL", true, ""},
      {&kCtl, "@control/no_ac_lines.CTL", true, ""},
      {&kCtl, "@control/empty.CTL", true, ""},
      {&kCtl, "AC:PR\r\nAC:OS\r\nPN:1\r\nYC:12", true, "H\n1 12,-,- hc\n"},
      // A lower-case unit code is unknown; the vertical unit copies the horizontal.
      {&kCtl, "@control/lowercase_units.CTL", true, ""},
      {&kCtl, "UL:i\r\nUL:I\r\n", true,
       "H u=International Feet/International Feet\n -,-,- u=International Feet/International "
       "Feet\n"},
      {&kCtl, "VD:NGVD29\r\nUL:x\r\n", true, "H vd=NGVD29\n -,-,-\n"},
      // Points and chains files.
      {&kPac, "@pac/control_coordinates.PAC", false,
       pac + " '@'.\r\nError on line 5.\r\nAn VORN Points and Chains File can not contain control "
             "coordinates."},
      {&kPac, "@pac/bad_latitude.PAC", false,
       pac + ": '@'\r\nError on Line: 4\r\nLatitude must be numeric."},
      {&kPac, "AC:PR\r\n\r\n", false,
       pac + " '@'.\r\nError on line 2.\r\nAn VORN Points and Chains File can not contain blank "
             "lines."},
      // An error estimate beyond single precision is refused, not overflowed.
      {&kPac, "SZ:1e39\r\n", false,
       pac + ": '@'\r\nError on Line: 1\r\nElevation Error Estimate must be numeric."},
      {&kPac, "YY: -12.5 \r\nSX:+0.01\r\n", true, "H\n -12.5,-,- s=-99999/0.01/-99999\n"},
      {&kPac, "@pac/chains.PAC", true, ""},
      // Only EG ends a chain section: FE and unknown lines of a later point
      // go to the open chain.
      {&kPac, "@pac/point_after_chain.PAC", true, ""},
      // AC:CH does not store the pending point; the next AC line does.
      {&kPac, "@pac/chain_keeps_pending_point.PAC", true, ""},
      {&kPac, "@pac/no_ac_lines.PAC", true, ""},
      // A stray EG adds no chain; chain lines outside a chain stay with the point.
      {&kPac, "@pac/stray_end_chain.PAC", true, ""},
      {&kPac, "@pac/chain_lines_outside_chain.PAC", true, ""},
      {&kPac, "@pac/point_before_project_section.PAC", true, ""},
      // Project files.
      {&kPrj, "@project/blank_line.PRJ", false,
       "Invalid VORN File: Invalid VORN File '@'.\r\nError on line 4.\r\nAn VORN Points and Chains "
       "File can not contain blank lines."},
      {&kPrj, "@project/bad_scale_factor.PRJ", false,
       "Invalid VORN File: Invalid VORN File: '@'\r\nError on Line: 4\r\nScale Factor must be "
       "numeric."},
      {&kPrj, "@project/record_codes.PRJ", true, ""},
      {&kPrj, "@project/mixed_flags.PRJ", true, ""},
      {&kPrj, "@project/bare_record_code.PRJ", true, ""},
      // Without a header: an empty point, then each point keeps its record
      // code although a project section follows it.
      {&kPrj, "AC:SS\r\nPN:1\r\nAC:PR\r\nCM:h\r\nAC:TP\r\nPN:2\r\n", true,
       "H hx=CM:h\n -,-,-\n1 -,-,- rc=SS\n2 -,-,- rc=TP\n"},
      // SRV files.
      {&kSrv, "!", false, "File Not Found: The file '@' can not be found."},
      {&kSrv, "P 1.0 2.0 3.0 EP 1\r\n\r\nBEGIN\r\n", false,
       "Invalid Chain Name" + srv + "3.  A chain must have a name."},
      {&kSrv, "BEGIN  A\r\n", false, "Invalid Chain Name" + srv + "1.  A chain must have a name."},
      {&kSrv, "P 1.0 N 3.0 EP 1\r\n", false,
       "Invalid Northing" + srv + "1.  The northing coordinate must be numeric."},
      {&kSrv, "P 1.0 2.0\r\n", false,
       "Invalid Elevation" + srv + "1.  The elevation must be numeric."},
      {&kSrv, "P 1.0 2.0 3.0\r\n", false,
       "Invalid Feature Code" + srv + "1.  A feature code is required."},
      {&kSrv, "# x\r\nP 1.0 2.0 3.0 EP  desc\r\n", false,
       "Invalid Point ID" + srv + "2.  A point id is required."},
      {&kSrv, "P 1.0 2.0 3.0 EP\r\n", false,
       "Invalid Point ID" + srv + "1.  A point id is required."},
      {&kSrv, "P 1.0 2.0 3.0 EP 1\r\n" + std::string("\0\0\xff\xfe", 4), false,
       "Invalid Line" + srv + "2.  The line holds binary data."},
      {&kSrv, "@srv/chains.srv", true, ""},
      // Keywords in any case; words after the id are the description;
      // coordinates without a decimal point are integer attributes; inside a
      // chain, code letters and attributes belong to the chain.
      {&kSrv, "@srv/quirks.srv", true, ""},
      // A unit line applies to the points stored after it.
      {&kSrv, "@srv/us_feet.srv", true, ""},
      {&kSrv, "BEGIN A\r\n1.5 2.5 3.5 X 1\r\nEND\r\nEND\r\nend c 4.5 5.5 6.5 Y 2\r\n", true,
       "H\n1 2.5,1.5,3.5 fe=X\n2 5.5,4.5,6.5 gm=c fe=Y\nchain n=A pl=PL:1\n"},
      // WSI files.
      {&kWsi, "!", false, "File Not Found: The file '@' can not be found."},
      {&kWsi, "@wsi/feet_units.wsi", false,
       "VORN Zurevazidu: Invalid WSI File.  Units must be metric."},
      {&kWsi,
       std::string("AC:PR\r\n\x7f"
                   "ELF\0\0\x02\r\n",
                   13),
       false, "VORN Zurevazidu: Invalid WSI File.  Line 2 holds binary data."},
      {&kWsi, "@wsi/groups.wsi", true, ""},
      {&kWsi, "@wsi/ellipsoid_heights.wsi", true, ""},
      // No rows; lines before a group's first row stay in the header.
      {&kWsi,
       "AC:PR\r\nUL:M\r\n\r\nGR:EMPTY\r\n\r\n     PT ID           X              Y              Z "
       "     REMARKS         AH  AV\r\n" +
           std::string(80, '=') + "\r\nOW:NOBODY\r\n",
       true, "H hx=OW:NOBODY u=Meters/Meters\n"},
      // A truncated row keeps what its columns hold; short lines are header lines.
      {&kWsi, "GR:A\r\n\r\nh\r\nr\r\n       101      254871.3", true,
       "H u=Meters/Meters\n101 -,254871.3,- gr=A u=Meters/Meters\n"},
      {&kWsi, "AC:PR\r\nHD\r\nU\r\n", true, "H hx=HD|U u=Meters/Meters\n"},
      // NGS data sheets.
      {&kNgs, "!", false, "File Does Not Exist: The file '@' does not exist."},
      {&kNgs, "@ngs/bad_height.ds", false, ngs + "4.\r\nOrthometric Height must be numeric."},
      {&kNgs, "@ngs/bad_latitude.ds", false, ngs + "2.\r\nLatitude must be numeric."},
      {&kNgs, "1        National Geodetic Survey,\r\n" + std::string("\x89PNG\0\x1a", 6) + "\r\n",
       false, ngs + "2.\r\nThe line holds binary data."},
      {&kNgs, "just some text\r\nwith no data sheet\r\n", false,
       "Invalid NGS Data Sheet: Invalid NGS Data Sheet '@'.\r\nThe file holds no data sheet."},
      // A datum conflict cancelled stores nothing.
      {&kNgs, "@ngs/two_datums.ds", false,
       "Horizontal Datum Conflict: A Horizontal Datum conflict exists in the file.  Point 'RT2202' "
       "does not match the Horizontal Datum of previous points in the file.  Click 'OK' to import "
       "using the previous points horizontal datum or click 'Cancel' to stop the import."},
      {&kNgs, "@ngs/cors_mark.ds", true, ""},
      // No vertical datum known on the first sheet: its GPS OBS height is left
      // out; a VERTCON height is kept with its source.
      {&kNgs, "@ngs/non_adjusted_height.ds", true, ""},
      // Accepted: the point that raised the question and later ones keep
      // their datum; a height in another vertical datum keeps its label.
      {&kNgs, "@ngs/two_datums.ds", true, "", Answer::Ok},
      // Accuracy estimates become one-sigma metres.
      {&kNgs, "@ngs/accuracy_block.ds", true, ""},
      {&kNgs, "@ngs/lines_before_first_sheet.ds", true, ""},
      // A first sheet without a position is no reason to report a conflict.
      {&kNgs, "@ngs/first_sheet_without_position.ds", true, ""},
      // A sheet start after a position is not taken as its height.
      {&kNgs, "@ngs/start_after_position.ds", true, ""},
      {&kNgs, "@ngs/truncated_accuracy.ds", true, ""},
      {&kNgs, "@ngs/angle_out_of_range.ds", true, ""},
  };
  // Every numeric tag of a points and chains file, with values that are not numbers.
  for (std::string field :
       {"XXEasting Coordinate", "YYNorthing Coordinate", "ZZElevation Coordinate",
        "SXEasting Error Estimate", "SYNorthing Error Estimate", "SZElevation Error Estimate",
        "LTLatitude", "LGLongitude", "HEEllipsoid Height", "HGGeoid Height", "CAConvergance Angle",
        "SFScale Factor"}) {
    for (const char* value : {"", "1,5", "1.2.3", "nan", "1e999"}) {
      rows.push_back(
          {&kPac, "AC:PD\r\n" + field.substr(0, 2) + ":" + value + "\r\n", false,
           pac + ": '@'\r\nError on Line: 2\r\n" + field.substr(2) + " must be numeric."});
    }
  }
  return rows;
}

TEST(SurveyReaders, ReadAsOrReportedWithTheirLine) {
  TempDir dir;
  for (const ReadRow& r : ReadRows()) {
    std::string path = r.input[0] == '@' ? Fixture(r.input.substr(1))
                       : r.input == "!"  ? dir.file("missing." + std::string(r.format->name))
                                         : dir.write("in." + std::string(r.format->name), r.input);
    SCOPED_TRACE(r.input.substr(0, 60));
    ScriptedUi ui;
    ui.answers.push_back(r.answer);
    WorkArea work;
    work.InputPoints.resize(3);
    work.InputHeader.Zone = "kept";
    EXPECT_EQ(r.format->read(ui, work, path), r.reads);
    std::string got = r.reads ? Describe(work) : "";
    for (const RecordedBox& b : ui.boxes) {
      if (b.buttons == Buttons::Ok) {
        EXPECT_EQ(b.icon, Icon::Exclamation);
      }
      got += (r.reads ? "!" : "") + b.title + ": " + b.text + (r.reads ? "\n" : "");
    }
    std::string want = r.want;
    if (r.reads && want.empty()) want = ReadFile(path + ".read");
    for (size_t at; (at = want.find('@')) != std::string::npos;) want.replace(at, 1, path);
    EXPECT_EQ(got, want);
    if (!r.reads) {
      EXPECT_EQ(ui.boxes.size(), 1u);
      EXPECT_EQ(work.InputPoints.size(), 3u);  // a failed read leaves the work area alone
      EXPECT_EQ(work.InputHeader.Zone, "kept");
    }
  }
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
    const std::string pd = r.headerPdToPoint ? " pd=PD:note" : "";
    for (SurveyPoint& p : work.InputPoints) {  // they differ by format
      p.HorizontalIsControl = p.ElevationIsControl = false;
      p.RecordCode.clear();
    }
    EXPECT_EQ(Describe(work, false),
              "A1 100,200,10 ll=45.5/- u=Meters/Meters pd=" +
                  std::string(r.headerPdToPoint ? "PD:job|PD:first" : "PD:first") +
                  "\nB1 300,-,- u=U.S. Survey Feet/U.S. Survey Feet" + pd +
                  "\nC1 500,-,- u=U.S. Survey Feet/U.S. Survey Feet\n");
    EXPECT_EQ(work.InputHeader.HeaderExtraLines, r.headerPdToPoint ? "" : "PD:job\r\nPD:note");
    EXPECT_TRUE(ui.boxes.empty());
  }
}

// Boxes shown, points and chains read.
TEST(SurveyReaders, SamplesInTheApplicationFolder) {
  for (const auto& [format, file, want] : {std::tuple(&kSrv, "sample.srv", "0 13 2"),
                                           {&kWsi, "sample.wsi", "0 12 0"},
                                           {&kNgs, "sample.ds", "0 12 0"}}) {
    ScriptedUi ui;
    WorkArea work;
    EXPECT_TRUE(format->read(ui, work, std::string(ZV_SOURCE_DIR) + "/appdata/samples/" + file));
    EXPECT_EQ(std::to_string(ui.boxes.size()) + " " + std::to_string(work.InputPoints.size()) +
                  " " + std::to_string(work.InputChains.size()),
              want)
        << file;
  }
}

TEST(SurveyReaders, ChainListDateAndRecordCodeCategory) {
  const char* old = std::getenv("TZ");
  std::string saved = old ? old : "";
  setenv("TZ", "UTC", 1);
  tzset();
  EXPECT_EQ(ChainListDate(0), "01/01/1970 0:00:00");
  EXPECT_EQ(ChainListDate(1715072703), "05/07/2024 9:05:03");
  EXPECT_EQ(ChainListDate(1734567890), "12/19/2024 0:24:50");
  old ? setenv("TZ", saved.c_str(), 1) : unsetenv("TZ");
  tzset();
  // Only the first two characters count; letter case does.
  EXPECT_EQ(RecordCodeCategory("PN:1001"), "PointID");
  EXPECT_EQ(RecordCodeCategory("BR"), "Bearing");
  EXPECT_EQ(RecordCodeCategory("ZZ"), "Math");
  EXPECT_EQ(RecordCodeCategory("pn"), "");
  EXPECT_EQ(RecordCodeCategory("P"), "");
}

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
  // A stop while reading leaves the other file as it was.
  struct Stop : RunProgress {
    void step(RunStage, std::uintmax_t, std::uintmax_t) override { throw RunCancelled{}; }
  } stop;
  EXPECT_THROW(ConvertRecordToList(dir.file("c.rec"), dir.file("c.lst"), error, &stop),
               RunCancelled);
  EXPECT_EQ(test::ReadFile(dir.file("c.lst")), test::ReadFile(Fixture("listing/control.lst")));
  EXPECT_EQ(ListingStem("/a/b.CTL.lst"), "/a/b.CTL");
  EXPECT_EQ(ListingStem("/a/b.CTL"), "/a/b.CTL");
}

}  // namespace
}  // namespace zv
