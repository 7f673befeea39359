// The projections of the explorer: the library's methods, what may be changed about them, and the
// part of the Earth that each shows.

import { across, band, cap, capWithout } from "./domain.js";

const lon0 = (value = 0) => ({ key: "lon0", label: "Central meridian", min: -180, max: 180, value });
const lat0 = (value = 0) => ({ key: "lat0", label: "Latitude of origin", min: -90, max: 90, value });
const centre = (lon, lat) => [
  { key: "lon0", label: "Longitude of the centre", min: -180, max: 180, value: lon },
  { key: "lat0", label: "Latitude of the centre", min: -90, max: 90, value: lat },
];
const parallel = (value, min = 0, max = 80) => ({
  key: "lat1", label: "Standard parallel", min, max, value, parallel: true });
const parallels = (first, second) => [
  { key: "lat1", label: "First standard parallel", min: -80, max: 80, value: first, parallel: true },
  { key: "lat2", label: "Second standard parallel", min: -80, max: 80, value: second, parallel: true },
];
const azimuth = (value) => ({
  key: "azimuth", label: "Azimuth of the central line", min: -85, max: 85, value });
const height = (value) => ({
  key: "h", label: "Height of the viewpoint", min: 1000000, max: 40000000, step: 100000, value,
  unit: "m" });
const tilt = (value) => ({ key: "tilt", label: "Tilt", min: 0, max: 40, value });

const world = (p) => band(p.lon0, 180, -90, 90);
const upTo = (limit) => (p) => band(p.lon0, 180, -limit, limit);
const around = (radius) => (p) => cap(p.lon0, p.lat0, radius);
const horizon = (p) => (Math.acos(6378137 / (6378137 + p.h)) * 180) / Math.PI;
const conic = (reach) => (p) => {
  const north = (p.lat1 ?? p.lat0) + (p.lat2 ?? p.lat0) >= 0;
  return north ? band(p.lon0, 180, -reach, 90) : band(p.lon0, 180, -90, reach);
};
// A region with a centre of its own, in degrees, and a radius.
const region = (lon, lat, radius) => () => cap(lon, lat, radius);

export const FAMILIES = [
  "World", "Cylindrical", "Conic", "Azimuthal and perspective", "For one country or region"];

export const PROJECTIONS = [
  // World maps.
  { id: "robinson", name: "Robinson", method: "robinson", family: "World", keeps: "compromise",
    controls: [lon0()], domain: world,
    use: "A world map for the wall and the atlas: nothing is exact and nothing looks wrong." },
  { id: "equal-earth", name: "Equal Earth", method: "equal earth", family: "World",
    keeps: "equal area", controls: [lon0()], domain: world,
    use: "World maps of anything counted by area, with continents of familiar shape." },
  { id: "mollweide", name: "Mollweide", method: "mollweide", family: "World", keeps: "equal area",
    controls: [lon0()], domain: world,
    use: "Global distributions, and the whole sky, in an ellipse of true areas." },
  { id: "eckert-4", name: "Eckert IV", method: "eckert iv", family: "World", keeps: "equal area",
    controls: [lon0()], domain: world,
    use: "Thematic world maps: true areas, and poles drawn as lines so that the north is not crowded." },
  { id: "sinusoidal", name: "Sinusoidal", method: "sinusoidal", family: "World",
    keeps: "equal area", controls: [lon0()], domain: world,
    use: "Raster grids of satellite data: true areas, and every parallel at its true length." },
  { id: "van-der-grinten", name: "Van der Grinten", method: "van der grinten", family: "World",
    keeps: "compromise", controls: [lon0()], domain: world,
    use: "The world in a circle, with the look of older political maps." },
  { id: "bonne", name: "Bonne", method: "bonne", family: "World", keeps: "equal area",
    controls: [lon0(), { ...lat0(45), label: "Standard parallel", min: 5, max: 88, parallel: true }],
    domain: world,
    use: "Topographic maps of the nineteenth century; at a steep parallel, a heart." },
  { id: "polyconic", name: "American polyconic", method: "polyconic", family: "World",
    keeps: "compromise", controls: [lon0()], domain: (p) => band(p.lon0, 80, -85, 85),
    use: "Older quadrangle maps: every parallel is true, close to the central meridian." },

  // Cylindrical.
  { id: "mercator", name: "Mercator", method: "mercator", family: "Cylindrical", keeps: "conformal",
    controls: [lon0(), parallel(0)], domain: upTo(82),
    use: "Sea charts: a course of constant bearing is a straight line." },
  { id: "web-mercator", name: "Popular visualisation Mercator", method: "pseudo mercator",
    family: "Cylindrical", keeps: "nearly conformal", controls: [lon0()], domain: upTo(85.06),
    use: "Tiles of maps on the web; not for measuring." },
  { id: "miller", name: "Miller cylindrical", method: "miller", family: "Cylindrical",
    keeps: "compromise", controls: [lon0()], domain: world,
    use: "A rectangular world map that shows the poles, milder than Mercator's." },
  { id: "equidistant-cylindrical", name: "Equidistant cylindrical", method: "equidistant cylindrical",
    family: "Cylindrical", keeps: "equidistant", controls: [lon0(), parallel(0)], domain: world,
    use: "Grids of data by degree, and the simplest exchange of world images." },
  { id: "cylindrical-equal-area", name: "Lambert cylindrical equal area",
    method: "cylindrical equal area", family: "Cylindrical", keeps: "equal area",
    controls: [lon0(), parallel(30)], domain: world,
    use: "Areas in the tropics; its standard parallel makes it Behrmann's, Gall's or Peters's map." },
  { id: "transverse-mercator", name: "Transverse Mercator", method: "transverse mercator",
    family: "Cylindrical", keeps: "conformal", controls: [lon0(10)],
    domain: (p) => across(p.lon0, 90, 32.5),
    use: "National grids and UTM: zones that reach from south to north." },
  { id: "oblique-mercator", name: "Oblique Mercator", method: "oblique mercator",
    family: "Cylindrical", keeps: "conformal", controls: [...centre(102, 4), azimuth(53)],
    fixed: (p) => ({ gamma: p.azimuth }), domain: around(50),
    use: "Countries and satellite tracks that lie along a slanted line." },
  { id: "cassini", name: "Cassini-Soldner", method: "cassini", family: "Cylindrical",
    keeps: "equidistant", controls: [lon0(0)], domain: (p) => band(p.lon0, 36, -85, 85),
    use: "Cadastral maps older than conformal ones; distances square to the meridian are true." },

  // Conic.
  { id: "lambert-conformal", name: "Lambert conformal conic", method: "lambert conformal",
    family: "Conic", keeps: "conformal", controls: [lon0(0), ...parallels(30, 60)],
    fixed: (p) => ({ lat0: (p.lat1 + p.lat2) / 2 }), domain: conic(30),
    use: "Aeronautical charts and countries wider than high: France, the states of the US." },
  { id: "albers", name: "Albers equal area", method: "albers", family: "Conic", keeps: "equal area",
    controls: [lon0(-96), ...parallels(29.5, 45.5)],
    fixed: (p) => ({ lat0: (p.lat1 + p.lat2) / 2 }), domain: conic(40),
    use: "Statistics of continents in middle latitudes, such as the United States." },
  { id: "equidistant-conic", name: "Equidistant conic", method: "equidistant conic", family: "Conic",
    keeps: "equidistant", controls: [lon0(60), ...parallels(40, 60)],
    fixed: (p) => ({ lat0: (p.lat1 + p.lat2) / 2 }), domain: conic(40),
    use: "Atlas maps of wide countries: every meridian is true to scale." },
  { id: "lambert-near-conformal", name: "Lambert conic near-conformal",
    method: "lambert near conformal", family: "Conic", keeps: "nearly conformal", controls: [],
    fixed: () => ({ lat0: 34.65, lon0: 37.35, k0: 0.9996256 }), domain: region(37.35, 34.65, 12),
    use: "The Levant zone between the wars; a truncated series instead of the cone's formula." },
  { id: "oblique-lambert", name: "Oblique Lambert conformal conic", method: "oblique lambert",
    family: "Conic", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: 42, lon0: 12, lat1: 4, lat2: -4, azimuth: 30, k0: 1 }),
    domain: region(12, 42, 35),
    use: "A cone whose axis leans, for a region along a curved belt." },
  { id: "bipolar-conic", name: "Bipolar oblique conformal conic", method: "bipolar conic",
    family: "Conic", keeps: "conformal", controls: [], fixed: () => ({}),
    domain: () => capWithout(-88, 12, 60, -145, -18, 40),
    use: "Both Americas in one conformal map, of two cones that meet in the middle." },

  // Azimuthal and perspective.
  { id: "orthographic", name: "Orthographic", method: "orthographic",
    family: "Azimuthal and perspective", keeps: "perspective", controls: centre(10, 35),
    domain: around(89.8), use: "The globe as seen from far away." },
  { id: "azimuthal-equal-area", name: "Lambert azimuthal equal area", method: "azimuthal equal area",
    family: "Azimuthal and perspective", keeps: "equal area", controls: centre(10, 52),
    domain: around(165), use: "Statistics of a continent: the grid of European data." },
  { id: "azimuthal-equidistant", name: "Azimuthal equidistant", method: "azimuthal equidistant",
    family: "Azimuthal and perspective", keeps: "equidistant", controls: centre(0, 90),
    domain: around(165), use: "Distances and bearings from one place: radio, flights, earthquakes." },
  { id: "stereographic", name: "Stereographic", method: "oblique stereographic",
    family: "Azimuthal and perspective", keeps: "conformal", controls: centre(-30, 40),
    domain: around(89.5), use: "Conformal maps of round regions; circles stay circles." },
  { id: "polar-stereographic", name: "Polar stereographic", method: "polar stereographic (variant b)",
    family: "Azimuthal and perspective", keeps: "conformal",
    controls: [lon0(0), { ...parallel(71, -90, 90), min: 40, max: 90 }],
    domain: (p) => cap(p.lon0, 90, 60), use: "Ice, weather and ships near the poles." },
  { id: "gnomonic", name: "Gnomonic", method: "gnomonic", family: "Azimuthal and perspective",
    keeps: "perspective", controls: centre(-40, 45), domain: around(62),
    use: "Great circles are straight: the shortest way drawn with a ruler." },
  { id: "vertical-perspective", name: "Vertical perspective", method: "vertical perspective",
    family: "Azimuthal and perspective", keeps: "perspective", controls: [...centre(20, 10), height(8000000)],
    domain: (p) => cap(p.lon0, p.lat0, horizon(p) * 0.995),
    use: "The Earth photographed from a satellite's height, straight down." },
  { id: "tilted-perspective", name: "Tilted perspective", method: "tilted perspective",
    family: "Azimuthal and perspective", keeps: "perspective",
    controls: [...centre(-75, 38), height(3000000), tilt(20), azimuth(20)],
    domain: (p) => cap(p.lon0, p.lat0, horizon(p) * 0.97),
    use: "The view from space towards the horizon." },

  // For one country or region.
  { id: "oblique-stereographic", name: "Oblique stereographic", method: "oblique stereographic",
    family: "For one country or region", keeps: "conformal", controls: centre(5.39, 52.16),
    fixed: () => ({ k0: 0.9999079 }), domain: around(25),
    use: "The double projection of the Netherlands, Romania and New Brunswick." },
  { id: "swiss-oblique", name: "Swiss oblique cylindrical", method: "swiss oblique mercator",
    family: "For one country or region", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: 46.952405556, lon0: 7.439583333 }), domain: region(7.44, 46.95, 25),
    use: "Switzerland: ellipsoid to sphere to an oblique cylinder through Bern." },
  { id: "krovak", name: "Krovak", method: "krovak north", family: "For one country or region",
    keeps: "conformal", controls: [],
    fixed: () => ({ lat0: 49.5, lon0: 24.833333333, colat: 30.288139722, lat1: 78.5, k0: 0.9999 }),
    domain: region(17, 49.5, 18),
    use: "Czechia and Slovakia: an oblique cone along the country's length." },
  { id: "laborde", name: "Laborde oblique Mercator", method: "laborde",
    family: "For one country or region", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: -18.9, lon0: 46.437229167, azimuth: 18.9, k0: 0.9995 }),
    domain: region(46.5, -18.9, 8), use: "Madagascar, along the island's axis." },
  { id: "new-zealand", name: "New Zealand map grid", method: "new zealand map grid",
    family: "For one country or region", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: -41, lon0: 173 }), domain: region(173, -41, 8.5),
    use: "New Zealand: a complex polynomial that follows the shape of the islands." },
  { id: "rectified-skew", name: "Rectified skew orthomorphic", method: "rectified skew orthomorphic",
    family: "For one country or region", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: 4, lon0: 102.25, azimuth: -36.97420943, k0: 0.99984 }),
    domain: region(102.25, 4, 25), use: "Malaya and Borneo, aligned with the peninsula." },
  { id: "two-point-oblique", name: "Two-point oblique Mercator", method: "two point oblique mercator",
    family: "For one country or region", keeps: "conformal", controls: [],
    fixed: () => ({ lat0: 45, lat1: 60, lon1: -10, lat2: 30, lon2: 40, k0: 1 }),
    domain: region(15, 47, 40), use: "A conformal map along the great circle of two places." },
  { id: "imw-polyconic", name: "Modified polyconic", method: "imw polyconic",
    family: "For one country or region", keeps: "compromise", controls: [],
    fixed: () => ({ lat1: 42, lon0: 9 }), domain: () => band(9, 15, 30, 56),
    use: "Sheets of the International Map of the World at one to a million." },
  { id: "hyperbolic-cassini", name: "Hyperbolic Cassini-Soldner", method: "hyperbolic cassini",
    family: "For one country or region", keeps: "equidistant", controls: [],
    fixed: () => ({ lat0: -16.25, lon0: 179.333333333 }), domain: region(179.33, -16.25, 9),
    use: "Vanua Levu in Fiji." },
  { id: "modified-azimuthal-equidistant", name: "Modified azimuthal equidistant",
    method: "modified azimuthal equidistant", family: "For one country or region",
    keeps: "equidistant", controls: [], fixed: () => ({ lat0: 9.546708333, lon0: 138.168744444 }),
    domain: region(138.17, 9.55, 14), use: "The islands of Micronesia." },
  { id: "guam", name: "Guam projection", method: "guam", family: "For one country or region",
    keeps: "equidistant", controls: [], fixed: () => ({ lat0: 13.472466353, lon0: 144.748750706 }),
    domain: region(144.75, 13.47, 8), use: "Guam, and no larger place." },
  { id: "colombia-urban", name: "Colombia urban", method: "colombia urban",
    family: "For one country or region", keeps: "compromise", controls: [],
    fixed: () => ({ lat0: 4.680486111, lon0: -74.146591667, h0: 2550 }),
    domain: region(-74.15, 4.68, 8), use: "Plans of Colombian cities in their height." },
  { id: "local-orthographic", name: "Local orthographic", method: "local orthographic",
    family: "For one country or region", keeps: "perspective", controls: [...centre(-122, 37.6), azimuth(0)],
    domain: around(25), use: "Sites whose plans lie at their own scale and bearing." },
];

export function parametersOf(projection, values) {
  const given = {};
  for (const { key } of projection.controls) given[key] = values[key];
  return { ...given, ...(projection.fixed?.(given) ?? {}) };
}
