// A headless Chromium on the explorer.

import { existsSync } from "node:fs";
import { fileURLToPath } from "node:url";
import { chromium } from "playwright-core";
import { serve } from "../explorer/serve.mjs";

export const root = fileURLToPath(new URL("../../", import.meta.url));
const CHROMIUM = process.env.CHROMIUM ?? "/usr/bin/chromium";

export async function openExplorer({ width = 1280, height = 800, dark = false, hash = "" } = {}) {
  if (!existsSync(CHROMIUM)) throw new Error(`There is no Chromium at ${CHROMIUM}.`);
  const { server, port } = await serve(`${root}build/web/explorer`);
  const browser = await chromium.launch({
    executablePath: CHROMIUM,
    headless: true,
    args: [
      "--headless", ...(process.getuid() === 0 ? ["--no-sandbox"] : []), "--disable-gpu",
      "--disable-quic", "--no-first-run", "--disable-background-networking",
      "--disable-component-update", "--disable-sync"],
  });
  const page = await browser.newPage({
    viewport: { width, height }, colorScheme: dark ? "dark" : "light" });
  const errors = [];
  page.on("pageerror", (error) => errors.push(String(error)));
  page.on("console", (message) => {
    if (message.type() === "error") errors.push(message.text());
  });
  await page.goto(`http://127.0.0.1:${port}/${hash}`);
  await page.waitForSelector("html[data-ready]", { timeout: 60000 });
  const close = async () => {
    await browser.close();
    server.close();
  };
  return { page, errors, port, close };
}
