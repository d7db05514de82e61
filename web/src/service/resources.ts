// What the methods of the service need for one resource: a device or a physical channel.
import { read } from "./watch.ts";
import { call } from "./rpc.ts";
import { reserve, session } from "./session.ts";
import type { Information, Value } from "./values.ts";

export interface Resource {
  device: string; // the device that it belongs to
  channel: string | null; // null: the device itself
}

export function nameOf(resource: Resource): string {
  return resource.channel ?? resource.device;
}

function single({ device, channel }: Resource): { device: string } | { physical_channel: string } {
  return channel === null ? { device } : { physical_channel: channel };
}

function several({ device, channel }: Resource): { devices: string } | { physical_channels: string } {
  return channel === null ? { devices: device } : { physical_channels: channel };
}

export async function listProperties(resource: Resource): Promise<string[]> {
  const session_id = await session();
  const lists = await call("getDevicePropertyList", { session_id, ...single(resource) });
  return [...(lists.dynamic_properties ?? []), ...lists.static_properties];
}

export async function informationOf(resource: Resource, property: string): Promise<Information> {
  const session_id = await session();
  return call("getPropertyInformation", { session_id, property, ...single(resource) });
}

export function readValue(resource: Resource, property: string): Promise<Value> {
  return read<Value>({ property, ...several(resource) });
}

export async function writeValue(resource: Resource, property: string, value: Value): Promise<void> {
  await reserve(resource.device);
  const session_id = await session();
  // The generated type knows no bigints, which stand for the integers beyond 2 ** 53.
  await call("setProperty", { session_id, property, value: value as number, ...several(resource) });
}

export async function commitProperties(resource: Resource): Promise<void> {
  await reserve(resource.device);
  const session_id = await session();
  await call("commitProperties", { session_id, ...several(resource) });
}

export async function listCommands(resource: Resource): Promise<string[]> {
  const session_id = await session();
  return (await call("getCommandList", { session_id, ...single(resource) })).commands;
}

export async function commandInformation(resource: Resource, command: string) {
  const session_id = await session();
  return call("getCommandInformation", { session_id, command, ...single(resource) });
}

export async function executeCommand(resource: Resource, command: string, timeout: number): Promise<void> {
  await reserve(resource.device);
  const session_id = await session();
  await call("executeCommand", { session_id, command, timeout, ...several(resource) });
}

// The same single value of several channels comes with one request.
export async function readValues(channels: string[], property: string): Promise<Value[]> {
  const values = await read<Value>({ property, physical_channels: channels });
  return channels.length === 1 ? [values] : (values as Value[]);
}
