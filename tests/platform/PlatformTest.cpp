// The platform layer: console boxes, numbers, profile files and text files.

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <charconv>
#include <cmath>
#include <filesystem>
#include <random>
#include <sstream>

#include "platform/ConsoleUi.h"
#include "platform/Numbers.h"
#include "platform/Profile.h"
#include "platform/TextIo.h"
#include "support/TempDir.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;
using test::CrLf;
using test::ReadFile;
using test::TempDir;
using V = std::vector<std::string>;

struct Console {
  explicit Console(const std::string& answers) : in(answers), ui(in, out, err) {}
  std::istringstream in;
  std::ostringstream out, err;
  ConsoleUi ui;
};

TEST(ConsoleUiTest, LayoutAnswersAndTheirSafeDefaults) {
  Console c(" YES\r\n");
  c.ui.message("Invalid VORN Control File 'x'.\r\nError on line 4.", Icon::Exclamation, Buttons::Ok,
               "Invalid VORN Control File");
  c.ui.inform("Incorrect Number of Command Line Arguments.", "");
  EXPECT_EQ(c.ui.message("Overwrite?", Icon::None, Buttons::YesNo, "T"), Answer::Yes);
  EXPECT_EQ(c.err.str(),
            "exclamation: Invalid VORN Control File\nInvalid VORN Control File 'x'.\n"
            "Error on line 4.\n\n"
            "information: VORN Zurevazidu\nIncorrect Number of Command Line Arguments.\n\n"
            "none: T\nOverwrite?\n\n[Yes/No]? ");
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
  TempDir dir;
  std::string path = dir.write("Convert.out", "CODE1\r\nCODE2\r\n");
  c.ui.viewText(path, "Out File (*.OUT)");
  EXPECT_EQ(c.out.str(), "view: Out File (*.OUT): " + path + "\nCODE1\nCODE2\n");
}

TEST(NumbersTest, NumericTextAndFixedFormats) {
  for (const char* ok : {"0", "-1", "+2.5", " 12.3456 ", ".5", "5.", "1e3", "-2.5E-04", "\t7"})
    EXPECT_TRUE(IsNumeric(ok)) << ok;
  for (const char* bad :
       {"", " ", "-", ".", "1.2.3", "12a", "1e", "1,000", "--1", "0x10", "nan", "inf", "1 2"})
    EXPECT_FALSE(IsNumeric(bad)) << bad;
  EXPECT_DOUBLE_EQ(*ToNumber(" -12.25 "), -12.25);
  EXPECT_DOUBLE_EQ(*ToNumber("+3"), 3.0);
  EXPECT_FALSE(ToNumber("1e999").has_value());
  EXPECT_DOUBLE_EQ(*ToNumber("1e-999"), 0.0);

  // Rounded, never a negative zero; plain decimals expand exponents.
  const std::pair<std::string, std::string> cases[] = {
      {FormatFixed(1234.56786, 4), "1234.5679"},
      {FormatFixed(-0.25, 4), "-0.2500"},
      {FormatFixed(-0.00001, 4), "0.0000"},
      {FormatFixed(-99999, 4), "-99999.0000"},
      {FormatFixed(2.0, 0), "2"},
      {FormatPadded(5.25, 2, 4), "05.2500"},
      {FormatPadded(-5.25, 2, 1), "-05.2"},  // the sign stays in front
      {FormatGrouped(1234567.891, 2), "1,234,567.89"},
      {FormatGrouped(-999.5, 0), "-1,000"},
      {FormatGrouped(12.0, 1), "12.0"},
      {FormatPlainDecimal(0.0033528106647474805), "0.0033528106647474805"},
      {FormatPlainDecimal(1e-7), "0.0000001"},
      {FormatPlainDecimal(1e21), "1000000000000000000000"},
      {FormatPlainDecimal(-0.0), "0"},
      {FormatPlainDecimal(12.5), "12.5"},
  };
  for (const auto& [got, expected] : cases) EXPECT_EQ(got, expected);
}

// The fast fixed formatting must give the text of the exact decimal expansion.
TEST(NumbersTest, FastFixedMatchesExactRoundingIncludingTies) {
  std::mt19937_64 rng(12345);
  std::uniform_real_distribution<double> any(-1e7, 1e7);
  std::uniform_int_distribution<int> places(0, 9);
  auto exact = [](double v, int d) {
    char buf[400];
    auto res = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::fixed, d);
    std::string text(buf, res.ptr);
    if (text.front() == '-' && text.find_first_of("123456789") == std::string::npos)
      text.erase(0, 1);
    return text;
  };
  for (int i = 0; i < 200000; ++i) {
    double v = any(rng);
    int d = places(rng);
    ASSERT_EQ(FormatFixed(v, d), exact(v, d)) << v << " " << d;
    // Values on or next to a decimal tie of the last place.
    double tie = std::round(v * 1e3) / 1e3 + 0.0005;
    ASSERT_EQ(FormatFixed(tie, 3), exact(tie, 3)) << tie;
    ASSERT_EQ(FormatFixed(std::nextafter(tie, 0.0), 3), exact(std::nextafter(tie, 0.0), 3));
    double back = 0;
    std::string text = exact(v, d);
    std::from_chars(text.data(), text.data() + text.size(), back);
    ASSERT_EQ(RoundToDecimals(v, d), back) << v << " " << d;
  }
  EXPECT_EQ(FormatFixed(0.125, 2), exact(0.125, 2));
  EXPECT_EQ(FormatFixed(2.5, 0), exact(2.5, 0));
  EXPECT_EQ(FormatFixed(1e300, 2).size(), 304u);
}

TEST(ProfileTest, NamesIgnoreLetterCaseValuesDoNot) {
  TempDir dir;
  std::string ini = dir.write("zones.ini",
                              "[State Plane 1983~North]\nFull Name = North Zone \n"
                              "Show In=\n[Other]\nkey=Value\n");
  EXPECT_EQ(ReadProfileValue(ini, "state plane 1983~NORTH", "full name", "x"), "North Zone");
  EXPECT_EQ(ReadProfileValue(ini, "State Plane 1983~North", "Show In", "1"), "1");   // empty
  EXPECT_EQ(ReadProfileValue(ini, "State Plane 1983~North", "Show Out", "1"), "1");  // missing
  EXPECT_EQ(ReadProfileValue(ini, "Missing", "key", "dflt"), "dflt");
  EXPECT_EQ(ReadProfileValue(dir.file("none.ini"), "Other", "key", "d"), "d");
  EXPECT_EQ(ReadProfileSectionsText(ini), std::string("State Plane 1983~North\0Other\0", 29));
}

TEST(ProfileTest, WritesUpdateInPlaceAppendAndKeepFileOrder) {
  TempDir dir;
  std::string ini = dir.write("d.ini", CrLf({"; catalog", "[NAD 27]", "Type=Horizontal",
                                             "Show In=1", "", "[NAVD 88]", "Type=Vertical"}));
  // The edits themselves are the document's (CatalogStoreTest); here they reach the file.
  ASSERT_TRUE(WriteProfileValue(ini, "nad 27", "TYPE", "3D"));
  ASSERT_TRUE(WriteProfileValue(ini, "NGVD 29", "Type", "Vertical"));
  ASSERT_TRUE(DeleteProfileSection(ini, "navd 88"));
  EXPECT_EQ(ReadFile(ini), CrLf({"; catalog", "[NAD 27]", "TYPE=3D", "Show In=1", "", "[NGVD 29]",
                                 "Type=Vertical"}));
  ASSERT_TRUE(DeleteProfileSection(ini, "never there"));
  EXPECT_FALSE(WriteProfileValue(dir.file("no/such/folder/x.ini"), "S", "k", "v"));

  // The limits of a value and of the section list: 1200 names of 30
  // characters overflow the 30000-character list.
  ASSERT_TRUE(WriteProfileValue(ini, "S", "long", std::string(26000, 'x')));
  EXPECT_EQ(ReadProfileValue(ini, "S", "long", "").size(), kProfileValueLimit);
  std::string many;
  for (int i = 0; i < 1200; ++i)
    many += "[Section number " + std::to_string(100000 + i) + " padding.]\r\nk=v\r\n";
  ini = dir.write("many.ini", many);
  EXPECT_LE(ReadProfileSectionsText(ini).size() + 1, kProfileSectionsLimit);
  EXPECT_EQ(ReadProfileSections(ini).size(), 967u);
}

V Lines(const std::string& text) {
  std::istringstream in(text);
  LineReader reader(in);
  V lines;
  std::string_view line;
  while (reader.next(line)) lines.emplace_back(line);
  return lines;
}

TEST(TextIoTest, ReadsCrLfLfAndCrAloneSkipsAUtf8MarkAndKnowsUtf16) {
  const std::pair<std::string, V> cases[] = {
      {"a\r\nb\nc", {"a", "b", "c"}},
      {"a\r\n\r\nb\r\n", {"a", "", "b"}},
      {"", {}},
      {"x\r", {"x"}},
      {"n\0ul\n"s, {"n\0ul"s}},
      {"PN:1\rPN:2\r\rPN:3", {"PN:1", "PN:2", "", "PN:3"}},
      {"a\rb\nc\r\nd\n\re", {"a", "b", "c", "d", "", "e"}},
      {"\xEF\xBB\xBFPN:1\r\n\xEF\xBB\xBF", {"PN:1", "\xEF\xBB\xBF"}},
      // A CR LF split between two reads is one line end.
      {std::string((64 << 10) - 1, 'q') + "\r\nz", {std::string((64 << 10) - 1, 'q'), "z"}},
      // Lines longer than the read chunk stay whole.
      {"a\n" + std::string(3 << 20, 'q') + "\r\nz", {"a", std::string(3 << 20, 'q'), "z"}},
  };
  for (const auto& [text, lines] : cases) EXPECT_EQ(Lines(text), lines) << text.substr(0, 20);
  // Long files without LF stay fast: a million CR lines.
  std::string many;
  for (int i = 0; i < 1000000; ++i) many += "PN:1\r";
  EXPECT_EQ(Lines(many).size(), 1000000u);

  for (const std::string& wide :
       {"\xFF\xFEP"s, "\xFE\xFF"s, "P\0N\0:\0001\0\r\0\n\0"s, "\0P\0N\0:"s})
    EXPECT_TRUE(LooksLikeUtf16(wide)) << wide;
  EXPECT_FALSE(LooksLikeUtf16("PN:1\r\n"));
  EXPECT_FALSE(LooksLikeUtf16("\0\0\0\0ab"s));  // binary, not text
  std::istringstream in("\xFF\xFEP\0"s);
  EXPECT_TRUE(LineReader(in).isUtf16());
}

size_t Entries(const std::string& folder) {
  return static_cast<size_t>(std::distance(fs::directory_iterator(folder), {}));
}

// Writes one line to path in a child process that then gets the signal;
// returns the signal that ended the child.
int WriteAndGetSignal(const std::string& path, int sig) {
  pid_t pid = ::fork();
  if (pid == 0) {
    TextFileWriter writer(path);
    if (writer.open()) {
      writer.line("half");
      ::kill(::getpid(), sig);
    }
    ::_exit(0);
  }
  int status = 0;
  ::waitpid(pid, &status, 0);
  return WIFSIGNALED(status) ? WTERMSIG(status) : 0;
}

// A file is replaced only on commit; a write that is abandoned or killed
// leaves the old file and no temporary file.
TEST(TextIoTest, WriterUsesCrLfAndReplacesOnlyOnCommit) {
  TempDir dir;
  const std::string path = dir.write("out.txt", "old\r\n");
  {
    TextFileWriter writer(path);
    ASSERT_TRUE(writer.open());
    writer.line("one");
  }
  EXPECT_EQ(ReadFile(path), "old\r\n");
  for (int sig : {SIGINT, SIGTERM, SIGHUP}) EXPECT_EQ(WriteAndGetSignal(path, sig), sig);
  EXPECT_EQ(Entries(dir.path()), 1u);
  // SIGKILL leaves the temporary file; the next write of the same file
  // removes it, that of another file does not.
  EXPECT_EQ(WriteAndGetSignal(path, SIGKILL), SIGKILL);
  EXPECT_EQ(Entries(dir.path()), 2u);
  ASSERT_TRUE(WriteTextLines(dir.file("other.txt"), {"x"}));
  EXPECT_EQ(Entries(dir.path()), 3u);
  ASSERT_TRUE(WriteTextLines(path, {"one", "two"}));
  EXPECT_EQ(Entries(dir.path()), 2u);
  EXPECT_EQ(ReadFile(path), "one\r\ntwo\r\n");

  // The longest file name the system takes can still be written.
  const std::string longName = dir.file(std::string(255, 'n'));
  ASSERT_TRUE(WriteTextLines(longName, {"x"}));
  EXPECT_EQ(ReadFile(longName), "x\r\n");
  std::string error;
  EXPECT_FALSE(WriteTextLines(dir.file("missing/dir/x.txt"), {"a"}, &error));
  EXPECT_FALSE(error.empty());
}

TEST(TextIoTest, OnlyRegularFilesAreReplaced) {
  TempDir dir;
  const std::string fifo = dir.file("pipe");
  ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
  fs::create_directory(dir.file("folder"));
  fs::create_symlink(fifo, dir.file("link"));
  for (const char* name : {"pipe", "folder", "link"}) {
    std::string error;
    EXPECT_FALSE(WriteTextLines(dir.file(name), {"x"}, &error)) << name;
    EXPECT_EQ(error, kNotRegularFile);
  }
  EXPECT_TRUE(fs::is_fifo(fifo));
  EXPECT_TRUE(fs::is_symlink(dir.file("link")));
  EXPECT_EQ(Entries(dir.path()), 3u);
}

}  // namespace
}  // namespace zv
