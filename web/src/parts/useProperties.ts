// The properties of one device, or of channels that have the same ones, kept up to date.
import { useCallback, useRef, useState } from "preact/hooks";
import { ServiceError } from "../service/rpc.ts";
import { informationOf, listProperties, nameOf, readValue, readValues, type Resource } from "../service/resources.ts";
import { ignoreRefusal } from "../service/session.ts";
import { isArray, type Information, type Value } from "../service/values.ts";
import { usePeriodic } from "./useAsync.ts";

const PERIOD = 1000;

export type Informations = Record<string, Information>; // by property
export type Values = Record<string, Value>; // by resource and property

export function keyOf(resource: Resource, property: string): string {
  return `${nameOf(resource)}\n${property}`;
}

export interface Properties {
  informations: Informations | null; // null until they are known
  values: Values;
  pending: Set<string>; // keys of values with changes that wait for a commit
  fault: string;
  refresh: (resource: Resource, property: string) => Promise<void>;
  refreshPending: () => Promise<void>;
}

async function describeAll(resource: Resource): Promise<Informations> {
  const names = await listProperties(resource);
  const all = await Promise.all(names.map(async (name) =>
    [name, await informationOf(resource, name).catch(ignoreRefusal)] as const));
  return Object.fromEntries(all.filter((entry): entry is [string, Information] => entry[1] !== undefined));
}

async function readProperty(resources: Resource[], property: string, information: Information): Promise<Values> {
  const channels = resources.map(nameOf);
  if (resources.length > 1 && !isArray(information)) {
    const values = await readValues(channels, property).catch(ignoreRefusal);
    if (values) return Object.fromEntries(resources.map((resource, i) => [keyOf(resource, property), values[i]]));
  }
  const values = await Promise.all(resources.map((resource) => readValue(resource, property).catch(ignoreRefusal)));
  return Object.fromEntries(resources.flatMap((resource, i) =>
    values[i] === undefined ? [] : [[keyOf(resource, property), values[i] as Value]]));
}

async function readAll(resources: Resource[], informations: Informations): Promise<Values> {
  const readable = Object.entries(informations).filter(([, information]) => information.access !== "WriteOnly");
  const parts = await Promise.all(readable.map(([name, information]) => readProperty(resources, name, information)));
  return Object.assign({}, ...parts);
}

async function findPending(resources: Resource[], informations: Informations): Promise<Set<string>> {
  const writable = Object.keys(informations).filter((name) => informations[name].access !== "ReadOnly");
  const keys = await Promise.all(resources.flatMap((resource) => writable.map(async (name) => {
    const information = await informationOf(resource, name).catch(ignoreRefusal);
    return information?.pending_changes ? keyOf(resource, name) : null;
  })));
  return new Set(keys.filter((key): key is string => key !== null));
}

export function useProperties(resources: Resource[]): Properties {
  const [informations, setInformations] = useState<Informations | null>(null);
  const [values, setValues] = useState<Values>({});
  const [pending, setPending] = useState<Set<string>>(new Set());
  const [fault, setFault] = useState("");
  const known = useRef<Informations | null>(null);
  const names = resources.map(nameOf).join("\n");
  const refreshPending = useCallback(async () => {
    if (known.current) setPending(await findPending(resources, known.current));
  }, [names]);
  usePeriodic(PERIOD, async () => {
    if (resources.length === 0) return;
    if (known.current === null) {
      known.current = await describeAll(resources[0]);
      setInformations(known.current);
      await refreshPending();
    }
    setValues(await readAll(resources, known.current));
    setFault("");
  }, [names], (failure) => setFault(failure instanceof ServiceError ? failure.message : ""));
  const refresh = useCallback(async (resource: Resource, property: string) => {
    const information = await informationOf(resource, property);
    const value = information.access === "WriteOnly" ? undefined : await readValue(resource, property);
    const key = keyOf(resource, property);
    if (value !== undefined) setValues((old) => ({ ...old, [key]: value }));
    setPending((old) => {
      const now = new Set(old);
      if (information.pending_changes) now.add(key); else now.delete(key);
      return now;
    });
  }, []);
  return { informations, values, pending, fault, refresh, refreshPending };
}
