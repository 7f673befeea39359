// Named systems, transformations, projections and lines in JavaScript.  The computation is the
// WebAssembly library's; this module hands numbers and texts to it and back.

import createLibrary from "./library.js";

// Points go to the library and back in runs that stay in the processor's cache.
const RUN = 4096;

const GRID_FOLDER = "/grids";

async function read(name) {
  const url = new URL(name, import.meta.url);
  if (url.protocol === "file:") {
    const { readFile } = await import("node:fs/promises");
    return new Uint8Array(await readFile(url));
  }
  const response = await fetch(url);
  if (!response.ok) throw new Error(`${url} cannot be read: ${response.status}`);
  return new Uint8Array(await response.arrayBuffer());
}

async function unpacked(given) {
  const bytes = await given;
  // Some servers unpack what ends with .gz on its way.
  if (bytes[0] !== 0x1f || bytes[1] !== 0x8b) return bytes;
  const stream = new Blob([bytes]).stream().pipeThrough(new DecompressionStream("gzip"));
  return new Uint8Array(await new Response(stream).arrayBuffer());
}

let loading;

export function load(options = {}) {
  loading ??= start(options).catch((error) => {
    loading = undefined;
    throw error;
  });
  return loading;
}

async function start({ wasm, tables }) {
  const [wasmBinary, bytes] = await Promise.all([
    unpacked(wasm ?? read("library.wasm.gz")),
    unpacked(tables ?? read("tables.bin.gz")),
  ]);
  const library = await createLibrary({ wasmBinary });
  const at = library._malloc(bytes.length);
  library.HEAPU8.set(bytes, at);
  const opened = library._tidewater_open(at, bytes.length);
  library._free(at);
  if (!opened) throw new Error("The tables are damaged.");
  return interfaceOf(library);
}

function interfaceOf(library) {
  const memory = new Memory(library);

  // A handle of the library's, given back when its object goes, or before by free().
  const finalizer = new FinalizationRegistry((destroy) => destroy());

  class Handle {
    #pointer;
    #destroy;
    constructor(pointer, destroy) {
      if (pointer === 0) throw new Error(memory.lastError());
      this.#pointer = pointer;
      this.#destroy = () => destroy(pointer);
      finalizer.register(this, this.#destroy, this);
    }
    get handle() {
      if (this.#pointer === 0) throw new Error("It was given back by free().");
      return this.#pointer;
    }
    free() {
      if (this.#pointer === 0) return;
      finalizer.unregister(this);
      this.#destroy();
      this.#pointer = 0;
    }
    // What a function of the library's writes about it.
    text(function_) {
      return memory.scoped(() => memory.answer((at, size) => function_(this.handle, at, size)));
    }
  }

  // What takes points there and back.
  class Mapping extends Handle {
    #run;
    constructor(pointer, destroy, run) {
      super(pointer, destroy);
      this.#run = run;
    }
    forward(x, y, z) {
      return points(this.#run, this.handle, 0, x, y, z);
    }
    inverse(x, y, z) {
      return points(this.#run, this.handle, 1, x, y, z);
    }
    forwardPoints(array, dimension = 2) {
      return interleaved(this.#run, this.handle, 0, array, dimension);
    }
    inversePoints(array, dimension = 2) {
      return interleaved(this.#run, this.handle, 1, array, dimension);
    }
  }

  class System extends Handle {
    constructor(text) {
      super(memory.scoped(() => library._tw_system_create(memory.text(String(text)))),
        library._tw_system_destroy);
    }
    get code() {
      return library._tw_system_code(this.handle);
    }
    get kind() {
      return KINDS[library._tw_system_kind(this.handle)];
    }
    get unitFactor() {
      return library._tw_system_unit_factor(this.handle);
    }
    get area() {
      return memory.scoped(() => {
        const bounds = memory.room(32);
        if (!library._tw_system_area(this.handle, bounds)) return undefined;
        const [west, south, east, north] = memory.doubles(bounds, 4);
        return { west, south, east, north };
      });
    }
    describe() {
      return this.text(library._tw_system_describe);
    }
    toText(form = "wkt2") {
      const text = memory.scoped(() => {
        const name = memory.text(form);
        return memory.answer((at, size) => library._tw_system_text(this.handle, name, at, size));
      });
      if (text === "") throw new Error(memory.lastError());
      return text;
    }
    get name() {
      return this.text(library._tw_system_name);
    }
    get datum() {
      return this.text(library._tw_system_datum);
    }
    get method() {
      return this.text(library._tw_system_method);
    }
    get unit() {
      return this.text(library._tw_system_unit);
    }
    get axes() {
      return this.text(library._tw_system_axes);
    }
  }

  const systemOf = (value) => (value instanceof System ? value : new System(value));

  class Transformation extends Mapping {
    constructor(source, target, options = {}) {
      const from = systemOf(source);
      const to = systemOf(target);
      super(
        memory.scoped(() =>
          library._tw_transformation_create(from.handle, to.handle, optionsAt(options))),
        library._tw_transformation_destroy, library._tw_transform);
      this.source = from;
      this.target = to;
    }
    why(x, y, z = 0, inverse = false) {
      return why(library._tw_transform, this.handle, inverse ? 1 : 0, x, y, z);
    }
    get accuracy() {
      return library._tw_transformation_accuracy(this.handle);
    }
    get operation() {
      return this.text(library._tw_transformation_operation);
    }
    describe() {
      return this.text(library._tw_transformation_describe);
    }
  }

  class Projection extends Mapping {
    constructor(method, parameters, ellipsoid = WGS84) {
      const pointer = memory.scoped(() => {
        if (method instanceof System) return library._tw_projection_of(method.handle);
        const names = Object.keys(parameters);
        const pointers = names.map((name) => memory.text(name));
        const namesAt = memory.room(4 * names.length);
        pointers.forEach((at, i) => (library.HEAPU32[namesAt / 4 + i] = at));
        const valuesAt = memory.room(8 * names.length);
        names.forEach((name, i) => (library.HEAPF64[valuesAt / 8 + i] = parameters[name]));
        const { a, inverseFlattening } = ellipsoid;
        return library._tw_projection_create(
          memory.text(method), names.length, namesAt, valuesAt, a, inverseFlattening);
      });
      super(pointer, library._tw_projection_destroy, library._tw_project);
    }
    why(x, y, inverse = false) {
      return why(library._tw_project, this.handle, inverse ? 1 : 0, x, y, 0);
    }
    factors(longitude, latitude) {
      if (typeof longitude === "number") {
        const all = this.factors(Float64Array.of(longitude), Float64Array.of(latitude));
        return Object.fromEntries(Object.entries(all).map(([name, values]) => [name, values[0]]));
      }
      const count = sameLength(longitude, latitude);
      const out = Object.fromEntries(FACTORS.map((name) => [name, new Float64Array(count)]));
      for (let begin = 0; begin < count; begin += RUN) {
        const n = Math.min(RUN, count - begin);
        memory.scoped(() => {
          const { view } = memory.load(begin, n, longitude, latitude);
          const answers = memory.room(40 * n);
          library._tw_project_factors(this.handle, n, view, answers, 0);
          const values = library.HEAPF64;
          FACTORS.forEach((name, k) => {
            for (let i = 0; i < n; ++i) out[name][begin + i] = values[answers / 8 + 5 * i + k];
          });
        });
      }
      return out;
    }
  }

  class Lines extends Handle {
    constructor(rhumb, a, f) {
      super(library._tw_lines_create(rhumb ? 1 : 0, a, f), library._tw_lines_destroy);
    }
    // From a point along an azimuth.
    direct(longitude, latitude, azimuth, length) {
      return memory.scoped(() => {
        const at = memory.put([longitude, latitude, azimuth, length, NaN, NaN, NaN]);
        const place = (i) => at + 8 * i;
        library._tw_lines_direct(this.handle, 1, ...[0, 1, 2, 3, 4, 5, 6].map(place));
        const [endLongitude, endLatitude, endAzimuth] = memory.doubles(place(4), 3);
        return { longitude: endLongitude, latitude: endLatitude, azimuth: endAzimuth };
      });
    }
    // Between two points.
    inverse(longitude1, latitude1, longitude2, latitude2) {
      return memory.scoped(() => {
        const at = memory.put([longitude1, latitude1, longitude2, latitude2, NaN, NaN, NaN]);
        const place = (i) => at + 8 * i;
        library._tw_lines_inverse(this.handle, 1, ...[0, 1, 2, 3, 4, 5, 6].map(place));
        const [length, azimuth1, azimuth2] = memory.doubles(place(4), 3);
        return { length, azimuth1, azimuth2 };
      });
    }
    // Points on the way, at equal distances: longitudes and latitudes, both ends included.
    between(longitude1, latitude1, longitude2, latitude2, count = 100) {
      const line = this.inverse(longitude1, latitude1, longitude2, latitude2);
      const longitudes = new Float64Array(count);
      const latitudes = new Float64Array(count);
      memory.scoped(() => {
        const filled = (value) => memory.put(new Float64Array(count).fill(value));
        const starts = [filled(longitude1), filled(latitude1), filled(line.azimuth1)];
        const lengths = memory.put(
          Float64Array.from({ length: count }, (_, i) => (line.length * i) / (count - 1)));
        const ends = [filled(NaN), filled(NaN)];
        library._tw_lines_direct(this.handle, count, ...starts, lengths, ...ends, 0);
        longitudes.set(memory.doubles(ends[0], count));
        latitudes.set(memory.doubles(ends[1], count));
      });
      return { longitudes, latitudes };
    }
    polygon(longitudes, latitudes) {
      const count = sameLength(longitudes, latitudes);
      return memory.scoped(() => {
        const lon = memory.put(longitudes);
        const lat = memory.put(latitudes);
        const out = memory.put([NaN, NaN]);
        library._tw_lines_polygon(this.handle, count, lon, lat, out, out + 8);
        const [perimeter, area] = memory.doubles(out, 2);
        return { perimeter, area };
      });
    }
  }

  function optionsAt({ operation, area, epoch = 0, radians = false, ownAxes = false }) {
    const folders = memory.text(GRID_FOLDER);
    const steps = operation ? memory.text(operation) : 0;
    const bounds = area ? memory.put([area.west, area.south, area.east, area.north]) : 0;
    const at = memory.room(32);
    const words = library.HEAPU32;
    words[at / 4] = steps;
    words[at / 4 + 1] = folders;
    library.HEAPF64[at / 8 + 1] = epoch;
    words[at / 4 + 4] = bounds;
    words[at / 4 + 5] = radians ? 1 : 0;
    words[at / 4 + 6] = ownAxes ? 1 : 0;
    return at;
  }

  // Numbers give a point; arrays are changed in place and give the number of points that failed.
  function points(transform, handle, inverse, x, y, z) {
    if (typeof x === "number") {
      const { place, flat, high } = memory.point;
      library.HEAPF64[place] = x;
      library.HEAPF64[place + 1] = y;
      if (z !== undefined) library.HEAPF64[place + 2] = z;
      const view = z === undefined ? flat : high;
      transform(handle, inverse, 1, view, view, 0, 1);
      const values = library.HEAPF64; // the memory may have grown
      return z === undefined ? [values[place], values[place + 1]]
        : [values[place], values[place + 1], values[place + 2]];
    }
    const count = sameLength(x, y, z);
    let failed = 0;
    for (let begin = 0; begin < count; begin += RUN) {
      const n = Math.min(RUN, count - begin);
      failed += memory.scoped(() => {
        const { view, places } = memory.load(begin, n, x, y, z);
        const bad = transform(handle, inverse, n, view, view, 0, 1);
        [x, y, z].forEach((array, k) => array?.set(memory.doubles(places[k], n), begin));
        return bad;
      });
    }
    return failed;
  }

  function interleaved(transform, handle, inverse, array, dimension) {
    if (!(array instanceof Float64Array)) throw new TypeError("Points stand in a Float64Array.");
    if (!(dimension >= 2) || array.length % dimension !== 0) {
      throw new RangeError(`${array.length} numbers are no points of ${dimension} numbers.`);
    }
    const count = array.length / dimension;
    let failed = 0;
    for (let begin = 0; begin < count; begin += RUN) {
      const n = Math.min(RUN, count - begin);
      const part = array.subarray(begin * dimension, (begin + n) * dimension);
      failed += memory.scoped(() => {
        const at = memory.put(part);
        const view = memory.view(at, at + 8, dimension > 2 ? at + 16 : 0, dimension);
        const bad = transform(handle, inverse, n, view, view, 0, 1);
        part.set(memory.doubles(at, part.length));
        return bad;
      });
    }
    return failed;
  }

  function why(transform, handle, inverse, x, y, z) {
    return memory.scoped(() => {
      const at = memory.put([x, y, z]);
      const view = memory.view(at, at + 8, at + 16, 1);
      const status = memory.room(4);
      if (transform(handle, inverse, 1, view, view, status, 1) === 0) return "";
      return library.UTF8ToString(library._tw_status_text(library.HEAPU32[status / 4]));
    });
  }

  function parsed(numbers, call) {
    return memory.scoped(() => {
      const at = memory.put(new Float64Array(numbers).fill(NaN));
      if (!call(at)) throw new Error(memory.lastError());
      return Array.from(memory.doubles(at, numbers));
    });
  }

  return Object.freeze({
    version: library.UTF8ToString(library._tw_version()),
    system: (text) => new System(text),
    transformation: (source, target, options) => new Transformation(source, target, options),
    projection: (method, parameters = {}, ellipsoid = WGS84) =>
      new Projection(method, parameters, ellipsoid),
    projectionOf: (system) => new Projection(systemOf(system)),
    geodesics: ({ a, inverseFlattening } = WGS84) => new Lines(false, a, flattening(inverseFlattening)),
    rhumbLines: ({ a, inverseFlattening } = WGS84) => new Lines(true, a, flattening(inverseFlattening)),
    methods: () =>
      Array.from({ length: library._tw_projection_method_count() }, (_, i) =>
        memory.scoped(() =>
          memory.answer((at, size) => library._tw_projection_method(i, at, size)),
        ),
      ),
    search: (words, limit = 20) =>
      memory.scoped(() => {
        const text = memory.text(words);
        const codes = memory.room(4 * limit);
        const count = library._tw_system_search(text, codes, limit);
        return Array.from(library.HEAP32.subarray(codes / 4, codes / 4 + count));
      }),
    parseAngle: (text, axis = "either") =>
      parsed(1, (at) => library._tw_parse_angle(
        memory.text(text), ["either", "longitude", "latitude"].indexOf(axis), 0, at))[0],
    parsePosition: (text, order = "told") => {
      const [longitude, latitude, height] = parsed(3, (at) =>
        library._tw_parse_position(
          memory.text(text), ["told", "longitude", "latitude"].indexOf(order), 0, at));
      return Number.isNaN(height) ? { longitude, latitude } : { longitude, latitude, height };
    },
    parseMgrs: (text) => {
      const [longitude, latitude] = parsed(2, (at) =>
        library._tw_parse_mgrs(memory.text(text), at));
      return { longitude, latitude };
    },
    formatMgrs: (longitude, latitude, digits = 5) =>
      memory.scoped(() =>
        memory.answer((at, size) => library._tw_format_mgrs(longitude, latitude, digits, at, size)),
      ),
    addGrid: (name, bytes) => {
      if (/[/\0]/.test(name)) throw new Error(`"${name}" is no file's name.`);
      if (!library.FS.analyzePath(GRID_FOLDER).exists) library.FS.mkdir(GRID_FOLDER);
      library.FS.writeFile(`${GRID_FOLDER}/${name}`, bytes);
    },
  });
}

const KINDS = ["geographic 2D", "geographic 3D", "geocentric", "projected", "vertical", "compound"];

const FACTORS = ["meridional", "parallel", "areal", "convergence", "angular"];

const WGS84 = Object.freeze({ a: 6378137, inverseFlattening: 298.257223563 });

const flattening = (inverse) => (inverse === 0 ? 0 : 1 / inverse);

function sameLength(...arrays) {
  for (const array of arrays) {
    if (array === undefined) continue;
    if (!(array instanceof Float64Array)) {
      throw new TypeError("Coordinates are numbers or Float64Arrays.");
    }
    if (array.length !== arrays[0].length) {
      throw new RangeError("The arrays of coordinates differ in length.");
    }
  }
  return arrays[0].length;
}

// Room in the library's memory for the length of a call: a stack that keeps its pieces.
class Memory {
  #library;
  #base = 0;
  #size = 1 << 18;
  #top = 0;
  #extra = [];

  constructor(library) {
    this.#library = library;
    this.#base = library._malloc(this.#size);
    // The room of a lone point, for good: where it stands in HEAPF64, and views with and without z.
    const at = this.room(24);
    this.point = {
      place: at / 8, flat: this.view(at, at + 8, 0, 1), high: this.view(at, at + 8, at + 16, 1) };
  }

  scoped(work) {
    const top = this.#top;
    const extra = this.#extra.length;
    try {
      return work();
    } finally {
      this.#top = top;
      while (this.#extra.length > extra) this.#library._free(this.#extra.pop());
    }
  }

  room(bytes) {
    const size = (bytes + 15) & ~15;
    if (this.#top + size <= this.#size) {
      const at = this.#base + this.#top;
      this.#top += size;
      return at;
    }
    const at = this.#library._malloc(size);
    if (at === 0) throw new Error("There is no memory left.");
    this.#extra.push(at);
    return at;
  }

  text(value) {
    const size = this.#library.lengthBytesUTF8(value) + 1;
    const at = this.room(size);
    this.#library.stringToUTF8(value, at, size);
    return at;
  }

  answer(call) {
    const size = 1024;
    const at = this.room(size);
    const length = call(at, size);
    if (length < size) return length === 0 ? "" : this.#library.UTF8ToString(at);
    const longer = this.room(length + 1);
    call(longer, length + 1);
    return this.#library.UTF8ToString(longer);
  }

  put(numbers) {
    const at = this.room(8 * numbers.length);
    this.#library.HEAPF64.set(numbers, at / 8);
    return at;
  }

  doubles(at, count) {
    return this.#library.HEAPF64.subarray(at / 8, at / 8 + count);
  }

  view(x, y, z, stride) {
    const at = this.room(16);
    this.#library.HEAPU32.set([x, y, z, stride], at / 4);
    return at;
  }

  load(begin, count, ...arrays) {
    const places = arrays.map((array) =>
      array === undefined ? 0 : this.put(array.subarray(begin, begin + count)));
    return { view: this.view(places[0], places[1], places[2] ?? 0, 1), places };
  }

  lastError() {
    return this.#library.UTF8ToString(this.#library._tw_last_error());
  }
}
