// The native library's figures, printed by figures.cpp: [words, numbers] of each line.

import { execFileSync } from "node:child_process";
import { existsSync } from "node:fs";

export const figuresProgram = process.env.TIDEWATER_FIGURES;

export function nativeFigures() {
  if (!figuresProgram || !existsSync(figuresProgram)) {
    throw new Error("TIDEWATER_FIGURES names no program; scripts/test-web builds it.");
  }
  return execFileSync(figuresProgram, { encoding: "utf8" }).trim().split("\n").map((line) => {
    const [, kind, what, rest] = /^(transform|project) (EPSG:\d+|[^|]*)[ |](.*)$/.exec(line);
    return { kind, what, numbers: rest.split(" ").map(parsed) };
  });
}

// Hexadecimal as C prints it, or decimal.
function parsed(text) {
  const found = /^(-?)0x([0-9a-f]+)(?:\.([0-9a-f]+))?p([+-]\d+)$/.exec(text);
  if (!found) return Number(text);
  const [, sign, whole, fraction = "", exponent] = found;
  const digits = Number(BigInt(`0x${whole}${fraction}`));
  return (sign ? -1 : 1) * digits * 2 ** (Number(exponent) - 4 * fraction.length);
}

export const LAMBERT = { lat1: 30, lat2: 60, lat0: 45 };
