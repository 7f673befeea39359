// Cuts the coastlines of world-atlas into cells, which the map can take one by one.
//   node build.mjs FOLDER   writes land-110.bin and land-50.bin
//
// A file: the number of pieces, then of lines, as 32-bit words; the number of points of each piece
// and of each line, 16-bit; their points, longitude and latitude, 16-bit: 32767 is a half turn of
// longitude, a quarter of latitude.  Little-endian.

import { readFileSync, writeFileSync, mkdirSync } from "node:fs";
import { createRequire } from "node:module";
import { feature } from "topojson-client";

// By the scale of the coastlines: the size of a cell, and the longest edge, degrees.  A cell's edges
// have the same points on both sides.
const CELLS = { 50: { cell: 5, step: 2.5 }, 110: { cell: 10, step: 5 } };

const { resolve } = createRequire(import.meta.url);
// Where maps are stretched most, the only land being in the south.
const NEAR_THE_POLE = [-88.4, -89, -89.4, -89.7, -89.85, -89.95, -89.99];
const atlas = (name) => JSON.parse(readFileSync(resolve(`world-atlas/${name}.json`), "utf8"));

// One side of a straight cut, after Sutherland and Hodgman (1974).
function keep(ring, axis, sign, limit) {
  const out = [];
  for (let i = 0; i < ring.length; ++i) {
    const a = ring[i];
    const b = ring[(i + 1) % ring.length];
    const insideA = sign * (a[axis] - limit) >= 0;
    const insideB = sign * (b[axis] - limit) >= 0;
    if (insideA) out.push(a);
    if (insideA !== insideB) {
      const t = (limit - a[axis]) / (b[axis] - a[axis]);
      const p = [a[0] + t * (b[0] - a[0]), a[1] + t * (b[1] - a[1])];
      p[axis] = limit;
      out.push(p);
    }
  }
  return out;
}

// Points at multiples of the step, so that neighbours have the same ones.
function dense(points, closed, step) {
  const out = [];
  const count = closed ? points.length : points.length - 1;
  for (let i = 0; i < count; ++i) {
    const a = points[i];
    const b = points[(i + 1) % points.length];
    out.push(a);
    const axis = Math.abs(b[0] - a[0]) >= Math.abs(b[1] - a[1]) ? 0 : 1;
    const low = Math.min(a[axis], b[axis]);
    const high = Math.max(a[axis], b[axis]);
    const between = [];
    for (let v = (Math.floor(low / step) + 1) * step; v < high - 1e-9; v += step) {
      const t = (v - a[axis]) / (b[axis] - a[axis]);
      between.push([a[0] + t * (b[0] - a[0]), a[1] + t * (b[1] - a[1])]);
    }
    if (axis === 1) {
      for (const v of NEAR_THE_POLE) {
        if (v <= low || v >= high) continue;
        const t = (v - a[1]) / (b[1] - a[1]);
        between.unshift([a[0] + t * (b[0] - a[0]), v]);
      }
    }
    if (b[axis] < a[axis]) between.reverse();
    out.push(...between);
  }
  if (!closed) out.push(points[points.length - 1]);
  return out;
}

const area = (ring) =>
  ring.reduce((sum, a, i) => {
    const b = ring[(i + 1) % ring.length];
    return sum + a[0] * b[1] - b[0] * a[1];
  }, 0);

// A ring whose longitudes go on across the 180th meridian instead of leaping back; one that goes
// around the south pole is closed along it.
function unwrapped(ring) {
  const out = [ring[0]];
  for (let i = 1; i < ring.length; ++i) {
    const last = out[i - 1][0];
    out.push([ring[i][0] - 360 * Math.round((ring[i][0] - last) / 360), ring[i][1]]);
  }
  const [first, last] = [out[0], out.at(-1)];
  if (Math.abs(last[0] - first[0]) > 1) out.push([last[0], -90], [first[0], -90], first);
  return out;
}

function cells(rings, { cell, step }) {
  const pieces = [];
  for (const ring of rings) {
    const open = ring.slice(0, -1);
    let [west, east] = [Infinity, -Infinity];
    for (const p of open) [west, east] = [Math.min(west, p[0]), Math.max(east, p[0])];
    for (let x = Math.floor(west / cell) * cell; x < east; x += cell) {
      const strip = keep(keep(open, 0, 1, x), 0, -1, x + cell);
      if (strip.length < 3) continue;
      let [south, north] = [90, -90];
      for (const p of strip) [south, north] = [Math.min(south, p[1]), Math.max(north, p[1])];
      for (let y = Math.floor(south / cell) * cell; y < north; y += cell) {
        const piece = keep(keep(strip, 1, 1, y), 1, -1, y + cell);
        if (piece.length >= 3 && Math.abs(area(piece)) > 1e-6) pieces.push(dense(piece, true, step));
      }
    }
  }
  return pieces;
}

// Coastlines without the edges that only close a polygon at the 180th meridian and the pole.
function coasts(rings, { step }) {
  const lines = [];
  const edge = (p) => Math.abs(Math.abs(p[0]) - 180) < 0.01;
  for (const ring of rings) {
    let line = [];
    for (let i = 0; i + 1 < ring.length; ++i) {
      const pole = Math.min(ring[i][1], ring[i + 1][1]) < -89.9;
      if (pole || (edge(ring[i]) && edge(ring[i + 1]))) {
        if (line.length > 1) lines.push(dense(line, false, step));
        line = [];
        continue;
      }
      if (line.length === 0) line.push(ring[i]);
      line.push(ring[i + 1]);
      if (line.length === 60 || Math.abs(Math.abs(ring[i + 1][0]) - 180) < 0.01) {
        lines.push(dense(line, false, step));
        line = [ring[i + 1]];
      }
    }
    if (line.length > 1) lines.push(dense(line, false, step));
  }
  return lines;
}

function write(path, pieces, lines) {
  const all = [...pieces, ...lines];
  const points = all.reduce((sum, part) => sum + part.length, 0);
  const bytes = Buffer.alloc(8 + 2 * all.length + 4 * points);
  bytes.writeUInt32LE(pieces.length, 0);
  bytes.writeUInt32LE(lines.length, 4);
  let at = 8;
  for (const part of all) at = bytes.writeUInt16LE(part.length, at);
  for (const part of all) {
    const middle = part.reduce((sum, p) => sum + p[0], 0) / part.length;
    const turn = 360 * Math.round(middle / 360);
    for (const [x, y] of part) {
      const lon = Math.max(-180, Math.min(180, x - turn));
      at = bytes.writeInt16LE(Math.round((lon / 180) * 32767), at);
      at = bytes.writeInt16LE(Math.round((y / 90) * 32767), at);
    }
  }
  writeFileSync(path, bytes);
  console.log(`${path}: ${pieces.length} pieces, ${lines.length} lines, ${points} points`);
}

const folder = process.argv[2];
mkdirSync(folder, { recursive: true });
for (const scale of [110, 50]) {
  const topology = atlas(`land-${scale}m`);
  const rings = [];
  for (const { geometry } of feature(topology, topology.objects.land).features) {
    const polygons = geometry.type === "Polygon" ? [geometry.coordinates] : geometry.coordinates;
    // Outer rings and holes turn against each other, which the map's filling rule goes by.
    for (const polygon of polygons) rings.push(...polygon.map(unwrapped));
  }
  write(`${folder}/land-${scale}.bin`, cells(rings, CELLS[scale]), coasts(rings, CELLS[scale]));
}
