// The package beside proj4 on arrays, in one run: median of interleaved ratios, nanoseconds a point.

import proj4 from "proj4";
import { load } from "../../build/web/package/tidewater.js";

const COUNT = 20000;
const ROUNDS = 31;

const tw = await load();
const cases = {
  "EPSG:32631": "+proj=utm +zone=31 +datum=WGS84 +units=m",
  "EPSG:3857": "+proj=merc +a=6378137 +b=6378137 +lat_ts=0 +lon_0=0 +x_0=0 +y_0=0 +k=1 +units=m",
  "EPSG:2154": "+proj=lcc +lat_0=46.5 +lon_0=3 +lat_1=49 +lat_2=44 +x_0=700000 +y_0=6600000 +ellps=GRS80 +towgs84=0,0,0 +units=m",
  "EPSG:3035": "+proj=laea +lat_0=52 +lon_0=10 +x_0=4321000 +y_0=3210000 +ellps=GRS80 +towgs84=0,0,0 +units=m",
  "EPSG:5070": "+proj=aea +lat_0=23 +lon_0=-96 +lat_1=29.5 +lat_2=45.5 +x_0=0 +y_0=0 +ellps=GRS80 +towgs84=0,0,0 +units=m",
};
const median = (values) => values.sort((a, b) => a - b)[values.length >> 1];
const timed = (work) => {
  const begin = process.cpuUsage();
  work();
  const spent = process.cpuUsage(begin);
  return ((spent.user + spent.system) * 1000) / COUNT;
};

console.log("system      direction  tidewater ns  proj4 ns  times");
for (const [code, definition] of Object.entries(cases)) {
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
