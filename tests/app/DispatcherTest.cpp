#include <gtest/gtest.h>

#include "app/AppContext.h"
#include "app/Dispatcher.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;

const std::string kCtl = "VORN Control Files (*.CTL)";
const std::string kPac = "VORN Points and Chains Files (*.PAC)";

const std::string kControl =
    CrLf({"AC:PR", "AC:OS", "PN:CP1", "YC:1000.0", "XC:2000.0", "ZC:300.5", "PD:IRON PIN", "AC:OS",
          "PN:CP2", "YC:1100.25", "XC:2050.75", "ZC:301.0"});

class DispatcherTest : public ::testing::Test {
 protected:
  DispatcherTest() : ctx(ui, dir.path()) {
    dir.write("UTIFiles/CTL2PAC.uti", CrLf({"ConvertFile", "To PAC", kCtl, kPac}));
    dir.write("UTIFiles/CTL2PRJ.uti",
              CrLf({"ConvertFile", "To PRJ", kCtl, "VORN Project Files (*.PRJ)"}));
    dir.write("UTIFiles/ODD.uti", CrLf({"Frobnicate", "Odd", kCtl, kPac}));
    dir.write("UTIFiles/SHORT.uti", CrLf({"ConvertFile", "Short"}));
    dir.write("UTIFiles/BARE.uti",
              CrLf({"ConvertFile", "To PAC", kCtl, kPac, "NO-SUCH-CODES.TRN"}));
    input = dir.write("job.ctl", kControl);
    output = dir.file("job.pac");
  }
  bool run(const std::string& def, const std::string& in, const std::string& out,
           const std::string& config = "") {
    std::string defPath = def.empty() ? "" : dir.file("UTIFiles/" + def + ".uti");
    return Translate(ctx, {defPath, in, out, config});
  }

  test::TempDir dir;
  ScriptedUi ui;
  AppContext ctx;
  std::string input;
  std::string output;
};

TEST_F(DispatcherTest, ConvertsControlToPointsAndChains) {
  ASSERT_TRUE(run("CTL2PAC", input, output)) << ui.onlyText();
  EXPECT_TRUE(ui.boxes.empty());
  std::string pac = ReadFile(output);
  EXPECT_NE(pac.find("AC:PD\r\nPN:CP1\r\nYY:1000.0000\r\nXX:2000.0000\r\nZZ:300.5000\r\n"),
            std::string::npos)
      << pac;
  EXPECT_NE(pac.find("PN:CP2\r\nYY:1100.2500\r\nXX:2050.7500\r\nZZ:301.0000\r\n"),
            std::string::npos);
}

TEST_F(DispatcherTest, ChecksComeInOrderWithTheirMessages) {
  EXPECT_FALSE(run("NOPE", input, output));
  EXPECT_FALSE(run("CTL2PAC", dir.file("missing.ctl"), output));
  ASSERT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.boxes[0].text, "The specified translation file '" + dir.file("UTIFiles/NOPE.uti") +
                                  "' does not exist.");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
  EXPECT_EQ(ui.boxes[1].text,
            "The specified input file '" + dir.file("missing.ctl") + "' does not exist.");

  ui.boxes.clear();
  EXPECT_FALSE(run("CTL2PAC", input, output, dir.file("none.trn")));
  EXPECT_EQ(ui.onlyText(),
            "The specified Translation/Filter file '" + dir.file("none.trn") + "' does not exist.");
}

TEST_F(DispatcherTest, AnsweringNoKeepsTheExistingOutput) {
  dir.write("job.pac", "precious\r\n");
  ui.answers.push_back(Answer::No);
  EXPECT_FALSE(run("CTL2PAC", input, output));
  EXPECT_EQ(ui.onlyText(),
            "The specified output file '" + output + "' already exists.  Overwrite it?");
  EXPECT_EQ(ui.boxes[0].buttons, Buttons::YesNo);
  EXPECT_EQ(ui.boxes[0].icon, Icon::None);
  EXPECT_EQ(ReadFile(output), "precious\r\n");

  ui.answers.push_back(Answer::Yes);
  EXPECT_TRUE(run("CTL2PAC", input, output));
  EXPECT_NE(ReadFile(output).find("PN:CP1"), std::string::npos);
}

TEST_F(DispatcherTest, FailingReaderEndsTheRunAndTheOutputSurvives) {
  dir.write("job.pac", "precious\r\n");
  std::string bad = dir.write("bad.ctl", CrLf({"AC:PR", "AC:OS", "PN:CP1", "", "YC:1"}));
  ui.answers.push_back(Answer::Yes);
  EXPECT_FALSE(run("CTL2PAC", bad, output));
  ASSERT_EQ(ui.boxes.size(), 2u);  // the question and the reader's own message
  EXPECT_EQ(ui.boxes[1].text, "Invalid VORN Control File '" + bad +
                                  "'.\r\nError on line 4.\r\nAn VORN Control File can not "
                                  "contain blank lines.");
  EXPECT_EQ(ReadFile(output), "precious\r\n");
}

TEST_F(DispatcherTest, RoutinesAndTypesThatCannotRunSaySo) {
  EXPECT_FALSE(run("ODD", input, output));
  EXPECT_EQ(ui.boxes.back().text, "Unknown Translation Routine. Could not perform translation.");
  EXPECT_EQ(ui.boxes.back().title, "Unknown Routine");

  EXPECT_FALSE(run("CTL2PRJ", input, dir.file("job.prj")));
  EXPECT_EQ(ui.boxes.back().text, "Can not convert to VORN Project Files (*.PRJ)");
  EXPECT_EQ(ui.boxes.back().title, "Invalid Format");
  EXPECT_FALSE(test::TempDir().path().empty());

  EXPECT_FALSE(run("SHORT", input, output));
  EXPECT_NE(ui.boxes.back().text.find("at least four lines"), std::string::npos);
}

TEST_F(DispatcherTest, BareConfigurationNameResolvesAgainstTheCurrentFolder) {
  EXPECT_FALSE(run("BARE", input, output));
  EXPECT_EQ(ui.onlyText(),
            "The specified Translation/Filter file 'NO-SUCH-CODES.TRN' does not exist.");
}

TEST_F(DispatcherTest, ExchangeNamesAreCaseSensitive) {
  EXPECT_FALSE(Translate(ctx, {"", "TCCIN.TMP", "tccout.tmp", ""}));
  EXPECT_EQ(ui.onlyText(), "The specified translation file '' does not exist.");
  EXPECT_TRUE(IsExchangeCall({"", "tccin.tmp", "tccout.tmp", ""}));
  EXPECT_FALSE(IsExchangeCall({"", "./tccin.tmp", "tccout.tmp", ""}));
}

}  // namespace
}  // namespace zv
