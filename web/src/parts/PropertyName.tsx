import type { Information } from "../service/values.ts";
import { texts } from "../texts/texts.ts";

// The name of a property with what is known of it.
export function PropertyName({ name, information }: { name: string; information: Information }) {
  const { data_type, min_value, max_value, description, document, unit } = information;
  const hasLimits = min_value !== undefined || max_value !== undefined;
  return (
    <>
      <span class="property-name">{name}</span>
      {description && <span class="description">{description}</span>}
      {document && <span class="description">{document}</span>}
      <span class="kind">
        {data_type}
        {hasLimits && ` · ${min_value ?? "−∞"} … ${max_value ?? "∞"}`}
        {unit && ` · ${unit}`}
        {information.access === "ReadOnly" && ` · ${texts().readOnly}`}
        {information.access === "WriteOnly" && ` · ${texts().writeOnly}`}
      </span>
    </>
  );
}

export function matches(search: string, name: string, information: Information): boolean {
  const wanted = search.trim().toLowerCase();
  return wanted === "" || name.toLowerCase().includes(wanted) ||
    (information.description ?? "").toLowerCase().includes(wanted);
}

// Properties with the same beginning of their names belong together.
export function groupsOf(names: string[]): [string, string[]][] {
  const groups = new Map<string, string[]>();
  for (const name of names) {
    const group = name.includes(".") ? name.slice(0, name.indexOf(".")) : "";
    groups.set(group, [...(groups.get(group) ?? []), name]);
  }
  return [...groups];
}
