// Files of coordinates converted from one system to another: CSV by columns, GeoJSON by geometry.

const X_NAMES = ["lon", "long", "longitude", "lng", "x", "e", "east", "easting"];
const Y_NAMES = ["lat", "latitude", "y", "n", "north", "northing"];

export function convert(name, text, transformation) {
  const trimmed = text.replace(/^\uFEFF/, "");
  if (/\.(geo)?json$/i.test(name) || /^\s*\{/.test(trimmed)) return geojson(trimmed, transformation);
  return csv(trimmed, transformation);
}

// Rows of cells; quotes as RFC 4180 has them.
export function cells(text, separator) {
  const rows = [];
  let row = [];
  let cell = "";
  let quoted = false;
  for (let i = 0; i < text.length; ++i) {
    const c = text[i];
    if (quoted) {
      if (c !== '"') cell += c;
      else if (text[i + 1] === '"') cell += text[++i];
      else quoted = false;
    } else if (c === '"' && cell === "") {
      quoted = true;
    } else if (c === separator) {
      row.push(cell);
      cell = "";
    } else if (c === "\n" || c === "\r") {
      if (c === "\r" && text[i + 1] === "\n") ++i;
      row.push(cell);
      rows.push(row);
      [row, cell] = [[], ""];
    } else {
      cell += c;
    }
  }
  if (cell !== "" || row.length > 0) rows.push([...row, cell]);
  return rows.filter((r) => r.length > 1 || r[0] !== "");
}

const quotedCell = (cell, separator) =>
  cell.includes(separator) || /["\r\n]/.test(cell) ? `"${cell.replaceAll('"', '""')}"` : cell;

const numberIn = (cell) => (cell !== undefined && cell.trim() !== "" ? Number(cell) : NaN);

// To a tenth of a millimetre, or as much in degrees.
const written = (value, geographic) =>
  Number.isFinite(value) ? value.toFixed(geographic ? 9 : 4) : "";

function csv(text, transformation) {
  const line = text.slice(0, text.search(/[\r\n]|$/));
  const separator = ["\t", ";", ","].find((s) => line.includes(s)) ?? ",";
  const rows = cells(text, separator);
  if (rows.length === 0) throw new Error("The file is empty.");
  const title = rows[0].map((cell) => cell.trim().toLowerCase());
  const hasTitle = rows[0].every((cell) => Number.isNaN(numberIn(cell)));
  let [x, y] = [X_NAMES, Y_NAMES].map((names) => title.findIndex((t) => names.includes(t)));
  const body = hasTitle ? rows.slice(1) : rows;
  if (!hasTitle || x < 0 || y < 0) {
    const numeric = (body[0] ?? []).flatMap((cell, i) => (Number.isFinite(numberIn(cell)) ? [i] : []));
    if (numeric.length < 2) throw new Error("No two columns of the file are coordinates.");
    [x, y] = numeric;
  }
  const xs = Float64Array.from(body, (row) => numberIn(row[x]));
  const ys = Float64Array.from(body, (row) => numberIn(row[y]));
  const failed = transformation.forward(xs, ys);
  const geographic = transformation.target.kind.startsWith("geographic");
  const out = body.map((row, i) => {
    const cells_ = [...row];
    cells_[x] = written(xs[i], geographic);
    cells_[y] = written(ys[i], geographic);
    return cells_;
  });
  const lines = (hasTitle ? [rows[0], ...out] : out).map((row) =>
    row.map((cell) => quotedCell(cell, separator)).join(separator));
  return { text: `${lines.join("\n")}\n`, points: body.length, failed, type: "text/csv" };
}

function geojson(text, transformation) {
  const content = JSON.parse(text);
  const positions = [];
  const collect = (value) => {
    if (!Array.isArray(value)) return;
    if (typeof value[0] === "number") positions.push(value);
    else value.forEach(collect);
  };
  const visit = (item) => {
    if (!item || typeof item !== "object") return;
    collect(item.coordinates);
    item.geometries?.forEach(visit);
    item.features?.forEach(visit);
    visit(item.geometry);
    // A box would have to be found anew.
    delete item.bbox;
  };
  visit(content);
  if (positions.length === 0) throw new Error("The file has no coordinates.");
  const xs = Float64Array.from(positions, (p) => p[0]);
  const ys = Float64Array.from(positions, (p) => p[1]);
  const failed = transformation.forward(xs, ys);
  const digits = transformation.target.kind.startsWith("geographic") ? 9 : 4;
  positions.forEach((p, i) => {
    p[0] = Number.isFinite(xs[i]) ? Number(xs[i].toFixed(digits)) : null;
    p[1] = Number.isFinite(ys[i]) ? Number(ys[i].toFixed(digits)) : null;
  });
  const code = transformation.target.code;
  if (code !== 0 && code !== 4326) {
    content.crs = { type: "name", properties: { name: `urn:ogc:def:crs:EPSG::${code}` } };
  } else {
    delete content.crs;
  }
  return { text: `${JSON.stringify(content)}\n`, points: positions.length, failed,
    type: "application/geo+json" };
}
