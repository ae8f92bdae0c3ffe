// libFuzzer target for the FlexIn reader. The first bytes choose the format
// (delimiter, angle format, columns, position cells, prefixes); the rest is
// the file. Any input must read or be refused with a message, never crash.
// Seeds in tests/fixtures/flex/fuzz-seeds start with such a selector.

#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

#include "geodesy/Angles.h"
#include "platform/ScriptedUi.h"
#include "userformats/FlexIn.h"

namespace {

const char* const kDelimiters[] = {"Comma", "Space", "Tab", "Semicolon", "Column Specific", "::"};
const char* const kAngleFormats[] = {zv::kFormatDMS, zv::kFormatPacked, zv::kFormatDecimal,
                                     zv::kFormatDM, zv::kMeters};
const char* const kColumns[] = {"Point ID",
                                "Northing",
                                "Easting",
                                "Orthometric Height",
                                "Latitude",
                                "Longitude",
                                "Ellipsoid Height",
                                "Feature Code",
                                "Point Description",
                                "Attribute",
                                "Geometry",
                                "Northing Error Estimate",
                                "Easting Error Estimate",
                                "Height Error Estimate",
                                "Geoid Height",
                                "Convergance Angle",
                                "Scale Factor",
                                "Not A Column"};

template <size_t N>
const char* Pick(const char* const (&list)[N], uint8_t byte) {
  return list[byte % N];
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size < 4) return 0;
  zv::FlexInFormat format;
  format.delimiter = Pick(kDelimiters, data[0]);
  std::string angleFormat = Pick(kAngleFormats, data[1]);
  format.coordinateType = angleFormat == zv::kMeters ? "Plane" : "Geographic";
  size_t count = 1 + data[2] % 8;
  size_t at = 3;
  int position = 1;
  for (size_t i = 0; i < count && at < size; ++i, ++at) {
    format.columns.push_back(Pick(kColumns, data[at]));
    // Mostly ascending positions, sometimes a bad cell.
    uint8_t step = data[at] >> 3;
    if (step == 31) {
      format.order.push_back("x");
    } else if (step == 30) {
      format.order.push_back("");
    } else {
      position += step % 12;
      format.order.push_back(std::to_string(position));
    }
  }
  if (at < size && (data[at] & 1)) format.headerPrefix = "PRJ";
  if (at < size && (data[at] & 2)) format.ignorePrefix = "#";
  ++at;
  std::string text(reinterpret_cast<const char*>(data) + std::min(at, size),
                   size - std::min(at, size));

  zv::ScriptedUi ui;
  std::istringstream in(text);
  zv::FileHeader header;
  std::vector<zv::SurveyPoint> points;
  bool ok = zv::ReadFlexInStream(ui, in, "fuzz.txt", format, angleFormat, header, points);
  if (ok && points.empty()) std::abort();
  if (!ok && ui.boxes.empty()) std::abort();  // a refusal always says why
  return 0;
}
