// What is looked at stands in the fragment of the address: #/module/Mod1/properties
import { update } from "./store.ts";

export function followAddress(): void {
  const follow = () => update({ route: partsOf(location.hash) });
  addEventListener("hashchange", follow);
  follow();
}

function partsOf(hash: string): string[] {
  return hash.replace(/^#\/?/, "").split("/").filter((part) => part !== "").map(decoded);
}

function decoded(part: string): string {
  try {
    return decodeURIComponent(part);
  } catch {
    return part;
  }
}

export function address(...parts: string[]): string {
  return "#/" + parts.map(encodeURIComponent).join("/");
}
