// The map: what is drawn, cut by the domain, projected by the library in one call for each layer,
// and put on a canvas.

// Indicatrices of a world's map and of a region's: between centres, degrees; radius, metres.
const WORLD_CIRCLES = { step: 30, radius: 400000 };
const REGION_CIRCLES = { step: 5, radius: 90000 };
const REGION_SIZE = 8e6;

// The coastlines as build.mjs writes them.
export function readLand(buffer) {
  const view = new DataView(buffer);
  const counts = [view.getUint32(0, true), view.getUint32(4, true)];
  let at = 8;
  let points = at + 2 * (counts[0] + counts[1]);
  const parts = counts.map((count) => {
    const out = [];
    for (let i = 0; i < count; ++i, at += 2) {
      const n = view.getUint16(at, true);
      const part = new Float64Array(2 * n);
      for (let k = 0; k < 2 * n; ++k, points += 2) {
        part[k] = (view.getInt16(points, true) / 32767) * (k % 2 === 0 ? 180 : 90);
      }
      out.push(part);
    }
    return out;
  });
  return { pieces: parts[0], lines: parts[1] };
}

export function graticule(step) {
  const lines = [];
  for (let lon = -180; lon < 180; lon += step) {
    const top = lon % 90 === 0 ? 90 : 90 - step;
    const line = [];
    for (let lat = -top; lat <= top; lat += Math.abs(lat) < 88 ? 1.5 : 0.25) line.push(lon, lat);
    lines.push(line);
  }
  for (let lat = -90 + step; lat < 90; lat += step) {
    const line = [];
    for (let lon = -180; lon <= 180; lon += 1.5) line.push(lon, lat);
    lines.push(line);
  }
  return lines;
}

// Circles on the ground around points of a grid, as far as a domain has them.
function indicatrices(geodesics, { step, radius }, domain) {
  const circles = [];
  const last = Math.floor(80 / step) * step;
  for (let lat = -last; lat <= last; lat += step) {
    for (let lon = -180; lon < 180; lon += step) {
      if (domain && !domain.contains(lon, lat)) continue;
      const circle = [];
      for (let azimuth = 0; azimuth < 360; azimuth += 7.5) {
        const end = geodesics.direct(lon, lat, azimuth, radius);
        circle.push(end.longitude, end.latitude);
      }
      circles.push(circle);
    }
  }
  return circles;
}

// Room for what the cutting hands out, kept from one layer to the next.
let room = [new Float64Array(1 << 16), new Float64Array(1 << 16)];

// Anything of parts, cut and projected: where each begins, degrees, and plane coordinates in metres.
function projected(parts, cut, mapping) {
  const starts = [0];
  let count = 0;
  const emit = (points) => {
    const most = count + points.length / 2;
    if (most > room[0].length) {
      room = room.map((old) => {
        const wider = new Float64Array(2 * most);
        wider.set(old);
        return wider;
      });
    }
    const [lon, lat] = room;
    for (let i = 0; i < points.length; i += 2) {
      lon[count] = points[i];
      lat[count++] = points[i + 1];
    }
    starts.push(count);
  };
  for (const part of parts) cut(part, emit);
  const [lon, lat] = room.map((all) => all.slice(0, count));
  const [x, y] = [lon.slice(), lat.slice()];
  mapping.forward(x, y);
  return { starts, lon, lat, x, y };
}

// One hue from low to high for what only grows, two that meet in the middle for scale and area.
const GROWS = [[255, 247, 224], [252, 205, 130], [242, 135, 84], [203, 62, 92], [108, 26, 104]];
const PARTS = [[20, 92, 130], [98, 174, 190], [250, 248, 240], [238, 158, 96], [160, 44, 54]];

function colour(stops, t) {
  const place = Math.max(0, Math.min(1, t)) * (stops.length - 1);
  const i = Math.min(Math.floor(place), stops.length - 2);
  return stops[i].map((c, k) => c + (place - i) * (stops[i + 1][k] - c));
}

export const DISTORTIONS = {
  area: { label: "Area", stops: PARTS, of: (f, i) => f.areal[i],
    place: (v) => 0.5 + Math.log2(v) / 4, ticks: [[0.25, "¼"], [0.5, "½"], [1, "1"], [2, "2"], [4, "4"]] },
  angle: { label: "Angle", stops: GROWS, of: (f, i) => f.angular[i],
    place: (v) => v / 60, ticks: [[0, "0°"], [15, "15°"], [30, "30°"], [45, "45°"], [60, "60°"]] },
  scale: { label: "Scale", stops: PARTS, of: (f, i) => Math.max(f.meridional[i], f.parallel[i]),
    place: (v) => 0.5 + Math.log2(v) / 4, ticks: [[0.25, "¼"], [0.5, "½"], [1, "1"], [2, "2"], [4, "4"]] },
};
export const gradient = ({ stops }) =>
  `linear-gradient(90deg, ${stops.map((c) => `rgb(${c.join(" ")})`).join(", ")})`;

export class MapView {
  // Layers as the present mapping has them: moving the map in its window projects nothing anew.
  #shapes = new WeakMap();

  constructor(canvas, layers) {
    this.canvas = canvas;
    this.context = canvas.getContext("2d");
    this.layers = layers; // land, landFine, graticule, graticuleFine, geodesics
    this.zoom = 1;
    this.panX = 0;
    this.panY = 0;
    this.margin = 24;
  }

  // What to draw: a mapping of degrees to plane coordinates and the domain that it shows; `frame` is
  // a smaller domain that fills the canvas, if any.
  set(mapping, domain, frame) {
    this.mapping = mapping;
    this.domain = domain;
    this.frame = frame;
    this.#shapes = new WeakMap();
    const border = projected([domain.border().flat()], (part, emit) => emit(part), mapping);
    this.outline = border;
    let shown = border;
    if (frame) shown = projected([frame.border().flat()], (part, emit) => emit(part), mapping);
    const box = [Infinity, Infinity, -Infinity, -Infinity];
    const take = ({ x, y }) => {
      for (let i = 0; i < x.length; ++i) {
        if (!Number.isFinite(x[i]) || !Number.isFinite(y[i])) continue;
        box[0] = Math.min(box[0], x[i]);
        box[1] = Math.min(box[1], y[i]);
        box[2] = Math.max(box[2], x[i]);
        box[3] = Math.max(box[3], y[i]);
      }
    };
    take(shown);
    if (!frame) take(this.shape(this.layers.graticule, false));
    this.box = box;
    this.fit();
  }

  resize(width, height, ratio) {
    this.canvas.width = Math.round(width * ratio);
    this.canvas.height = Math.round(height * ratio);
    this.width = width;
    this.height = height;
    this.ratio = ratio;
    if (this.box) this.fit();
  }

  fit() {
    const [x0, y0, x1, y1] = this.box;
    const room = (length) => Math.max(40, length - 2 * this.margin);
    this.scale =
      Math.min(room(this.width) / (x1 - x0), room(this.height) / (y1 - y0)) * this.zoom;
    this.originX = this.width / 2 - this.scale * ((x0 + x1) / 2) + this.panX;
    this.originY = this.height / 2 + this.scale * ((y0 + y1) / 2) + this.panY;
  }

  toScreen(x, y) {
    return [this.originX + this.scale * x, this.originY - this.scale * y];
  }
  toPlane(px, py) {
    return [(px - this.originX) / this.scale, (this.originY - py) / this.scale];
  }
  // Longitude and latitude under a place of the canvas; undefined outside the map.
  toEarth(px, py, domain = this.domain) {
    const [lon, lat] = this.mapping.inverse(...this.toPlane(px, py));
    if (!Number.isFinite(lon) || !Number.isFinite(lat) || !domain.contains(lon, lat)) return undefined;
    const [x, y] = this.toScreen(...this.mapping.forward(lon, lat));
    return Math.hypot(x - px, y - py) < 2 ? [lon, lat] : undefined;
  }
  fromEarth(lon, lat) {
    if (!this.domain.contains(lon, lat)) return undefined;
    const at = this.toScreen(...this.mapping.forward(lon, lat));
    return at.every(Number.isFinite) ? at : undefined;
  }

  draw(style, show, moving) {
    const { context } = this;
    context.setTransform(this.ratio, 0, 0, this.ratio, 0, 0);
    context.clearRect(0, 0, this.width, this.height);
    context.lineJoin = "round";

    // The sea is the map's own shape; nothing leaves it.
    context.save();
    const outline = new Path2D();
    this.trace(outline, this.outline, true);
    context.fillStyle = style.sea;
    context.fill(outline);
    // While the map moves the clip costs more than the half of a thin line that it takes off.
    if (show.distortion || !moving) context.clip(outline);

    const land = moving || !this.layers.landFine ? this.layers.land : this.layers.landFine;
    this.path(land.pieces, true, (path) => {
      context.fillStyle = style.land;
      context.fill(path);
    });
    if (show.distortion) {
      this.distortion(show.distortion, moving);
    }
    if (show.graticule) {
      this.path(this.regional ? this.layers.graticuleFine : this.layers.graticule, false, (path) => {
        context.strokeStyle = show.distortion ? style.graticuleOver : style.graticule;
        context.lineWidth = 0.7;
        context.stroke(path);
      });
    }
    this.path(land.lines, false, (path) => {
      context.strokeStyle = show.distortion ? style.coastOver : style.coast;
      context.lineWidth = 0.8;
      context.stroke(path);
    });
    if (show.indicatrices) {
      this.path(this.circles(), true, (path) => {
        context.fillStyle = show.distortion ? style.indicatrixOver : style.indicatrix;
        context.fill(path);
        context.strokeStyle = show.distortion ? style.indicatrixEdgeOver : style.indicatrixEdge;
        context.lineWidth = 1;
        context.stroke(path);
      });
    }
    for (const { points, color, dash = [], width = 1.5 } of show.lines ?? []) {
      this.path([points], false, (path) => {
        context.setLineDash(dash);
        context.strokeStyle = color;
        context.lineWidth = width;
        context.stroke(path);
        context.setLineDash([]);
      });
    }
    context.restore();
    context.strokeStyle = style.outline;
    context.lineWidth = 1.2;
    context.stroke(outline);
    for (const mark of show.marks ?? []) this.mark(mark, style);
  }

  // Whether the map is of a region, in plane coordinates of metres; degrees are a world's.
  get regional() {
    const [x0, y0, x1, y1] = this.box;
    const size = Math.max(x1 - x0, y1 - y0);
    return size > 400 && size < REGION_SIZE;
  }

  circles() {
    const { layers, domain } = this;
    if (this.regional) {
      if (this.circled !== domain) {
        this.regionCircles = indicatrices(layers.geodesics, REGION_CIRCLES, domain);
        this.circled = domain;
      }
      return this.regionCircles;
    }
    this.worldCircles ??= indicatrices(layers.geodesics, WORLD_CIRCLES);
    return this.worldCircles;
  }

  // Areas or lines, cut at the edges and projected.
  shape(parts, closed) {
    let shape = this.#shapes.get(parts);
    if (!shape) {
      const { domain } = this;
      const cut = closed ? (part, emit) => domain.area(part, emit) : (part, emit) => domain.line(part, emit);
      shape = projected(parts, cut, this.mapping);
      this.#shapes.set(parts, shape);
    }
    return shape;
  }

  path(parts, closed, paint) {
    const path = new Path2D();
    this.trace(path, this.shape(parts, closed), closed);
    paint(path);
  }

  trace(path, { starts, x, y }, closed) {
    const { originX, originY, scale } = this;
    for (let k = 0; k + 1 < starts.length; ++k) {
      let [first, last] = [-1, -1];
      const end = starts[k + 1];
      for (let i = starts[k]; i < end; ++i) {
        if (!Number.isFinite(x[i]) || !Number.isFinite(y[i])) {
          if (!closed) last = -1;
          continue;
        }
        if (last < 0) {
          path.moveTo(originX + scale * x[i], originY - scale * y[i]);
          first = i;
        } else {
          path.lineTo(originX + scale * x[i], originY - scale * y[i]);
        }
        last = i;
      }
      // Not by closePath(), for which some browsers look at the whole path each time.
      if (closed && last >= 0) path.lineTo(originX + scale * x[first], originY - scale * y[first]);
    }
  }

  // Factors of the library on a lattice of the canvas, smoothed by the canvas itself.
  distortion(name, moving) {
    const { place, of, stops } = DISTORTIONS[name];
    const columns = moving ? 64 : 200;
    const rows = Math.max(2, Math.round((columns * this.height) / this.width));
    const count = columns * rows;
    const lon = new Float64Array(count);
    const lat = new Float64Array(count);
    for (let r = 0; r < rows; ++r) {
      for (let c = 0; c < columns; ++c) {
        const [x, y] = this.toPlane(((c + 0.5) * this.width) / columns, ((r + 0.5) * this.height) / rows);
        lon[r * columns + c] = x;
        lat[r * columns + c] = y;
      }
    }
    this.mapping.inverse(lon, lat);
    const factors = this.mapping.factors(lon, lat);
    const image = new ImageData(columns, rows);
    for (let i = 0; i < count; ++i) {
      const value = of(factors, i);
      // Differences across an edge of the map say nothing.
      if (!Number.isFinite(value) || !this.domain.inside(lon[i], lat[i], 0.5)) continue;
      const [red, green, blue] = colour(stops, place(value));
      image.data.set([red, green, blue, 205], 4 * i);
    }
    // The rim takes the colour of its neighbours, so that smoothing does not fade it.
    for (let pass = 0; pass < 3; ++pass) {
      const before = image.data.slice();
      for (let i = 0; i < count; ++i) {
        if (before[4 * i + 3] !== 0) continue;
        for (const j of [i - 1, i + 1, i - columns, i + columns]) {
          if (j >= 0 && j < count && before[4 * j + 3] !== 0) {
            image.data.set(before.subarray(4 * j, 4 * j + 4), 4 * i);
            break;
          }
        }
      }
    }
    this.raster ??= document.createElement("canvas");
    this.raster.width = columns;
    this.raster.height = rows;
    this.raster.getContext("2d").putImageData(image, 0, 0);
    this.context.imageSmoothingQuality = "high";
    this.context.drawImage(this.raster, 0, 0, this.width, this.height);
  }

  mark({ lon, lat, label, color }, style) {
    const at = this.fromEarth(lon, lat);
    if (!at) return;
    const { context } = this;
    context.beginPath();
    context.arc(at[0], at[1], 6, 0, 2 * Math.PI);
    context.fillStyle = color;
    context.fill();
    context.strokeStyle = style.markEdge;
    context.lineWidth = 2;
    context.stroke();
    if (!label) return;
    context.font = "600 13px system-ui, sans-serif";
    context.lineWidth = 4;
    context.strokeStyle = style.markEdge;
    context.strokeText(label, at[0] + 10, at[1] - 8);
    context.fillStyle = style.ink;
    context.fillText(label, at[0] + 10, at[1] - 8);
  }
}
