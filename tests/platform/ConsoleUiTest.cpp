#include <gtest/gtest.h>

#include <sstream>

#include "platform/ConsoleUi.h"
#include "support/TempDir.h"

namespace zv {
namespace {

struct Console {
  explicit Console(const std::string& answers) : in(answers), ui(in, out, err) {}
  std::istringstream in;
  std::ostringstream out, err;
  ConsoleUi ui;
};

TEST(ConsoleUiTest, MessageLayoutFollowsTheContract) {
  Console c("");
  c.ui.message("Invalid VORN Control File 'x'.\r\nError on line 4.", Icon::Exclamation, Buttons::Ok,
               "Invalid VORN Control File");
  c.ui.inform("Incorrect Number of Command Line Arguments.", "");
  EXPECT_EQ(c.err.str(),
            "exclamation: Invalid VORN Control File\nInvalid VORN Control File 'x'.\n"
            "Error on line 4.\n\n"
            "information: VORN Zurevazidu\nIncorrect Number of Command Line Arguments.\n\n");
}

TEST(ConsoleUiTest, AnswersAndTheirSafeDefaults) {
  Console yes(" YES\r\n");
  EXPECT_EQ(yes.ui.message("Overwrite?", Icon::None, Buttons::YesNo, "T"), Answer::Yes);
  EXPECT_NE(yes.err.str().find("none: T\nOverwrite?\n\n[Yes/No]? "), std::string::npos);
  const std::tuple<const char*, Buttons, Answer> cases[] = {
      {"", Buttons::YesNo, Answer::No},  // end of input
      {"", Buttons::YesNoCancel, Answer::Cancel},
      {"maybe\nperhaps\nwhat\ny\n", Buttons::YesNo, Answer::No},  // three unreadable answers
      {"x\nc\n", Buttons::OkCancel, Answer::Cancel},
      {"o\n", Buttons::OkCancel, Answer::Ok},
      {"c\nn\n", Buttons::YesNo, Answer::No},  // Cancel is not offered on Yes/No
  };
  for (const auto& [answers, buttons, expected] : cases) {
    Console c(answers);
    EXPECT_EQ(c.ui.message("Q", Icon::None, buttons, "T"), expected) << answers;
  }
}

TEST(ConsoleUiTest, InputBoxAndTextViewer) {
  Console c("12a\r\n");
  EXPECT_EQ(c.ui.input("Upper limit point number:", "Enter Point Number", ""), "12a");
  EXPECT_EQ(c.err.str(), "input: Enter Point Number\nUpper limit point number:\n> ");
  EXPECT_FALSE(c.ui.input("again", "T", "").has_value());  // end of input is Cancel

  test::TempDir dir;
  std::string path = dir.write("Convert.out", "CODE1\r\nCODE2\r\n");
  c.ui.viewText(path, "Out File (*.OUT)");
  EXPECT_EQ(c.out.str(), "view: Out File (*.OUT): " + path + "\nCODE1\nCODE2\n");
}

}  // namespace
}  // namespace zv
