#pragma once
// The batch exchange with another program: it writes tccin.tmp in the
// application folder (a header of twelve lines and one point per line) and
// starts this program; the answer goes to tccout.tmp there. A request that
// fails leaves no tccout.tmp.

#include <functional>
#include <iosfwd>
#include <string>

#include "geodesy/ConversionDriver.h"
#include "platform/Ui.h"

namespace zv {

inline constexpr const char* kExchangeInput = "tccin.tmp";
inline constexpr const char* kExchangeOutput = "tccout.tmp";

// The Coordinate Conversion window for the manual mode: converts the points
// itself and returns the accepted flag.
using ManualConversion = std::function<bool(ConversionState&)>;

// The request as read from tccin.tmp.
struct ExchangeRequest {
  bool automatic = false;
  bool grid = false;
  std::string coordinateSystem, zone, horizontalDatum, verticalDatum;
  std::string horizontalUnits, verticalUnits;  // full unit names
  std::string heightType, geoidModel;
};

// Reads the request and its points (into state.points) from the stream.
// Lines that break the layout (a short header, unknown horizontal units, a
// point line with too few fields or text where a number belongs) are
// refused with a message naming the line; false then.
bool ReadExchangeRequest(Ui& ui, std::istream& in, ExchangeRequest& request,
                         ConversionState& state);

// The zones.ini section for the request's coordinate system, zone and
// horizontal datum; empty when none fits.
std::string FindExchangeZone(const std::string& appFolder, const std::string& coordinateSystem,
                             const std::string& zone, const std::string& horizontalDatum);

// Writes tccout.tmp (through a temporary file); false (reported) when it
// cannot be written.
bool WriteExchangeAnswer(Ui& ui, const std::string& path, const ConversionState& state,
                         bool automatic);

// The whole exchange: true when tccout.tmp was written. Without a manual
// window the manual mode is refused.
bool BatchExchange(Ui& ui, const std::string& appFolder, ConversionState& state,
                   const ManualConversion& manual);

}  // namespace zv
