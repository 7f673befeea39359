// The public structures have one layout on every machine: that of 64-bit Linux.  On 32-bit x86 a
// double in a structure needs no more than 4 bytes' alignment, so what stands before one counts.

#include <cstddef>

#include "tidewater/tidewater.h"

static_assert(sizeof(TWchar16) == 2);
static_assert(sizeof(TWstatus) == 4);

static_assert(sizeof(CoordinateTriple) == 24);
static_assert(offsetof(CoordinateTriple, y) == 8);
static_assert(offsetof(CoordinateTriple, z) == 16);

static_assert(sizeof(AngleUnit) == 48);
static_assert(alignof(AngleUnit) == 8);
static_assert(offsetof(AngleUnit, format) == 0);
static_assert(offsetof(AngleUnit, wide_format) == 0);
static_assert(offsetof(AngleUnit, precision) == 32);
static_assert(offsetof(AngleUnit, hemisphere_mode) == 34);
static_assert(offsetof(AngleUnit, factor) == 40);

static_assert(sizeof(MreTerm) == 16);
static_assert(offsetof(MreTerm, power_u) == 8);
static_assert(offsetof(MreTerm, power_v) == 10);
static_assert(offsetof(MreTerm, reserved) == 12);

static_assert(sizeof(ZoneRecord) == 44);
static_assert(offsetof(ZoneRecord, zone_name) == 2);

static_assert(sizeof(SatelliteRecord) == 120);
static_assert(offsetof(SatelliteRecord, real1) == 32);
static_assert(offsetof(SatelliteRecord, angle1) == 48);
static_assert(offsetof(SatelliteRecord, real3) == 64);
static_assert(offsetof(SatelliteRecord, angle3) == 88);
static_assert(offsetof(SatelliteRecord, count1) == 96);
static_assert(offsetof(SatelliteRecord, short1) == 100);
static_assert(offsetof(SatelliteRecord, id) == 106);
static_assert(offsetof(SatelliteRecord, reserved) == 108);

static_assert(sizeof(MagneticElements) == 32);
static_assert(offsetof(MagneticElements, total) == 24);

static_assert(sizeof(NadconGrid) == 320);
static_assert(offsetof(NadconGrid, nc) == 264);
static_assert(offsetof(NadconGrid, xmin) == 272);
static_assert(offsetof(NadconGrid, dy) == 312);
static_assert(sizeof(NadconControl) == 16264);
static_assert(offsetof(NadconControl, grid_count) == 260);
static_assert(offsetof(NadconControl, grids) == 264);
static_assert(sizeof(NadconWindow) == 56);
static_assert(offsetof(NadconWindow, xmin) == 8);

static_assert(sizeof(GeoidGrid) == 292);
static_assert(offsetof(GeoidGrid, nc) == 260);
static_assert(offsetof(GeoidGrid, xmin) == 268);
static_assert(sizeof(GeoidControl) == 14864);
static_assert(offsetof(GeoidControl, grid_count) == 260);
static_assert(offsetof(GeoidControl, grids) == 264);
static_assert(sizeof(GeoidWindow) == 32);
static_assert(offsetof(GeoidWindow, xmin) == 8);
