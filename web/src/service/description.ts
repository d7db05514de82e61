// The description of the methods that comes with the page.
import type { Json } from "./json.ts";

export interface Schema {
  $ref?: string;
  type?: string;
  enum?: (string | number)[];
  oneOf?: Schema[];
  minimum?: number;
  maximum?: number;
}

export interface Param {
  name: string;
  description: string;
  required: boolean;
  schema: Schema;
}

export interface Method {
  name: string;
  summary: string;
  params: Param[];
  examples: { params: { name: string; value: Json }[] }[];
  "x-at-most-one-of": string[];
}

interface CatalogueEntry {
  code: number;
  message: string;
  data?: { qitrmc_code: number; qitrmc_message: string };
}

interface Description {
  methods: Method[];
  components: { schemas: Record<string, Schema>; errors: Record<string, CatalogueEntry> };
}

let description: Promise<Description> | null = null;

export function loadDescription(): Promise<Description> {
  description ??= fetch("/openrpc.json").then((response) => {
    if (!response.ok) throw new Error(`openrpc.json: HTTP ${response.status}`);
    return response.json();
  });
  description.catch(() => { description = null; });
  return description;
}

export function resolved(schema: Schema, all: Description): Schema {
  return schema.$ref ? all.components.schemas[schema.$ref.split("/").at(-1)!] : schema;
}

export interface Explanation {
  name: string;
  code: number;
  words: string;
}

export function explanationOf(code: number, all: Description): Explanation | undefined {
  for (const [name, entry] of Object.entries(all.components.errors)) {
    const known = entry.data?.qitrmc_code ?? entry.code;
    if (known === code) return { name, code, words: entry.data?.qitrmc_message ?? entry.message };
  }
  return undefined;
}

export type { Description };
