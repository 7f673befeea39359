// PROJ as a peer: the same operation by another implementation.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "tidewater/frame.h"

#ifdef TIDEWATER_HAVE_PROJ
#include <proj.h>
#endif

namespace tidewater::test {

#ifdef TIDEWATER_HAVE_PROJ
// One PROJ operation, from its "+proj=..." text.  Angles in radians, like ours.
class ProjPeer {
 public:
  explicit ProjPeer(const std::string& definition)
      : context_(proj_context_create()), operation_(proj_create(context_, definition.c_str())) {}
  ~ProjPeer() {
    proj_destroy(operation_);
    proj_context_destroy(context_);
  }
  ProjPeer(const ProjPeer&) = delete;
  ProjPeer& operator=(const ProjPeer&) = delete;

  bool ok() const { return operation_ != nullptr; }
  PJ* operation() const { return operation_; }
  CoordinateTriple forward(const CoordinateTriple& p) const { return run(PJ_FWD, p); }
  CoordinateTriple inverse(const CoordinateTriple& p) const { return run(PJ_INV, p); }

 private:
  CoordinateTriple run(PJ_DIRECTION direction, const CoordinateTriple& p) const {
    const PJ_COORD r = proj_trans(operation_, direction, proj_coord(p.x, p.y, p.z, 0));
    return {r.xyz.x, r.xyz.y, r.xyz.z};
  }

  PJ_CONTEXT* context_;
  PJ* operation_;
};
#endif

}  // namespace tidewater::test

#ifdef TIDEWATER_HAVE_PROJ
#define TIDEWATER_NEED_PROJ() static_cast<void>(0)
#else
#define TIDEWATER_NEED_PROJ() GTEST_SKIP() << "PROJ is not installed: no peer to compare with"
#endif
