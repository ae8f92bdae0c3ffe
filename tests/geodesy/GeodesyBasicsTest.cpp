// Angles and units, ellipsoids, and the projection forms on the cases the
// PROJ oracle (tests/oracle) does not reach: it checks every shipped zone
// over its area of use, forward and inverse.

#include <gtest/gtest.h>

#include <array>
#include <cmath>
#include <functional>
#include <limits>

#include "geodesy/Angles.h"
#include "geodesy/Ellipsoids.h"
#include "geodesy/Projection.h"
#include "platform/Error.h"
#include "platform/ScriptedUi.h"
#include "support/Boxes.h"

namespace zv {
namespace {

constexpr double kDeg = kDegreesToRadians;

double Dms(double d, double m = 0, double s = 0) {
  return (d + m / 60 + s / 3600) * kDeg;
}

// The error a call throws (number 0 when it throws none).
ZvError Thrown(const std::function<void()>& fn) {
  try {
    fn();
  } catch (const ZvError& e) {
    return e;
  }
  return ZvError(0, "", "");
}

TEST(AnglesParse, EveryFormat) {
  const std::tuple<const char*, std::string, double> cases[] = {
      {"45 30 15.25", kFormatDMS, Dms(45, 30, 15.25)},
      {"45.301525", kFormatPacked, Dms(45, 30, 15.25)},
      {"45.5042361111111", kFormatDecimal, Dms(45, 30, 15.25)},
      {"45 30.2541666666667", kFormatDM, Dms(45, 30, 15.25)},
      {"-0 30 00", kFormatDMS, -Dms(0, 30, 0)},
      {"-0 30.0", kFormatDM, -Dms(0, 30, 0)},
      {"-0.3000", kFormatPacked, -Dms(0, 30, 0)},
      {"-45.3000", kFormatPacked, -Dms(45, 30, 0)},
      {"45.3", kFormatPacked, Dms(45, 3, 0)},
      {"45.305", kFormatPacked, Dms(45, 30, 0)},
      {"45", kFormatPacked, Dms(45, 0, 0)},
      {"45.30152", kFormatPacked, Dms(45, 30, 15.2)},
      {"88.2000000000", kFormatPacked, Dms(88, 20, 0)},
      {"45 59 59.9999999999999", kFormatDMS, Dms(45, 59, 59.9999999999999)},
      {"400 0 0", kFormatDMS, Dms(400, 0, 0)},  // degrees are not limited
  };
  ScriptedUi ui;
  for (const auto& [text, format, expected] : cases)
    EXPECT_NEAR(Angles_TextToRadians(ui, text, format), expected, 1e-15) << text;
  // Rounded to 15 significant digits in decimal degrees, then the factor.
  EXPECT_EQ(Angles_DMSToRadians(ui, "0 20 00"), 0.333333333333333 * kDeg);
  EXPECT_EQ(Angles_DMSToRadians(ui, "10 20 00"), 10.3333333333333 * kDeg);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesParse, LimitsAndUnknownFormatsShowTheirMessages) {
  const std::string minutes = "'. Minutes portion must be positive and not exceed 59.";
  const std::string seconds =
      "'. Seconds portion must be positive and not exceed 59.9999999999999.";
  const std::tuple<std::string, std::string, std::string> cases[] = {
      {"45 60 00", kFormatDMS, minutes},   {"45 -1 00", kFormatDMS, minutes},
      {"45 59 60", kFormatDMS, seconds},   {"45 10 -1", kFormatDMS, seconds},
      {"45.6000", kFormatPacked, minutes}, {"45.3060", kFormatPacked, seconds},
      {"45 60.5", kFormatDM, minutes},     {"45 -1.5", kFormatDM, minutes},
      {"45 -0.5", kFormatDM, seconds},
  };
  ScriptedUi ui;
  for (const auto& [text, format, message] : cases) {
    EXPECT_EQ(Angles_TextToRadians(ui, text, format), kNoValue) << text;
    EXPECT_EQ(ui.boxes.at(0).buttons, Buttons::Ok);
    EXPECT_EQ(test::Take(ui), "E Invalid Angle: Invalid Angle '" + text + message);
  }
  EXPECT_EQ(Angles_TextToRadians(ui, "45 30 00", "ddd mm ss.ssss"), kNoValue);
  EXPECT_EQ(test::Take(ui),
            "E Invalid Angular Format: Unknown Angular Format. Can not convert angle to radians.");
}

TEST(AnglesParse, BadFieldsThrowForTheCaller) {
  ScriptedUi ui;
  using Parse = std::function<void(const char*)>;
  const Parse dms = [&](const char* t) { Angles_DMSToRadians(ui, t); };
  const Parse dm = [&](const char* t) { Angles_DMToRadians(ui, t); };
  const Parse packed = [&](const char* t) { Angles_PackedToRadians(ui, t); };
  const Parse decimal = [](const char* t) { Angles_DecimalToRadians(t); };
  const std::tuple<const char*, Parse, int> cases[] = {
      {"45 30", dms, 13},
      {"45 3O 00", dms, 13},
      {"45.5 30 00", dms, 13},
      {"", dms, 13},
      {"45", dm, 13},
      {"abc", packed, 13},
      {"45.30x5", packed, 13},
      {"45.3015e3", packed, 13},
      {".3015", packed, 13},
      {"nan", decimal, 13},
      {"40000.3000", packed, 6},
      {"-32769 0 0", dms, 6},
      {"-32768 0 0", dms, 0},
  };
  for (const auto& [text, parse, number] : cases)
    EXPECT_EQ(Thrown([&] { parse(text); }).number(), number) << text;
  const ZvError e = Thrown([&] { packed("4x.30"); });
  EXPECT_EQ(e.source() + ": " + e.description(), "modAngles.Angles_PackedToRadians: Type mismatch");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesFormat, PatternsSymbolsRoundingAndSigns) {
  ScriptedUi ui;
  const double a = 45.504236111 * kDeg, half = 0.5 * kDeg;
  const std::pair<std::string, std::string> cases[] = {
      {Angles_RadiansToDMS(ui, a, 4, false), "45 30 15.2500"},
      {Angles_RadiansToDMS(ui, a, 4, true), "45\xC2\xB0 30' 15.2500\""},
      {Angles_RadiansToDM(a, 4, true), "45\xC2\xB0 30.2542'"},
      {Angles_RadiansToDecimal(a, 3, true), "45.504\xC2\xB0"},
      {Angles_RadiansToDMS(ui, Dms(5, 3, 2.5), 1, false), "5 03 02.5"},
      {Angles_RadiansToDMS(ui, Dms(5, 3, 2), 0, false), "5 03 02"},
      {Angles_RadiansToDecimal(1234.5 * kDeg, 1, false), "1,234.5"},
      {Angles_RadiansToPacked(ui, Dms(45, 30, 15.12345), 5), "45.301512345"},
      {Angles_RadiansToPacked(ui, -Dms(0, 30, 15.12345), 5), "-0.301512345"},
      {Angles_RadiansToPacked(ui, Dms(45, 30, 15), 0), "45.3015"},
      {Angles_RadiansToPacked(ui, Dms(323, 7, 48.36847), 5), "323.074836847"},
      {Angles_RadiansToDMS(ui, -half, 4, false), "-0 30 00.0000"},
      {Angles_RadiansToDM(-half, 4, false), "-0 30.0000"},
      {Angles_RadiansToPacked(ui, -half, 4), "-0.30000000"},
      {Angles_RadiansToDecimal(-half, 6, false), "-0.500000"},
      // Seconds and minutes that round to 60 carry over.
      {Angles_RadiansToDMS(ui, Dms(45, 29, 59.99999), 4, false), "45 30 00.0000"},
      {Angles_RadiansToPacked(ui, Dms(45, 29, 59.99999), 4), "45.30000000"},
      {Angles_RadiansToDMS(ui, Dms(45, 59, 59.99999), 4, false), "46 00 00.0000"},
      {Angles_RadiansToDM(Dms(45, 59, 59.999), 4, false), "46 00.0000"},
      {Angles_RadiansToDMS(ui, -Dms(0, 59, 59.99999), 2, false), "-1 00 00.00"},
      // Tiny negative angles print without a minus.
      {Angles_RadiansToDMS(ui, -1e-12, 4, false), "0 00 00.0000"},
      {Angles_RadiansToDM(-1e-12, 4, false), "0 00.0000"},
      {Angles_RadiansToPacked(ui, -1e-12, 4), "0.00000000"},
      {Angles_RadiansToDecimal(-1e-12, 6, false), "0.000000"},
  };
  for (const auto& [text, expected] : cases) EXPECT_EQ(text, expected);
  // Packed with five decimals comes back within 0.000006 arc seconds.
  for (double deg = -179.9; deg < 360; deg += 0.731) {
    const std::string text = Angles_RadiansToPacked(ui, deg * kDeg, 5);
    EXPECT_NEAR(Angles_PackedToRadians(ui, text), deg * kDeg, 0.6e-5 / 3600 * kDeg) << text;
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesHemisphereAndUnits, UnknownNamesAndAbsentValuesGiveNoValue) {
  EXPECT_DOUBLE_EQ(Angles_ConvertHemisphere(0.1, "E", "W"), 6.18318530717958);
  EXPECT_NEAR(Angles_ConvertHemisphere(6.18318530717958, "W", "E"), 0.1, 1e-15);
  const std::pair<double, double> cases[] = {
      {Angles_ConvertHemisphere(0.1, "N", "S"), -0.1},
      {Angles_ConvertHemisphere(0.3, "W", "W"), 0.3},
      {Angles_ConvertHemisphere(0.1, "N", "E"), kNoValue},
      {Angles_ConvertHemisphere(0.1, "n", "S"), kNoValue},
      {Angles_ConvertHemisphere(kNoValue, "W", "W"), kNoValue},
      {Distances_Convert(100, "M", "Meters"), 100},
      {Distances_Convert(7, "I", "International Feet"), 7},
      {Distances_Convert(1, "F", "I"), 1.000002},
      {Distances_Convert(1, "International Feet", "U.S. Survey Feet"), 0.999998},
      {Distances_Convert(100, "Meters", "Yards"), kNoValue},
      {Distances_Convert(100, "meters", "F"), kNoValue},
      {Distances_Convert(kNoValue, "M", "F"), kNoValue},
      {Distances_Convert(kNoValue, "Yards", "Yards"), kNoValue},
  };
  for (const auto& [got, expected] : cases) EXPECT_EQ(got, expected);
}

constexpr double kA = 6378137.0;  // GRS 80
constexpr double kB = 6356752.314140356;
constexpr double kF = 1 / 298.257222101;

TEST(Ellipsoids, EveryPairCompletesTheEllipsoid) {
  const double e = std::sqrt(2 * kF - kF * kF);
  // Any two of a, b, f, e; all four given: a and b win.
  for (std::array<double, 4> c : {std::array{kA, kB, -1.0, -1.0},
                                  {kA, -1, kF, -1},
                                  {kA, -1, -1, e},
                                  {-1, kB, kF, -1},
                                  {-1, kB, -1, e},
                                  {kA, kB, 0.5, 0.5}}) {
    Ellipsoids_GET_Parameters(c[0], c[1], c[2], c[3]);
    EXPECT_NEAR(c[0], kA, 1e-6);
    EXPECT_NEAR(c[1], kB, 1e-6);
    EXPECT_NEAR(c[2], kF, 1e-15);
    EXPECT_NEAR(c[3], e, 1e-15);
  }
  EXPECT_EQ(Ellipsoids_GET_fab(6371000, 6371000), 0);  // a sphere
  EXPECT_EQ(Ellipsoids_GET_eab(6371000, 6371000), 0);
}

TEST(Ellipsoids, FailuresLeaveValuesAndCarryTheirTexts) {
  const std::string check = "  Check the other ellipsoid parameters.";
  const std::string greater = " The Semimajor Axis must be greater than the Semiminor Axis.";
  double a = 6356752.0, b = kA, f = -1, e = -1;
  const std::tuple<std::function<void()>, int, std::string> cases[] = {
      {[&] { Ellipsoids_GET_Parameters(a, b, f, e); }, 1,
       "Ellipsoids_GET_fab: Can not compute the Ellipsoid Flattening." + greater},
      {[] { Ellipsoids_GET_eab(1, 2); }, 1,
       "Ellipsoids_GET_eab: Can not compute the Ellipsoid Eccentricity." + greater},
      {[] { Ellipsoids_GET_abf(kB, -0.01); }, 1,
       "Ellipsoids_GET_abf: The computed Ellipsoid Semimajor Axis is less than the Semiminor "
       "Axis." +
           check},
      {[] {
         double a = -1, b = -1, f = 0.003, e = 0.08;
         Ellipsoids_GET_Parameters(a, b, f, e);
       },
       1,
       "Ellipsoids_GET_Parameters: Can not compute ellipsoid parameters. Two ellipsoidal "
       "parameters are required in any combination other than Flattening and Eccentricity."},
      // Values that would store NaN or infinity are arithmetic errors.
      {[] { Ellipsoids_GET_bae(kA, 1.5); }, 5, ""},
      {[] { Ellipsoids_GET_fe(1.5); }, 5, ""},
      {[] { Ellipsoids_GET_abe(kB, 1); }, 11, ""},
      {[] { Ellipsoids_GET_abf(kB, 1); }, 11, ""},
  };
  for (const auto& [call, number, text] : cases) {
    const ZvError err = Thrown(call);
    EXPECT_EQ(err.number(), number) << text;
    if (!text.empty()) {
      EXPECT_EQ(err.source() + ": " + err.description(), "modEllipsoids." + text);
    }
  }
  EXPECT_TRUE(f == -1 && e == -1);
  // A negative flattening (an inverse flattening typed negative), and one
  // above 1: b and e stay unset.
  for (const auto& [flattening, text] :
       {std::pair{-kF,
                  "Ellipsoids_GET_baf: The computed Ellipsoid Semiminor Axis is greater than "
                  "the Semimajor Axis." +
                      check},
        {2.5, std::string("Ellipsoids_GET_ef: ")}}) {
    a = kA, b = -1, f = flattening, e = -1;
    const ZvError err = Thrown([&] { Ellipsoids_GET_Parameters(a, b, f, e); });
    EXPECT_TRUE((err.source() + ": " + err.description()).starts_with("modEllipsoids." + text));
    EXPECT_TRUE(b == -1 && e == -1);
  }
}

const double kGrs80E = std::sqrt(2.0 / 298.257222101 - 1.0 / (298.257222101 * 298.257222101));

ZoneParameters Zone(const char* projection, double phi0, double lambda0, double k0,
                    double falseNorthing, double falseEasting, double phiS = kNoValue,
                    double phiN = kNoValue, double azimuth = kNoValue) {
  const bool nad27 = std::string(projection).find("NAD 27") != std::string::npos;
  ZoneParameters d{};
  d.projection = projection;
  d.a = nad27 ? 6378206.4 : 6378137.0;
  d.e = nad27 ? 0.08227185422300323 : kGrs80E;
  d.phi0 = phi0, d.lambda0 = lambda0, d.k0 = k0;
  d.falseNorthing = falseNorthing, d.falseEasting = falseEasting;
  d.phiS = phiS, d.phiN = phiN, d.azimuth = azimuth;
  return d;
}

TEST(Projection, ReferenceValuesForwardAndInverse) {
  const double te1991Lat = Dms(48, 4, 18.44714);
  const double kNone = std::numeric_limits<double>::quiet_NaN();
  struct Case {
    const char* where;
    ZoneParameters zone;
    double phi, lambda;        // radians, west-positive
    double northing, easting;  // zone units
    double tolerance;          // zone units
    double convergence;        // arc seconds (kNone: not checked)
    double scale;
  };
  const Case cases[] = {
      // Data sheet TE1991 in UTM 14, with the central meridian moved to 0 10 E.
      {"across the zero meridian",
       Zone(kTransverseMercator, 0, kFullCircle - Dms(0, 10), 0.9996, 0, 5e5), te1991Lat,
       Dms(0, 4, 45.11046), 5324308.767, 481685.116, 0.001, -(10 * 60 + 58.5), 0.99960412},
      // North Dakota North with its parallels given the other way round.
      {"parallels swapped",
       Zone(kLambertTwoParallels, Dms(47), Dms(100, 30), kNoValue, 0, 6e5, Dms(48, 44),
            Dms(47, 26)),
       te1991Lat, Dms(99, 14, 45.11046), 119923.671, 693450.294, 0.001, 55 * 60 + 59.7, 0.99993587},
      // Alaska zone 1 with the azimuth given negative: Juneau from PROJ omerc variant A.
      {"Juneau, negative azimuth",
       Zone(kObliqueMercator, Dms(57), Dms(133, 40), 0.9999, -5e6, 5e6, kNoValue, kNoValue,
            std::atan(-0.75)),
       Dms(58, 18), Dms(134, 24), 720098.3293, 775672.4612, 0.001, -(36 * 60 + 51.552), 0.99993389},
      // NAD 27 Transverse Mercator with a false northing (no shipped zone has
      // one): rigorous Clarke 1866 (PROJ tmerc) in feet.
      {"NAD 27 false northing",
       Zone(kTransverseMercatorNad27, Dms(31), Dms(106, 15), 0.9999, 1e4, 5e5), Dms(33), Dms(106),
       737597.2435, 576645.2201, 0.003, kNone, kNone},
      // The false origin: no convergence.
      {"NAD 27 California VII",
       Zone(kLambertNad27, Dms(34, 8), Dms(118, 20), kNoValue, 4160926.74, 4186692.58, Dms(33, 52),
            Dms(34, 25)),
       Dms(34, 8), Dms(118, 20), 4160926.74, 4186692.58, 1e-5, 0, kNone},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.where);
    const ProjectionZone zone = Projection_SetZone(c.zone);
    ASSERT_EQ(zone.status, ProjectionStatus::Ok);
    EXPECT_EQ(zone.usSurveyFeet,
              std::string(c.zone.projection).find("NAD 27") != std::string::npos);
    const GridPoint g = Projection_GeographicToGrid(zone, c.phi, c.lambda);
    EXPECT_NEAR(g.northing, c.northing, c.tolerance);
    EXPECT_NEAR(g.easting, c.easting, c.tolerance);
    EXPECT_FALSE(std::fabs(g.convergence / kDeg * 3600 - c.convergence) > 0.05) << g.convergence;
    EXPECT_FALSE(std::fabs(g.scaleFactor - c.scale) > 1e-8) << g.scaleFactor;  // NaN: unchecked
    // Back from the reference grid values, in 0..2 pi.
    const GeographicPoint p = Projection_GridToGeographic(zone, c.northing, c.easting);
    const double angle = (zone.usSurveyFeet ? 0.3048 : 1.0) * std::max(c.tolerance, 1e-4) / 2e6;
    EXPECT_NEAR(p.phi, c.phi, angle);
    EXPECT_NEAR(p.lambda, c.lambda, angle);
    EXPECT_NEAR(p.convergence, g.convergence, 1e-9);
    EXPECT_NEAR(p.scaleFactor, g.scaleFactor, 1e-9);
  }
}

TEST(Projection, UnknownNamesFailedConesAndNoValueInputsGiveNoValue) {
  for (const char* name : {"transverse mercator", "Transverse Mercator ", "Polyconic", ""}) {
    const ProjectionZone zone = Projection_SetZone(Zone(name, Dms(40), Dms(100), 1, 0, 0));
    EXPECT_EQ(zone.status, ProjectionStatus::UnknownProjection) << name;
    EXPECT_EQ(Projection_GeographicToGrid(zone, Dms(40), Dms(100)).easting, kNoValue);
    EXPECT_EQ(Projection_GridToGeographic(zone, 0.0, 0.0).lambda, kNoValue);
  }
  for (const char* name : {kLambertTwoParallels, kLambertNad27}) {
    const ZoneParameters cone = Zone(name, Dms(39), Dms(100), kNoValue, 0, 0, Dms(40), Dms(40));
    const ProjectionZone zone = Projection_SetZone(cone);
    EXPECT_EQ(zone.status, ProjectionStatus::MappingRadius) << name;
    EXPECT_EQ(Projection_GeographicToGrid(zone, Dms(40), Dms(100)).northing, kNoValue) << name;
  }
  const ProjectionZone zone =
      Projection_SetZone(Zone(kTransverseMercator, 0, Dms(99), 0.9996, 0, 0));
  const GridPoint g = Projection_GeographicToGrid(zone, kNoValue, Dms(99));
  const GeographicPoint p = Projection_GridToGeographic(zone, 100.0, kNoValue);
  for (double v : {g.northing, g.easting, g.convergence, g.scaleFactor, p.phi, p.lambda})
    EXPECT_EQ(v, kNoValue);

  // Grid values that are not finite end the one-parallel inverse's search.
  const ProjectionZone one =
      Projection_SetZone(Zone(kLambertOneParallel, Dms(40), Dms(100), 0.9999, 0, 5e5));
  EXPECT_TRUE(std::isnan(Projection_GridToGeographic(one, std::nan(""), 5e5).phi));
  EXPECT_FALSE(std::isfinite(Projection_GridToGeographic(one, INFINITY, 5e5).phi));
}

}  // namespace
}  // namespace zv
