// Records numbers ten times a second for as long as the page is there, an hour at most.
import { read } from "./watch.ts";
import { nameOf, type Resource } from "./resources.ts";
import { ignoreRefusal } from "./session.ts";

const PERIOD = 100;
const MOST_SAMPLES = 36_000;
// Old samples are dropped in blocks, since moving the others costs time.
const BLOCK = 1_000;

export interface Track {
  resource: Resource;
  property: string;
  unit: string;
  label: string;
  values: (number | null)[];
}

export const recording: { times: number[]; tracks: Track[]; paused: boolean } = { times: [], tracks: [], paused: false };

let timer = 0;
let reading = false;

export function addTrack(resource: Resource, property: string, unit: string): void {
  const label = `${nameOf(resource)} ${property}`;
  if (recording.tracks.some((track) => track.label === label)) return;
  const values = recording.times.map(() => null);
  recording.tracks.push({ resource, property, unit, label, values });
  timer ||= setInterval(() => void sample(), PERIOD);
}

export function removeTrack(label: string): void {
  recording.tracks = recording.tracks.filter((track) => track.label !== label);
  if (recording.tracks.length > 0) return;
  clearInterval(timer);
  timer = 0;
  recording.times = [];
}

// The tracks that one request reads: the same property of channels, or of devices.
function requests(): Track[][] {
  const groups = new Map<string, Track[]>();
  for (const track of recording.tracks) {
    const key = `${track.property}\n${track.resource.channel === null}`;
    groups.set(key, [...(groups.get(key) ?? []), track]);
  }
  return [...groups.values()];
}

async function readGroup(group: Track[]): Promise<[Track, number | null][]> {
  const names = group.map((track) => nameOf(track.resource));
  const property = group[0].property;
  const isDevice = group[0].resource.channel === null;
  const value = await read<unknown>(isDevice ? { property, devices: names } : { property, physical_channels: names })
    .catch(ignoreRefusal);
  if (value === undefined && group.length > 1)
    return (await Promise.all(group.map((track) => readGroup([track])))).flat();
  const values = group.length === 1 ? [value] : (value as unknown[]);
  return group.map((track, i) => [track, values[i] === undefined ? null : Number(values[i])]);
}

async function sample(): Promise<void> {
  if (reading || recording.paused) return;
  reading = true;
  try {
    const values = new Map((await Promise.all(requests().map(readGroup))).flat());
    keep(Date.now() / 1000, values);
  } catch {
    keep(Date.now() / 1000, new Map()); // a gap, as long as there is no service
  } finally {
    reading = false;
  }
}

export function keep(time: number, values: Map<Track, number | null>): void {
  recording.times.push(time);
  for (const track of recording.tracks) track.values.push(values.get(track) ?? null);
  if (recording.times.length < MOST_SAMPLES + BLOCK) return;
  recording.times.splice(0, BLOCK);
  for (const track of recording.tracks) track.values.splice(0, BLOCK);
}

export function firstIndexSince(time: number): number {
  let low = 0;
  let high = recording.times.length;
  while (low < high) {
    const middle = (low + high) >> 1;
    if (recording.times[middle] < time) low = middle + 1; else high = middle;
  }
  return low;
}

function quoted(text: string): string {
  return `"${text.replaceAll('"', '""')}"`;
}

export function csv(): string {
  const head = ["time", ...recording.tracks.map((track) => track.unit ? `${track.label} [${track.unit}]` : track.label)];
  const rows = recording.times.map((time, i) =>
    [new Date(time * 1000).toISOString(), ...recording.tracks.map((track) => track.values[i] ?? "")].join(","));
  return [head.map(quoted).join(","), ...rows].join("\r\n") + "\r\n";
}
