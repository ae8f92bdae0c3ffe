#pragma once
// What the stand-in NGS programs share: the keyboard answers from standard
// input, the point input file, the output lines and the "ERROR: " lines that
// say why a point got no result (written to standard output, which the
// batch file sends to the file junk).

#include <cstdio>
#include <istream>
#include <string>
#include <vector>

namespace zv::ngs {

// Standard input, one answer per line, without line ends.
std::vector<std::string> ReadAnswers(std::istream& in);

struct InputPoint {
  double lat = 0;      // degrees north
  double lonWest = 0;  // degrees west
  std::string name;    // from column 42
};

// The point input file: latitude and longitude in decimal degrees, the name
// from column 42. False (reported) when it cannot be read.
bool ReadInputPoints(const std::string& path, std::vector<InputPoint>& points);

// Writes "ERROR: " + message to standard output.
void Report(const std::string& message);

// The current folder, where the batch file runs the program.
std::string CurrentFolder();

// "'P1' at 45.000000000 N, 100.000000000 W"
std::string Describe(const InputPoint& p);

// Latitude and longitude in columns 1-14 and 17-30 (9 decimals).
std::string Coordinates(double lat, double lonWest);

// The output file, written with CR LF lines; false (reported) on failure.
bool WriteOutput(const std::string& path, const std::vector<std::string>& lines);

// A case-insensitive compare of ASCII names.
bool StartsWithNoCase(const std::string& text, const std::string& prefix);
bool EndsWithNoCase(const std::string& text, const std::string& suffix);

}  // namespace zv::ngs
