// Whole-file reprojection through the built program with -t, checked point by
// point against PROJ: Wisconsin Central (U.S. survey feet, NAD 83) to UTM
// zone 16 north (metres).

#include <gtest/gtest.h>
#include <proj.h>
#include <sys/wait.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>

#include "platform/ScriptedUi.h"
#include "support/TempDir.h"
#include "survey/SurveyFiles.h"

namespace zv {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;

// PROJ from one EPSG system to another, easting first.
class Transform {
 public:
  Transform(const char* from, const char* to) {
    PJ* raw = proj_create_crs_to_crs(ctx_, from, to, nullptr);
    pj_ = proj_normalize_for_visualization(ctx_, raw);
    proj_destroy(raw);
  }
  ~Transform() {
    proj_destroy(pj_);
    proj_context_destroy(ctx_);
  }
  Transform(const Transform&) = delete;
  Transform& operator=(const Transform&) = delete;
  PJ_XY operator()(double x, double y) const {
    return proj_trans(pj_, PJ_FWD, proj_coord(x, y, 0, 0)).xy;
  }

 private:
  PJ_CONTEXT* ctx_ = proj_context_create();
  PJ* pj_ = nullptr;
};

class ReprojectTest : public ::testing::Test {
 protected:
  ReprojectTest() {
    const std::string shipped = ZV_APP_DIR;
    for (const char* name : {"zurevazidu", "zones.ini", "datums.ini", "ellipsoids.ini"})
      fs::copy(shipped + "/" + name, app.file(name));
    for (const char* folder : {"UTIFiles", "TRNFiles", "samples"})
      fs::copy(shipped + "/" + folder, app.file(folder), fs::copy_options::recursive);
  }
  // Runs one -t translation; the exit status, with standard error beside.
  int run(const std::string& fields, std::string& err) {
    const std::string cmd = "cd '" + app.path() + "' && ZUREVAZIDU_UI=console ./zurevazidu '-t|" +
                            fields + "' </dev/null >/dev/null 2>'" + app.file(".err") + "'";
    const int raw = std::system(cmd.c_str());
    err = ReadFile(app.file(".err"));
    return WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
  }
  test::TempDir app;
};

TEST_F(ReprojectTest, ControlFileAgreesWithProjToTheMillimetre) {
  // A grid of points over the zone, placed through PROJ from latitudes and longitudes.
  const Transform toWisconsin("EPSG:4269", "EPSG:2288");
  std::string ctl = test::CrLf({"PR:Reprojection check", "AC:PR", "CS:State Plane 1983",
                                "ZN:Wisconsin Central 4802", "HD:NAD 83", "VD:NAVD 88", "UL:F"});
  std::vector<PJ_XY> feet;
  for (double lat = 43.8; lat <= 45.6; lat += 0.3) {
    for (double lon = -92.6; lon <= -87.6; lon += 0.5) {
      const PJ_XY p = toWisconsin(lon, lat);
      feet.push_back(p);
      char point[160];
      std::snprintf(point, sizeof point,
                    "AC:OS\r\nPN:P%zu\r\nYC:%.4f\r\nXC:%.4f\r\nZC:1000.0000\r\n", feet.size(), p.y,
                    p.x);
      ctl += point;
    }
  }
  app.write("job.ctl", ctl);
  std::string err;
  ASSERT_EQ(run("CTLREPROJ|job.ctl|utm.ctl|TRNFiles/UTM16N-METRES.TRN", err), 0) << err;
  EXPECT_EQ(err, "");

  ScriptedUi ui;
  WorkArea work;
  ASSERT_TRUE(ReadControlFile(ui, work, app.file("utm.ctl")));
  EXPECT_EQ(work.InputHeader.ProjectLine, "PR:Reprojection check");
  EXPECT_EQ(work.InputHeader.CoordinateSystem + "|" + work.InputHeader.Zone + "|" +
                work.InputHeader.HorizontalDatum + "|" + work.InputHeader.VerticalDatum,
            "UTM NAD 83|Zone 16N|NAD 83|NAVD 88");
  const Transform toUtm("EPSG:2288", "EPSG:26916");
  ASSERT_EQ(work.InputPoints.size(), feet.size());
  for (size_t i = 0; i < feet.size(); ++i) {
    const SurveyPoint& p = work.InputPoints[i];
    const PJ_XY expected = toUtm(feet[i].x, feet[i].y);
    SCOPED_TRACE(p.PointName);
    char name[24];
    std::snprintf(name, sizeof name, "P%zu", i + 1);
    EXPECT_EQ(p.PointName, name);
    EXPECT_NEAR(p.Northing, expected.y, 0.001);
    EXPECT_NEAR(p.Easting, expected.x, 0.001);
    EXPECT_NEAR(p.Elevation, 1000.0 * 1200.0 / 3937.0, 0.0001);
  }
}

TEST_F(ReprojectTest, PointsAndChainsKeepTheirChainsAndRefusedSettingsNameTheirKey) {
  std::string err;
  ASSERT_EQ(run("PACREPROJ|samples/sample.pac|utm.pac|TRNFiles/UTM16N-METRES.TRN", err), 0) << err;
  const std::string in = ReadFile(app.file("samples/sample.pac"));
  const std::string out = ReadFile(app.file("utm.pac"));
  const std::string chains = "AC:CH";
  ASSERT_NE(out.find(chains), std::string::npos) << out;
  EXPECT_EQ(out.substr(out.find(chains), out.rfind("CP:") - out.find(chains)),
            in.substr(in.find(chains), in.rfind("CP:") - in.find(chains)));
  EXPECT_NE(out.find("ZN:Zone 16N\r\n"), std::string::npos);

  // A settings file without the output zone: refused, nothing written.
  std::string settings = ReadFile(app.file("TRNFiles/UTM16N-METRES.TRN"));
  settings.replace(settings.find("Output Zone=Zone 16N"), 20, "Output Zone=");
  app.write("nozone.TRN", settings);
  EXPECT_EQ(run("PACREPROJ|samples/sample.pac|none.pac|nozone.TRN", err), 1);
  EXPECT_NE(err.find("exclamation: Zone Required\nYou must specify the output Zone.\n"
                     "Key \"Output Zone\" of section \"Coordinate Conversion\""),
            std::string::npos)
      << err;
  EXPECT_FALSE(fs::exists(app.file("none.pac")));
}

}  // namespace
}  // namespace zv
