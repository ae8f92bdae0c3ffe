#include <gtest/gtest.h>

#include <sstream>

#include "platform/ScriptedUi.h"
#include "platform/TextIo.h"
#include "support/Boxes.h"
#include "support/TempDir.h"
#include "tools/SearchReplace.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::Take;
using test::TempDir;

const std::string kFixtures = ZV_FIXTURES "/replace/";

// Runs commands over input lines in memory; the output, or "<failed>".
std::string Filter(ScriptedUi& ui, const std::vector<std::string>& commands,
                   const std::vector<std::string>& input) {
  std::istringstream in(CrLf(input));
  std::istringstream cmd(CrLf(commands));
  std::string out;
  if (!SearchAndReplaceStreams(ui, in, cmd, out, "in.ctl", "cmd.TRN")) return "<failed>";
  return out;
}

std::string Arith(ScriptedUi& ui, std::string value, std::string operand, std::string category,
                  char op) {
  auto r = ApplyArithmetic(ui, value, operand, category, op);
  return r ? *r : "<none>";
}

class SearchReplaceFile : public ::testing::Test {
 protected:
  TempDir dir;
  ScriptedUi ui;
  std::string out = dir.file("out.ctl");
};

TEST_F(SearchReplaceFile, WorkedExampleAndAnInvalidCommandThatWritesNothing) {
  ASSERT_TRUE(SearchAndReplace(ui, kFixtures + "worked-example.ctl", out,
                               kFixtures + "worked-example.TRN"));
  EXPECT_TRUE(ui.boxes.empty());
  EXPECT_EQ(ReadFile(out), ReadFile(kFixtures + "worked-example.expected"));
  dir.write("out.ctl", "old contents\r\n");
  EXPECT_FALSE(SearchAndReplace(ui, kFixtures + "worked-example.ctl", out,
                                kFixtures + "invalid-middle.TRN"));
  EXPECT_EQ(Take(ui),
            "E Invalid Search and Replace Command: Invalid TRN.  The line 'ZC +1' is "
            "invalid.\r\nError on line 4.\r\nThe first word must begin with a tag such as PN:.");
  EXPECT_EQ(ReadFile(out), "old contents\r\n");
}

TEST_F(SearchReplaceFile, MissingFilesAreReportedInputFirst) {
  const std::string input = dir.file("in.ctl"), trn = dir.file("cmd.TRN");
  for (const std::string& missing : {input, trn}) {
    EXPECT_FALSE(SearchAndReplace(ui, input, out, trn));
    EXPECT_EQ(Take(ui), "E File Not Found: The file '" + missing + "' can not be found.");
    dir.write("in.ctl", "PN:1\r\n");
  }
  EXPECT_FALSE(FileExists(out));
}

TEST_F(SearchReplaceFile, OutputMayReplaceTheInput) {
  std::string file = dir.write("same.ctl", "PN:1\nPN:2\n");
  std::string trn = dir.write("c.TRN", "PN: +1\n");
  ASSERT_TRUE(SearchAndReplace(ui, file, file, trn));
  EXPECT_EQ(ReadFile(file), CrLf({"PN:2", "PN:3"}));
  std::string bad = dir.file("missing-folder/out.ctl");
  EXPECT_FALSE(SearchAndReplace(ui, file, bad, trn));
  EXPECT_NE(ui.onlyText().find(bad), std::string::npos);
}

TEST_F(SearchReplaceFile, ShippedCommandFilesRunOnTheSample) {
  const std::string app = ZV_SOURCE_DIR "/appdata/";
  for (auto [trn, before, after] :
       {std::tuple{"RENUMBER1000.TRN", "\r\nPN:CP100\r\n", "\r\nPN:CP1100\r\n"},
        std::tuple{"ELEVSHIFT.TRN", "\r\nZC:1102.3400\r\n", "\r\nZC:1101.99\r\n"},
        std::tuple{"FEATCODES.TRN", "\r\nFE:CTLMON\r\n", "\r\nFE:CONTROL\r\n"}}) {
    ASSERT_TRUE(SearchAndReplace(ui, app + "samples/sample.ctl", out, app + "TRNFiles/" + trn))
        << trn << ": " << ui.onlyText();
    EXPECT_TRUE(ui.boxes.empty()) << trn;
    ASSERT_NE(ReadFile(app + "samples/sample.ctl").find(before), std::string::npos) << trn;
    EXPECT_NE(ReadFile(out).find(after), std::string::npos) << trn;
  }
}

TEST(SearchReplaceCommands, ReplacementFormsInOrder) {
  ScriptedUi ui;
  // A second word that is not a tag word replaces the whole line by text.
  EXPECT_EQ(Filter(ui, {"PN:17 18"}, {"PN:17", "PN:170"}), CrLf({"18", "PN:170"}));
  // The blank ends the search value: OAK, never "OAK TREE".
  EXPECT_EQ(Filter(ui, {"FE:OAK TREE FE:PINE"}, {"FE:OAK TREE", "FE:OAK"}),
            CrLf({"FE:OAK TREE", "TREE", "FE:PINE"}));
  // One word and a blank: matching lines become empty lines.
  EXPECT_EQ(Filter(ui, {"CM:OLD "}, {"CM:OLD", "CM:OLDER"}), CrLf({"", "CM:OLDER"}));
  // Matching is exact and case-sensitive, on the whole rest of the line.
  EXPECT_EQ(Filter(ui, {"FE:tree FE:X"}, {"FE:TREE", "fe:tree", "FE:tree "}),
            CrLf({"FE:TREE", "fe:tree", "FE:tree "}));
  // A tag word as the first replacement word is taken as it is; two blanks
  // give an empty word.
  EXPECT_EQ(Filter(ui, {"GM:P CM:A  B"}, {"GM:P"}), CrLf({"CM:A  B"}));
  // Later commands see earlier results. The replaced entry is one entry: its tag is tested and its
  // whole rest, line break included, compared.
  EXPECT_EQ(Filter(ui, {"FE:A FE:B CM:x", "FE:B FE:C", "CM:x FE:Z"}, {"FE:A", "FE:B"}),
            CrLf({"FE:B", "CM:x", "FE:C"}));
  EXPECT_EQ(Filter(ui, {"PN:1 PN:5", "PN: *10"}, {"PN:1", "PN:2"}), CrLf({"PN:50", "PN:20"}));
  // Empty lines do not reach the output.
  EXPECT_EQ(Filter(ui, {"", "PN: +1", ""}, {"", "PN:1", "", "", "XC:5"}), CrLf({"PN:2", "XC:5"}));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(SearchReplaceCommands, InvalidCommandsNameLineAndReason) {
  const std::pair<std::string, std::string> cases[] = {
      {"PN17 18", "The first word must begin with a tag such as PN:."},
      {"PN: +1x", "The operand after the operator must be a number."},
      {"PN: +", "The operand after the operator must be a number."},
      {"PN: +1 more", "An arithmetic command must have exactly two words."},
      {"FE: +1", "The tag FE: takes no arithmetic."},
      {"P: +1", "The tag P: takes no arithmetic."},
      {"CM:OLD",
       "The command has no replacement text (end it with a blank to replace the line by an "
       "empty line)."},
      {"XC: /0", "The command divides by zero."},
      {"AZ: /0.0000", "The command divides by zero."},
      {"AZ: +1.6000", "The operand is not a packed angle (DDD.MMSSssss)."},
  };
  for (const auto& [command, reason] : cases) {
    ScriptedUi ui;
    EXPECT_EQ(Filter(ui, {"PN: +1", command}, {"PN:1"}), "<failed>") << command;
    const std::string boxes = Take(ui);  // an angle operand first shows its own message
    EXPECT_TRUE(boxes.ends_with("E Invalid Search and Replace Command: Invalid TRN.  The line '" +
                                command + "' is invalid.\r\nError on line 2.\r\n" + reason))
        << boxes;
  }
}

// "value|operand|category and operator|result", "<none>" for no result. PointID
// halves go to even; an angle operand 0.30 is thirty minutes; products and
// quotients of seconds combine the two values in radians.
TEST(SearchReplaceArithmetic, ResultsByCategory) {
  std::istringstream table(
      "17|1000|PointID+|1017;A9|1000|PointID+|A1009;X|1000|PointID+|X;007|1|PointID+|8;"
      "CP12|5|PointID-|CP7;CP2|5|PointID-|CP-3;P5|2|PointID/|P2;P7|2|PointID/|P4;"
      "1.5|0|PointID+|2;-99999|5|PointID+|-99999;-99999|5|Angle+|-99999;"
      "-99999|5|Bearing+|-99999;-99999|5|Seconds+|-99999;-99999|5|Math+|-99999;"
      "359.3000|1|Angle+|0.30000;10.0000|1|Angle-|9.00000;10.0000|20|Angle-|-10.00000;"
      "180.0000|180|Angle+|360.00000;10.0000|0.30|Angle+|10.30000;10.0000|0.3|Angle+|10.03000;"
      "12.6000|1|Angle+|<none>;N10.0000E|100|Bearing+|S70.00000E;"
      "N10.0000W|20|Bearing+|N10.00000E;S10.0000E|20|Bearing+|S10.00000W;"
      "S10.0000W|20|Bearing+|S30.00000W;S80.0000W|20|Bearing+|N80.00000W;"
      "N10.0000E|20|Bearing-|N10.00000W;N45.0000E|45|Bearing+|N90.00000E;"
      "S45.0000E|45|Bearing+|S0.00000E;S45.0000W|45|Bearing+|N90.00000W;"
      "N45.0000W|45|Bearing+|N0.00000E;NE|1|Bearing+|<none>;X10.0000E|1|Bearing+|<none>;"
      "N10.0000|1|Bearing+|<none>;Nabc.0000E|1|Bearing+|<none>;N10.6000E|1|Bearing+|<none>;"
      "12.25|0.5|Seconds-|11.750;-1|0.5|Seconds+|-0.500;0.25|0.5|Seconds+|0.750;"
      "3600|3600|Seconds*|62.832;7200|3600|Seconds/|412529.612;100|1|Math+|101;3|2|Math/|1.5;"
      "-1.25|2|Math-|-3.25;0.1|0.2|Math+|0.3;1|1e15|Math*|1E+15;1|100000|Math/|1E-05;"
      " 5 |1|Math+|6;abc|1|Math+|<none>;1e308|10|Math*|<none>;");
  for (std::string row; std::getline(table, row, ';');) {
    std::vector<std::string> f(1);
    for (char c : row) c == '|' ? f.emplace_back(), void() : f.back().push_back(c);
    ScriptedUi ui;
    EXPECT_EQ(Arith(ui, f[0], f[1], f[2].substr(0, f[2].size() - 1), f[2].back()), f[3]) << row;
    // Unreadable angles and bearings have their own message.
    EXPECT_TRUE(ui.boxes.empty() || (f[3] == "<none>" && f[2][0] != 'M')) << row;
  }
  ScriptedUi ui;
  EXPECT_EQ(Arith(ui, "ABCDEFG9", "1", "PointID", '+'), "ABCDEFG9");
  EXPECT_EQ(Arith(ui, "1", "1e300", "PointID", '*'), "1");
  EXPECT_EQ(Take(ui),
            "E Invalid Point ID: Point ID Assignment Error.\nE Invalid Point ID: Point ID "
            "Assignment Error.");
  // The tagged writers put absent grid coordinates as -99999.0000.
  EXPECT_EQ(Filter(ui, {"YC: +1000"}, {"YC:-99999.0000", "YC:5"}),
            CrLf({"YC:-99999.0000", "YC:1005"}));
  EXPECT_EQ(Filter(ui, {"PN: +1"}, {"PN:9", "", "PN:ABCDEFG9", "PN:10"}),
            CrLf({"PN:10", "PN:ABCDEFG9", "PN:11"}));
  EXPECT_EQ(ui.onlyText(), "Point ID Assignment Error.\r\nError on line 3.");
}

TEST(SearchReplaceRefusals, EmptyFilesAndValuesThatCannotBeUsedStopTheRun) {
  ScriptedUi ui;
  EXPECT_EQ(Filter(ui, {"", ""}, {"PN:1"}), "<failed>");
  EXPECT_EQ(Filter(ui, {"PN: +1"}, {"", ""}), "<failed>");
  EXPECT_EQ(ui.boxes.at(0).text + "|" + ui.boxes.at(1).text,
            "Invalid TRN.  The file 'cmd.TRN' holds no commands.|"
            "The file 'in.ctl' holds no lines.");
  ui.boxes.clear();
  EXPECT_EQ(Filter(ui, {"XC: +1"}, {"XC:1", "XC:n/a"}), "<failed>");
  EXPECT_EQ(Take(ui),
            "E Invalid Search and Replace Value: The command 'XC: +1' can not be applied to line 2 "
            "of 'in.ctl':\r\nXC:n/a\r\nThe value is not a number.");
  EXPECT_EQ(Filter(ui, {"AZ: +1"}, {"AZ:10.6000"}), "<failed>");
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
  EXPECT_NE(ui.boxes[0].text.find("\r\nError on line 1."), std::string::npos);
  EXPECT_NE(ui.boxes[1].text.find("The value is not a packed angle (DDD.MMSSssss)."),
            std::string::npos);
}

}  // namespace
}  // namespace zv
