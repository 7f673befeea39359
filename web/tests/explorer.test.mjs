// The explorer in a headless Chromium.

import assert from "node:assert/strict";
import { readFileSync } from "node:fs";
import { createRequire } from "node:module";
import { after, before, test } from "node:test";
import { openExplorer } from "./browser.mjs";
import { LAMBERT, nativeFigures } from "./native.mjs";

const axe = readFileSync(createRequire(import.meta.url).resolve("axe-core/axe.min.js"), "utf8");

let explorer, page;
before(async () => {
  explorer = await openExplorer();
  page = explorer.page;
});
after(() => explorer.close());

const settled = () => page.waitForTimeout(400);
const figures = () => page.locator("#figures").innerText();

// A step of a line that crosses the map has its middle on the ground far from its middle on the map; a
// step that follows the ground has both in nearly the same place, however long it is.
test("every projection draws without errors and without stray lines", async () => {
  const drawn = await page.evaluate(() => {
    const { view } = explorer;
    const RAD = Math.PI / 180;
    const middle = (lon1, lat1, lon2, lat2) => {
      const turn = lon2 - lon1 - 360 * Math.round((lon2 - lon1) / 360);
      if (Math.abs(turn) <= 12) return [lon1 + turn / 2, (lat1 + lat2) / 2];
      // Around a pole by unit vectors.
      const [x, y, z] = [[lon1, lat1], [lon2, lat2]].reduce(([a, b, c], [lon, lat]) => [
        a + Math.cos(lat * RAD) * Math.cos(lon * RAD), b + Math.cos(lat * RAD) * Math.sin(lon * RAD),
        c + Math.sin(lat * RAD)], [0, 0, 0]);
      return [Math.atan2(y, x) / RAD, Math.atan2(z, Math.hypot(x, y)) / RAD];
    };
    let run;
    const { trace } = view;
    view.trace = function (path, shape, closed) {
      const { starts, lon, lat, x, y } = shape;
      const steps = [];
      for (let k = 0; k + 1 < starts.length; ++k) {
        for (let i = starts[k]; i < starts[k + 1]; ++i) {
          const j = i + 1 < starts[k + 1] ? i + 1 : closed ? starts[k] : i;
          if ([x[i], y[i], x[j], y[j]].every(Number.isFinite)) steps.push([i, j]);
          else ++run.blank;
        }
      }
      const middles = steps.map(([i, j]) => middle(lon[i], lat[i], lon[j], lat[j]));
      const [mx, my] = [0, 1].map((axis) => Float64Array.from(middles, (m) => m[axis]));
      view.mapping.forward(mx, my);
      const size = Math.hypot(view.box[2] - view.box[0], view.box[3] - view.box[1]);
      steps.forEach(([i, j], s) => {
        const off = Math.hypot(mx[s] - (x[i] + x[j]) / 2, my[s] - (y[i] + y[j]) / 2) / size;
        if (off > run.off) Object.assign(run, { off, at: [lon[i], lat[i], lon[j], lat[j]] });
      });
      run.steps += steps.length;
      return trace.call(this, path, shape, closed);
    };
    const all = explorer.projections.map(({ id, controls }) => {
      explorer.state.tissot = true;
      const runs = [];
      // As it comes, and turned so that land lies on its edges.
      for (const turn of [0, 97, -171]) {
        explorer.chooseProjection(id);
        if (controls.some((c) => c.key === "lon0")) explorer.state.values.lon0 = turn || explorer.state.values.lon0;
        if (controls.some((c) => c.key === "lat0") && turn) explorer.state.values.lat0 = turn / 3;
        run = { off: 0, at: [], steps: 0, blank: 0 };
        explorer.drawNow(turn !== 0);
        const { data } = view.context.getImageData(0, 0, view.canvas.width, view.canvas.height);
        let painted = 0;
        for (let i = 3; i < data.length; i += 4) if (data[i] > 0) ++painted;
        runs.push({ ...run, painted: painted / (data.length / 4) });
      }
      return { id, runs };
    });
    delete view.trace;
    return all;
  });
  assert.ok(drawn.length >= 40);
  for (const { id, runs } of drawn) {
    for (const { off, at, steps, blank, painted } of runs) {
      // The most is a bow of 0.0092 at Krovak's northern rim; a line across a map is off by a tenth and more.
      assert.ok(steps > 300 && off < 0.012, `${id}: a step off by ${off} of the map's diagonal at ${at}`);
      assert.ok(painted > 0.08, `${id}: only ${painted} of the canvas is painted`);
      // Eckert's iteration does not come to rest at two of the points next to the poles.
      assert.ok(blank <= (id === "eckert-4" ? 4 : 0), `${id}: ${blank} steps without an image`);
    }
  }
  const worst = drawn.flatMap(({ id, runs }) => runs.map((r) => [r.off, id])).sort((a, b) => b[0] - a[0])[0];
  console.log(`${drawn.length} projections; a step's middle is off by ${worst[0].toFixed(4)} of the diagonal at most (${worst[1]})`);
  assert.deepEqual(explorer.errors, []);
});

test("figures shown are the native library's", async () => {
  for (const { kind, what, numbers } of nativeFigures()) {
    const [lon, lat, x, y] = numbers;
    const got = await page.evaluate(({ kind: k, what: w, lon: a, lat: b, lambert }) => {
      if (k === "transform") {
        explorer.chooseSystem(Number(w.slice(5)));
        explorer.drawNow();
        const f = explorer.figuresAt(a, b);
        return [f.x, f.y];
      }
      return explorer.library.projection(w, w === "lambert conformal" ? lambert : {}).forward(a, b);
    }, { kind, what, lon, lat, lambert: LAMBERT });
    assert.ok(Math.abs(got[0] - x) < 1e-7 && Math.abs(got[1] - y) < 1e-7, `${what}: ${got}, native ${[x, y]}`);
  }
  // And as text.
  const [, , x, y] = nativeFigures().find((f) => f.what === "EPSG:2154").numbers;
  await page.evaluate(() => {
    explorer.chooseSystem(2154);
    explorer.state.points = [[2.35, 48.85]];
    explorer.drawNow();
  });
  const text = await figures();
  for (const value of [x, y]) {
    const shown = value.toLocaleString("en", { minimumFractionDigits: 3, maximumFractionDigits: 3 });
    assert.ok(text.includes(`${shown} m`), `${shown} in ${text}`);
  }
});

test("a click gives the point's figures, a second one the way", async () => {
  await page.evaluate(() => {
    explorer.state.points = [];
    explorer.chooseProjection("mercator");
  });
  await settled();
  const box = await page.locator("#map").boundingBox();
  await page.mouse.click(box.x + box.width * 0.5, box.y + box.height * 0.5);
  await settled();
  assert.match(await figures(), /Point A[\s\S]*Latitude[\s\S]*Convergence/);
  await page.mouse.click(box.x + box.width * 0.6, box.y + box.height * 0.4);
  await settled();
  assert.match(await figures(), /Shortest way[\s\S]*km[\s\S]*Rhumb line[\s\S]*Longer by/);
  assert.match(page.url(), /projection=mercator.*a=.*b=/);
});

test("dragging turns the map, frame by frame", async () => {
  await page.evaluate(() => explorer.chooseProjection("orthographic"));
  await settled();
  const box = await page.locator("#map").boundingBox();
  const [x, y] = [box.x + box.width / 2, box.y + box.height / 2];
  const before_ = await page.evaluate(() => ({ ...explorer.state.values }));
  await page.mouse.move(x, y);
  await page.mouse.down();
  for (let i = 1; i <= 10; ++i) await page.mouse.move(x - 8 * i, y + 4 * i);
  await page.mouse.up();
  await settled();
  const after_ = await page.evaluate(() => ({ ...explorer.state.values }));
  assert.ok(after_.lon0 > before_.lon0 + 5, `${after_.lon0}`);
  assert.ok(after_.lat0 > before_.lat0 + 2, `${after_.lat0}`);
  assert.equal(Number(await page.inputValue("#number-lon0")), after_.lon0);
});

test("the keyboard turns and zooms", async () => {
  await page.evaluate(() => explorer.chooseProjection("robinson"));
  await page.focus("#map");
  await page.keyboard.press("ArrowRight");
  await page.keyboard.press("+");
  await page.keyboard.press("Enter");
  await settled();
  const { lon0, zoom, points } = await page.evaluate(() => ({
    lon0: explorer.state.values.lon0, zoom: explorer.state.zoom, points: explorer.state.points.length }));
  assert.equal(lon0, 5);
  assert.equal(zoom, 1.25);
  assert.equal(points, 1);
  assert.match(await figures(), /Point A/);
  await page.keyboard.press("Escape");
  await settled();
  assert.match(await figures(), /^Click the map/);
});

test("a standard parallel is dragged by its handle", async () => {
  await page.evaluate(() => explorer.chooseProjection("albers"));
  await settled();
  const box = await page.locator("#map").boundingBox();
  const { place: [x, y], lat2 } = await page.evaluate(() => {
    const { lon0, lat2 } = explorer.state.values;
    return { place: explorer.view.fromEarth(lon0 + 12, lat2), lat2 };
  });
  await page.mouse.move(box.x + x, box.y + y);
  await page.mouse.down();
  for (let i = 1; i <= 8; ++i) await page.mouse.move(box.x + x, box.y + y - 5 * i);
  await page.mouse.up();
  await settled();
  const after_ = await page.evaluate(() => ({ ...explorer.state.values }));
  assert.ok(after_.lat2 > lat2 + 5, `${after_.lat2}`);
  assert.deepEqual([after_.lon0, after_.lat1], [-96, 29.5]);
  assert.equal(Number(await page.inputValue("#number-lat2")), after_.lat2);
});

test("search finds systems by name and by code", async () => {
  await page.fill("#search", "lambert-93");
  await page.waitForSelector("#found button");
  assert.match(await page.locator("#found").innerText(), /RGF93 v1 \/ Lambert-93/);
  await page.fill("#search", "27700");
  await page.waitForSelector("#found button");
  await page.keyboard.press("ArrowDown");
  await page.keyboard.press("Enter");
  await settled();
  assert.equal(await page.evaluate(() => explorer.state.code), 27700);
  assert.match(page.url(), /system=27700/);
  await page.fill("#search", "qqqqqq");
  assert.match(await page.locator("#found").innerText(), /Nothing/);
  await page.fill("#search", "");
});

test("an address brings its view back", async () => {
  await page.goto(`http://127.0.0.1:${explorer.port}/#projection=albers&lon0=20&lat1=10&lat2=50&distortion=area&a=10,20`);
  await page.reload();
  await page.waitForSelector("html[data-ready]");
  await settled();
  const state = await page.evaluate(() => explorer.state);
  assert.deepEqual(
    [state.id, state.values.lon0, state.values.lat1, state.values.lat2, state.distortion],
    ["albers", 20, 10, 50, "area"]);
  assert.deepEqual(state.points, [[10, 20]]);
  assert.ok(await page.isVisible("#legend"));
});

test("a file is converted and offered", async () => {
  await page.fill("#from", "EPSG:4326");
  await page.fill("#to", "EPSG:2154");
  await page.setInputFiles("#file", {
    name: "places.csv", mimeType: "text/csv", buffer: Buffer.from("name,lon,lat\nParis,2.35,48.85\n") });
  const link = page.locator("#converted a");
  await link.waitFor();
  const [download] = await Promise.all([page.waitForEvent("download"), link.click()]);
  assert.equal(download.suggestedFilename(), "places-epsg-2154.csv");
  assert.equal(readFileSync(await download.path(), "utf8"), "name,lon,lat\nParis,652301.5648,6861302.7259\n");
  // Dropped anywhere on the page.
  await page.evaluate(() => {
    const dataTransfer = new DataTransfer();
    dataTransfer.items.add(new File(['{"type":"Point","coordinates":[2.35,48.85]}'], "p.geojson"));
    document.dispatchEvent(new DragEvent("drop", { dataTransfer, bubbles: true, cancelable: true }));
  });
  await page.waitForFunction(() => document.querySelector("#converted a")?.download === "p-epsg-2154.geojson");
  await page.fill("#to", "nowhere at all");
  await page.setInputFiles("#file", { name: "a.csv", mimeType: "text/csv", buffer: Buffer.from("1,2\n") });
  await page.waitForFunction(() => /nowhere at all/.test(document.querySelector("#converted").textContent));
});

for (const dark of [false, true]) {
  for (const width of [1280, 390]) {
    test(`nothing bars anybody: ${dark ? "dark" : "light"}, ${width} wide`, async () => {
      const other = await openExplorer({
        width, height: 844, dark, hash: "#projection=lambert-conformal&distortion=angle&a=2,48&b=10,50" });
      await other.page.waitForTimeout(400);
      await other.page.evaluate(axe);
      const { violations } = await other.page.evaluate(() => axe.run());
      const grave = violations.filter((v) => ["serious", "critical"].includes(v.impact));
      assert.deepEqual(grave.map((v) => `${v.id}: ${v.nodes.map((n) => n.html).join(" ")}`), []);
      const overflow = await other.page.evaluate(
        () => document.documentElement.scrollWidth - document.documentElement.clientWidth);
      assert.equal(overflow, 0);
      assert.deepEqual(other.errors, []);
      await other.close();
    });
  }
}
