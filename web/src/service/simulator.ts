// What the host of a simulated chassis offers on its own machine: its faults and its trace.
import { update } from "../store.ts";

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

const FAULTS = "/simulator/faults";

export async function findSimulator(): Promise<void> {
  const response = await fetch(FAULTS).catch(() => null);
  update({ simulated: response !== null && response.ok });
}

export async function readFaults(): Promise<Faults> {
  const response = await fetch(FAULTS);
  if (!response.ok) throw new Error(await response.text());
  return response.json();
}

export async function setFaults(faults: Faults): Promise<void> {
  const response = await fetch(FAULTS, { method: "POST", body: JSON.stringify(faults) });
  if (!response.ok) throw new Error(await response.text());
}

export interface Trace {
  text: string;
  end: number; // where the next piece begins
}

// Null when the host writes no trace.
export async function readTrace(from: number): Promise<Trace | null> {
  const response = await fetch(`/simulator/trace?from=${from}`);
  if (!response.ok) return null;
  return { text: await response.text(), end: Number(response.headers.get("X-Trace-End")) };
}
