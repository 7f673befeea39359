// What a frame costs while the hand drags the map: the processor time of the page's own thread, which
// other work on the machine does not lengthen, from the hand's move to the painted canvas, for each
// projection at 1280 by 800.  Headless, the processor paints what elsewhere the graphics card does.

import { openExplorer } from "./browser.mjs";

const FRAMES = 60;
const BUDGET = 1000 / 60;

const { page, close } = await openExplorer({ width: 1280, height: 800 });
const session = await page.context().newCDPSession(page);
await session.send("Performance.enable");
const spent = async () => {
  const { metrics } = await session.send("Performance.getMetrics");
  return 1000 * metrics.find(({ name }) => name === "ThreadTime").value;
};
// Until the frame after the next has begun, so that the next is painted.
const frame = () => page.evaluate(() =>
  new Promise((resolve) => requestAnimationFrame(() => requestAnimationFrame(resolve))));

// Processor time of each frame, the hand moving from (x, y) to and fro.
async function frames(x, y, step) {
  const times = [];
  for (let i = 1; i <= FRAMES; ++i) {
    const begin = await spent();
    await page.mouse.move(x + step * (i % 20), y + (step / 2) * (i % 20));
    await frame();
    times.push((await spent()) - begin);
  }
  return times.sort((a, b) => a - b);
}
const middle = (times) => times[times.length >> 1];

const box = await page.locator("#map").boundingBox();
const [x, y] = [box.x + box.width / 2, box.y + box.height / 2];
// What asking for the time and moving the hand cost by themselves.
const idle = middle(await frames(x, y, 1));

const all = [];
console.log("milliseconds of a frame           median   worst");
for (const id of await page.evaluate(() => explorer.projections.map((p) => p.id))) {
  await page.evaluate((chosen) => explorer.chooseProjection(chosen), id);
  await page.mouse.move(x, y + 60);
  await page.mouse.down();
  await frames(x, y, 6); // until all is compiled
  const times = (await frames(x, y, 6)).map((time) => Math.max(0, time - idle));
  await page.mouse.up();
  await page.evaluate(() => (explorer.state.points = []));
  const [median, worst] = [middle(times), times.at(-1)];
  all.push({ median, worst });
  console.log(id.padEnd(32), median.toFixed(1).padStart(7), worst.toFixed(1).padStart(7));
}
const late = (of) => all.filter((one) => one[of] > BUDGET).length;
console.log(`of ${all.length} projections above ${BUDGET.toFixed(1)} ms: ${late("median")} in the median, ${late("worst")} in the worst frame`);
await close();
