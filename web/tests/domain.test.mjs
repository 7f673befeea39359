// Cutting at the edges of a map, by hand.

import assert from "node:assert/strict";
import test from "node:test";
import { across, band, cap } from "../explorer/domain.js";

const parts = (domain, what, points) => {
  const out = [];
  domain[what](points, (part) => out.push(Array.from(part)));
  return out;
};
const longitudes = (part) => part.filter((_, i) => i % 2 === 0);

test("a square across the edge of a band comes in two parts, one on each side", () => {
  const two = parts(band(0, 180, -90, 90), "area", [178, 0, 182, 0, 182, 4, 178, 4]);
  assert.equal(two.length, 2);
  const [a, b] = two.map(longitudes);
  assert.ok(Math.min(...a) >= 178 - 1e-9 && Math.max(...a) <= 180);
  assert.ok(Math.max(...b) <= -178 + 1e-9 && Math.min(...b) >= -180);
  // The same square with the map's middle beside it stays whole.
  assert.equal(parts(band(170, 180, -90, 90), "area", [178, 0, 182, 0, 182, 4, 178, 4]).length, 1);
});

test("the sides that a cut has made follow the edge in small steps", () => {
  const [a] = parts(band(0, 180, -90, 90), "area", [175, -80, 185, -80, 185, -90, 175, -90]);
  const edge = [];
  for (let i = 0; i < a.length; i += 2) if (Math.abs(a[i] - 180) < 1e-5) edge.push(a[i + 1]);
  edge.sort((p, q) => p - q);
  assert.deepEqual([edge[0], edge.at(-1)], [-90, -80]);
  for (let i = 1; i < edge.length; ++i) assert.ok(edge[i] - edge[i - 1] <= 2);
});

test("what lies beyond a latitude goes", () => {
  assert.equal(parts(band(0, 180, -60, 60), "area", [0, 70, 4, 70, 4, 74]).length, 0);
  const [cut] = parts(band(0, 180, -60, 60), "area", [0, 58, 4, 58, 4, 62, 0, 62]);
  assert.equal(Math.max(...cut.filter((_, i) => i % 2 === 1)), 60);
});

test("a line around the world breaks at the edge and nowhere else", () => {
  const line = [];
  for (let lon = -180; lon <= 180; lon += 10) line.push(lon, 20);
  const two = parts(band(100, 180, -90, 90), "line", line);
  assert.equal(two.length, 2);
  for (const part of two) {
    const lon = longitudes(part);
    for (let i = 1; i < lon.length; ++i) assert.ok(Math.abs(lon[i] - lon[i - 1]) <= 10 + 1e-9);
  }
});

test("a cap cuts along its rim", () => {
  const domain = cap(0, 90, 30);
  const [cut] = parts(domain, "area", [0, 58, 5, 58, 5, 63, 0, 63]);
  const latitudes = cut.filter((_, i) => i % 2 === 1);
  assert.ok(Math.abs(Math.min(...latitudes) - 60) < 1e-9);
  assert.equal(parts(domain, "area", [0, 50, 5, 50, 5, 55]).length, 0);
  assert.equal(parts(domain, "area", [0, 70, 5, 70, 5, 75]).length, 1);
  const [line] = parts(domain, "line", [0, 59, 0, 61]);
  assert.ok(Math.abs(line[1] - 60) < 0.02); // cut on the chord
});

test("a belt across a meridian", () => {
  const domain = across(10, 90, 30);
  assert.ok(domain.contains(10, 89) && domain.contains(39, 0) && !domain.contains(41, 0));
  assert.ok(domain.contains(90, 70) && !domain.contains(190, 0));
});
