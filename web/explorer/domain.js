// Which part of the Earth a projection shows, and lines and areas cut at its edges before they are
// projected, so that nothing is drawn across the map.
//
// A band is cut in longitude and latitude; a cap, and a belt across a meridian, on unit vectors by
// planes.  Areas come in pieces of a few degrees (see build.mjs): each is convex enough for the
// method of Sutherland and Hodgman (1974), and small enough never to reach around the Earth.

const RAD = Math.PI / 180;
// How close to a cut things are drawn, degrees.
const NEAR = 1e-6;

const vector = (lon, lat) => {
  const c = Math.cos(lat * RAD);
  return [c * Math.cos(lon * RAD), c * Math.sin(lon * RAD), Math.sin(lat * RAD)];
};
const dot = (a, b) => a[0] * b[0] + a[1] * b[1] + a[2] * b[2];
const cross = (a, b) => [
  a[1] * b[2] - a[2] * b[1], a[2] * b[0] - a[0] * b[2], a[0] * b[1] - a[1] * b[0]];
const clamped = (x) => Math.max(-1, Math.min(1, x));
const unit = (v) => {
  const r = Math.hypot(v[0], v[1], v[2]);
  return [v[0] / r, v[1] / r, v[2] / r];
};
const mix = (a, b, t) => [a[0] + t * (b[0] - a[0]), a[1] + t * (b[1] - a[1]), a[2] + t * (b[2] - a[2])];
const degrees = (v) => [
  Math.atan2(v[1], v[0]) / RAD, Math.atan2(v[2], Math.hypot(v[0], v[1])) / RAD];
const wrapped = (lon) => lon - 360 * Math.round(lon / 360);

// Longitudes within `reach` of the central meridian, latitudes from south to north.
export function band(lon0, reach, south, north) {
  const limit = Math.min(reach, 180) - NEAR;
  return new Band(lon0, limit, Math.max(south, -90), Math.min(north, 90), reach >= 180);
}

// Everything within a radius of a point, degrees.
export function cap(lon, lat, radius) {
  const centre = vector(lon, lat);
  return new Cut([{ n: centre, d: Math.cos(radius * RAD) }], capBorder(centre, radius));
}

// The same without what lies within another radius of a second point.
export function capWithout(lon, lat, radius, lon2, lat2, radius2) {
  const centre = vector(lon, lat);
  const away = vector(lon2, lat2).map((x) => -x);
  const planes = [
    { n: centre, d: Math.cos(radius * RAD) }, { n: away, d: -Math.cos(radius2 * RAD) }];
  // Along every bearing from the centre as far as all planes allow.
  const rims = Array.from({ length: 200 }, (_, i) => capBorder(centre, (radius * (i + 1)) / 200));
  const border = rims[0].map((_, bearing) => {
    let last = [lon, lat];
    for (const rim of rims) {
      const v = vector(...rim[bearing]);
      if (!planes.every(({ n, d }) => dot(v, n) >= d - 1e-12)) break;
      last = rim[bearing];
    }
    return last;
  });
  return new Cut(planes, border);
}

// The belt along a central meridian: `along` degrees to the south and north of the equator, `aside`
// to the west and east.
export function across(lon0, along, aside) {
  const front = vector(lon0, 0);
  const north = [0, 0, 1];
  const west = cross(front, north).map((x) => -x);
  const sine = Math.sin(aside * RAD);
  const planes = [{ n: west, d: -sine }, { n: west.map((x) => -x), d: -sine }];
  // As far as the poles, the half of the globe in front.
  planes.push({ n: front, d: Math.cos(Math.min(along, 90) * RAD) });
  const border = [];
  const at = (a, b) => {
    const [ca, sa, cb, sb] = [Math.cos(a * RAD), Math.sin(a * RAD), Math.cos(b * RAD), Math.sin(b * RAD)];
    return degrees([0, 1, 2].map((k) => cb * (ca * front[k] + sa * north[k]) + sb * west[k]));
  };
  const e = along - NEAR;
  for (let t = -e; t < e; t += 2) border.push(at(t, aside));
  for (let t = aside; t > -aside; t -= 2) border.push(at(e, t));
  for (let t = e; t > -e; t -= 2) border.push(at(t, -aside));
  for (let t = -aside; t < aside; t += 2) border.push(at(-e, t));
  return new Cut(planes, border);
}

function capBorder(centre, radius) {
  const side = unit(cross(Math.abs(centre[2]) < 0.9 ? [0, 0, 1] : [1, 0, 0], centre));
  const up = cross(centre, side);
  const [c, s] = [Math.cos(radius * RAD), Math.sin(radius * RAD)];
  return Array.from({ length: 361 }, (_, i) => {
    const [x, y] = [s * Math.cos(i * RAD), s * Math.sin(i * RAD)];
    return degrees([0, 1, 2].map((k) => c * centre[k] + x * side[k] + y * up[k]));
  });
}

// Latitudes along a map's edge, ever closer towards the poles, where some maps are stretched most.
const EDGE = [];
for (let y = -90; y < 90; ) {
  EDGE.push(y);
  y += Math.min(2, Math.max(0.01, 0.2 * (90 - Math.abs(y))));
}
EDGE.push(90);

class Band {
  constructor(lon0, reach, south, north, whole) {
    Object.assign(this, { lon0, reach, south, north, whole });
  }

  contains(lon, lat) {
    return Math.abs(wrapped(lon - this.lon0)) <= this.reach && lat >= this.south && lat <= this.north;
  }

  // Whether a point is at least so far from the edges, degrees.
  inside(lon, lat, margin) {
    return Math.abs(wrapped(lon - this.lon0)) <= this.reach - margin &&
      lat >= this.south + margin && lat <= this.north - margin;
  }

  border() {
    const { lon0, reach, south, north } = this;
    const out = [];
    const steps = [south, ...EDGE.filter((y) => y > south && y < north), north];
    for (const y of steps) out.push([lon0 - reach, y]);
    for (let x = -reach; x < reach; x += 2) out.push([lon0 + x, north]);
    for (const y of steps.reverse()) out.push([lon0 + reach, y]);
    for (let x = reach; x > -reach; x -= 2) out.push([lon0 + x, south]);
    out.push([lon0 - reach, south]);
    return out;
  }

  // Hands the parts of a small area to `emit` as arrays of longitudes and latitudes.
  area(piece, emit) {
    const { lon0, reach } = this;
    const first = wrapped(piece[0] - lon0);
    let [west, east, south, north] = [Infinity, -Infinity, Infinity, -Infinity];
    for (let i = 0; i < piece.length; i += 2) {
      const x = first + wrapped(piece[i] - piece[0]);
      const y = piece[i + 1];
      if (x < west) west = x;
      if (x > east) east = x;
      if (y < south) south = y;
      if (y > north) north = y;
    }
    if (north < this.south || south > this.north) return;
    if (west >= -reach && east <= reach && south >= this.south && north <= this.north) {
      emit(piece);
      return;
    }
    const relative = Array.from(piece, (v, i) => (i % 2 === 0 ? first + wrapped(v - piece[0]) : v));
    for (const turn of [0, 360, -360]) {
      if (west + turn > reach || east + turn < -reach) continue;
      let part = turn === 0 ? relative : relative.map((v, i) => (i % 2 === 0 ? v + turn : v));
      if (west + turn < -reach) part = side(part, 0, 1, -reach);
      if (east + turn > reach) part = side(part, 0, -1, reach);
      if (south < this.south) part = side(part, 1, 1, this.south);
      if (north > this.north) part = side(part, 1, -1, this.north);
      if (part.length < 6) continue;
      part = this.#alongEdges(part);
      emit(part.map((v, i) => (i % 2 === 0 ? v + lon0 : v)));
    }
  }

  // The sides of a part that the cut has made follow the map's edge, which may be curved.
  #alongEdges(part) {
    const out = [];
    for (let i = 0; i < part.length; i += 2) {
      const [x, y] = [part[i], part[i + 1]];
      const j = (i + 2) % part.length;
      out.push(x, y);
      if (Math.abs(x) !== this.reach || part[j] !== x) continue;
      const [low, high] = [Math.min(y, part[j + 1]), Math.max(y, part[j + 1])];
      const between = EDGE.filter((lat) => lat > low && lat < high);
      if (part[j + 1] < y) between.reverse();
      for (const lat of between) out.push(x, lat);
    }
    return out;
  }

  // The same for a line.
  line(points, emit) {
    const { lon0, reach, south, north } = this;
    if (this.#whole(points)) {
      emit(points);
      return;
    }
    let run = [];
    const end = () => {
      if (run.length >= 4) emit(run);
      run = [];
    };
    let x = wrapped(points[0] - lon0);
    let y = points[1];
    if (Math.abs(x) <= reach && y >= south && y <= north) run.push(x + lon0, y);
    for (let i = 2; i < points.length; i += 2) {
      const nx = x + wrapped(points[i] - points[i - 2]);
      const ny = points[i + 1];
      // From one copy of the world to the next, at most once in a step.
      const parts = [[x, y, nx, ny]];
      if (nx > reach || nx < -reach) {
        const turn = nx > reach ? -360 : 360;
        parts.push([x + turn, y, nx + turn, ny]);
      }
      for (const [ax, ay, bx, by] of parts) {
        const cut = within(ax, ay, bx, by, -reach, reach, south, north);
        if (!cut) continue;
        const [t, u] = cut;
        if (t > 0) end();
        if (run.length === 0) run.push(ax + t * (bx - ax) + lon0, ay + t * (by - ay));
        run.push(ax + u * (bx - ax) + lon0, ay + u * (by - ay));
        if (u < 1) end();
      }
      x = wrapped(nx);
      if (Math.abs(x - nx) < 1e-9) x = nx;
      y = ny;
    }
    end();
  }

  // Whether a line stays within the edges from beginning to end.
  #whole(points) {
    let x = wrapped(points[0] - this.lon0);
    for (let i = 0; i < points.length; i += 2) {
      if (i > 0) x += wrapped(points[i] - points[i - 2]);
      if (!(Math.abs(x) <= this.reach && points[i + 1] >= this.south && points[i + 1] <= this.north)) {
        return false;
      }
    }
    return true;
  }
}

// Which part of a step lies within a rectangle (Liang and Barsky 1984); undefined for none.
function within(ax, ay, bx, by, west, east, south, north) {
  let [t, u] = [0, 1];
  for (const [p, q] of [
    [ax - bx, ax - west], [bx - ax, east - ax], [ay - by, ay - south], [by - ay, north - ay]]) {
    if (p === 0) {
      if (q < 0) return undefined;
    } else if (p < 0) {
      t = Math.max(t, q / p);
    } else {
      u = Math.min(u, q / p);
    }
  }
  return t <= u ? [t, u] : undefined;
}

function side(points, axis, sign, limit) {
  const out = [];
  for (let i = 0; i < points.length; i += 2) {
    const j = (i + 2) % points.length;
    const a = sign * (points[i + axis] - limit);
    const b = sign * (points[j + axis] - limit);
    if (a >= 0) out.push(points[i], points[i + 1]);
    if (a >= 0 !== b >= 0) {
      const t = a / (a - b);
      const p = [points[i] + t * (points[j] - points[i]),
        points[i + 1] + t * (points[j + 1] - points[i + 1])];
      p[axis] = limit;
      out.push(p[0], p[1]);
    }
  }
  return out;
}

// Unit vectors of the points of a line or an area, formed once.
const formed = new WeakMap();
function vectorsOf(points) {
  let vectors = formed.get(points);
  if (!vectors) {
    vectors = Array.from({ length: points.length / 2 }, (_, i) => vector(points[2 * i], points[2 * i + 1]));
    formed.set(points, vectors);
  }
  return vectors;
}

class Cut {
  constructor(planes, border) {
    this.planes = planes;
    this.points = border;
  }

  contains(lon, lat) {
    const v = vector(lon, lat);
    return this.planes.every(({ n, d }) => dot(v, n) >= d);
  }

  inside(lon, lat, margin) {
    const v = vector(lon, lat);
    return this.planes.every(({ n, d }) => Math.asin(clamped(dot(v, n))) >= Math.asin(d) + margin * RAD);
  }

  border() {
    return this.points;
  }

  area(piece, emit) {
    let whole = true;
    const vectors = vectorsOf(piece);
    for (const { n, d } of this.planes) {
      let any = false;
      for (const v of vectors) {
        if (dot(v, n) >= d) any = true;
        else whole = false;
      }
      // Nothing of a piece is inside while all its corners are far out.
      if (!any) return;
    }
    if (whole) {
      emit(piece);
      return;
    }
    let part = vectors;
    for (const plane of this.planes) {
      part = beyond(part, plane);
      if (part.length < 3) return;
    }
    emit(part.flatMap(degrees));
  }

  line(points, emit) {
    let run = [];
    const end = () => {
      if (run.length >= 4) emit(run);
      run = [];
    };
    const vectors = vectorsOf(points);
    if (this.planes.every(({ n, d }) => vectors.every((v) => dot(v, n) >= d))) {
      emit(points);
      return;
    }
    let a = vectors[0];
    for (let i = 2; i < points.length; i += 2) {
      const b = vectors[i / 2];
      let [t, u] = [0, 1];
      for (const { n, d } of this.planes) {
        const [p, q] = [dot(a, n) - d, dot(b, n) - d];
        if (p < 0 && q < 0) [t, u] = [1, 0];
        else if (p < 0) t = Math.max(t, p / (p - q));
        else if (q < 0) u = Math.min(u, p / (p - q));
      }
      if (t < u) {
        if (t > 0) end();
        if (run.length === 0) {
          run.push(...(t === 0 ? [points[i - 2], points[i - 1]] : degrees(mix(a, b, t))));
        }
        run.push(...(u === 1 ? [points[i], points[i + 1]] : degrees(mix(a, b, u))));
        if (u < 1) end();
      } else {
        end();
      }
      a = b;
    }
    end();
  }
}

// The point of the circle in which a plane cuts the Earth that a vector points to.
function onRim(v, n, d) {
  const height = dot(v, n);
  const aside = unit(v.map((x, k) => x - height * n[k]));
  const radius = Math.sqrt(Math.max(0, 1 - d * d));
  return aside.map((x, k) => x * radius + d * n[k]);
}

// What lies on the inner side of a plane; new edges follow the circle in which it cuts the Earth.
function beyond(vectors, { n, d }) {
  const out = [];
  let left;
  const join = (to) => {
    const [p, q] = [left, to].map((v) => unit(v.map((x, k) => x - d * n[k])));
    const steps = Math.ceil(Math.acos(clamped(dot(p, q))) / (4 * RAD));
    for (let i = 1; i < steps; ++i) out.push(onRim(mix(p, q, i / steps), n, d));
    left = undefined;
  };
  let firstIn;
  for (let i = 0; i < vectors.length; ++i) {
    const [a, b] = [vectors[i], vectors[(i + 1) % vectors.length]];
    const [p, q] = [dot(a, n) - d, dot(b, n) - d];
    if (p >= 0) out.push(a);
    if (p >= 0 !== q >= 0) {
      const at = onRim(mix(a, b, p / (p - q)), n, d);
      if (p >= 0) {
        out.push(at);
        left = at;
      } else {
        if (left) join(at);
        else firstIn = at;
        out.push(at);
      }
    }
  }
  if (left && firstIn) join(firstIn);
  return out;
}
