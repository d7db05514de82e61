// The state of the page, in one place. Screens read it with useStore and change it with update.
import { useEffect, useState } from "preact/hooks";
import type { Language } from "./texts/texts.ts";

export interface Device {
  name: string;
  product: string;
  category: number;
  serial: string;
  firmware: string;
  slot: number | null; // of a module
  slots: number; // of a chassis
  modules: string[]; // of a chassis
  channels: string[];
  areas: string[];
  temperature: number | null;
  fault: string; // why it does not answer; empty when it does
}

export interface Holder {
  session: string;
  isPage: boolean; // of another page like this one
  devices: string[];
}

export type Link = "connecting" | "up" | "lost";

export interface State {
  language: Language;
  route: string[];
  link: Link;
  linkFault: string;
  session: string | null;
  devices: Device[];
  loaded: boolean;
  holders: Holder[]; // other sessions with reservations
  reserved: string[]; // devices that this page has reserved
  waiting: string[]; // devices that this page waits for
  notice: string;
  simulated: boolean;
}

type Listener = () => void;

let state: State = {
  language: "eng", route: [], link: "connecting", linkFault: "", session: null, devices: [],
  loaded: false, holders: [], reserved: [], waiting: [], notice: "", simulated: false,
};
const listeners = new Set<Listener>();

export function current(): State {
  return state;
}

export function update(change: Partial<State>): void {
  state = { ...state, ...change };
  for (const listener of listeners) listener();
}

export function useStore<Part>(select: (state: State) => Part): Part {
  const [part, setPart] = useState(() => select(state));
  useEffect(() => {
    const listener = () => setPart(() => select(state));
    listeners.add(listener);
    listener();
    return () => void listeners.delete(listener);
  }, []);
  return part;
}

export function deviceNamed(name: string): Device | undefined {
  return state.devices.find((device) => device.name === name);
}
