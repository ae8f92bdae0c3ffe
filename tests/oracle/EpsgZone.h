#pragma once
// PROJ's definition of an EPSG projected system: east-positive degrees to its
// easting and northing in its own units, its units and area of use, and the
// convergence and scale factor of its projection.

#include <proj.h>

#include <cstdlib>
#include <string>

namespace zv::test {

// The EPSG code in a "Full Name" such as "Alabama East 0101 (EPSG:26929)"; 0 when none.
inline int EpsgCode(const std::string& fullName) {
  const size_t at = fullName.find("EPSG:");
  return at == std::string::npos ? 0 : std::atoi(fullName.c_str() + at + 5);
}

class EpsgZone {
 public:
  explicit EpsgZone(int code) {
    crs_ = proj_create(ctx_, ("EPSG:" + std::to_string(code)).c_str());
    if (crs_ == nullptr) return;
    hasArea = proj_get_area_of_use(ctx_, crs_, &west, &south, &east, &north, nullptr) != 0;
    PJ* cs = proj_crs_get_coordinate_system(ctx_, crs_);
    proj_cs_get_axis_info(ctx_, cs, 0, nullptr, nullptr, nullptr, &toMeters, nullptr, nullptr,
                          nullptr);
    proj_destroy(cs);
    PJ* base = proj_crs_get_geodetic_crs(ctx_, crs_);
    PJ* op = proj_create_crs_to_crs_from_pj(ctx_, base, crs_, nullptr, nullptr);
    op_ = proj_normalize_for_visualization(ctx_, op);
    proj_destroy(op);
    proj_destroy(base);
    // proj_factors does not take the foot units of a system: the projection in metres.
    std::string def = proj_as_proj_string(ctx_, crs_, PJ_PROJ_5, nullptr);
    for (const char* key : {" +units=", " +vunits="}) {
      const size_t at = def.find(key);
      if (at != std::string::npos) def.erase(at, def.find(' ', at + 1) - at);
    }
    metres_ = proj_create(ctx_, (def + " +units=m").c_str());
  }
  ~EpsgZone() {
    for (PJ* p : {metres_, op_, crs_}) proj_destroy(p);
    proj_context_destroy(ctx_);
  }
  EpsgZone(const EpsgZone&) = delete;
  EpsgZone& operator=(const EpsgZone&) = delete;

  bool ok() const { return op_ != nullptr; }
  PJ_XY forward(double latDeg, double lonDeg) const {
    return proj_trans(op_, PJ_FWD, proj_coord(lonDeg, latDeg, 0, 0)).xy;
  }
  PJ_LP inverse(double easting, double northing) const {
    return proj_trans(op_, PJ_INV, proj_coord(easting, northing, 0, 0)).lp;
  }
  PJ_FACTORS factors(double latDeg, double lonDeg) const {
    constexpr double kDeg = 3.14159265358979323846 / 180.0;
    return proj_factors(metres_, proj_coord(lonDeg * kDeg, latDeg * kDeg, 0, 0));
  }

  double toMeters = 1.0, west = 0, south = 0, east = 0, north = 0;
  bool hasArea = false;

 private:
  PJ_CONTEXT* ctx_ = proj_context_create();
  PJ *crs_ = nullptr, *op_ = nullptr, *metres_ = nullptr;
};

}  // namespace zv::test
