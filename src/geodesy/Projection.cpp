#include "geodesy/Projection.h"

#include <array>

#include "platform/Numbers.h"

namespace zv {

namespace {

using SetUp = ProjectionZone (*)(const ZoneParameters&);

ProjectionZone Ok(auto record, bool usSurveyFeet = false) {
  ProjectionZone zone;
  zone.record = record;
  zone.status = ProjectionStatus::Ok;
  zone.usSurveyFeet = usSurveyFeet;
  return zone;
}

ProjectionZone SetUpTM(const ZoneParameters& d) {
  return Ok(TM_SetZone(d.a, d.e, d.phi0, d.lambda0, d.falseNorthing, d.falseEasting, d.k0));
}

ProjectionZone SetUpLambert1(const ZoneParameters& d) {
  return Ok(Lambert1_SetZone(d.a, d.e, d.phi0, d.lambda0, d.falseNorthing, d.falseEasting, d.k0));
}

ProjectionZone SetUpTM27(const ZoneParameters& d) {
  return Ok(TM27_SetZone(d.phi0, d.lambda0, d.falseNorthing, d.falseEasting, d.k0), true);
}

ProjectionZone SetUpLambert2(const ZoneParameters& d) {
  ProjectionZone zone = Ok(Lambert2_SetZone(d.phiS, d.phiN, d.phi0, d.lambda0, d.falseNorthing,
                                            d.falseEasting, d.a, d.e));
  if (!std::get<Lambert2Zone>(zone.record).mappingRadiusOk) {
    zone.status = ProjectionStatus::MappingRadius;
  }
  return zone;
}

ProjectionZone SetUpLambert27(const ZoneParameters& d) {
  ProjectionZone zone = Ok(Lambert27_SetZone(d.phiS, d.phiN, d.phi0, d.lambda0, d.falseNorthing,
                                             d.falseEasting, d.a, d.e),
                           true);
  if (!std::get<Lambert27Zone>(zone.record).mappingRadiusOk) {
    zone.status = ProjectionStatus::MappingRadius;
  }
  return zone;
}

ProjectionZone SetUpOM(const ZoneParameters& d) {
  return Ok(
      OM_SetZone(d.a, d.e, d.phi0, d.lambda0, d.falseNorthing, d.falseEasting, d.k0, d.azimuth));
}

struct Form {
  const char* name;
  SetUp setUp;
};

constexpr std::array<Form, 6> kForms{{
    {kTransverseMercator, SetUpTM},
    {kLambertOneParallel, SetUpLambert1},
    {kTransverseMercatorNad27, SetUpTM27},
    {kLambertTwoParallels, SetUpLambert2},
    {kLambertNad27, SetUpLambert27},
    {kObliqueMercator, SetUpOM},
}};

template <class... Ts>
struct Overloaded : Ts... {
  using Ts::operator()...;
};
template <class... Ts>
Overloaded(Ts...) -> Overloaded<Ts...>;

}  // namespace

ProjectionZone Projection_SetZone(const ZoneParameters& parameters) {
  for (const Form& form : kForms) {
    if (parameters.projection == form.name) return form.setUp(parameters);
  }
  return ProjectionZone{};
}

GridPoint Projection_GeographicToGrid(const ProjectionZone& zone, double phi, double lambda) {
  if (zone.status != ProjectionStatus::Ok || phi == kNoValue || lambda == kNoValue) {
    return {kNoValue, kNoValue, kNoValue, kNoValue};
  }
  return std::visit(
      Overloaded{
          [](std::monostate) {
            return GridPoint{kNoValue, kNoValue, kNoValue, kNoValue};
          },
          [&](const TmZone& z) { return TM_GeographicToGrid(z, phi, lambda); },
          [&](const Tm27Zone& z) { return TM27_GeographicToGrid(z, phi, lambda); },
          [&](const Lambert2Zone& z) { return Lambert2_GeographicToGrid(z, phi, lambda); },
          [&](const Lambert1Zone& z) { return Lambert1_GeographicToGrid(z, phi, lambda); },
          [&](const Lambert27Zone& z) { return Lambert27_GeographicToGrid(z, phi, lambda); },
          [&](const OmZone& z) { return OM_GeographicToGrid(z, phi, lambda); },
      },
      zone.record);
}

GeographicPoint Projection_GridToGeographic(const ProjectionZone& zone, double northing,
                                            double easting) {
  if (zone.status != ProjectionStatus::Ok || northing == kNoValue || easting == kNoValue) {
    return {kNoValue, kNoValue, kNoValue, kNoValue};
  }
  return std::visit(
      Overloaded{
          [](std::monostate) {
            return GeographicPoint{kNoValue, kNoValue, kNoValue, kNoValue};
          },
          [&](const TmZone& z) { return TM_GridToGeographic(z, northing, easting); },
          [&](const Tm27Zone& z) { return TM27_GridToGeographic(z, northing, easting); },
          [&](const Lambert2Zone& z) { return Lambert2_GridToGeographic(z, northing, easting); },
          [&](const Lambert1Zone& z) { return Lambert1_GridToGeographic(z, northing, easting); },
          [&](const Lambert27Zone& z) { return Lambert27_GridToGeographic(z, northing, easting); },
          [&](const OmZone& z) { return OM_GridToGeographic(z, northing, easting); },
      },
      zone.record);
}

}  // namespace zv
