// Similarity transformations of geocentric coordinates, and constant shifts: the exported
// functions.

#include "datum/similarity_points.hpp"

#include "tidewater/similarity.h"

using namespace tidewater::detail;

void TWbw_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation, double tx,
            double ty, double tz, CoordinateTriple* out, TWstatus* status) {
  *status =
      over_points(SimilarityForward{rotation, 1 + s, {0, 0, 0}, {tx, ty, tz}}, count, in, out);
}

void TWbw_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation, double tx,
            double ty, double tz, CoordinateTriple* out, TWstatus* status) {
  const bool singular = 1 + s == 0;  // the points are written undivided
  const double over_scale = singular ? 1 : 1 / (1 + s);
  *status =
      over_points(SimilarityInverse{rotation, over_scale, {0, 0, 0}, {tx, ty, tz}}, count, in, out);
  if (singular && count > 0) *status = TW_SINGULAR;
}

void TWmol_bdk_f(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                 double px, double py, double pz, double qx, double qy, double qz,
                 CoordinateTriple* out, TWstatus* status) {
  *status =
      over_points(SimilarityForward{rotation, 1 + s, {px, py, pz}, {qx, qy, qz}}, count, in, out);
}

void TWmol_bdk_i(int32_t count, const CoordinateTriple* in, double s, const double* rotation,
                 double px, double py, double pz, double qx, double qy, double qz,
                 CoordinateTriple* out, TWstatus* status) {
  *status = over_points(SimilarityInverse{rotation, 1 / (1 + s), {px, py, pz}, {qx, qy, qz}}, count,
                        in, out);
  // By contract: the guard is on the scale difference itself, unlike that of TWbw_i.  Without a
  // scale change the coordinates are right and the word is a failure; a factor of zero is divided
  // by.
  if (s == 0 && count > 0) *status = TW_FAILURE;
}

void TWshifts_f(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                CoordinateTriple* out, TWstatus* status) {
  *status = over_points(ConstantShift{dx, dy, dz}, count, in, out);
}

void TWshifts_i(int32_t count, const CoordinateTriple* in, double dx, double dy, double dz,
                CoordinateTriple* out, TWstatus* status) {
  *status = over_points(ConstantShift{-dx, -dy, -dz}, count, in, out);
}
