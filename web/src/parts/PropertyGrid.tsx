// Properties in rows, grouped and searchable, with a column for each resource.
import { useState } from "preact/hooks";
import { commitProperties, nameOf, writeValue, type Resource } from "../service/resources.ts";
import { showReading, type Information } from "../service/values.ts";
import { texts } from "../texts/texts.ts";
import { groupsOf, matches, PropertyName } from "./PropertyName.tsx";
import { useAttempt } from "./useAsync.ts";
import { keyOf, useProperties, type Informations, type Properties } from "./useProperties.ts";
import { ValueField } from "./ValueField.tsx";

const LONGEST_READING = 120;

function Cell({ resource, name, information, properties }: {
  resource: Resource; name: string; information: Information; properties: Properties;
}) {
  const key = keyOf(resource, name);
  const value = properties.values[key];
  if (information.access === "ReadOnly") {
    const text = showReading(information, value);
    const short = text.length > LONGEST_READING ? `${text.slice(0, LONGEST_READING)}…` : text;
    return <output class="reading" title={text.slice(0, 2000)}>{short} {text !== "" && information.unit}</output>;
  }
  const write = async (entry: Parameters<typeof writeValue>[2]) => {
    await writeValue(resource, name, entry);
    await properties.refresh(resource, name);
  };
  return <ValueField label={`${nameOf(resource)} ${name}`} information={information} value={value}
                     pending={properties.pending.has(key)} write={write} />;
}

// Writing the value in force again leaves nothing that a commit would change.
async function takeBack(resource: Resource, informations: Informations, properties: Properties): Promise<void> {
  const names = Object.keys(informations).filter((name) => properties.pending.has(keyOf(resource, name)));
  for (const name of names) await writeValue(resource, name, properties.values[keyOf(resource, name)]);
  await commitProperties(resource);
}

function PendingBar({ resources, informations, properties }: {
  resources: Resource[]; informations: Informations; properties: Properties;
}) {
  const t = texts();
  const { busy, fault, attempt } = useAttempt();
  const changed = resources.filter((resource) =>
    Object.keys(informations).some((name) => properties.pending.has(keyOf(resource, name))));
  if (changed.length === 0) return null;
  const forEach = (work: (resource: Resource) => Promise<void>) => attempt(async () => {
    for (const resource of changed) await work(resource);
    await properties.refreshPending();
  });
  return (
    <div class="banner pending" role="status">
      <span>{t.pendingCount(properties.pending.size)}</span>
      <button type="button" class="primary" disabled={busy} onClick={() => forEach(commitProperties)}>{t.commit}</button>
      <button type="button" disabled={busy}
              onClick={() => forEach((resource) => takeBack(resource, informations, properties))}>{t.takeBack}</button>
      {fault && <span class="fault" role="alert">{fault}</span>}
    </div>
  );
}

export function PropertyGrid({ resources }: { resources: Resource[] }) {
  const t = texts();
  const [search, setSearch] = useState("");
  const properties = useProperties(resources);
  const { informations } = properties;
  if (informations === null) return <p class="quiet">{properties.fault || t.loading}</p>;
  const names = Object.keys(informations).filter((name) => matches(search, name, informations[name]));
  return (
    <>
      <input type="search" class="search" placeholder={t.search} aria-label={t.search} value={search}
             onInput={(event) => setSearch(event.currentTarget.value)} />
      <PendingBar resources={resources} informations={informations} properties={properties} />
      {properties.fault && <p class="fault" role="alert">{properties.fault}</p>}
      {names.length === 0 && <p class="quiet">{t.nothingFound}</p>}
      {groupsOf(names).map(([group, members]) => (
        <section key={group} class="group">
          <h2>{group}</h2>
          <div class="scroll" tabIndex={0} role="group" aria-label={group}>
            <table class={resources.length > 1 ? "grid wide" : "grid"}>
              {resources.length > 1 && (
                <thead><tr><th scope="col">{t.property}</th>
                  {resources.map((resource) => <th scope="col" key={nameOf(resource)}>{nameOf(resource)}</th>)}</tr></thead>
              )}
              <tbody>
                {members.map((name) => (
                  <tr key={name}>
                    <th scope="row"><PropertyName name={name} information={informations[name]} /></th>
                    {resources.map((resource) => (
                      <td key={nameOf(resource)}>
                        <Cell resource={resource} name={name} information={informations[name]} properties={properties} />
                      </td>
                    ))}
                  </tr>
                ))}
              </tbody>
            </table>
          </div>
        </section>
      ))}
    </>
  );
}
