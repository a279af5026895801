import { parse, stringify } from 'lossless-json';

export type Members = Record<string, unknown>;

export function isMembers(value: unknown): value is Members {
  return typeof value === 'object' && value !== null && !Array.isArray(value);
}

// Whole numbers that a double does not hold stay exact.
function readNumber(text: string): number | bigint {
  const number = Number(text);
  return Number.isSafeInteger(number) || !/^-?\d+$/.test(text) ? number : BigInt(text);
}

/** Throws SyntaxError for a text that is not JSON. */
export function readJson(text: string): unknown {
  return parse(text, null, readNumber);
}

export function writeJson(value: Members): string {
  return stringify(value) ?? '';
}

/** The members with their types: those that are `wide` as bigints, other numbers as numbers, however they were written. */
export function typed(members: Members, wide: readonly string[] = []): Members {
  const convert = (name: string, value: unknown): unknown => {
    if (typeof value === 'number' && wide.includes(name))
      return BigInt(value);
    return typeof value === 'bigint' && !wide.includes(name) ? Number(value) : value;
  };
  return Object.fromEntries(Object.entries(members).map(([name, value]) => [name, convert(name, value)]));
}
