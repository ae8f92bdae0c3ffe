#pragma once
// From a resolved zone (ResolveZone) to the right projection form: one table
// maps the six "Projection" names to their set-up, and the zone record it
// returns selects the forward and inverse routines. Parameters a projection
// does not use are ignored (they are kNoValue).

#include <variant>

#include "geodesy/Catalogs.h"
#include "geodesy/Lambert.h"
#include "geodesy/ObliqueMercator.h"
#include "geodesy/ProjectionMath.h"
#include "geodesy/TransverseMercator.h"

namespace zv {

enum class ProjectionStatus {
  Ok,
  UnknownProjection,  // the name is none of the six
  MappingRadius,      // a Lambert cone that does not compute: kMappingRadiusMessage
};

struct ProjectionZone {
  std::variant<std::monostate, TmZone, Tm27Zone, Lambert2Zone, Lambert1Zone, Lambert27Zone, OmZone>
      record;
  ProjectionStatus status = ProjectionStatus::UnknownProjection;
  // True for the NAD 27 forms: northings and eastings in U.S. survey feet.
  bool usSurveyFeet = false;
};

// Sets up the zone. Every NAD 27 Transverse Mercator zone, the Alaska zones
// 2 to 9 included, takes the one NAD 27 form (Tm27Zone).
ProjectionZone Projection_SetZone(const ZoneParameters& zone);

// Forward and inverse of the zone's form. A zone whose status is not Ok, or
// an input that is -99999, gives -99999 in every field.
GridPoint Projection_GeographicToGrid(const ProjectionZone& zone, double phi, double lambda);
GeographicPoint Projection_GridToGeographic(const ProjectionZone& zone, double northing,
                                            double easting);

}  // namespace zv
