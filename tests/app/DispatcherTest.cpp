// The catalogue of translation definitions and the unattended dispatcher.

#include <gtest/gtest.h>

#include <array>
#include <filesystem>

#include "app/AppContext.h"
#include "app/Catalogue.h"
#include "app/Dispatcher.h"
#include "platform/ScriptedUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;

const std::string kCtl = "VORN Control Files (*.CTL)";
const std::string kPac = "VORN Points and Chains Files (*.PAC)";
const std::string kPrj = "VORN Project Files (*.PRJ)";

class CatalogueTest : public ::testing::Test {
 protected:
  std::string def(const std::string& name, const std::vector<std::string>& lines) {
    return dir.write("UTIFiles/" + name + ".uti", CrLf(lines));
  }
  test::TempDir dir;
  Catalogue cat;
};

TEST_F(CatalogueTest, QueriesKeepCatalogueOrderAndLastMatchWins) {
  def("a", {"ConvertFile", "Copy", kCtl, kCtl});
  def("b", {"ConvertFile", "To PAC", kCtl, kPac, "CODES.TRN"});
  def("c", {"Replace", "To PAC", kCtl, kPac, "/filters/x.trn"});
  def("d", {"ConvertFile", "Back", kPac, kCtl});
  def("short", {"ConvertFile", "Broken", kCtl});
  dir.write("UTIFiles/notes.txt", "not a definition\r\n");
  ASSERT_TRUE(cat.load(dir.path()));
  ASSERT_EQ(cat.definitions().size(), 4u);
  // A bare configuration name is taken from TRNFiles.
  EXPECT_EQ(cat.definitions()[1].ConfigFile, dir.path() + "/TRNFiles/CODES.TRN");
  EXPECT_EQ(cat.definitions()[0].ConfigFile, "");

  EXPECT_EQ(cat.query("Input"), kCtl + "|" + kCtl + "|" + kCtl + "|" + kPac + "|");
  EXPECT_EQ(cat.query("Output", kCtl), kCtl + "|" + kPac + "|" + kPac + "|");
  EXPECT_EQ(cat.query("Action", kCtl, kPac), "To PAC|To PAC|");
  EXPECT_EQ(cat.query("Action", kCtl, kPrj), "");
  EXPECT_EQ(cat.query("input"), "");  // keywords are case-sensitive

  // Two definitions equal in the three fields: the later one runs.
  EXPECT_EQ(cat.query("ConfigFile", kCtl, kPac, "To PAC"), "/filters/x.trn");
  EXPECT_EQ(cat.query("Program", kCtl, kPac, "To PAC"), "Replace");
  EXPECT_EQ(cat.currentIndex(), 2);
  EXPECT_EQ(cat.query("Program", kCtl, kPrj, "To PAC"), "");
  EXPECT_EQ(cat.currentIndex(), 2);  // a failed query leaves the current one

  // Nothing chosen yet: the first definition is the last used one.
  Catalogue fresh;
  ASSERT_TRUE(fresh.load(dir.path()));
  ASSERT_TRUE(fresh.writeLastUsed(dir.path()));
  EXPECT_EQ(ReadFile(dir.file("Quorvane.cfg")), dir.file("UTIFiles/a.uti") + "\r\n");
}

TEST_F(CatalogueTest, DefaultPathProposesTheStemOnlyWhenTheFileExists) {
  const std::string folder = dir.path() + "/";
  dir.write("JOB7.CTL", "AC:PR\r\n");
  dir.write("job8.pac", "AC:PR\r\n");
  const std::tuple<const char*, std::string, std::string> cases[] = {
      {"JOB7", kCtl, folder + "JOB7.CTL"},
      {"JOB7", kPrj, folder},
      {"job8", kPac, folder + "job8.pac"},
      {"JOB8", kPac, folder},
  };
  for (const auto& [stem, type, expected] : cases) {
    EXPECT_EQ(DefaultPath(folder, stem, type), expected) << stem << " " << type;
  }
  EXPECT_EQ(TypeExtension(kPrj), ".PRJ");
}

class DispatcherTest : public CatalogueTest {
 protected:
  DispatcherTest() : ctx(ui, dir.path()) {
    def("CTL2PAC", {"ConvertFile", "To PAC", kCtl, kPac});
    def("CTL2PRJ", {"ConvertFile", "To PRJ", kCtl, kPrj});
    def("ODD", {"Frobnicate", "Odd", kCtl, kPac});
    def("SHORT", {"ConvertFile", "Short"});
    def("BARE", {"ConvertFile", "To PAC", kCtl, kPac, "NO-SUCH-CODES.TRN"});
  }
  bool run(const std::string& def, const std::string& in, const std::string& out,
           const std::string& config = "") {
    return Translate(ctx, {dir.file("UTIFiles/" + def + ".uti"), in, out, config});
  }
  ScriptedUi ui;
  AppContext ctx;
  std::string input = dir.write(
      "job.ctl", CrLf({"AC:PR", "AC:OS", "PN:CP1", "YC:1000.0", "XC:2000.0", "ZC:300.5"}));
  std::string output = dir.file("job.pac");
};

TEST_F(DispatcherTest, RefusalsComeInOrderWithTheirMessages) {
  const std::array<std::string, 6> cases[] = {
      {"NOPE", input, output, "",
       "The specified translation file '" + dir.file("UTIFiles/NOPE.uti") + "' does not exist.",
       "VORN Zurevazidu"},
      {"CTL2PAC", dir.file("missing.ctl"), output, "",
       "The specified input file '" + dir.file("missing.ctl") + "' does not exist.",
       "VORN Zurevazidu"},
      {"CTL2PAC", input, output, dir.file("none.trn"),
       "The specified Translation/Filter file '" + dir.file("none.trn") + "' does not exist.",
       "VORN Zurevazidu"},
      // A bare configuration name resolves against the current folder.
      {"BARE", input, output, "",
       "The specified Translation/Filter file 'NO-SUCH-CODES.TRN' does not exist.",
       "VORN Zurevazidu"},
      {"ODD", input, output, "", "Unknown Translation Routine. Could not perform translation.",
       "Unknown Routine"},
      {"CTL2PRJ", input, dir.file("job.prj"), "", "Can not convert to " + kPrj, "Invalid Format"},
  };
  for (const auto& [def, in, out, config, text, title] : cases) {
    ui.boxes.clear();
    EXPECT_FALSE(run(def, in, out, config)) << text;
    ASSERT_EQ(ui.onlyText(), text);
    EXPECT_TRUE(ui.boxes[0].title == title && ui.boxes[0].icon == Icon::Exclamation) << text;
  }
  ui.boxes.clear();
  EXPECT_FALSE(run("SHORT", input, output));
  EXPECT_NE(ui.onlyText().find("at least four lines"), std::string::npos);
  EXPECT_FALSE(std::filesystem::exists(output));
  EXPECT_TRUE(run("CTL2PAC", input, output)) << ui.onlyText();
  EXPECT_NE(ReadFile(output).find("PN:CP1\r\nYY:1000.0000\r\nXX:2000.0000\r\nZZ:300.5000\r\n"),
            std::string::npos);
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

TEST_F(DispatcherTest, ExchangeNamesAreCaseSensitive) {
  EXPECT_FALSE(Translate(ctx, {"", "TCCIN.TMP", "tccout.tmp", ""}));
  EXPECT_EQ(ui.onlyText(), "The specified translation file '' does not exist.");
  EXPECT_TRUE(IsExchangeCall({"", "tccin.tmp", "tccout.tmp", ""}));
  EXPECT_FALSE(IsExchangeCall({"", "./tccin.tmp", "tccout.tmp", ""}));
}

}  // namespace
}  // namespace zv
