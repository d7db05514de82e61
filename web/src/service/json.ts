// JSON whose integers keep all of their 64 bits: those that a number cannot hold are bigints here.

export type Json = null | boolean | number | bigint | string | Json[] | { [name: string]: Json };

const TOKENS = /"(?:[^"\\]|\\.)*"|-?\d+(?:\.\d+)?(?:[eE][+-]?\d+)?/g;
const LONG_INTEGER = /^-?\d{16,}$/;
const MARK = "\u0001integer:";

function markInteger(token: string): string {
  const keepsItsValue = !LONG_INTEGER.test(token) || Number.isSafeInteger(Number(token));
  return keepsItsValue ? token : JSON.stringify(MARK + token);
}

export function parseJson(text: string): Json {
  return JSON.parse(text.replace(TOKENS, markInteger), (_, value) =>
    typeof value === "string" && value.startsWith(MARK) ? BigInt(value.slice(MARK.length)) : value);
}

export function printJson(value: unknown, indent?: number): string {
  const marked = JSON.stringify(value, (_, item) => (typeof item === "bigint" ? MARK + item : item), indent);
  return marked.replace(/"\\u0001integer:(-?\d+)"/g, "$1");
}
