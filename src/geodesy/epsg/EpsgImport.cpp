#include "geodesy/epsg/EpsgImport.h"

#include <proj.h>

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <initializer_list>
#include <map>
#include <memory>
#include <string_view>

#include "geodesy/Angles.h"
#include "geodesy/Catalogs.h"
#include "platform/Numbers.h"
#include "platform/ScriptedUi.h"
#include "platform/Strings.h"

namespace zv {

namespace {

constexpr const char* kNoDatabase =
    "PROJ's database (proj.db) could not be opened, so systems can not be imported from EPSG. "
    "Install PROJ's data files or set PROJ_DATA to their folder.";
// PROJ's conversion factor of the degree.
constexpr double kProjDegree = 0.017453292519943295;

std::string Cat(std::initializer_list<std::string_view> parts) {
  std::string s;
  for (std::string_view p : parts) s.append(p);
  return s;
}

std::string Text(const char* s) {
  return s == nullptr ? std::string() : std::string(s);
}

// One PROJ context for one operation, with PROJ's own log silenced: the
// callers report what failed.
class Proj {
 public:
  Proj() {
    proj_log_func(ctx_, nullptr, [](void*, int, const char*) {});
  }
  ~Proj() { proj_context_destroy(ctx_); }
  Proj(const Proj&) = delete;
  Proj& operator=(const Proj&) = delete;
  PJ_CONTEXT* ctx() const { return ctx_; }
  bool hasDatabase() const { return proj_context_get_database_path(ctx_) != nullptr; }

 private:
  PJ_CONTEXT* ctx_ = proj_context_create();
};

struct PjDelete {
  void operator()(PJ* p) const { proj_destroy(p); }
};
using Pj = std::unique_ptr<PJ, PjDelete>;

// The program's projection of an EPSG method and the EPSG codes of the
// parameters it takes (0: not taken).
struct Form {
  const char* method;
  const char* projection;
  int latitude, longitude, falseEasting, falseNorthing;
  int scale, parallel1, parallel2, azimuth, skew;
};

constexpr Form kForms[] = {
    {"9807", kTransverseMercator, 8801, 8802, 8806, 8807, 8805, 0, 0, 0, 0},
    {"9801", kLambertOneParallel, 8801, 8802, 8806, 8807, 8805, 0, 0, 0, 0},
    {"9802", kLambertTwoParallels, 8821, 8822, 8826, 8827, 0, 8823, 8824, 0, 0},
    {"9812", kObliqueMercator, 8811, 8812, 8806, 8807, 8815, 0, 0, 8813, 8814},
};

// The linear units of the catalog by EPSG unit code, with their exact length.
struct Unit {
  const char* code;
  const char* name;
  double metres;
};
constexpr Unit kUnits[] = {
    {"9001", kMeters, 1.0},
    {"9002", kInternationalFeet, 0.3048},
    {"9003", kUsSurveyFeet, 1200.0 / 3937.0},
};

const Unit* UnitOf(std::string_view code) {
  for (const Unit& u : kUnits) {
    if (code == u.code) return &u;
  }
  return nullptr;
}

struct Parameter {
  std::string name;
  double value = 0.0, factor = 1.0;
  std::string unitCode, category;
};

// What an EPSG projected system says, read and checked against what the
// program's projections can express.
struct System {
  std::string name;
  std::string refusal;  // empty: the system can be imported
  const Form* form = nullptr;
  std::map<int, Parameter> parameters;
  const Unit* unit = nullptr;
  std::string geodeticName, datumName, ellipsoidName;
  double a = 0.0, e = 0.0, inverseFlattening = 0.0;

  double degrees(int code) const {
    const Parameter& p = parameters.at(code);
    return p.factor == kProjDegree ? p.value : p.value * p.factor / kProjDegree;
  }
  // In the system's unit; a value given in another unit is converted with
  // the exact lengths and kept to a millionth of the unit.
  double length(int code) const {
    const Parameter& p = parameters.at(code);
    const Unit* from = UnitOf(p.unitCode);
    if (from == unit) return p.value;
    return RoundToDecimals(p.value * (from ? from->metres : p.factor) / unit->metres, 6);
  }
  double scale(int code) const {
    const Parameter& p = parameters.at(code);
    return p.value * p.factor;
  }
};

std::string CheckParameters(System& s, PJ_CONTEXT* ctx, PJ* op) {
  const int count = proj_coordoperation_get_param_count(ctx, op);
  for (int i = 0; i < count; ++i) {
    const char *name = nullptr, *auth = nullptr, *code = nullptr, *unitCode = nullptr,
               *category = nullptr;
    Parameter p;
    if (!proj_coordoperation_get_param(ctx, op, i, &name, &auth, &code, &p.value, nullptr,
                                       &p.factor, nullptr, nullptr, &unitCode, &category)) {
      continue;
    }
    if (Text(auth) != "EPSG") continue;
    p.name = Text(name);
    p.unitCode = Text(unitCode);
    p.category = Text(category);
    s.parameters[std::atoi(Text(code).c_str())] = p;
  }
  const Form& f = *s.form;
  const std::pair<int, const char*> wanted[] = {
      {f.latitude, "angular"},     {f.longitude, "angular"}, {f.falseEasting, "linear"},
      {f.falseNorthing, "linear"}, {f.scale, "scale"},       {f.parallel1, "angular"},
      {f.parallel2, "angular"},    {f.azimuth, "angular"},   {f.skew, "angular"}};
  for (const auto& [code, category] : wanted) {
    if (code == 0) continue;
    auto it = s.parameters.find(code);
    if (it == s.parameters.end()) return "a parameter of its projection is missing.";
    if (it->second.category != category) {
      return Cat({"its parameter ", it->second.name, " has an unexpected unit."});
    }
  }
  if (f.skew != 0 && std::fabs(s.degrees(f.skew) - s.degrees(f.azimuth)) > 1e-9) {
    return Cat({"its rectified grid angle (", FormatFixed(s.degrees(f.skew), 9),
                " degrees) differs from the azimuth of its central line (",
                FormatFixed(s.degrees(f.azimuth), 9), " degrees)."});
  }
  if (f.parallel1 != 0 && s.degrees(f.parallel1) == s.degrees(f.parallel2)) {
    return "its two standard parallels are equal.";
  }
  if (std::string_view(f.projection) == kLambertOneParallel && s.degrees(f.latitude) == 0.0) {
    return "its standard parallel is the equator.";
  }
  return {};
}

std::string CheckAxes(System& s, PJ_CONTEXT* ctx, PJ* crs) {
  Pj cs(proj_crs_get_coordinate_system(ctx, crs));
  if (!cs || proj_cs_get_axis_count(ctx, cs.get()) != 2) return "its axes could not be read.";
  std::string directions, units[2], unitName;
  for (int i = 0; i < 2; ++i) {
    const char *direction = nullptr, *name = nullptr, *code = nullptr;
    proj_cs_get_axis_info(ctx, cs.get(), i, nullptr, nullptr, &direction, nullptr, &name, nullptr,
                          &code);
    directions.append(Text(direction)).append(" ");
    units[i] = Text(code);
    unitName = Text(name);
  }
  if (directions != "east north " && directions != "north east ") {
    return "its axes do not point east and north.";
  }
  s.unit = units[0] == units[1] ? UnitOf(units[0]) : nullptr;
  if (s.unit == nullptr) {
    return Cat({"its unit (", unitName, ") is none of Meters, U.S. Survey Feet and ",
                "International Feet."});
  }
  return {};
}

std::string CheckGeodetic(System& s, PJ_CONTEXT* ctx, PJ* crs) {
  Pj meridian(proj_get_prime_meridian(ctx, crs));
  double longitude = 0.0;
  const char* meridianName = meridian ? proj_get_name(meridian.get()) : nullptr;
  if (!meridian ||
      !proj_prime_meridian_get_parameters(ctx, meridian.get(), &longitude, nullptr, nullptr)) {
    return "its prime meridian could not be read.";
  }
  if (longitude != 0.0)
    return Cat({"its prime meridian is ", Text(meridianName), ", not Greenwich."});

  Pj geodetic(proj_crs_get_geodetic_crs(ctx, crs));
  Pj datum(geodetic ? proj_crs_get_datum_forced(ctx, geodetic.get()) : nullptr);
  Pj ellipsoid(proj_get_ellipsoid(ctx, crs));
  double b = 0.0;
  int computed = 0;
  if (!geodetic || !datum || !ellipsoid ||
      !proj_ellipsoid_get_parameters(ctx, ellipsoid.get(), &s.a, &b, &computed,
                                     &s.inverseFlattening)) {
    return "its datum could not be read.";
  }
  s.geodeticName = Text(proj_get_name(geodetic.get()));
  s.datumName = Text(proj_get_name(datum.get()));
  s.ellipsoidName = Text(proj_get_name(ellipsoid.get()));
  const double f = s.inverseFlattening > 0.0 ? 1.0 / s.inverseFlattening : 1.0 - b / s.a;
  s.e = std::sqrt(f * (2.0 - f));
  return {};
}

System Read(PJ_CONTEXT* ctx, PJ* crs) {
  System s;
  s.name = Text(proj_get_name(crs));
  if (proj_get_type(crs) != PJ_TYPE_PROJECTED_CRS) {
    s.refusal = std::string("it is not a projected coordinate system.");
    return s;
  }
  Pj op(proj_crs_get_coordoperation(ctx, crs));
  const char *methodName = nullptr, *auth = nullptr, *code = nullptr;
  if (!op || !proj_coordoperation_get_method_info(ctx, op.get(), &methodName, &auth, &code)) {
    s.refusal = std::string("its projection could not be read.");
    return s;
  }
  for (const Form& f : kForms) {
    if (Text(auth) == "EPSG" && Text(code) == f.method) s.form = &f;
  }
  if (s.form == nullptr) {
    s.refusal = Cat({"its projection (", Text(methodName),
                     ") is none of Transverse Mercator, Lambert Conic Conformal (1SP), Lambert ",
                     "Conic Conformal (2SP) and Hotine Oblique Mercator (variant A)."});
    return s;
  }
  s.refusal = CheckParameters(s, ctx, op.get());
  if (s.refusal.empty()) s.refusal = CheckAxes(s, ctx, crs);
  if (s.refusal.empty()) s.refusal = CheckGeodetic(s, ctx, crs);
  return s;
}

// Upper case without blanks: "NAD 83" and "NAD83" compare equal.
std::string Squeezed(std::string_view s) {
  std::string out;
  for (char c : ToUpper(s)) {
    if (c != ' ') out.push_back(c);
  }
  return out;
}

bool SameEllipsoid(const EllipsoidRecord& r, double a, double e) {
  const std::optional<double> ra = r.semimajorAxis.value(), re = r.eccentricity.value();
  return ra && re && std::fabs(*ra - a) < 1e-4 && std::fabs(*re - e) < 1e-11;
}

// The state HPGN datum of a NAD83(HARN) system: the catalog's "<state>
// HPGN" (states joined by "-") whose state begins the system's area name.
std::vector<std::string> StateHpgn(const System& s, const std::vector<DatumRecord>& datums) {
  const size_t slash = s.name.find(" / ");
  const std::string area = slash == std::string::npos ? "" : s.name.substr(slash + 3);
  std::vector<std::string> found;
  for (const DatumRecord& d : datums) {
    const size_t at = d.name.find(" HPGN");
    if (at == std::string::npos) continue;
    std::string_view states(d.name.data(), at);
    while (!states.empty()) {
      const size_t dash = std::min(states.find('-'), states.size());
      const std::string_view state = states.substr(0, dash);
      if (area.starts_with(state) && (area.size() == state.size() || area[state.size()] == ' ')) {
        found.push_back(d.name);
        break;
      }
      states.remove_prefix(std::min(dash + 1, states.size()));
    }
  }
  return found;
}

// The catalog's horizontal datum and, when the datum's ellipsoid is not the
// system's, the computational ellipsoid; `error` when no ellipsoid fits.
struct CatalogMatch {
  std::string datum, ellipsoid, note, error;
};

CatalogMatch MatchCatalog(const System& s, const std::string& appFolder) {
  std::vector<DatumRecord> datums;
  for (DatumRecord& d : DatumStore::In(appFolder).loadAll()) {
    if (d.type == "Horizontal") datums.push_back(std::move(d));
  }
  const std::vector<EllipsoidRecord> ellipsoids = EllipsoidStore::In(appFolder).loadAll();
  auto named = [&](std::string_view squeezed) -> std::string {
    for (const DatumRecord& d : datums) {
      if (Squeezed(d.name) == squeezed) return d.name;
    }
    return {};
  };

  CatalogMatch m;
  const std::string geodetic = Squeezed(s.geodeticName);
  m.datum = named(geodetic);
  if (!m.datum.empty()) {
    m.note = Cat({"Horizontal Datum: ", m.datum, " (", s.datumName, ")."});
  } else if (geodetic == "NAD83(HARN)") {
    const std::vector<std::string> hpgn = StateHpgn(s, datums);
    if (hpgn.size() == 1) {
      m.datum = hpgn.front();
      m.note = Cat({"Horizontal Datum: ", m.datum, " (", s.datumName, ")."});
    } else {
      m.note = Cat({s.datumName, ": no single HPGN datum of the catalog fits ", s.name,
                    "; the Horizontal Datum is left empty, choose it before use."});
    }
  } else {
    // A realisation, "NAD83(2011)", taken as its datum, "NAD83".
    const size_t paren = geodetic.find('(');
    if (paren != std::string::npos) m.datum = named(geodetic.substr(0, paren));
    if (!m.datum.empty()) {
      m.note = Cat({"Horizontal Datum: ", m.datum, ". The catalog has no datum of its own for ",
                    s.datumName, "; datum shifts treat the zone as ", m.datum, "."});
    } else {
      m.note = Cat({"The catalog has no datum for ", s.datumName,
                    "; the Horizontal Datum is left empty, choose it before use."});
    }
  }

  if (!m.datum.empty()) {
    const DatumRecord& d =
        *std::find_if(datums.begin(), datums.end(), [&](auto& r) { return r.name == m.datum; });
    for (const EllipsoidRecord& r : ellipsoids) {
      if (EqualsNoCase(r.name, d.ellipsoid) && SameEllipsoid(r, s.a, s.e)) return m;
    }
  }
  for (const EllipsoidRecord& r : ellipsoids) {
    if (SameEllipsoid(r, s.a, s.e)) {
      m.ellipsoid = r.name;
      m.note.append(" Computational Ellipsoid: ").append(r.name).append(".");
      return m;
    }
  }
  m.error = Cat({"its ellipsoid ", s.ellipsoidName, " (semimajor axis ", FormatPlainDecimal(s.a),
                 ", eccentricity ", FormatFixed(s.e, 12), ") is not in the ellipsoid catalog."});
  return m;
}

}  // namespace

EpsgSearch SearchEpsg(const std::string& query, std::size_t limit) {
  EpsgSearch out;
  Proj proj;
  if (!proj.hasDatabase()) {
    out.error = std::string(kNoDatabase);
    return out;
  }
  std::string code(Trim(query));
  if (EqualsNoCase(code.substr(0, 5), "EPSG:")) code.erase(0, 5);
  std::vector<std::string> words;
  for (size_t at = 0; at < code.size();) {
    const size_t end = std::min(code.find(' ', at), code.size());
    if (end > at) words.push_back(ToLower(code.substr(at, end - at)));
    at = end + 1;
  }
  if (words.empty()) return out;

  PROJ_CRS_LIST_PARAMETERS* parameters = proj_get_crs_list_parameters_create();
  const PJ_TYPE projected = PJ_TYPE_PROJECTED_CRS;
  parameters->types = &projected;
  parameters->typesCount = 1;
  int count = 0;
  PROJ_CRS_INFO** list =
      proj_get_crs_info_list_from_database(proj.ctx(), "EPSG", parameters, &count);
  proj_get_crs_list_parameters_destroy(parameters);
  if (list == nullptr) {
    out.error = std::string(kNoDatabase);
    return out;
  }
  for (int i = 0; i < count; ++i) {
    const PROJ_CRS_INFO& info = *list[i];
    const std::string name = Text(info.name), lower = ToLower(name);
    const bool match = Text(info.code) == code ||
                       (!info.deprecated && std::all_of(words.begin(), words.end(), [&](auto& w) {
                         return lower.find(w) != std::string::npos;
                       }));
    if (match) out.candidates.push_back({Text(info.code), name, {}});
  }
  proj_crs_info_list_destroy(list);

  std::sort(out.candidates.begin(), out.candidates.end(), [](auto& x, auto& y) {
    return x.name != y.name ? x.name < y.name
                            : std::atoi(x.code.c_str()) < std::atoi(y.code.c_str());
  });
  if (out.candidates.size() > limit) out.candidates.resize(limit);
  for (EpsgCandidate& c : out.candidates) {
    Pj crs(
        proj_create_from_database(proj.ctx(), "EPSG", c.code.c_str(), PJ_CATEGORY_CRS, 0, nullptr));
    c.refusal = crs ? Read(proj.ctx(), crs.get()).refusal : std::string("it could not be read.");
  }
  return out;
}

EpsgZone ZoneFromEpsg(const std::string& code, const std::string& appFolder) {
  EpsgZone out;
  Proj proj;
  if (!proj.hasDatabase()) {
    out.error = std::string(kNoDatabase);
    return out;
  }
  const std::string trimmed(Trim(code));
  Pj crs(
      proj_create_from_database(proj.ctx(), "EPSG", trimmed.c_str(), PJ_CATEGORY_CRS, 0, nullptr));
  if (!crs) {
    out.error = Cat({"EPSG:", trimmed, " is not in PROJ's database."});
    return out;
  }
  const System s = Read(proj.ctx(), crs.get());
  CatalogMatch m;
  if (s.refusal.empty()) m = MatchCatalog(s, appFolder);
  const std::string& refusal = s.refusal.empty() ? m.error : s.refusal;
  if (!refusal.empty()) {
    out.error = Cat({"EPSG:", trimmed, " (", s.name, ") can not be imported: ", refusal});
    return out;
  }

  const Form& f = *s.form;
  ZoneRecord& z = out.zone;
  ScriptedUi quiet;
  auto angle = [&](int parameter) {
    return CatalogAngle::Of(quiet, s.degrees(parameter) * kDegreesToRadians);
  };
  z.fullName = Cat({s.name, " (EPSG:", trimmed, ")"});
  z.horizontalDatum = m.datum;
  z.computationalEllipsoid = m.ellipsoid;
  z.projection = std::string(f.projection);
  z.centralLatitude = angle(f.latitude);
  // East of Greenwich the longitude is kept positive east.
  const double longitude = s.degrees(f.longitude);
  z.longitudeDirection = std::string(longitude > 0.0 ? "E" : "W");
  z.centralLongitude = CatalogAngle::Of(quiet, std::fabs(longitude) * kDegreesToRadians);
  z.falseNorthing = CatalogNumber::Of(s.length(f.falseNorthing));
  z.falseEasting = CatalogNumber::Of(s.length(f.falseEasting));
  if (f.scale != 0) z.scaleFactor = CatalogNumber::Of(s.scale(f.scale));
  if (f.parallel1 != 0) {
    const double p1 = s.degrees(f.parallel1), p2 = s.degrees(f.parallel2);
    z.northernParallel = angle(p1 > p2 ? f.parallel1 : f.parallel2);
    z.southernParallel = angle(p1 > p2 ? f.parallel2 : f.parallel1);
  }
  if (f.azimuth != 0) z.azimuth = angle(f.azimuth);
  z.latitudeDirection = std::string("N");
  z.linearUnits = std::string(s.unit->name);
  out.datumNote = m.note;
  if (!quiet.boxes.empty()) {
    out = EpsgZone{};
    out.error =
        Cat({"EPSG:", trimmed, " (", s.name, ") can not be imported: ", quiet.boxes.front().text});
  }
  return out;
}

}  // namespace zv
