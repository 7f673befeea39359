// The explorer: the view's state, what the hand does to it, and the figures beside the map.

import { load } from "./package/tidewater.js";
import { convert } from "./convert.js";
import { band, cap } from "./domain.js";
import { DISTORTIONS, MapView, gradient, graticule, readLand } from "./map.js";
import { FAMILIES, PROJECTIONS, parametersOf } from "./projections.js";

const $ = (id) => document.getElementById(id);
const element = (name, properties = {}, ...children) => {
  const made = Object.assign(document.createElement(name), properties);
  made.append(...children);
  return made;
};

const state = {
  id: "robinson", // or empty while a system is shown
  code: 0,
  values: {},
  distortion: "",
  tissot: false,
  graticule: true,
  points: [],
  zoom: 1,
};

let tw, view, geodesics, rhumbs, mapping, system, projection;

// ---- What is shown --------------------------------------------------------------------------

const clamp = (value, low, high) => Math.max(low, Math.min(high, value));
const turned = (lon) => lon - 360 * Math.round(lon / 360);

function chooseProjection(id, values = {}) {
  projection = PROJECTIONS.find((p) => p.id === id) ?? PROJECTIONS[0];
  state.id = projection.id;
  state.code = 0;
  system = undefined;
  state.values = Object.fromEntries(
    projection.controls.map((c) => [c.key, clamp(values[c.key] ?? c.value, c.min, c.max)]));
  $("projection").value = state.id;
  $("keeps").textContent = projection.keeps[0].toUpperCase() + projection.keeps.slice(1);
  $("use").textContent = projection.use;
  $("map").setAttribute("aria-label", `World map, ${projection.name} projection`);
  $("show").hidden = false;
  resetZoom();
  buildControls();
  update();
}

function chooseSystem(code) {
  const found = tw.system(`EPSG:${code}`);
  if (found.kind === "vertical" || found.kind === "geocentric") {
    throw new Error(`${found.name} has no map: it is a ${found.kind} system.`);
  }
  const transformation = tw.transformation("EPSG:4326", found);
  const factors = found.method ? tw.projectionOf(found) : undefined;
  const signs = [found.axes.includes("W") ? -1 : 1, found.axes.includes("S") && !/SS|NN/.test(found.axes) ? -1 : 1];
  system = { found, transformation, factors, signs };
  projection = undefined;
  state.id = "";
  state.code = code;
  state.values = {};
  $("projection").value = "system";
  $("projection").querySelector("[value=system]").textContent = found.name;
  $("keeps").textContent = `EPSG:${code}`;
  $("use").textContent = [found.method || "Longitude and latitude", found.datum, found.unit]
    .filter(Boolean).join(" · ");
  $("map").setAttribute("aria-label", `Map of ${found.name}`);
  $("to").value = `EPSG:${code}`;
  $("show").hidden = !factors;
  if (!factors) state.distortion = "";
  resetZoom();
  buildControls();
  update();
}

// A system's map: x to the right and y up whatever its axes count.
function systemMapping() {
  const { transformation, factors, signs } = system;
  const turn = (x, y) => {
    if (typeof x === "number") return [signs[0] * x, signs[1] * y];
    for (let i = 0; i < x.length; ++i) {
      x[i] *= signs[0];
      y[i] *= signs[1];
    }
    return undefined;
  };
  return {
    forward(x, y) {
      const answer = transformation.forward(x, y);
      return typeof x === "number" ? turn(...answer) : (turn(x, y), answer);
    },
    inverse(x, y) {
      if (typeof x === "number") return transformation.inverse(...turn(x, y));
      turn(x, y);
      return transformation.inverse(x, y);
    },
    factors: (lon, lat) => factors.factors(lon, lat),
  };
}

// The part of the Earth that a system's map shows, and its area of use, which fills the window.
function systemDomain({ found }) {
  const area = found.area ?? { west: -180, south: -90, east: 180, north: 90 };
  const wide = ((area.east - area.west + 360) % 360) || 360;
  const lon = turned(area.west + wide / 2);
  const lat = (area.south + area.north) / 2;
  if (wide > 300) {
    if (area.south >= 40) return [cap(lon, 90, Math.min(90, 92 - area.south)), undefined];
    if (area.north <= -40) return [cap(lon, -90, Math.min(90, 92 + area.north)), undefined];
    const limit = found.kind === "projected" && /Mercator/.test(found.method) ? 85 : 89.9;
    return [
      band(lon, 180, Math.max(area.south, -limit), Math.min(area.north, limit)), undefined];
  }
  const radius = geodesics.inverse(lon, lat, area.west, area.south).length / 111000;
  const frame = band(lon, wide / 2, area.south, area.north);
  return [cap(lon, lat, Math.min(75, 1.8 * radius + 8)), frame];
}

const memo = { key: "", projection: undefined };

function remap() {
  let domain, frame;
  if (system) {
    mapping = systemMapping();
    [domain, frame] = systemDomain(system);
  } else {
    const parameters = parametersOf(projection, state.values);
    const key = projection.id + JSON.stringify(parameters);
    if (memo.key !== key) {
      const made = tw.projection(projection.method, parameters);
      memo.projection?.free();
      Object.assign(memo, { key, projection: made });
    }
    mapping = memo.projection;
    domain = projection.domain({ ...parameters, ...state.values });
  }
  view.set(mapping, domain, frame);
}

// ---- Drawing ----------------------------------------------------------------------------------

let style, asked = false, restTimer, stale = true;

function readStyle() {
  const values = getComputedStyle(document.documentElement);
  const color = (name) => values.getPropertyValue(`--${name}`).trim();
  style = {
    sea: color("sea"), land: color("land"), coast: color("coast"), graticule: color("graticule"),
    graticuleOver: "rgb(20 30 36 / 22%)", coastOver: "rgb(20 30 36 / 75%)",
    indicatrixOver: "rgb(255 255 255 / 35%)", indicatrixEdgeOver: "rgb(20 30 36 / 85%)",
    outline: color("outline"), indicatrix: color("indicatrix"),
    indicatrixEdge: color("indicatrix-edge"), ink: color("ink"), markEdge: color("panel"),
    a: color("a"), b: color("b"), accent: color("accent"),
  };
}

function parallelsShown() {
  if (!projection) return [];
  return projection.controls.filter((c) => c.parallel).map(({ key }) => {
    const lat = state.values[key];
    const points = [];
    for (let lon = -180; lon <= 180; lon += 1.5) points.push(lon, lat);
    return { key, lat, points };
  });
}

function draw(moving) {
  const lines = parallelsShown().map(({ points }) => ({ points, color: style.accent, width: 2, dash: [2, 4] }));
  const marks = state.points.map(([lon, lat], i) => ({
    lon, lat, label: "AB"[i], color: i === 0 ? style.a : style.b }));
  if (state.points.length === 2) {
    const [[lon1, lat1], [lon2, lat2]] = state.points;
    for (const [lines_, color, dash] of [[rhumbs, style.b, [7, 5]], [geodesics, style.a, []]]) {
      const { longitudes, latitudes } = lines_.between(lon1, lat1, lon2, lat2, 200);
      const points = new Float64Array(2 * longitudes.length);
      longitudes.forEach((lon, i) => points.set([lon, latitudes[i]], 2 * i));
      lines.push({ points, color, dash, width: 2.5 });
    }
  }
  for (const { lat } of parallelsShown()) {
    const place = handlePlace(lat);
    if (place) marks.push({ lon: place[0], lat: place[1], color: style.accent });
  }
  view.draw(style, {
    graticule: state.graticule, indicatrices: state.tissot, distortion: state.distortion,
    lines, marks,
  }, moving);
}

// Where the hand takes a parallel: near the map's middle.
const handlePlace = (lat) => [turned((state.values.lon0 ?? 0) + 12), lat];

function update(moving = false) {
  stale = true;
  redraw(moving);
}

function redraw(moving = false) {
  if (!asked) {
    asked = true;
    requestAnimationFrame(() => {
      asked = false;
      try {
        if (stale) remap();
        stale = false;
      } catch (error) {
        // A combination that the projection cannot serve: the last one stays on the map.
        tell(error.message);
        return;
      }
      draw(true);
      if (!moving && !hand) rest(0);
    });
  }
  if (moving) rest(160);
}

// Once the hand rests, everything in full detail, and the figures and the address follow.
function rest(delay) {
  clearTimeout(restTimer);
  restTimer = setTimeout(() => {
    if (hand?.moved) return rest(160);
    draw(false);
    showFigures();
    showLegend();
    remember();
    document.documentElement.dataset.drawn = String(Number(document.documentElement.dataset.drawn ?? 0) + 1);
  }, delay);
}

function resize() {
  const { width, height } = $("stage").getBoundingClientRect();
  view.margin = width < 500 ? 12 : 28;
  view.resize(width, height, Math.min(window.devicePixelRatio || 1, 2));
  redraw();
}

// ---- The hand on the map ----------------------------------------------------------------------

let hand;
const touches = new Map();

const has = (key) => projection?.controls.some((c) => c.key === key && !c.parallel);

function place(event) {
  const box = $("map").getBoundingClientRect();
  return [event.clientX - box.left, event.clientY - box.top];
}

function press(event) {
  const [x, y] = place(event);
  touches.set(event.pointerId, [x, y]);
  $("map").setPointerCapture(event.pointerId);
  if (touches.size === 2) {
    const [a, b] = [...touches.values()];
    hand = { pinch: Math.hypot(a[0] - b[0], a[1] - b[1]), zoom: state.zoom, moved: true };
    return;
  }
  hand = {
    x, y, moved: false, from: view.toEarth(x, y), values: { ...state.values },
    panX: view.panX, panY: view.panY, mapping, domain: view.domain,
    degree: (view.scale * 6371000 * Math.PI) / 180,
    pan: event.shiftKey || !(has("lon0") || has("lat0")),
  };
  for (const { key, lat } of parallelsShown()) {
    const at = view.fromEarth(...handlePlace(lat));
    if (at && Math.hypot(at[0] - x, at[1] - y) < 16) hand.parallel = key;
  }
}

function move(event) {
  if (!hand || !touches.has(event.pointerId)) return;
  const [x, y] = place(event);
  touches.set(event.pointerId, [x, y]);
  if (hand.pinch) {
    if (touches.size < 2) return;
    const [a, b] = [...touches.values()];
    setZoom((hand.zoom * Math.hypot(a[0] - b[0], a[1] - b[1])) / hand.pinch);
    return;
  }
  const [dx, dy] = [x - hand.x, y - hand.y];
  if (!hand.moved && Math.hypot(dx, dy) < 4) return;
  hand.moved = true;
  $("map").classList.add("moving");
  if (hand.parallel) {
    const control = projection.controls.find((c) => c.key === hand.parallel);
    const lat = hand.values[hand.parallel] - dy / hand.degree;
    state.values[hand.parallel] = round(clamp(lat, control.min, control.max));
  } else if (hand.pan) {
    view.panX = hand.panX + dx;
    view.panY = hand.panY + dy;
    view.fit();
    redraw(true);
    return;
  } else {
    const lat = hand.values.lat0 ?? 0;
    const stretch = has("lat0") ? Math.max(Math.cos((lat * Math.PI) / 180), 0.2) : 1;
    if (has("lon0")) state.values.lon0 = round(turned(hand.values.lon0 - dx / (hand.degree * stretch)));
    if (has("lat0")) state.values.lat0 = round(clamp(lat + dy / hand.degree, -90, 90));
  }
  syncControls();
  update(true);
}

function release(event) {
  touches.delete(event.pointerId);
  $("map").classList.remove("moving");
  const was = hand;
  hand = undefined;
  if (!was) return;
  if (!was.moved && event.type === "pointerup") take(view.toEarth(...place(event)));
  else rest(60);
}

// A point for the figures: the first, the second, then the first anew.
function take(point) {
  if (!point) return;
  state.points = state.points.length === 1 ? [state.points[0], point] : [point];
  redraw();
}

const round = (value) => Math.round(value * 10) / 10;

function setZoom(zoom) {
  const before = state.zoom;
  state.zoom = clamp(zoom, 0.5, 40);
  view.zoom = state.zoom;
  view.panX *= state.zoom / before;
  view.panY *= state.zoom / before;
  view.fit();
  redraw(true);
}

function resetZoom() {
  state.zoom = 1;
  Object.assign(view, { zoom: 1, panX: 0, panY: 0 });
}

function key(event) {
  const steps = { ArrowLeft: [-1, 0], ArrowRight: [1, 0], ArrowUp: [0, 1], ArrowDown: [0, -1] };
  if (event.key in steps) {
    const [dx, dy] = steps[event.key].map((d) => d * (event.shiftKey ? 1 : 5));
    if (has("lon0") || has("lat0")) {
      if (has("lon0")) state.values.lon0 = round(turned(state.values.lon0 + dx));
      if (has("lat0")) state.values.lat0 = round(clamp(state.values.lat0 + dy, -90, 90));
      syncControls();
      update(true);
    } else {
      view.panX -= dx * 8;
      view.panY += dy * 8;
      view.fit();
      redraw(true);
    }
  } else if (event.key === "+" || event.key === "=") {
    setZoom(state.zoom * 1.25);
  } else if (event.key === "-") {
    setZoom(state.zoom / 1.25);
  } else if (event.key === "Enter") {
    take(view.toEarth(view.width / 2, view.height / 2));
  } else if (event.key === "Escape") {
    state.points = [];
    redraw();
  } else {
    return;
  }
  event.preventDefault();
}

// ---- Controls ---------------------------------------------------------------------------------

function buildControls() {
  const controls = projection?.controls ?? [];
  $("controls").replaceChildren(...controls.map((c) => {
    const common = { min: c.min, max: c.max, step: c.step ?? 0.1, value: state.values[c.key] };
    const range = element("input", { type: "range", id: `range-${c.key}`, ...common });
    const number = element("input", { type: "number", id: `number-${c.key}`, ...common });
    number.setAttribute("aria-label", `${c.label}, ${c.unit === "m" ? "metres" : "degrees"}`);
    const change = (event) => {
      const value = event.target.valueAsNumber;
      if (!Number.isFinite(value)) return;
      state.values[c.key] = clamp(value, c.min, c.max);
      syncControls(event.target);
      update(true);
    };
    range.addEventListener("input", change);
    number.addEventListener("change", change);
    return element("div", { className: "control" },
      element("label", { htmlFor: range.id, textContent: c.label }), range, number);
  }));
  if (controls.length === 0) {
    $("controls").replaceChildren(element("p", {
      className: "quiet",
      textContent: system ? "The registry sets this system’s parameters. Drag to move the map."
        : "This projection stands where it was made for. Drag to move the map.",
      style: "margin-bottom: 14px",
    }));
  }
}

function syncControls(except) {
  for (const c of projection?.controls ?? []) {
    for (const id of [`range-${c.key}`, `number-${c.key}`]) {
      if ($(id) !== except) $(id).value = state.values[c.key];
    }
  }
}

function showLegend() {
  const scale = DISTORTIONS[state.distortion];
  $("legend").hidden = !scale;
  if (!scale) return;
  $("legend-label").textContent =
    { area: "Area, true is 1", angle: "Largest change of an angle", scale: "Largest scale, true is 1" }[state.distortion];
  $("legend-bar").style.background = gradient(scale);
  $("legend-ticks").replaceChildren(...scale.ticks.map(([, text]) => element("span", { textContent: text })));
}

// ---- Figures ----------------------------------------------------------------------------------

function sexagesimal(value, positive, negative) {
  const tenths = Math.round(Math.abs(value) * 36000);
  const [d, m, s] = [Math.floor(tenths / 36000), Math.floor(tenths / 600) % 60, (tenths % 600) / 10];
  const two = (n) => String(n).padStart(2, "0");
  return `${d}° ${two(m)}′ ${s.toFixed(1).padStart(4, "0")}″ ${value < 0 ? negative : positive}`;
}

const metres = (value) =>
  value.toLocaleString("en", { minimumFractionDigits: 3, maximumFractionDigits: 3 });
const length = (value) =>
  value < 10000 ? `${metres(value)} m`
    : `${(value / 1000).toLocaleString("en", { minimumFractionDigits: 3, maximumFractionDigits: 3 })} km`;
const bearing = (value) => `${(((value % 360) + 360) % 360).toFixed(3)}°`;

// All that the page tells about a point, as numbers.
export function figuresAt(lon, lat) {
  const [x, y] = system ? system.transformation.forward(lon, lat) : mapping.forward(lon, lat);
  const factors = system ? system.factors?.factors(lon, lat) : mapping.factors(lon, lat);
  return { lon, lat, x, y, factors, mgrs: tw.formatMgrs(lon, lat) };
}

export function wayBetween([lon1, lat1], [lon2, lat2]) {
  return {
    geodesic: geodesics.inverse(lon1, lat1, lon2, lat2),
    rhumb: rhumbs.inverse(lon1, lat1, lon2, lat2),
  };
}

function list(rows) {
  return element("dl", {}, ...rows.flatMap(([name, value]) =>
    [element("dt", { textContent: name }), element("dd", { textContent: value })]));
}

// What stands there while there is no point.
const invitation = $("figures").firstElementChild;

function showFigures() {
  const parts = state.points.map(([lon, lat], i) => {
    const { x, y, factors, mgrs } = figuresAt(lon, lat);
    const rows = [
      ["Latitude", sexagesimal(lat, "N", "S")],
      ["Longitude", sexagesimal(lon, "E", "W")],
      ["Degrees", `${lat.toFixed(6)}, ${lon.toFixed(6)}`],
    ];
    if (mgrs) rows.push(["Grid reference", mgrs]);
    const geographic = system?.found.kind.startsWith("geographic");
    if (!Number.isFinite(x)) {
      rows.push([system ? system.found.name : projection.name, "no image"]);
    } else if (!geographic) {
      rows.push(["Easting", `${metres(x)} ${unitName()}`], ["Northing", `${metres(y)} ${unitName()}`]);
    } else {
      rows.push([system.found.name, `${y.toFixed(8)}, ${x.toFixed(8)}`]);
    }
    if (factors && Number.isFinite(factors.areal)) {
      rows.push(["Scale, meridian", factors.meridional.toFixed(6)],
        ["Scale, parallel", factors.parallel.toFixed(6)],
        ["Scale of areas", factors.areal.toFixed(6)],
        ["Angular distortion", `${factors.angular.toFixed(4)}°`],
        ["Convergence", `${factors.convergence.toFixed(5)}°`]);
    }
    const dot = element("i", { style: `background: var(--${"ab"[i]})` });
    return element("div", { className: "place" }, element("h3", {}, dot, `Point ${"AB"[i]}`), list(rows));
  });
  if (state.points.length === 2) {
    const { geodesic, rhumb } = wayBetween(...state.points);
    const way = (name, className, rows) =>
      element("div", { className: "place way" }, element("h3", {}, element("span", { className }), name), list(rows));
    parts.push(
      way("Shortest way", "key", [["Length", length(geodesic.length)],
        ["Leaves at", bearing(geodesic.azimuth1)], ["Arrives at", bearing(geodesic.azimuth2)]]),
      way("Rhumb line", "key rhumb", [["Length", length(rhumb.length)],
        ["Constant bearing", bearing(rhumb.azimuth1)],
        ["Longer by", length(Math.max(0, rhumb.length - geodesic.length))]]));
  }
  if (parts.length === 0) parts.push(invitation);
  $("figures").replaceChildren(...parts);
}

const unitName = () => {
  const name = system?.found.unit ?? "metre";
  return name === "metre" ? "m" : name === "US survey foot" ? "ftUS" : name === "foot" ? "ft" : name;
};

function tell(text) {
  $("converted").textContent = text;
}

// ---- Search -----------------------------------------------------------------------------------

function search() {
  const words = $("search").value.trim();
  const found = $("found");
  found.hidden = words === "";
  if (words === "") return;
  let codes = [];
  const code = Number(words.replace(/^epsg:/i, ""));
  if (Number.isInteger(code) && code > 0) codes = [code];
  else codes = tw.search(words, 30);
  const items = [];
  for (const c of codes) {
    try {
      const s = tw.system(`EPSG:${c}`);
      if (s.kind === "vertical" || s.kind === "geocentric") continue;
      const button = element("button", { type: "button" },
        element("span", { textContent: s.name }), element("code", { textContent: c }),
        element("small", { textContent: [s.method, areaName(s)].filter(Boolean).join(" · ") }));
      button.addEventListener("click", () => pick(c));
      items.push(element("li", {}, button));
    } catch {
      // Not every code that is typed is a system's.
    }
  }
  if (items.length === 0) items.push(element("li", {}, element("p", { textContent: "Nothing in the registry has that name." })));
  found.replaceChildren(...items);
}

// The area's name without its bounds.
const areaName = (s) => /area(?: of use)?:\s*(.*?)(?: \([-\d][^()]*\))?$/im.exec(s.describe())?.[1];

function pick(code) {
  $("found").hidden = true;
  try {
    chooseSystem(code);
    $("search").value = "";
    $("map").focus({ preventScroll: true });
  } catch (error) {
    $("found").replaceChildren(element("li", {}, element("p", { textContent: error.message })));
    $("found").hidden = false;
  }
}

// ---- The address ------------------------------------------------------------------------------

function remember() {
  const query = new URLSearchParams();
  if (state.code) query.set("system", state.code);
  else query.set("projection", state.id);
  for (const [name, value] of Object.entries(state.values)) query.set(name, value);
  if (state.distortion) query.set("distortion", state.distortion);
  if (state.tissot) query.set("tissot", 1);
  if (!state.graticule) query.set("graticule", 0);
  if (state.zoom !== 1) query.set("zoom", state.zoom.toFixed(3));
  state.points.forEach(([lon, lat], i) => query.set("ab"[i], `${lon.toFixed(6)},${lat.toFixed(6)}`));
  history.replaceState(null, "", `#${query}`);
}

function recall() {
  const query = new URLSearchParams(location.hash.slice(1));
  const number = (name) => (query.has(name) ? Number(query.get(name)) : undefined);
  const values = {};
  for (const name of ["lon0", "lat0", "lat1", "lat2", "azimuth", "h", "tilt"]) {
    if (Number.isFinite(number(name))) values[name] = number(name);
  }
  state.distortion = query.get("distortion") in DISTORTIONS ? query.get("distortion") : "";
  state.tissot = query.get("tissot") === "1";
  state.graticule = query.get("graticule") !== "0";
  state.points = ["a", "b"].flatMap((name) => {
    const point = (query.get(name) ?? "").split(",").map(Number);
    return point.length === 2 && point.every(Number.isFinite) && Math.abs(point[1]) <= 90 ? [point] : [];
  });
  $("tissot").checked = state.tissot;
  $("graticule").checked = state.graticule;
  document.querySelector(`[name=distortion][value="${state.distortion}"]`).checked = true;
  const code = number("system");
  try {
    if (code) chooseSystem(code);
    else chooseProjection(query.get("projection") ?? "robinson", values);
  } catch (error) {
    chooseProjection("robinson");
    tell(error.message);
  }
  if (number("zoom") > 0) setZoom(number("zoom"));
}

// ---- Files ------------------------------------------------------------------------------------

let offered;

async function convertFile(file) {
  if (!file) return;
  try {
    const transformation = tw.transformation($("from").value, $("to").value);
    const result = convert(file.name, await file.text(), transformation);
    if (offered) URL.revokeObjectURL(offered);
    offered = URL.createObjectURL(new Blob([result.text], { type: result.type }));
    const dot = file.name.lastIndexOf(".");
    const name = `${file.name.slice(0, dot)}-${$("to").value.replace(/\W+/g, "-").toLowerCase()}${file.name.slice(dot)}`;
    const failed = result.failed ? ` ${result.failed} could not be.` : "";
    $("converted").replaceChildren(
      `${result.points} ${result.points === 1 ? "point was" : "points were"} converted.${failed} `,
      element("a", { href: offered, download: name, textContent: "Save it" }));
  } catch (error) {
    tell(error.message);
  }
}

// ---- Beginning --------------------------------------------------------------------------------

function theme(name) {
  document.documentElement.dataset.theme = name;
  readStyle();
  if (mapping) redraw();
}

async function begin() {
  const dark = matchMedia("(prefers-color-scheme: dark)");
  theme(dark.matches ? "dark" : "light");
  dark.addEventListener("change", () => theme(dark.matches ? "dark" : "light"));
  $("theme").addEventListener("click", () =>
    theme(document.documentElement.dataset.theme === "dark" ? "light" : "dark"));

  const land = async (name) => readLand(await (await fetch(`land/${name}.bin`)).arrayBuffer());
  const [library, coarse] = await Promise.all([load(), land("land-110")]);
  tw = library;
  geodesics = tw.geodesics();
  rhumbs = tw.rhumbLines();
  const layers = { land: coarse, graticule: graticule(15), graticuleFine: graticule(5), geodesics };
  view = new MapView($("map"), layers);
  const { width, height } = $("stage").getBoundingClientRect();
  view.margin = width < 500 ? 12 : 28;
  view.resize(width, height, Math.min(window.devicePixelRatio || 1, 2));

  $("projection").append(
    ...FAMILIES.map((family) => {
      const group = element("optgroup", { label: family });
      group.append(...PROJECTIONS.filter((p) => p.family === family)
        .map((p) => element("option", { value: p.id, textContent: p.name })));
      return group;
    }),
    element("option", { value: "system", textContent: "A system of the registry", disabled: true }));
  $("projection").addEventListener("change", (event) => chooseProjection(event.target.value));
  $("tissot").addEventListener("change", (event) => { state.tissot = event.target.checked; redraw(); });
  $("graticule").addEventListener("change", (event) => { state.graticule = event.target.checked; redraw(); });
  document.querySelectorAll("[name=distortion]").forEach((radio) =>
    radio.addEventListener("change", () => { state.distortion = radio.value; redraw(); }));

  const map = $("map");
  map.addEventListener("pointerdown", press);
  map.addEventListener("pointermove", move);
  map.addEventListener("pointerup", release);
  map.addEventListener("pointercancel", release);
  map.addEventListener("keydown", key);
  map.addEventListener("wheel", (event) => {
    event.preventDefault();
    setZoom(state.zoom * Math.exp(-event.deltaY / 500));
  }, { passive: false });
  $("zoom-in").addEventListener("click", () => setZoom(state.zoom * 1.4));
  $("zoom-out").addEventListener("click", () => setZoom(state.zoom / 1.4));
  $("zoom-reset").addEventListener("click", () => { resetZoom(); update(); });

  $("search").addEventListener("input", search);
  $("search-form").addEventListener("submit", (event) => {
    event.preventDefault();
    $("found").querySelector("button")?.click();
  });
  $("search-form").addEventListener("keydown", (event) => {
    if (event.key === "Escape") $("found").hidden = true;
    const step = { ArrowDown: 1, ArrowUp: -1 }[event.key];
    if (!step) return;
    const stops = [$("search"), ...$("found").querySelectorAll("button")];
    stops[clamp(stops.indexOf(document.activeElement) + step, 0, stops.length - 1)].focus();
    event.preventDefault();
  });
  document.addEventListener("click", (event) => {
    if (!$("search-form").contains(event.target)) $("found").hidden = true;
  });

  $("file").addEventListener("change", (event) => convertFile(event.target.files[0]));
  const drop = $("drop");
  for (const type of ["dragenter", "dragover", "dragleave", "drop"]) {
    document.addEventListener(type, (event) => {
      event.preventDefault();
      drop.classList.toggle("over", type === "dragenter" || type === "dragover");
      if (type === "drop") convertFile(event.dataTransfer.files[0]);
    });
  }
  $("share").addEventListener("click", async () => {
    remember();
    try {
      await navigator.clipboard.writeText(location.href);
      $("share").textContent = "Copied";
    } catch {
      $("share").textContent = "It stands in the address bar";
    }
    setTimeout(() => ($("share").textContent = "Copy the address of this view"), 2500);
  });
  window.addEventListener("hashchange", recall);

  $("waiting").remove();
  recall();
  new ResizeObserver(resize).observe($("stage"));
  layers.landFine = await land("land-50");
  redraw();
  document.documentElement.dataset.ready = "yes";
}

// What tests and the gallery take hold of.
window.explorer = {
  state, chooseProjection, chooseSystem, figuresAt, wayBetween, theme,
  projections: PROJECTIONS,
  get view() { return view; },
  get library() { return tw; },
  drawNow: (moving = false) => {
    remap();
    draw(moving);
    if (!moving) showFigures();
    showLegend();
  },
};

begin().catch((error) => {
  const waiting = $("waiting");
  if (waiting) waiting.textContent = `The library could not be loaded: ${error.message}`;
  console.error(error);
});
