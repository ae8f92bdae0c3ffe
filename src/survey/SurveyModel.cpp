#include "survey/SurveyModel.h"

#include <sys/mman.h>

#include <algorithm>
#include <new>

namespace zv {

void ResetPoint(SurveyPoint& point) {
  CompactText recordCode = std::move(point.RecordCode);
  CompactText text33 = std::move(point.Text33);
  point = SurveyPoint{};
  point.RecordCode = std::move(recordCode);
  point.Text33 = std::move(text33);
}

void StartChain(SurveyChain& chain) {
  chain.FeatureCode.clear();
  chain.Description.clear();
  chain.FGText.clear();
  chain.PointListLines.clear();
  chain.ChainLines.clear();
  chain.ExtraLines.clear();
  chain.Station.clear();
  chain.Open = true;
}

void WorkArea::clearInput() {
  InputHeader = FileHeader{};
  InputPoints.clear();
  InputPoints.shrink_to_fit();
  InputChains.clear();
  InputChains.shrink_to_fit();
}

void WorkArea::copyInputToOutput(bool moveInput) {
  OutputHeader = InputHeader;
  if (moveInput) {
    OutputPoints = std::move(InputPoints);
    OutputChains = std::move(InputChains);
    InputPoints.clear();
    InputChains.clear();
  } else {
    OutputPoints = InputPoints;
    OutputChains = InputChains;
  }
}

void ReservePoints(std::vector<SurveyPoint>& points, std::uintmax_t count) {
  constexpr std::uintmax_t kMost = 4000000;  // beyond it the list grows as it goes
  count = std::min(count, kMost);
  if (count <= points.capacity()) return;
  try {
    points.reserve(count);
  } catch (const std::bad_alloc&) {
    return;  // the list grows as it goes instead
  }
#if defined(__linux__) && defined(MADV_HUGEPAGE)
  constexpr uintptr_t kHuge = 2u << 20;
  auto data = reinterpret_cast<uintptr_t>(points.data());
  uintptr_t begin = (data + kHuge - 1) & ~(kHuge - 1);
  uintptr_t end = (data + points.capacity() * sizeof(SurveyPoint)) & ~(kHuge - 1);
  if (end > begin) madvise(reinterpret_cast<void*>(begin), end - begin, MADV_HUGEPAGE);
#endif
}

std::uintmax_t BytesLeft(std::istream& in) {
  std::streampos here = in.tellg();
  if (here < 0) return 0;
  in.seekg(0, std::ios::end);
  std::streampos end = in.tellg();
  in.clear();
  in.seekg(here);
  return end > here ? static_cast<std::uintmax_t>(end - here) : 0;
}

void AppendLine(std::string& field, std::string_view line) {
  if (!field.empty()) field += "\r\n";
  field.append(line);
}

namespace {

struct CodeCategory {
  std::string_view code;
  std::string_view category;
};

// Sorted by code for the binary search below.
constexpr CodeCategory kCodeCategories[] = {
    {"AA", "Math"},    {"AR", "Math"},  {"AZ", "Angle"},   {"BP", "Math"},  {"BR", "Bearing"},
    {"BS", "PointID"}, {"CA", "Angle"}, {"CE", "Seconds"}, {"CF", "Math"},  {"DA", "Angle"},
    {"DC", "Angle"},   {"DD", "Math"},  {"DH", "Math"},    {"DI", "Math"},  {"DP", "Math"},
    {"DS", "Math"},    {"DV", "Math"},  {"DX", "Math"},    {"DY", "Math"},  {"DZ", "Math"},
    {"E1", "Math"},    {"E2", "Math"},  {"ED", "Math"},    {"EF", "Math"},  {"EH", "Seconds"},
    {"EV", "Seconds"}, {"EX", "Math"},  {"FM", "Math"},    {"HE", "Math"},  {"HG", "Math"},
    {"HH", "Math"},    {"HO", "Math"},  {"HT", "Math"},    {"HZ", "Math"},  {"IH", "Math"},
    {"L1", "Math"},    {"L2", "Math"},  {"LC", "Math"},    {"LG", "Angle"}, {"LN", "Math"},
    {"LO", "Math"},    {"LT", "Angle"}, {"MO", "Math"},    {"NS", "Math"},  {"OD", "Math"},
    {"OF", "Math"},    {"OO", "Math"},  {"OS", "PointID"}, {"PC", "Math"},  {"PM", "Math"},
    {"PN", "PointID"}, {"PO", "Math"},  {"R1", "Math"},    {"R2", "Math"},  {"R3", "Math"},
    {"RA", "Math"},    {"RO", "Math"},  {"RR", "Math"},    {"S1", "Math"},  {"S2", "Math"},
    {"S3", "Math"},    {"SE", "Math"},  {"SF", "Math"},    {"SH", "Math"},  {"SI", "Math"},
    {"SS", "Math"},    {"SX", "Math"},  {"SY", "Math"},    {"SZ", "Math"},  {"TE", "Math"},
    {"TL", "Math"},    {"TN", "Math"},  {"VE", "Seconds"}, {"VO", "Math"},  {"VT", "Math"},
    {"VV", "Math"},    {"W3", "Math"},  {"WD", "Math"},    {"XC", "Math"},  {"XE", "Math"},
    {"XX", "Math"},    {"YC", "Math"},  {"YE", "Math"},    {"YY", "Math"},  {"ZC", "Math"},
    {"ZE", "Math"},    {"ZZ", "Math"},
};

}  // namespace

std::string RecordCodeCategory(std::string_view code) {
  if (code.size() < 2) return {};
  std::string_view key = code.substr(0, 2);
  auto it = std::lower_bound(std::begin(kCodeCategories), std::end(kCodeCategories), key,
                             [](const CodeCategory& c, std::string_view k) { return c.code < k; });
  if (it == std::end(kCodeCategories) || it->code != key) return {};
  return std::string(it->category);
}

}  // namespace zv
