// The package beside proj4 on arrays, in one run: median of interleaved ratios, nanoseconds a point.

import proj4 from "proj4";
import { load } from "../../build/web/package/tidewater.js";
import { PEERS } from "./peers.mjs";

const COUNT = 20000;
const ROUNDS = 31;

const tw = await load();
const median = (values) => values.sort((a, b) => a - b)[values.length >> 1];
const timed = (work) => {
  const begin = process.cpuUsage();
  work();
  const spent = process.cpuUsage(begin);
  return ((spent.user + spent.system) * 1000) / COUNT;
};

console.log("system      direction  tidewater ns  proj4 ns  times");
for (const [code, definition] of Object.entries(PEERS)) {
  const peer = proj4("WGS84", definition);
  const ours = tw.transformation("EPSG:4326", code);
  const west = code === "EPSG:5070" ? -120 : -4;
  const lon = Float64Array.from({ length: COUNT }, () => west + 12 * Math.random());
  const lat = Float64Array.from({ length: COUNT }, () => 42 + 8 * Math.random());
  const [x, y] = [lon.slice(), lat.slice()];
  ours.forward(x, y);
  for (const [direction, fromX, fromY] of [["forward", lon, lat], ["inverse", x, y]]) {
    const [mine, theirs, ratios] = [[], [], []];
    for (let round = 0; round < ROUNDS; ++round) {
      const [ax, ay] = [fromX.slice(), fromY.slice()];
      const a = timed(() => ours[direction](ax, ay));
      const [bx, by] = [fromX.slice(), fromY.slice()];
      const b = timed(() => {
        const point = [0, 0];
        for (let i = 0; i < COUNT; ++i) {
          point[0] = bx[i];
          point[1] = by[i];
          const answer = peer[direction](point);
          bx[i] = answer[0];
          by[i] = answer[1];
        }
      });
      mine.push(a);
      theirs.push(b);
      ratios.push(b / a);
    }
    console.log(`${code.padEnd(11)} ${direction.padEnd(10)} ${median(mine).toFixed(1).padStart(12)} ${median(theirs).toFixed(1).padStart(9)} ${median(ratios).toFixed(1).padStart(6)}`);
  }
}
