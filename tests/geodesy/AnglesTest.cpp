#include <gtest/gtest.h>

#include <cmath>

#include "geodesy/Angles.h"
#include "platform/Error.h"
#include "platform/ScriptedUi.h"

namespace zv {
namespace {

constexpr double kHalfDegree = 0.5 * kDegreesToRadians;

double Dms(double d, double m, double s) {
  return (d + m / 60 + s / 3600) * kDegreesToRadians;
}

TEST(AnglesParse, FourFormatsGiveTheSameAngle) {
  ScriptedUi ui;
  double expected = Dms(45, 30, 15.25);
  EXPECT_NEAR(Angles_TextToRadians(ui, "45 30 15.25", kFormatDMS), expected, 1e-15);
  EXPECT_NEAR(Angles_TextToRadians(ui, "45.301525", kFormatPacked), expected, 1e-15);
  EXPECT_NEAR(Angles_TextToRadians(ui, "45.5042361111111", kFormatDecimal), expected, 1e-15);
  EXPECT_NEAR(Angles_TextToRadians(ui, "45 30.2541666666667", kFormatDM), expected, 1e-15);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesParse, MinusHalfDegreeInEveryForm) {
  ScriptedUi ui;
  EXPECT_DOUBLE_EQ(Angles_DMSToRadians(ui, "-0 30 00"), -kHalfDegree);
  EXPECT_DOUBLE_EQ(Angles_DMToRadians(ui, "-0 30.0"), -kHalfDegree);
  EXPECT_DOUBLE_EQ(Angles_PackedToRadians(ui, "-0.3000"), -kHalfDegree);
  EXPECT_DOUBLE_EQ(Angles_PackedToRadians(ui, "-45.3000"), -Dms(45, 30, 0));
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesParse, PackedFieldSplitting) {
  ScriptedUi ui;
  EXPECT_NEAR(Angles_PackedToRadians(ui, "45.3"), Dms(45, 3, 0), 1e-15);
  EXPECT_NEAR(Angles_PackedToRadians(ui, "45.305"), Dms(45, 30, 0), 1e-15);
  EXPECT_NEAR(Angles_PackedToRadians(ui, "45"), Dms(45, 0, 0), 1e-15);
  EXPECT_NEAR(Angles_PackedToRadians(ui, "45.3015"), Dms(45, 30, 15), 1e-15);
  EXPECT_NEAR(Angles_PackedToRadians(ui, "45.30152"), Dms(45, 30, 15.2), 1e-15);
  EXPECT_NEAR(Angles_PackedToRadians(ui, "88.2000000000"), Dms(88, 20, 0), 1e-15);
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesParse, ResultIsRoundedToFifteenSignificantDigits) {
  ScriptedUi ui;
  // 1/3 degree: 15 significant digits in decimal degrees, then the factor.
  EXPECT_EQ(Angles_DMSToRadians(ui, "0 20 00"), 0.333333333333333 * kDegreesToRadians);
  EXPECT_EQ(Angles_DMSToRadians(ui, "10 20 00"), 10.3333333333333 * kDegreesToRadians);
}

TEST(AnglesParse, LimitsShowTheirMessages) {
  const std::string minutesText = "'. Minutes portion must be positive and not exceed 59.";
  const std::string secondsText =
      "'. Seconds portion must be positive and not exceed 59.9999999999999.";
  struct Case {
    std::string text;
    std::string format;
    std::string message;
  };
  const Case cases[] = {
      {"45 60 00", kFormatDMS, "Invalid Angle '45 60 00" + minutesText},
      {"45 -1 00", kFormatDMS, "Invalid Angle '45 -1 00" + minutesText},
      {"45 59 60", kFormatDMS, "Invalid Angle '45 59 60" + secondsText},
      {"45 10 -1", kFormatDMS, "Invalid Angle '45 10 -1" + secondsText},
      {"45.6000", kFormatPacked, "Invalid Angle '45.6000" + minutesText},
      {"45.3060", kFormatPacked, "Invalid Angle '45.3060" + secondsText},
      {"45 60.5", kFormatDM, "Invalid Angle '45 60.5" + minutesText},
      {"45 -1.5", kFormatDM, "Invalid Angle '45 -1.5" + minutesText},
      {"45 -0.5", kFormatDM, "Invalid Angle '45 -0.5" + secondsText},
  };
  for (const Case& c : cases) {
    ScriptedUi ui;
    EXPECT_EQ(Angles_TextToRadians(ui, c.text, c.format), kNoValue) << c.text;
    ASSERT_EQ(ui.boxes.size(), 1u) << c.text;
    EXPECT_EQ(ui.boxes[0].text, c.message);
    EXPECT_EQ(ui.boxes[0].title, "Invalid Angle");
    EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
    EXPECT_EQ(ui.boxes[0].buttons, Buttons::Ok);
  }
}

TEST(AnglesParse, UpperLimitsAreInclusive) {
  ScriptedUi ui;
  EXPECT_NE(Angles_DMSToRadians(ui, "45 59 59.9999999999999"), kNoValue);
  EXPECT_NE(Angles_DMSToRadians(ui, "0 0 0"), kNoValue);
  EXPECT_NE(Angles_DMSToRadians(ui, "400 0 0"), kNoValue);  // degrees are not limited
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesParse, UnknownFormatNameIncludingLetterCase) {
  ScriptedUi ui;
  EXPECT_EQ(Angles_TextToRadians(ui, "45 30 00", "ddd mm ss.ssss"), kNoValue);
  ASSERT_EQ(ui.boxes.size(), 1u);
  EXPECT_EQ(ui.boxes[0].text, "Unknown Angular Format. Can not convert angle to radians.");
  EXPECT_EQ(ui.boxes[0].title, "Invalid Angular Format");
  EXPECT_EQ(ui.boxes[0].icon, Icon::Exclamation);
}

TEST(AnglesParse, BadFieldsThrowForTheCaller) {
  ScriptedUi ui;
  auto number = [&](auto fn) {
    try {
      fn();
    } catch (const ZvError& e) {
      return e.number();
    }
    return 0;
  };
  EXPECT_EQ(number([&] { Angles_DMSToRadians(ui, "45 30"); }), 13);
  EXPECT_EQ(number([&] { Angles_DMSToRadians(ui, "45 3O 00"); }), 13);
  EXPECT_EQ(number([&] { Angles_DMSToRadians(ui, "45.5 30 00"); }), 13);
  EXPECT_EQ(number([&] { Angles_DMSToRadians(ui, ""); }), 13);
  EXPECT_EQ(number([&] { Angles_DMToRadians(ui, "45"); }), 13);
  EXPECT_EQ(number([&] { Angles_PackedToRadians(ui, "abc"); }), 13);
  EXPECT_EQ(number([&] { Angles_PackedToRadians(ui, "45.30x5"); }), 13);
  EXPECT_EQ(number([&] { Angles_PackedToRadians(ui, "45.3015e3"); }), 13);
  EXPECT_EQ(number([&] { Angles_PackedToRadians(ui, ".3015"); }), 13);
  EXPECT_EQ(number([&] { Angles_DecimalToRadians("nan"); }), 13);
  EXPECT_EQ(number([&] { Angles_PackedToRadians(ui, "40000.3000"); }), 6);
  EXPECT_EQ(number([&] { Angles_DMSToRadians(ui, "-32769 0 0"); }), 6);
  EXPECT_NE(number([&] { Angles_DMSToRadians(ui, "-32768 0 0"); }), 6);
  try {
    Angles_PackedToRadians(ui, "4x.30");
    FAIL();
  } catch (const ZvError& e) {
    EXPECT_EQ(e.description(), "Type mismatch");
    EXPECT_EQ(e.source(), "modAngles.Angles_PackedToRadians");
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesFormat, MinusHalfDegree) {
  ScriptedUi ui;
  EXPECT_EQ(Angles_RadiansToDMS(ui, -kHalfDegree, 4, false), "-0 30 00.0000");
  EXPECT_EQ(Angles_RadiansToDM(-kHalfDegree, 4, false), "-0 30.0000");
  EXPECT_EQ(Angles_RadiansToPacked(ui, -kHalfDegree, 4), "-0.30000000");
  EXPECT_EQ(Angles_RadiansToDecimal(-kHalfDegree, 6, false), "-0.500000");
  EXPECT_EQ(Angles_RadiansToDecimal(kHalfDegree, 6, false), "0.500000");
}

TEST(AnglesFormat, SymbolsAndPatterns) {
  ScriptedUi ui;
  double a = 45.504236111 * kDegreesToRadians;
  EXPECT_EQ(Angles_RadiansToDMS(ui, a, 4, false), "45 30 15.2500");
  EXPECT_EQ(Angles_RadiansToDMS(ui, a, 4, true), "45\xC2\xB0 30' 15.2500\"");
  EXPECT_EQ(Angles_RadiansToDM(a, 4, true), "45\xC2\xB0 30.2542'");
  EXPECT_EQ(Angles_RadiansToDecimal(a, 3, true), "45.504\xC2\xB0");
  EXPECT_EQ(Angles_RadiansToDMS(ui, Dms(5, 3, 2.5), 1, false), "5 03 02.5");
  EXPECT_EQ(Angles_RadiansToDMS(ui, Dms(5, 3, 2), 0, false), "5 03 02");
  EXPECT_EQ(Angles_RadiansToDecimal(1234.5 * kDegreesToRadians, 1, false), "1,234.5");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesFormat, Packed) {
  ScriptedUi ui;
  EXPECT_EQ(Angles_RadiansToPacked(ui, Dms(45, 30, 15.12345), 5), "45.301512345");
  EXPECT_EQ(Angles_RadiansToPacked(ui, -Dms(0, 30, 15.12345), 5), "-0.301512345");
  EXPECT_EQ(Angles_RadiansToPacked(ui, Dms(45, 30, 15), 0), "45.3015");
  EXPECT_EQ(Angles_RadiansToPacked(ui, Dms(323, 7, 48.36847), 5), "323.074836847");
}

TEST(AnglesFormat, SecondsAndMinutesRoundingTo60CarryOver) {
  ScriptedUi ui;
  double justBelow = Dms(45, 29, 59.99999);
  EXPECT_EQ(Angles_RadiansToDMS(ui, justBelow, 4, false), "45 30 00.0000");
  EXPECT_EQ(Angles_RadiansToPacked(ui, justBelow, 4), "45.30000000");
  EXPECT_EQ(Angles_RadiansToDMS(ui, Dms(45, 59, 59.99999), 4, false), "46 00 00.0000");
  EXPECT_EQ(Angles_RadiansToDM(Dms(45, 59, 59.999), 4, false), "46 00.0000");
  EXPECT_EQ(Angles_RadiansToDMS(ui, -Dms(0, 59, 59.99999), 2, false), "-1 00 00.00");
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesFormat, TinyNegativeAnglesPrintWithoutMinus) {
  ScriptedUi ui;
  double tiny = -1e-12;
  EXPECT_EQ(Angles_RadiansToDMS(ui, tiny, 4, false), "0 00 00.0000");
  EXPECT_EQ(Angles_RadiansToDM(tiny, 4, false), "0 00.0000");
  EXPECT_EQ(Angles_RadiansToPacked(ui, tiny, 4), "0.00000000");
  EXPECT_EQ(Angles_RadiansToDecimal(tiny, 6, false), "0.000000");
}

TEST(AnglesFormat, PackedRoundTripsAtFiveDecimals) {
  ScriptedUi ui;
  for (double deg = -179.9; deg < 360; deg += 0.731) {
    double r = deg * kDegreesToRadians;
    std::string text = Angles_RadiansToPacked(ui, r, 5);
    double back = Angles_PackedToRadians(ui, text);
    // 0.000005 arc-seconds is 0.15 mm on the ground.
    EXPECT_NEAR(back, r, 0.6e-5 / 3600 * kDegreesToRadians) << text;
  }
  EXPECT_TRUE(ui.boxes.empty());
}

TEST(AnglesHemisphere, Conversions) {
  EXPECT_DOUBLE_EQ(Angles_ConvertHemisphere(0.1, "E", "W"), 6.18318530717958);
  EXPECT_NEAR(Angles_ConvertHemisphere(6.18318530717958, "W", "E"), 0.1, 1e-15);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "N", "S"), -0.1);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "N", "E"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(0.1, "n", "S"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(kNoValue, "N", "S"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(kNoValue, "W", "W"), kNoValue);
  EXPECT_EQ(Angles_ConvertHemisphere(0.3, "W", "W"), 0.3);
}

TEST(AnglesUnits, ConvertUsesTheFactorTable) {
  EXPECT_EQ(Distances_Convert(100, "M", "Meters"), 100);
  EXPECT_EQ(Distances_Convert(100, "Meters", "Yards"), kNoValue);
  EXPECT_EQ(Distances_Convert(100, "meters", "F"), kNoValue);
  EXPECT_EQ(Distances_Convert(kNoValue, "M", "F"), kNoValue);
  EXPECT_EQ(Distances_Convert(kNoValue, "Yards", "Yards"), kNoValue);
  EXPECT_EQ(Distances_Convert(1, "M", "F"), 3.2808333333333333);
  EXPECT_EQ(Distances_Convert(1, "Meters", "International Feet"), 3.280839895);
  EXPECT_EQ(Distances_Convert(1, "U.S. Survey Feet", "M"), 0.3048006096012192);
  EXPECT_EQ(Distances_Convert(1, "F", "I"), 1.000002);
  EXPECT_EQ(Distances_Convert(1, "I", "M"), 0.3048);
  EXPECT_EQ(Distances_Convert(1, "International Feet", "U.S. Survey Feet"), 0.999998);
  EXPECT_EQ(Distances_Convert(7, "I", "International Feet"), 7);
}

TEST(AnglesLists, NamesInListOrder) {
  EXPECT_EQ(AngleFormatNames(), (std::vector<std::string>{"DDD MM SS.ssss", "DDD.MMSSssss",
                                                          "DDD.dddddd", "DDD MM.mmmm"}));
  EXPECT_EQ(LinearUnitNames(),
            (std::vector<std::string>{"Meters", "U.S. Survey Feet", "International Feet"}));
}

}  // namespace
}  // namespace zv
