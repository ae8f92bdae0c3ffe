#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/Angles.h"
#include "platform/Error.h"
#include "platform/ScriptedUi.h"

namespace zv {
namespace {

double Dms(double d, double m, double s) {
  return (d + m / 60 + s / 3600) * kDegreesToRadians;
}

TEST(AnglesParse, EveryFormat) {
  const struct {
    const char* text;
    std::string format;
    double expected;
  } cases[] = {
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
  for (const auto& c : cases) {
    ScriptedUi ui;
    EXPECT_NEAR(Angles_TextToRadians(ui, c.text, c.format), c.expected, 1e-15) << c.text;
    EXPECT_TRUE(ui.boxes.empty()) << c.text;
  }
  // Rounded to 15 significant digits in decimal degrees, then the factor.
  ScriptedUi ui;
  EXPECT_EQ(Angles_DMSToRadians(ui, "0 20 00"), 0.333333333333333 * kDegreesToRadians);
  EXPECT_EQ(Angles_DMSToRadians(ui, "10 20 00"), 10.3333333333333 * kDegreesToRadians);
}

TEST(AnglesParse, LimitsAndUnknownFormatsShowTheirMessages) {
  const std::string minutes = "'. Minutes portion must be positive and not exceed 59.";
  const std::string seconds =
      "'. Seconds portion must be positive and not exceed 59.9999999999999.";
  const struct {
    std::string text, format, message;
  } cases[] = {
      {"45 60 00", kFormatDMS, "Invalid Angle '45 60 00" + minutes},
      {"45 -1 00", kFormatDMS, "Invalid Angle '45 -1 00" + minutes},
      {"45 59 60", kFormatDMS, "Invalid Angle '45 59 60" + seconds},
      {"45 10 -1", kFormatDMS, "Invalid Angle '45 10 -1" + seconds},
      {"45.6000", kFormatPacked, "Invalid Angle '45.6000" + minutes},
      {"45.3060", kFormatPacked, "Invalid Angle '45.3060" + seconds},
      {"45 60.5", kFormatDM, "Invalid Angle '45 60.5" + minutes},
      {"45 -1.5", kFormatDM, "Invalid Angle '45 -1.5" + minutes},
      {"45 -0.5", kFormatDM, "Invalid Angle '45 -0.5" + seconds},
      {"45 30 00", "ddd mm ss.ssss", "Unknown Angular Format. Can not convert angle to radians."},
  };
  for (const auto& c : cases) {
    ScriptedUi ui;
    EXPECT_EQ(Angles_TextToRadians(ui, c.text, c.format), kNoValue) << c.text;
    ASSERT_EQ(ui.boxes.size(), 1u) << c.text;
    EXPECT_EQ(ui.boxes[0].text, c.message);
    EXPECT_EQ(ui.boxes[0].title,
              c.message.starts_with("Invalid") ? "Invalid Angle" : "Invalid Angular Format");
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
    EXPECT_EQ(ui.boxes[0].buttons, Buttons::Ok);
  }
}

TEST(AnglesParse, BadFieldsThrowForTheCaller) {
  ScriptedUi ui;
  const auto number = [&](const char* text, auto parse) {
    try {
      parse(ui, text);
    } catch (const ZvError& e) {
      return e.number();
    }
    return 0;
  };
  const auto dms = [](ScriptedUi& u, const char* t) { Angles_DMSToRadians(u, t); };
  const auto dm = [](ScriptedUi& u, const char* t) { Angles_DMToRadians(u, t); };
  const auto packed = [](ScriptedUi& u, const char* t) { Angles_PackedToRadians(u, t); };
  for (const char* text : {"45 30", "45 3O 00", "45.5 30 00", ""}) EXPECT_EQ(number(text, dms), 13);
  EXPECT_EQ(number("45", dm), 13);
  for (const char* text : {"abc", "45.30x5", "45.3015e3", ".3015"})
    EXPECT_EQ(number(text, packed), 13) << text;
  EXPECT_EQ(number("nan", [](ScriptedUi&, const char* t) { Angles_DecimalToRadians(t); }), 13);
  EXPECT_EQ(number("40000.3000", packed), 6);
  EXPECT_EQ(number("-32769 0 0", dms), 6);
  EXPECT_EQ(number("-32768 0 0", dms), 0);
  try {
    Angles_PackedToRadians(ui, "4x.30");
    FAIL();
  } catch (const ZvError& e) {
    EXPECT_EQ(e.description(), "Type mismatch");
    EXPECT_EQ(e.source(), "modAngles.Angles_PackedToRadians");
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesFormat, PatternsSymbolsRoundingAndSigns) {
  ScriptedUi ui;
  const double a = 45.504236111 * kDegreesToRadians, half = 0.5 * kDegreesToRadians;
  const struct {
    std::string text, expected;
  } cases[] = {
      {Angles_RadiansToDMS(ui, a, 4, false), "45 30 15.2500"},
      {Angles_RadiansToDMS(ui, a, 4, true), "45\xC2\xB0 30' 15.2500\""},
      {Angles_RadiansToDM(a, 4, true), "45\xC2\xB0 30.2542'"},
      {Angles_RadiansToDecimal(a, 3, true), "45.504\xC2\xB0"},
      {Angles_RadiansToDMS(ui, Dms(5, 3, 2.5), 1, false), "5 03 02.5"},
      {Angles_RadiansToDMS(ui, Dms(5, 3, 2), 0, false), "5 03 02"},
      {Angles_RadiansToDecimal(1234.5 * kDegreesToRadians, 1, false), "1,234.5"},
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
  for (const auto& c : cases) EXPECT_EQ(c.text, c.expected);
  // Packed with five decimals comes back within 0.000006 arc seconds.
  for (double deg = -179.9; deg < 360; deg += 0.731) {
    const std::string text = Angles_RadiansToPacked(ui, deg * kDegreesToRadians, 5);
    EXPECT_NEAR(Angles_PackedToRadians(ui, text), deg * kDegreesToRadians,
                0.6e-5 / 3600 * kDegreesToRadians)
        << text;
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesHemisphereAndUnits, UnknownNamesAndAbsentValuesGiveNoValue) {
  EXPECT_DOUBLE_EQ(Angles_ConvertHemisphere(0.1, "E", "W"), 6.18318530717958);
  EXPECT_NEAR(Angles_ConvertHemisphere(6.18318530717958, "W", "E"), 0.1, 1e-15);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "N", "S"), -0.1);
  EXPECT_EQ(Angles_ConvertHemisphere(0.3, "W", "W"), 0.3);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "N", "E"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "n", "S"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(kNoValue, "W", "W"), kNoValue);

  EXPECT_EQ(Distances_Convert(100, "M", "Meters"), 100);
  EXPECT_EQ(Distances_Convert(7, "I", "International Feet"), 7);
  EXPECT_EQ(Distances_Convert(1, "F", "I"), 1.000002);
  EXPECT_EQ(Distances_Convert(1, "International Feet", "U.S. Survey Feet"), 0.999998);
  EXPECT_EQ(Distances_Convert(100, "Meters", "Yards"), kNoValue);
  EXPECT_EQ(Distances_Convert(100, "meters", "F"), kNoValue);
  EXPECT_EQ(Distances_Convert(kNoValue, "M", "F"), kNoValue);
  EXPECT_EQ(Distances_Convert(kNoValue, "Yards", "Yards"), kNoValue);
}

}  // namespace
}  // namespace zv
