// Draws every projection of the explorer into docs/gallery: node gallery.mjs [FOLDER]

import { mkdirSync, writeFileSync } from "node:fs";
import { openExplorer, root } from "./browser.mjs";

const folder = process.argv[2] ?? `${root}docs/gallery`;
mkdirSync(folder, { recursive: true });

const { page, errors, close } = await openExplorer({ width: 1100, height: 900 });
const projections = await page.evaluate(() =>
  explorer.projections.map(({ id, name, family, keeps, use, method }) => ({ id, name, family, keeps, use, method })));

for (const { id } of projections) {
  const data = await page.evaluate((chosen) => {
    const { view, state } = explorer;
    document.querySelector("#stage").style.cssText = "position: fixed; width: 720px; height: 460px";
    view.margin = 14;
    view.resize(720, 460, 1);
    state.tissot = true;
    explorer.chooseProjection(chosen);
    explorer.drawNow();
    const sheet = document.createElement("canvas");
    sheet.width = 720;
    sheet.height = 460;
    const context = sheet.getContext("2d");
    context.fillStyle = "#fbfaf6";
    context.fillRect(0, 0, 720, 460);
    context.drawImage(view.canvas, 0, 0);
    return sheet.toDataURL("image/webp", 0.72);
  }, id);
  writeFileSync(`${folder}/${id}.webp`, Buffer.from(data.split(",")[1], "base64"));
}
if (errors.length > 0) throw new Error(errors.join("\n"));
await close();

const lines = [
  "# Gallery of projections",
  "",
  "Every projection of the explorer with Tissot's indicatrices: circles of 400 km around points of the",
  "ground. Where they stay circles the map keeps angles, where they stay of one size it keeps areas.",
  "Drawn by the explorer itself; `node web/tests/gallery.mjs` draws them anew.",
  "",
];
for (const family of [...new Set(projections.map((p) => p.family))]) {
  lines.push(`## ${family}`, "");
  for (const p of projections.filter((q) => q.family === family)) {
    lines.push(`### ${p.name}`, "", `*${p.keeps}* — ${p.use}`, "", `![${p.name}](${p.id}.webp)`, "",
      `Method: \`${p.method}\``, "");
  }
}
writeFileSync(`${folder}/README.md`, `${lines.join("\n").trimEnd()}\n`);
console.log(`${projections.length} projections drawn into ${folder}`);
