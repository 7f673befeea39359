/**
 * Coordinate systems by name, transformations between them, map projections, geodesics and rhumb
 * lines.  Longitude or easting first, degrees, metres or the system's own unit.
 */

/** Loads the library, once for each program or page; all that follows is synchronous. */
export function load(options?: LoadOptions): Promise<Tidewater>;

export interface LoadOptions {
  /** The bytes of library.wasm.gz, packed or not, where they are not read from beside the module. */
  wasm?: Uint8Array;
  /** The bytes of tables.bin.gz, packed or unpacked, likewise. */
  tables?: Uint8Array;
}

export interface Tidewater {
  readonly version: string;
  /** From a code ("EPSG:2154"), a name, a PROJ string or WKT.  Throws an Error with the reason. */
  system(text: string): System;
  transformation(
    source: string | System, target: string | System, options?: TransformationOptions): Transformation;
  /**
   * A projection by method and parameters, such as
   * `projection("lambert conformal", { lat1: 44, lat2: 49, lat0: 46.5, lon0: 3 })`.
   */
  projection(
    method: string, parameters?: Record<string, number>, ellipsoid?: Ellipsoid): Projection;
  /** The projection of a projected system, in metres. */
  projectionOf(system: string | System): Projection;
  geodesics(ellipsoid?: Ellipsoid): Lines;
  rhumbLines(ellipsoid?: Ellipsoid): Lines;
  /** The names of all projection methods. */
  methods(): string[];
  /** Registry codes of systems whose names have these words. */
  search(words: string, limit?: number): number[];
  /** Degrees of an angle as people write it: 48°23'25.1"N, 48 23.418, 48.3903. */
  parseAngle(text: string, axis?: "either" | "longitude" | "latitude"): number;
  /** Where the text does not tell which comes first, `order` does, or an Error is thrown. */
  parsePosition(
    text: string, order?: "told" | "longitude" | "latitude"): Position;
  parseMgrs(text: string): { longitude: number; latitude: number };
  /** Empty where the point has no reference. */
  formatMgrs(longitude: number, latitude: number, digits?: number): string;
  /** Gives a grid file's bytes to transformations made after it, under the name they look for. */
  addGrid(name: string, bytes: Uint8Array): void;
}

export interface Position {
  longitude: number;
  latitude: number;
  height?: number;
}

export interface Ellipsoid {
  /** Semi-major axis, metres. */
  a: number;
  /** 0 for a sphere. */
  inverseFlattening: number;
}

export interface Area {
  west: number;
  south: number;
  east: number;
  north: number;
}

interface Freed {
  /** Gives the library's part back at once; otherwise it goes with the object. */
  free(): void;
}

export interface System extends Freed {
  /** Registry code, 0 without one. */
  readonly code: number;
  readonly name: string;
  readonly kind:
    "geographic 2D" | "geographic 3D" | "geocentric" | "projected" | "vertical" | "compound";
  readonly datum: string;
  /** The projection method; empty without one. */
  readonly method: string;
  readonly unit: string;
  /** Metres or radians in one unit. */
  readonly unitFactor: number;
  /** The axes in the registry's order, such as "EN". */
  readonly axes: string;
  /** Area of use in degrees; west is greater than east across the 180th meridian. */
  readonly area: Area | undefined;
  describe(): string;
  toText(form?: "wkt2" | "wkt1" | "esri" | "proj"): string;
}

export interface TransformationOptions {
  /** The datum operation to use, such as "EPSG:1671"; the best one without it. */
  operation?: string;
  /** Where the points lie. */
  area?: Area;
  /** Decimal year of the coordinates. */
  epoch?: number;
  /** Geographic coordinates in radians. */
  radians?: boolean;
  /** Axes in the systems' own order instead of longitude or easting first. */
  ownAxes?: boolean;
}

interface Mapping extends Freed {
  /** A point; not-a-numbers where it has no image. */
  forward(x: number, y: number): [x: number, y: number];
  /** Points in place; gives the number of those that failed, which become not-a-numbers. */
  forward(x: Float64Array, y: Float64Array): number;
  inverse(x: number, y: number): [x: number, y: number];
  inverse(x: Float64Array, y: Float64Array): number;
  /** Points one behind the other, x, y and what else they have, in place. */
  forwardPoints(points: Float64Array, dimension?: number): number;
  inversePoints(points: Float64Array, dimension?: number): number;
}

export interface Transformation extends Mapping {
  readonly source: System;
  readonly target: System;
  /** Stated accuracy of the datum step in metres: 0 without one, not-a-number when unknown. */
  readonly accuracy: number;
  /** The datum step, as options take it; empty without one. */
  readonly operation: string;
  forward(x: number, y: number): [x: number, y: number];
  forward(x: number, y: number, z: number): [x: number, y: number, z: number];
  forward(x: Float64Array, y: Float64Array, z?: Float64Array): number;
  inverse(x: number, y: number): [x: number, y: number];
  inverse(x: number, y: number, z: number): [x: number, y: number, z: number];
  inverse(x: Float64Array, y: Float64Array, z?: Float64Array): number;
  /** Why a point has no image; empty where it has one. */
  why(x: number, y: number, z?: number, inverse?: boolean): string;
  /** The steps in words, a line each. */
  describe(): string;
}

export interface Projection extends Mapping {
  /** Why a point has no image; empty where it has one. */
  why(x: number, y: number, inverse?: boolean): string;
  /** Distortion at points of degrees. */
  factors(longitude: number, latitude: number): Factors<number>;
  factors(longitude: Float64Array, latitude: Float64Array): Factors<Float64Array>;
}

export interface Factors<Value> {
  /** Scale along the meridian. */
  meridional: Value;
  /** Scale along the parallel. */
  parallel: Value;
  /** Scale of areas. */
  areal: Value;
  /** Bearing of grid north from true north, degrees, clockwise positive. */
  convergence: Value;
  /** Largest angular distortion, degrees. */
  angular: Value;
}

/** Lines on the ellipsoid; degrees and metres. */
export interface Lines extends Freed {
  direct(longitude: number, latitude: number, azimuth: number, length: number):
    { longitude: number; latitude: number; azimuth: number };
  inverse(longitude1: number, latitude1: number, longitude2: number, latitude2: number):
    { length: number; azimuth1: number; azimuth2: number };
  /** Points at equal distances on the way, both ends included. */
  between(
    longitude1: number, latitude1: number, longitude2: number, latitude2: number, count?: number):
    { longitudes: Float64Array; latitudes: Float64Array };
  /** Perimeter, and area counterclockwise positive. */
  polygon(longitudes: Float64Array, latitudes: Float64Array): { perimeter: number; area: number };
}
