// The npm package as its users see it.

import assert from "node:assert/strict";
import { execFileSync } from "node:child_process";
import { readFileSync } from "node:fs";
import { fileURLToPath } from "node:url";
import test from "node:test";
import proj4 from "proj4";
import { load } from "../../build/web/package/tidewater.js";
import { LAMBERT, nativeFigures } from "./native.mjs";
import { PEERS } from "./peers.mjs";

const folder = fileURLToPath(new URL("../../build/web/package/", import.meta.url));
const tw = await load();

const near = (value, expected, tolerance, what = "") =>
  assert.ok(Math.abs(value - expected) <= tolerance, `${what}: ${value}, expected ${expected}`);

test("figures are the native library's", () => {
  let equal = 0;
  let all = 0;
  for (const { kind, what, numbers } of nativeFigures()) {
    const [lon, lat, ...expected] = numbers;
    let got;
    if (kind === "transform") {
      got = tw.transformation("EPSG:4326", what).forward(lon, lat);
    } else {
      const projection = tw.projection(what, what === "lambert conformal" ? LAMBERT : {});
      const f = projection.factors(lon, lat);
      got = [...projection.forward(lon, lat), f.areal, f.convergence, f.angular];
    }
    expected.forEach((value, i) => {
      // Nanometres; the angular distortion of a conformal map is the root of a last digit.
      near(got[i], value, i < 2 ? 2e-9 * Math.max(1, Math.abs(value) / 1e6) : i < 4 ? 1e-8 : 1e-5, `${kind} ${what} ${i}`);
      all += 1;
      if (Object.is(got[i], value)) equal += 1;
    });
  }
  console.log(`${equal} of ${all} figures are the same to the last bit`);
  assert.ok(all > 150);
});

// EPSG Guidance Note 7-2, the example of Lambert Conic Conformal (2SP).
test("a published example", () => {
  const texas = tw.projection("EPSG:9802",
    { lat0: 27 + 50 / 60, lon0: -99, lat1: 28 + 23 / 60, lat2: 30 + 17 / 60, x0: 2000000, y0: 0 },
    { a: 20925832.16, inverseFlattening: 294.978698214 });
  const [x, y] = texas.forward(-96, 28.5);
  near(x - 2000000, 2963503.91 - 2000000, 0.01);
  near(y, 254759.8, 0.01);
});

test("systems agree with proj4's formulas", () => {
  for (const [code, definition] of Object.entries(PEERS)) {
    const peer = proj4("WGS84", definition);
    const ours = tw.transformation("EPSG:4326", code);
    for (let i = 0; i < 50; ++i) {
      const [lon, lat] = [(code === "EPSG:5070" ? -120 : -4) + 0.2 * i, 42 + 0.17 * i];
      const [x, y] = ours.forward(lon, lat);
      const [px, py] = peer.forward([lon, lat]);
      near(x, px, 0.001, code);
      near(y, py, 0.001, code);
      const [backLon, backLat] = ours.inverse(x, y);
      near(backLon, lon, 1e-10, code);
      near(backLat, lat, 1e-10, code);
    }
  }
});

test("arrays in place, numbers and interleaved points give the same", () => {
  const lambert = tw.transformation("EPSG:4326", "EPSG:2154");
  const n = 10001; // more than one run of points, and a rest
  const x = Float64Array.from({ length: n }, (_, i) => -4 + (12 * i) / n);
  const y = Float64Array.from({ length: n }, (_, i) => 42 + (8 * i) / n);
  const z = new Float64Array(n).fill(100);
  const pairs = new Float64Array(2 * n);
  const triples = new Float64Array(3 * n);
  for (let i = 0; i < n; ++i) {
    pairs.set([x[i], y[i]], 2 * i);
    triples.set([x[i], y[i], z[i]], 3 * i);
  }
  const [ax, ay] = [x.slice(), y.slice()];
  assert.equal(lambert.forward(ax, ay), 0);
  assert.equal(lambert.forwardPoints(pairs), 0);
  assert.equal(lambert.forwardPoints(triples, 3), 0);
  for (const i of [0, 1, 4095, 4096, 8191, 8192, n - 1]) {
    const [px, py] = lambert.forward(x[i], y[i]);
    assert.deepEqual([ax[i], ay[i]], [px, py]);
    assert.deepEqual([pairs[2 * i], pairs[2 * i + 1]], [px, py]);
    assert.equal(triples.length, 3 * n);
    near(triples[3 * i], px, 1e-6);
  }
  assert.equal(lambert.inverse(ax, ay), 0);
  near(ax[n - 1], x[n - 1], 1e-10);
});

test("a point that fails leaves the others alone", () => {
  const globe = tw.projection("orthographic", { lat0: 0, lon0: 0 });
  const x = Float64Array.of(0, 170, 10);
  const y = Float64Array.of(0, 0, 10);
  const failed = globe.inverse(Float64Array.of(9e6), Float64Array.of(0));
  assert.equal(failed, 1);
  assert.match(globe.why(9e6, 0, true), /\w+/);
  assert.equal(globe.why(0, 0, true), "");
  const web = tw.transformation("EPSG:4326", "EPSG:2154");
  y[1] = NaN;
  assert.equal(web.forward(x, y), 1);
  assert.ok(Number.isNaN(x[1]) && Number.isNaN(y[1]));
  assert.ok(Number.isFinite(x[0]) && Number.isFinite(y[2]));
});

test("what is not understood is told in a sentence", () => {
  assert.throws(() => tw.system("EPSG:99999999"), /There is no coordinate system EPSG:99999999/);
  assert.throws(() => tw.projection("no such thing"), /no such thing/);
  assert.throws(() => tw.transformation("EPSG:4326", "nowhere at all"), /nowhere at all/);
  assert.throws(() => tw.parseAngle("twelve"), Error);
  assert.throws(() => tw.transformation("EPSG:4326", "EPSG:3857").forward([1, 2], [3, 4]), TypeError);
  assert.throws(
    () => tw.transformation("EPSG:4326", "EPSG:3857").forward(new Float64Array(2), new Float64Array(3)),
    RangeError);
  assert.throws(() => tw.transformation("EPSG:4326", "EPSG:3857").forwardPoints(new Float64Array(3)), RangeError);
});

test("systems tell about themselves, and the whole registry is there", () => {
  const lambert = tw.system("EPSG:2154");
  assert.equal(lambert.name, "RGF93 v1 / Lambert-93");
  assert.equal(lambert.code, 2154);
  assert.equal(lambert.kind, "projected");
  assert.equal(lambert.unit, "metre");
  assert.match(lambert.method, /Lambert Conic Conformal/);
  assert.match(lambert.toText("wkt2"), /^PROJCRS\["RGF93 v1/);
  assert.ok(lambert.area.west < -4 && lambert.area.east > 8);
  assert.ok(tw.search("lambert-93").includes(2154));
  for (const file of ["projected_systems", "geodetic_systems"]) {
    const csv = readFileSync(new URL(`../../data/registry/${file}.csv`, import.meta.url), "utf8");
    const codes = csv.split("\n").map((line) => Number.parseInt(line)).filter(Number.isInteger);
    assert.ok(codes.length > 900);
    for (let i = 0; i < codes.length; i += 97) assert.equal(tw.system(`EPSG:${codes[i]}`).code, codes[i]);
  }
  lambert.free();
  assert.throws(() => lambert.name, /free/);
});

// Flinders Peak to Buninyong: Geocentric Datum of Australia Technical Manual, version 2.4, chapter 4.
test("lines on the ellipsoid", () => {
  const grs80 = { a: 6378137, inverseFlattening: 298.257222101 };
  const dms = (d, m, s) => Math.sign(d) * (Math.abs(d) + m / 60 + s / 3600);
  const geodesic = tw.geodesics(grs80).inverse(
    dms(144, 25, 29.5244), dms(-37, 57, 3.7203), dms(143, 55, 35.3839), dms(-37, 39, 10.1561));
  near(geodesic.length, 54972.271, 0.0006);
  near(geodesic.azimuth1, dms(306, 52, 5.37) - 360, 0.006 / 3600);
  const rhumb = tw.rhumbLines().inverse(0, 0, 90, 0);
  near(rhumb.length, (6378137 * Math.PI) / 2, 1e-6); // a quarter of the equator
  near(rhumb.azimuth1, 90, 1e-12);
  const { longitudes, latitudes } = tw.geodesics().between(0, 0, 90, 0, 3);
  near(longitudes[1], 45, 1e-9);
  near(latitudes[2], 0, 1e-9);
  const octant = tw.geodesics({ a: 1, inverseFlattening: 0 })
    .polygon(Float64Array.of(0, 90, 0), Float64Array.of(0, 0, 90));
  near(octant.area, Math.PI / 2, 1e-9);
});

test("texts of positions", () => {
  near(tw.parseAngle("48°23'25\"N"), 48 + 23 / 60 + 25 / 3600, 1e-12);
  const { longitude, latitude } = tw.parseMgrs(tw.formatMgrs(2.35, 48.85));
  near(longitude, 2.35, 2e-5);
  near(latitude, 48.85, 2e-5);
});

test("handing over a grid", () => {
  assert.throws(() => tw.addGrid("../elsewhere", new Uint8Array(4)), /no file's name/);
  tw.addGrid("tests.gsb", new Uint8Array(4));
});

test("objects that are not kept are given back", () => {
  for (let i = 0; i < 2000; ++i) {
    const s = tw.system("EPSG:3857");
    s.free();
    s.free();
  }
});

test("the package with the whole registry stays under 700 kB packed", () => {
  const [packed] = JSON.parse(
    execFileSync("npm", ["pack", "--dry-run", "--json"], { cwd: folder, encoding: "utf8", stdio: ["ignore", "pipe", "ignore"] }));
  console.log(`packed: ${packed.size} bytes`);
  assert.ok(packed.size < 700000, `${packed.size} bytes`);
});
