#pragma once
// Helpers shared by the survey format tests.

#include <string>
#include <vector>

#include "geodesy/Angles.h"
#include "survey/SurveyModel.h"

namespace zv::test {

inline std::string Fixture(const std::string& name) {
  return std::string(ZV_FIXTURES) + "/" + name;
}

// An angle given in degrees, minutes and seconds, in radians.
inline double Dms(double degrees, double minutes, double seconds) {
  return (degrees + minutes / 60 + seconds / 3600) * kDegreesToRadians;
}

// The lines of a text written with CR LF line ends (none may be empty).
inline std::vector<std::string> SplitCrLf(const std::string& text) {
  std::vector<std::string> lines;
  size_t start = 0;
  while (start < text.size()) {
    size_t end = text.find("\r\n", start);
    if (end == std::string::npos) end = text.size();
    lines.push_back(text.substr(start, end - start));
    start = end + 2;
  }
  return lines;
}

}  // namespace zv::test
