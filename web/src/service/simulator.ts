// What the host of a simulated chassis offers on its own machine: its devices, its faults and its trace.
import { current, update } from "../store.ts";

export interface Event {
  device: string;
  event: "pulled" | "connection_lost";
}

export interface Fault {
  function: string;
  resource?: string;
  delay?: number;
  calls?: { every?: number };
  status?: { code: number };
}

export interface Faults {
  faults?: Fault[];
  events?: Event[];
}

export interface Registers {
  address: number;
  size: number; // in bytes
  width?: 8 | 16 | 32 | 64; // the only one that is allowed, in bits
  name?: string;
  description?: string;
}

export interface SimulatedDevice {
  name: string;
  product?: string;
  state: "present" | "pulled" | "connection_lost";
  slot?: number; // of a module
  registers: Registers[];
}

const DEVICES = "/simulator/devices";
const FAULTS = "/simulator/faults";

async function get<Content>(path: string): Promise<Content> {
  const response = await fetch(path);
  if (!response.ok) throw new Error(await response.text());
  return response.json();
}

export async function findSimulator(): Promise<void> {
  const response = await fetch(DEVICES, { method: "HEAD" }).catch(() => null);
  update({ simulated: response !== null && response.ok });
}

export function readDevices(): Promise<SimulatedDevice[]> {
  return get(DEVICES);
}

// What the chassis file says of the registers of a device; nothing without the simulated chassis.
export async function describeRegisters(device: string): Promise<Registers[]> {
  if (!current().simulated) return [];
  return (await readDevices()).find(({ name }) => name === device)?.registers ?? [];
}

export function readFaults(): Promise<Faults> {
  return get(FAULTS);
}

export async function setFaults(faults: Faults): Promise<void> {
  const response = await fetch(FAULTS, { method: "POST", body: JSON.stringify(faults) });
  if (!response.ok) throw new Error(await response.text());
}

export interface Trace {
  lines: string[];
  next: number; // the number of the first line that is not there yet
}

export function readTrace(from: number): Promise<Trace> {
  return get(`/simulator/trace/${from}`);
}
