// Similarity transformations of geocentric coordinates, and constant shifts.

#include "tidewater/datum.h"

namespace {

// Product of a matrix of nine doubles, row by row, with a vector.
CoordinateTriple rotate(const double* r, const CoordinateTriple& v) {
  return {r[0] * v.x + r[1] * v.y + r[2] * v.z, r[3] * v.x + r[4] * v.y + r[5] * v.z,
          r[6] * v.x + r[7] * v.y + r[8] * v.z};
}

// The same with the transposed matrix, which takes the place of an inverse.
CoordinateTriple rotate_back(const double* r, const CoordinateTriple& v) {
  return {r[0] * v.x + r[3] * v.y + r[6] * v.z, r[1] * v.x + r[4] * v.y + r[7] * v.z,
          r[2] * v.x + r[5] * v.y + r[8] * v.z};
}

}  // namespace

void TWbw_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation, double tx,
            double ty, double tz, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double scale = 1 + s;
  for (int32_t i = 0; i < count; ++i) {
    const auto r = rotate(rotation, {scale * in[i].x, scale * in[i].y, scale * in[i].z});
    out[i] = {r.x + tx, r.y + ty, r.z + tz};
  }
}

void TWbw_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation, double tx,
            double ty, double tz, CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double scale = 1 + s;
  for (int32_t i = 0; i < count; ++i) {
    auto r = rotate_back(rotation, {in[i].x - tx, in[i].y - ty, in[i].z - tz});
    if (scale == 0) {
      *status = TW_SINGULAR;  // the point is written undivided, the loop goes on
    } else {
      r = {r.x / scale, r.y / scale, r.z / scale};
    }
    out[i] = r;
  }
}

void TWmol_bdk_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                 double px, double py, double pz, double qx, double qy, double qz,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double scale = 1 + s;
  for (int32_t i = 0; i < count; ++i) {
    const auto r =
        rotate(rotation, {(in[i].x - px) * scale, (in[i].y - py) * scale, (in[i].z - pz) * scale});
    out[i] = {r.x + qx, r.y + qy, r.z + qz};
  }
}

void TWmol_bdk_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                 double px, double py, double pz, double qx, double qy, double qz,
                 CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  const double scale = 1 + s;
  for (int32_t i = 0; i < count; ++i) {
    auto r = rotate_back(rotation, {in[i].x - qx, in[i].y - qy, in[i].z - qz});
    // By contract: the guard is on the scale difference itself, unlike that of TWbw_i.  Without a
    // scale change the coordinates are right and the word is a failure; a factor of zero is divided
    // by.
    if (s == 0) {
      *status = TW_FAILURE;
    } else {
      r = {r.x / scale, r.y / scale, r.z / scale};
    }
    out[i] = {r.x + px, r.y + py, r.z + pz};
  }
}

void TWshifts_f(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    out[i] = {in[i].x + dx, in[i].y + dy, in[i].z + dz};
  }
}

void TWshifts_i(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                CoordinateTriple* out, TWstatus* status) {
  *status = TW_SUCCESS;
  for (int32_t i = 0; i < count; ++i) {
    out[i] = {in[i].x - dx, in[i].y - dy, in[i].z - dz};
  }
}
