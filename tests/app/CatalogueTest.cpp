#include <gtest/gtest.h>

#include "app/Catalogue.h"
#include "support/TempDir.h"

namespace zv {
namespace {

using test::CrLf;
using test::ReadFile;
using test::TempDir;

const std::string kCtl = "VORN Control Files (*.CTL)";
const std::string kPac = "VORN Points and Chains Files (*.PAC)";
const std::string kSrv = "CAiCE SRV Files (*.SRV)";

class CatalogueTest : public ::testing::Test {
 protected:
  void def(const std::string& name, const std::vector<std::string>& lines) {
    dir.write("UTIFiles/" + name + ".uti", CrLf(lines));
  }
  TempDir dir;
  Catalogue cat;
};

TEST_F(CatalogueTest, QueriesKeepCatalogueOrderAndLastMatchWins) {
  def("a", {"ConvertFile", "Copy", kCtl, kCtl});
  def("b", {"ConvertFile", "To PAC", kCtl, kPac, "CODES.TRN"});
  def("c", {"Replace", "To PAC", kCtl, kPac, "/filters/x.trn"});
  def("d", {"ConvertFile", "Back", kPac, kCtl});
  ASSERT_TRUE(cat.load(dir.path()));

  EXPECT_EQ(cat.query("Input"), kCtl + "|" + kCtl + "|" + kCtl + "|" + kPac + "|");
  EXPECT_EQ(cat.query("Output", kCtl), kCtl + "|" + kPac + "|" + kPac + "|");
  EXPECT_EQ(cat.query("Action", kCtl, kPac), "To PAC|To PAC|");
  EXPECT_EQ(cat.query("Action", kCtl, kSrv), "");
  EXPECT_EQ(cat.query("input"), "");  // keywords are case-sensitive

  // Two definitions equal in the three fields: the later one runs.
  EXPECT_EQ(cat.query("ConfigFile", kCtl, kPac, "To PAC"), "/filters/x.trn");
  EXPECT_EQ(cat.query("Program", kCtl, kPac, "To PAC"), "Replace");
  EXPECT_EQ(cat.currentIndex(), 2);
  EXPECT_EQ(cat.query("Program", kCtl, kSrv, "To PAC"), "");
  EXPECT_EQ(cat.currentIndex(), 2);  // a failed query leaves the current one
}

TEST_F(CatalogueTest, BareConfigNameIsMadeAbsoluteShortFilesAreSkipped) {
  def("bare", {"Replace", "Filter", kCtl, kCtl, "CODES.TRN"});
  def("four", {"ConvertFile", "Copy", kPac, kPac});
  def("short", {"ConvertFile", "Broken", kCtl});
  dir.write("UTIFiles/notes.txt", "not a definition\r\n");
  ASSERT_TRUE(cat.load(dir.path()));
  ASSERT_EQ(cat.definitions().size(), 2u);
  EXPECT_EQ(cat.definitions()[0].ConfigFile, dir.path() + "/TRNFiles/CODES.TRN");
  EXPECT_EQ(cat.definitions()[1].ConfigFile, "");
}

TEST_F(CatalogueTest, EmptyFolderLoadsNothing) {
  EXPECT_FALSE(cat.load(dir.path()));
}

TEST_F(CatalogueTest, LastUsedRoundTripAndDefaultConfigurationUpdate) {
  def("a", {"ConvertFile", "Copy", kCtl, kCtl});
  def("b", {"ConvertFile", "To PAC", kCtl, kPac, "CODES.TRN"});
  ASSERT_TRUE(cat.load(dir.path()));
  EXPECT_EQ(cat.readLastUsed(dir.path()), "");  // no file yet

  // Nothing chosen: the first definition is written.
  ASSERT_TRUE(cat.writeLastUsed(dir.path()));
  EXPECT_EQ(ReadFile(dir.file("Quorvane.cfg")), dir.file("UTIFiles/a.uti") + "\r\n");

  cat.query("Program", kCtl, kPac, "To PAC");
  ASSERT_TRUE(cat.writeLastUsed(dir.path()));
  Catalogue again;
  ASSERT_TRUE(again.load(dir.path()));
  EXPECT_EQ(again.readLastUsed(dir.path()), kCtl + "|" + kPac + "|To PAC");
  EXPECT_EQ(again.currentIndex(), 1);

  ASSERT_TRUE(again.updateDefaultConfiguration("/filters/new.trn"));
  EXPECT_EQ(ReadFile(dir.file("UTIFiles/b.uti")),
            CrLf({"ConvertFile", "To PAC", kCtl, kPac, "/filters/new.trn"}));

  // A last-used file naming a definition that is gone is ignored.
  dir.write("Quorvane.cfg", "/nowhere/x.uti\r\n");
  Catalogue third;
  ASSERT_TRUE(third.load(dir.path()));
  EXPECT_EQ(third.readLastUsed(dir.path()), "");
  EXPECT_EQ(third.currentIndex(), 0);
}

TEST(DefaultPathTest, ProposesStemWhenTheFileExists) {
  TempDir dir;
  std::string folder = dir.path() + "/";
  dir.write("JOB7.CTL", "AC:PR\r\n");
  EXPECT_EQ(DefaultPath(folder, "JOB7", kCtl), folder + "JOB7.CTL");
  EXPECT_EQ(DefaultPath(folder, "JOB7", "VORN Project Files (*.PRJ)"), folder);
  dir.write("job8.pac", "AC:PR\r\n");
  EXPECT_EQ(DefaultPath(folder, "job8", "VORN Points and Chains Files (*.PAC)"),
            folder + "job8.pac");
  EXPECT_EQ(DefaultPath(folder, "JOB8", "VORN Points and Chains Files (*.PAC)"), folder);
  EXPECT_EQ(TypeExtension("VORN Project Files (*.PRJ)"), ".PRJ");
}

}  // namespace
}  // namespace zv
