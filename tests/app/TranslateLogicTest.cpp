#include <gtest/gtest.h>

#include <filesystem>
#include <sstream>

#include "app/AppContext.h"
#include "app/TranslateLogic.h"
#include "platform/ConsoleUi.h"
#include "platform/Error.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::Boxes;
using test::CrLf;
using test::ReadFile;

const std::string kCtl = "VORN Control Files (*.CTL)";
const std::string kPac = "VORN Points and Chains Files (*.PAC)";
const std::string kPrj = "VORN Project Files (*.PRJ)";

const std::string kControl =
    CrLf({"AC:PR", "AC:OS", "PN:CP1", "YC:1000.0", "XC:2000.0", "ZC:300.5", "FE:TREE", "AC:OS",
          "PN:CP2", "YC:1100.25", "XC:2050.75", "ZC:301.0", "FE:POLE"});

class TranslateLogicTest : public ::testing::Test {
 protected:
  TranslateLogicTest() : ctx(ui, dir.path()), logic(ctx) {
    // Loaded in file-name order.
    def("A1", {"ConvertFile", "To PAC", kCtl, kPac});
    def("A2", {"ConvertFile", "To PRJ", kCtl, kPrj});
    def("A3", {"Replace", "Filter", kCtl, kCtl, "CODES.TRN"});
    def("A4", {"ConvertFile", "Copy", kCtl, kCtl});
    def("B1", {"ConvertFile", "To CTL", kPac, kCtl});
    def("B2", {"CoordConvert", "Batch", kPac, kCtl});
    def("B3", {"Replace", "Bare filter", kPac, kPac});
    def("C1", {"SinglePoint", "One point", kManualEntryType, kManualEntryType});
    dir.write("TRNFiles/CODES.TRN", CrLf({"FE:TREE FE:OAK"}));
    input = dir.write("data/job.ctl", kControl);
    ctx.startup.defaultInputFolder = dir.file("data/");
    ctx.startup.defaultOutputFolder = dir.file("out/");
    ctx.startup.configurationFolder = dir.file("TRNFiles");
    std::filesystem::create_directories(dir.file("out"));
  }
  void def(const std::string& name, const std::vector<std::string>& lines) {
    dir.write("UTIFiles/" + name + ".uti", CrLf(lines));
  }
  // Selects the three entries by name and fills the location boxes.
  void choose(const std::string& in, const std::string& out, const std::string& action,
              const std::string& from = "", const std::string& to = "") {
    logic.selectInputType(logic.inputTypes.find(in));
    logic.selectOutputType(logic.outputTypes.find(out));
    logic.selectAction(logic.actions.find(action));
    if (!from.empty()) logic.input.text = from;
    if (!to.empty()) logic.output.text = dir.file(to);
  }

  // "inputs / outputs / actions / enabled boxes configuration", types by
  // their extension and the selected entries starred.
  std::string state() const {
    auto list = [](const ChoiceList& l) {
      std::string all;
      for (int i = 0; i < int(l.items.size()); ++i) {
        const std::string& item = l.items[i];
        const size_t ext = item.find("(*.");
        all += std::string(i ? "," : "") + (i == l.selected ? "*" : "") +
               (ext == std::string::npos ? item : item.substr(ext + 3, 3));
      }
      return all;
    };
    return list(logic.inputTypes) + " / " + list(logic.outputTypes) + " / " + list(logic.actions) +
           " /" + (logic.input.enabled ? " in" : "") + (logic.output.enabled ? " out" : "") +
           (logic.configuration.enabled ? " config" : "") +
           (logic.configuration.text.empty() ? "" : " " + logic.configuration.text) +
           (logic.storeDefault ? " default" : "");
  }

  test::TempDir dir;
  ScriptedUi ui;
  AppContext ctx;
  TranslateLogic logic;
  std::string input;
};

TEST(ChoiceListTest, FillDropsEmptyAndRepeatedEntriesAndConsoleGoesBelow) {
  ChoiceList list;
  list.fill("B||A|B|C||A|");
  EXPECT_EQ(list.items, (std::vector<std::string>{"B", "A", "C"}));
  EXPECT_EQ(list.selected, -1);
  // The tool console is centred below the window: 100 + 300.5 rounded, less half of 640.
  EXPECT_EQ(ConsoleBelow({100, 50, 601, 400}).left, 81);
  EXPECT_EQ(ConsoleBelow({100, 50, 601, 400}).top, 450);
}

TEST_F(TranslateLogicTest, ListsCascadeFromTheCatalogue) {
  ASSERT_TRUE(logic.load());
  EXPECT_TRUE(ui.boxes.empty());
  const std::string manual = kManualEntryType;
  // Filling a list selects its first entry, which fills the list below.
  EXPECT_EQ(state(), "*CTL,PAC," + manual + " / *PAC,PRJ,CTL / *To PAC / in out");
  logic.selectOutputType(logic.outputTypes.find(kCtl));
  // A bare configuration name is found in TRNFiles.
  EXPECT_EQ(state(), "*CTL,PAC," + manual + " / PAC,PRJ,*CTL / *Filter,Copy / in out config " +
                         dir.file("TRNFiles/CODES.TRN") + " default");
  logic.selectAction(logic.actions.find("Copy"));
  EXPECT_EQ(state(), "*CTL,PAC," + manual + " / PAC,PRJ,*CTL / Filter,*Copy / in out");
  // Another input type starts the cascade again and resets the configuration.
  logic.selectAction(logic.actions.find("Filter"));
  logic.selectInputType(logic.inputTypes.find(kPac));
  EXPECT_EQ(state(), "CTL,*PAC," + manual + " / *CTL,PAC / *To CTL,Batch / in out");

  // Manual entry has no locations and skips the file checks: its routine
  // goes to the Coordinate Conversion dialog (none without a display).
  logic.selectInputType(logic.inputTypes.find(kManualEntryType));
  EXPECT_EQ(state(), "CTL,PAC,*" + manual + " / *" + manual + " / *One point /");
  EXPECT_EQ(logic.input.text + logic.output.text, "");
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(Boxes(ui),
            "E VORN Zurevazidu: The Coordinate Conversion dialog needs a display "
            "(DISPLAY or WAYLAND_DISPLAY).");
}

TEST_F(TranslateLogicTest, PresetsProposeFolderStemAndExtension) {
  ctx.startup.fileStem = "job";
  // The extension in either letter case; the exact spelling first.
  ASSERT_TRUE(logic.load());
  EXPECT_EQ(logic.input.text, dir.file("data/job.ctl"));
  dir.write("data/job.CTL", kControl);
  logic.selectInputType(0);
  EXPECT_EQ(logic.input.text, dir.file("data/job.CTL"));
  // No out/job.PAC: the folder alone.
  EXPECT_EQ(logic.output.text, dir.file("out/"));
  dir.write("out/job.CTL", "x");
  logic.selectOutputType(logic.outputTypes.find(kCtl));
  EXPECT_EQ(logic.output.text, dir.file("out/job.CTL"));
}

TEST_F(TranslateLogicTest, ChecksComeInOrderEachWithItsMessage) {
  ASSERT_TRUE(logic.load());
  choose(kCtl, kCtl, "Filter");
  // Everything wrong at first; each step mends one thing.
  logic.inputTypes.selected = logic.outputTypes.selected = logic.actions.selected = -1;
  logic.input.text = logic.output.text = "";
  logic.configuration.text = dir.file("TRNFiles/NONE.TRN");
  const std::string output = dir.file("out/job.CTL");
  const std::pair<std::function<void()>, std::string> steps[] = {
      {[] {}, "You must select an input type"},
      {[&] { logic.inputTypes.selected = 0; }, "You must enter an input file location and name."},
      {[&] { logic.input.text = dir.file("data/"); }, "The specified input file does not exist."},
      {[&] { logic.input.text = input; }, "You must select an output type"},
      {[&] { logic.outputTypes.selected = logic.outputTypes.find(kCtl); },
       "You must enter an output file location and name."},
      {[&] { logic.output.text = dir.file("DATA/JOB.ctl"); },
       "The input and output files can not be the same."},
      {[&] { logic.output.text = output; }, "You must select an action type"},
      {[&] { logic.actions.selected = logic.actions.find("Filter"); },
       "The specified translation/filter file does not exist."},
  };
  for (const auto& [mend, message] : steps) {
    ui.boxes.clear();
    mend();
    EXPECT_FALSE(logic.translate());
    EXPECT_EQ(Boxes(ui), (message.starts_with("The input and output") ? "E Incompatible Files: "
                                                                      : "E VORN Zurevazidu: ") +
                             message);
  }
  EXPECT_FALSE(std::filesystem::exists(output));
}

// Two spellings of one file must not let the output replace the input.
TEST_F(TranslateLogicTest, RefusesTwoNamesOfTheSameFile) {
  ASSERT_TRUE(logic.load());
  choose(kCtl, kCtl, "Copy", input, "data/../data/./job.ctl");
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(ui.onlyText(), "The input and output files can not be the same.");
  std::filesystem::create_symlink(input, dir.file("out/link.ctl"));
  logic.output.text = dir.file("out/link.ctl");
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(ReadFile(input), kControl);
}

TEST_F(TranslateLogicTest, ConvertFileRunsAndReportsCompletion) {
  ASSERT_TRUE(logic.load());
  choose(kCtl, kPac, "To PAC", input, "out/job.pac");
  ctx.work.ConversionOptionsActive = true;
  int longRuns = 0;
  logic.setLongRunner([&](const std::function<bool()>& work) {
    ++longRuns;
    return work();
  });
  ASSERT_TRUE(logic.translate()) << ui.onlyText();
  EXPECT_EQ(longRuns, 1);
  EXPECT_FALSE(ctx.work.ConversionOptionsActive);
  EXPECT_EQ(Boxes(ui), "I Conversion Complete: Conversion Complete.");
  EXPECT_NE(ReadFile(dir.file("out/job.pac")).find("PN:CP2\r\n"), std::string::npos);
  EXPECT_TRUE(ui.editors.empty());

  // With the view flag the output opens in a viewer; a second OK overwrites
  // without a question.
  ctx.startup.viewOutput = true;
  ASSERT_TRUE(logic.translate());
  EXPECT_EQ(ui.boxes.size(), 2u);
  EXPECT_EQ(ui.editors,
            (std::vector<std::string>{"viewer: " + kPac + ": " + dir.file("out/job.pac")}));
}

TEST_F(TranslateLogicTest, RunFailuresNameTheirCause) {
  ASSERT_TRUE(logic.load());
  choose(kCtl, kPrj, "To PRJ", input, "out/job.prj");
  EXPECT_FALSE(logic.translate());
  EXPECT_FALSE(std::filesystem::exists(dir.file("out/job.prj")));
  choose(kPac, kCtl, "Batch", input, "out/job.CTL");
  EXPECT_FALSE(logic.translate());
  // Errors raised during a run are shown with their source.
  choose(kCtl, kPac, "To PAC", input, "out/job.pac");
  logic.setLongRunner([](const std::function<bool()>&) -> bool {
    throw ZvError(13, "Type mismatch", "modAngles.Angles_PackedToRadians");
  });
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(Boxes(ui), "E Invalid Format: Can not convert to " + kPrj +
                           "\nE VORN Zurevazidu: Could not perform translation.\n"
                           "E modAngles.Angles_PackedToRadians: Type mismatch");
}

TEST_F(TranslateLogicTest, ReplaceChecksItsConfigurationAndStoresTheDefault) {
  ASSERT_TRUE(logic.load());
  // A "Replace" definition without a default configuration file.
  const std::string pac = dir.write("data/job.pac", CrLf({"AC:PD", "PN:CP1"}));
  choose(kPac, kPac, "Bare filter", pac, "out/job.pac");
  EXPECT_FALSE(logic.configuration.enabled);
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(ui.onlyText(), "You must specify a configuration file to use for this translation.");
  logic.configuration.text = dir.file("TRNFiles/NONE.TRN");
  ui.boxes.clear();
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(ui.onlyText(), "The specified configuration file does not exist.");

  ui.boxes.clear();
  choose(kCtl, kCtl, "Filter", input, "out/job.CTL");
  // A browsed file clears the "default" box: the definition keeps its default.
  const std::string other = dir.write("elsewhere/OTHER.TRN", CrLf({"FE:POLE FE:MAST"}));
  ui.files.push_back(other);
  logic.browseConfiguration();
  EXPECT_EQ(logic.configuration.text, other);
  EXPECT_FALSE(logic.storeDefault);
  ui.boxes.clear();
  ASSERT_TRUE(logic.translate()) << ui.onlyText();
  EXPECT_EQ(ui.onlyText(), "Translation Complete.");
  EXPECT_NE(ReadFile(dir.file("out/job.CTL")).find("FE:MAST\r\n"), std::string::npos);
  EXPECT_EQ(ReadFile(dir.file("UTIFiles/A3.uti")),
            CrLf({"Replace", "Filter", kCtl, kCtl, "CODES.TRN"}));

  // Ticked again, the file becomes the definition's default.
  logic.storeDefault = true;
  ASSERT_TRUE(logic.translate());
  EXPECT_EQ(ReadFile(dir.file("UTIFiles/A3.uti")), CrLf({"Replace", "Filter", kCtl, kCtl, other}));
}

TEST_F(TranslateLogicTest, CancelRecordsTheDefinitionTheNextStartOpensOn) {
  ASSERT_TRUE(logic.load());
  choose(kCtl, kCtl, "Copy", input, "out/copy.ctl");
  ASSERT_TRUE(logic.translate());
  logic.cancel();
  EXPECT_EQ(ReadFile(dir.file("Quorvane.cfg")), CrLf({dir.file("UTIFiles/A4.uti")}));

  // The next start opens on it; on the first entries once it is gone.
  for (const std::string& opened : {kCtl, kPac}) {
    AppContext next(ui, dir.path());
    TranslateLogic again(next);
    ASSERT_TRUE(again.load());
    EXPECT_EQ(again.inputTypes.current() + again.outputTypes.current() + again.actions.current(),
              kCtl + opened + (opened == kCtl ? "Copy" : "To PAC"));
    std::filesystem::remove(dir.file("UTIFiles/A4.uti"));
  }
}

TEST_F(TranslateLogicTest, BrowseAndEditButtons) {
  def("D1", {"ConvertFile", "Flex", "User-Defined ASCII Files (*.*)", kCtl});
  ASSERT_TRUE(logic.load());
  ui.files = {dir.file("data/picked.ctl"), std::nullopt};
  logic.browseInput();
  EXPECT_EQ(logic.input.text, dir.file("data/picked.ctl"));
  logic.browseOutput();  // cancelled: nothing changes
  EXPECT_EQ(logic.output.text, dir.file("out/"));
  logic.selectInputType(logic.inputTypes.find("User-Defined ASCII Files (*.*)"));
  logic.browseInput();
  std::string dialogs;
  for (const auto& d : ui.fileDialogs)
    dialogs += d.title + (d.kind == FileDialogKind::Save ? " (save) " : " ") + d.filter + " " +
               d.folder + "\n";
  EXPECT_EQ(dialogs, "Select the Input File: " + kCtl + "|*.CTL " + dir.file("data/") +
                         "\nOutput to File: (save) " + kPac + "|*.PAC " + dir.file("out/") +
                         "\nSelect the Input File: User-Defined ASCII Files (*.*)|*.* " +
                         dir.file("data/") + "\n");

  // Configuration files open in the editor.
  logic.configuration.text = dir.file("TRNFiles/NONE.TRN");
  logic.editConfiguration();
  EXPECT_EQ(ui.onlyText(), "The file '" + dir.file("TRNFiles/NONE.TRN") + "' does not exist.");
  logic.configuration.text = dir.file("TRNFiles/CODES.TRN");
  logic.editConfiguration();
  logic.newConfiguration();
  EXPECT_EQ(ui.editors, (std::vector<std::string>{"editor: Translation/Filter File (*.TRN): " +
                                                      dir.file("TRNFiles/CODES.TRN"),
                                                  "editor: Translation/Filter Files (*.TRN): "}));
}

// Without a display the dialogs say what they need and change nothing.
TEST_F(TranslateLogicTest, ConsoleCannotBrowseOrEditButCanView) {
  std::istringstream in;
  std::ostringstream out, err;
  ConsoleUi console(in, out, err);
  AppContext consoleCtx(console, dir.path());
  TranslateLogic consoleLogic(consoleCtx);
  ASSERT_TRUE(consoleLogic.load());
  consoleLogic.input.text = "typed";
  consoleLogic.browseInput();
  EXPECT_EQ(consoleLogic.input.text, "typed");
  consoleLogic.newConfiguration();
  EXPECT_EQ(err.str(),
            "exclamation: VORN Zurevazidu\n"
            "The file dialog \"Select the Input File:\" needs a display.\n\n"
            "exclamation: VORN Zurevazidu\nThe text editor needs a display.\n\n");
  EXPECT_TRUE(console.openEditor(input, kCtl, EditorMode::Viewer));
  EXPECT_EQ(out.str().substr(0, out.str().find('\n')), "view: " + kCtl + ": " + input);
}

TEST_F(TranslateLogicTest, NoDefinitionsLeaveTheListsEmpty) {
  std::filesystem::remove_all(dir.file("UTIFiles"));
  EXPECT_FALSE(logic.load());
  EXPECT_TRUE(logic.inputTypes.items.empty());
  EXPECT_FALSE(logic.translate());
  EXPECT_EQ(Boxes(ui),
            "C VORN Zurevazidu: No valid translations were found!\n"
            "E VORN Zurevazidu: You must select an input type");
  EXPECT_EQ(TranslateLogic::Caption(), "VORN Zurevazidu - " + std::to_string(kVersionMajor) + "." +
                                           std::to_string(kVersionMinor) + "." +
                                           std::to_string(kVersionRevision));
}

}  // namespace
}  // namespace zv
