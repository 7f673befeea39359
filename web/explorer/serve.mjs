// Serves a folder on the loopback interface: node serve.mjs FOLDER [PORT]

import { createReadStream, statSync } from "node:fs";
import { createServer } from "node:http";
import { extname, join, normalize, sep } from "node:path";
import { pathToFileURL } from "node:url";

const TYPES = {
  ".html": "text/html; charset=utf-8", ".js": "text/javascript; charset=utf-8",
  ".css": "text/css; charset=utf-8", ".wasm": "application/wasm" };

export function serve(folder, port = 0) {
  const server = createServer((request, response) => {
    let path = "";
    try {
      path = normalize(decodeURIComponent(new URL(request.url, "http://localhost").pathname));
      if (path.split(sep).includes("..")) throw new Error("outside");
      if (path.endsWith(sep)) path += "index.html";
      path = join(folder, path);
      if (!statSync(path).isFile()) throw new Error("no file");
    } catch {
      response.writeHead(404).end("Not found\n");
      return;
    }
    response.writeHead(200, {
      "Content-Type": TYPES[extname(path)] ?? "application/octet-stream", "Cache-Control": "no-cache" });
    createReadStream(path).pipe(response);
  });
  return new Promise((resolve, reject) => {
    server.once("error", reject);
    server.listen(port, "127.0.0.1", () => resolve({ server, port: server.address().port }));
  });
}

if (process.argv[1] && import.meta.url === pathToFileURL(process.argv[1]).href) {
  const { port } = await serve(process.argv[2], Number(process.argv[3] ?? 8000));
  console.log(`The explorer is at http://127.0.0.1:${port}/`);
}
