#include "StandIn.h"

#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iostream>

#include "platform/TextIo.h"

namespace zv::ngs {

std::vector<std::string> ReadAnswers(std::istream& in) {
  std::vector<std::string> answers;
  LineReader reader(in);
  std::string_view line;
  while (reader.next(line)) answers.emplace_back(line);
  return answers;
}

bool ReadInputPoints(const std::string& path, std::vector<InputPoint>& points) {
  std::ifstream in(path, std::ios::binary);
  if (!in) {
    Report("The input file '" + path + "' was not found.");
    return false;
  }
  LineReader reader(in);
  std::string_view line;
  size_t number = 0;
  while (reader.next(line)) {
    ++number;
    if (line.find_first_not_of(' ') == std::string_view::npos) continue;
    std::string coordinates(line.substr(0, 41));
    char* end = nullptr;
    InputPoint p;
    p.lat = std::strtod(coordinates.c_str(), &end);
    char* lonEnd = nullptr;
    p.lonWest = std::strtod(end, &lonEnd);
    if (end == coordinates.c_str() || lonEnd == end) {
      Report("Line " + std::to_string(number) + " of '" + path +
             "' holds no latitude and longitude.");
      return false;
    }
    if (line.size() > 41) {
      std::string_view name = line.substr(41);
      size_t b = name.find_first_not_of(' '), e = name.find_last_not_of(' ');
      if (b != std::string_view::npos) p.name = std::string(name.substr(b, e - b + 1));
    }
    points.push_back(std::move(p));
  }
  return true;
}

void Report(const std::string& message) {
  std::cout << "ERROR: " << message << '\n';
}

std::string CurrentFolder() {
  std::error_code ec;
  return std::filesystem::current_path(ec).string();
}

std::string Describe(const InputPoint& p) {
  char text[96];
  std::snprintf(text, sizeof text, " at %.9f N, %.9f W", p.lat, p.lonWest);
  return "'" + p.name + "'" + text;
}

std::string Coordinates(double lat, double lonWest) {
  char text[64];
  std::snprintf(text, sizeof text, "%14.9f  %14.9f", lat, lonWest);
  return text;
}

bool WriteOutput(const std::string& path, const std::vector<std::string>& lines) {
  std::ofstream out(path, std::ios::binary);
  for (const std::string& l : lines) out << l << "\r\n";
  out.close();
  if (out) return true;
  Report("The output file '" + path + "' could not be written.");
  return false;
}

bool StartsWithNoCase(const std::string& text, const std::string& prefix) {
  if (text.size() < prefix.size()) return false;
  for (size_t i = 0; i < prefix.size(); ++i) {
    if (std::tolower(static_cast<unsigned char>(text[i])) !=
        std::tolower(static_cast<unsigned char>(prefix[i]))) {
      return false;
    }
  }
  return true;
}

bool EndsWithNoCase(const std::string& text, const std::string& suffix) {
  return text.size() >= suffix.size() &&
         StartsWithNoCase(text.substr(text.size() - suffix.size()), suffix);
}

}  // namespace zv::ngs
