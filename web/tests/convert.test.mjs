import assert from "node:assert/strict";
import test from "node:test";
import { cells, convert } from "../explorer/convert.js";

// A transformation whose figures are seen at once.
const shift = {
  target: { kind: "projected", code: 2154 },
  forward(x, y) {
    let failed = 0;
    for (let i = 0; i < x.length; ++i) {
      if (x[i] > 180) {
        x[i] = y[i] = NaN;
        ++failed;
      } else {
        x[i] += 1000;
        y[i] += 2000;
      }
    }
    return failed;
  },
};

test("cells with quotes, separators and line ends in them", () => {
  assert.deepEqual(cells('a,"b ""c"", d"\r\n1,"2\n3"\n', ","), [["a", 'b "c", d'], ["1", "2\n3"]]);
  assert.deepEqual(cells("1;2", ";"), [["1", "2"]]);
});

test("CSV by the names of its columns", () => {
  const { text, points, failed } = convert("a.csv", 'name,lat,lon\n"x, y",48.85,2.35\nfar,1,999\n', shift);
  assert.equal(text, 'name,lat,lon\n"x, y",2048.8500,1002.3500\nfar,,\n');
  assert.deepEqual([points, failed], [2, 1]);
});

test("CSV without names: the first two columns of numbers", () => {
  assert.equal(convert("a.csv", "p;1;2\n", shift).text, "p;1001.0000;2002.0000\n");
  assert.throws(() => convert("a.csv", "a,b\nc,d\n", shift), /No two columns/);
  assert.throws(() => convert("a.csv", "", shift), /empty/);
});

test("GeoJSON at every depth", () => {
  const given = { type: "FeatureCollection", bbox: [0, 0, 1, 1], features: [
    { type: "Feature", properties: { coordinates: "kept" },
      geometry: { type: "Polygon", coordinates: [[[1, 2, 5], [3, 4], [1, 2]]] } },
    { type: "Feature", properties: null,
      geometry: { type: "GeometryCollection", geometries: [{ type: "Point", coordinates: [7, 8] }] } },
    { type: "Feature", properties: {}, geometry: null }] };
  const { text, points } = convert("a.geojson", JSON.stringify(given), shift);
  const got = JSON.parse(text);
  assert.deepEqual(got.features[0].geometry.coordinates, [[[1001, 2002, 5], [1003, 2004], [1001, 2002]]]);
  assert.deepEqual(got.features[1].geometry.geometries[0].coordinates, [1007, 2008]);
  assert.equal(got.features[0].properties.coordinates, "kept");
  assert.equal(got.bbox, undefined);
  assert.equal(points, 4);
  assert.throws(() => convert("a.json", "{}", shift), /no coordinates/);
});
