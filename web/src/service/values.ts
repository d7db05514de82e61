// Values of properties as people read and type them.
import type { GetPropertyInformationResult } from "../../../clients/typescript/qitrmc.ts";
import { printJson } from "./json.ts";
import { texts } from "../texts/texts.ts";

export type Information = GetPropertyInformationResult;
export type Scalar = boolean | number | bigint | string;
export type Value = Scalar | Scalar[];

const LIMITS: Record<string, [bigint, bigint]> = {
  Int32: [-(2n ** 31n), 2n ** 31n - 1n],
  UInt32: [0n, 2n ** 32n - 1n],
  Int64: [-(2n ** 63n), 2n ** 63n - 1n],
  UInt64: [0n, 2n ** 64n - 1n],
};

export function isArray(information: Information): boolean {
  return information.data_type.endsWith("Array");
}

export function itemType(information: Information): string {
  return information.data_type.replace("Array", "");
}

export function isNumeric(information: Information): boolean {
  return !isArray(information) && !["Bool", "String"].includes(information.data_type);
}

export function nameOfItem(information: Information, value: unknown): string | undefined {
  return Object.entries(information.enum?.values ?? {}).find(([, number]) => number === value)?.[0];
}

function showItem(information: Information, value: Scalar): string {
  if (typeof value === "boolean") return value ? texts().on : texts().off;
  return nameOfItem(information, value) ?? String(value);
}

export function show(information: Information, value: Value | undefined): string {
  if (value === undefined) return "";
  return Array.isArray(value) ? value.map((item) => showItem(information, item)).join("; ")
    : showItem(information, value);
}

export function showReading(information: Information, value: Value | undefined): string {
  return typeof value === "number" && information.data_type === "Double" && !Number.isInteger(value)
    ? String(Number(value.toPrecision(7))) : show(information, value);
}

// What stands in the field of a value when editing begins. Texts of an array stand in a line each.
export function editable(information: Information, value: Value | undefined): string {
  if (value === undefined) return "";
  if (!Array.isArray(value)) return String(value);
  return value.map(String).join(itemType(information) === "String" ? "\n" : "; ");
}

export class WrongEntry extends Error {}

// Takes both decimal signs, and no sign between thousands.
export function parseDecimal(text: string): number {
  const plain = text.trim().replace(",", ".");
  if (!/^[+-]?(\d+\.?\d*|\.\d+)([eE][+-]?\d+)?$/.test(plain)) throw new WrongEntry(texts().notANumber);
  return Number(plain);
}

export function parseInteger(text: string, least: bigint, most: bigint): number | bigint {
  const plain = text.trim();
  if (!/^([+-]?\d+|0[xX][0-9a-fA-F]+)$/.test(plain)) throw new WrongEntry(texts().notAnInteger);
  const value = BigInt(plain.replace("+", ""));
  if (value < least || value > most) throw new WrongEntry(texts().outOfRange(String(least), String(most)));
  const number = Number(value);
  return Number.isSafeInteger(number) ? number : value;
}

function parseBool(text: string): boolean {
  const plain = text.trim().toLowerCase();
  if (["true", "1", texts().on.toLowerCase()].includes(plain)) return true;
  if (["false", "0", texts().off.toLowerCase()].includes(plain)) return false;
  throw new WrongEntry(texts().notABool);
}

function parseItem(information: Information, text: string): Scalar {
  const type = itemType(information);
  if (type === "String") return text;
  if (type === "Bool") return parseBool(text);
  const value = type === "Double" ? parseDecimal(text) : parseInteger(text, ...LIMITS[type]);
  const { min_value, max_value } = information;
  if ((min_value !== undefined && value < Number(min_value)) || (max_value !== undefined && value > Number(max_value)))
    throw new WrongEntry(texts().outOfRange(min_value ?? "−∞", max_value ?? "∞"));
  return value;
}

export function parseEntry(information: Information, text: string): Value {
  if (!isArray(information)) return parseItem(information, text);
  if (text.trim() === "") return [];
  const separator = itemType(information) === "String" ? "\n" : /[;\s]+/;
  return text.split(separator).filter((item) => item !== "").map((item) => parseItem(information, item));
}

export function sameValue(one: Value | undefined, other: Value | undefined): boolean {
  return printJson(one ?? null) === printJson(other ?? null);
}
