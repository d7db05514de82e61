// The bytes of NVMEM areas.
import { read } from "./watch.ts";
import { call } from "./rpc.ts";
import { reserve, session } from "./session.ts";

export interface Area {
  name: string;
  size: number;
  writable: boolean;
  wantsSerial: boolean;
  wantsPassword: boolean;
  pending: boolean; // written and not committed
}

export interface Credentials {
  serial_number: string;
  password: string;
}

export async function describeArea(name: string): Promise<Area> {
  const of = <Value>(property: string) => read<Value>({ property: `NVMEMArea.${property}`, nvmem_areas: name });
  const [size, writable, wantsSerial, wantsPassword, pending] = await Promise.all([
    of<number>("Size"), of<boolean>("Writable"), of<boolean>("SerialNumWanted"), of<boolean>("PasswordWanted"),
    of<boolean>("PendingChanges")]);
  return { name, size, writable, wantsSerial, wantsPassword, pending };
}

export async function readBytes(area: string, address: number, size: number): Promise<number[]> {
  const { data } = await call("getNvmemBytes", { session_id: await session(), nvmem_area: area, address, size });
  return data;
}

// Bytes that follow each other go with one request.
export function runsOf(bytes: Map<number, number>): [number, number[]][] {
  const runs: [number, number[]][] = [];
  for (const address of [...bytes.keys()].sort((one, other) => one - other)) {
    const last = runs.at(-1);
    if (last && last[0] + last[1].length === address) last[1].push(bytes.get(address)!);
    else runs.push([address, [bytes.get(address)!]]);
  }
  return runs;
}

export async function writeBytes(device: string, area: string, bytes: Map<number, number>, credentials: Credentials): Promise<void> {
  await reserve(device);
  const session_id = await session();
  for (const [address, data] of runsOf(bytes))
    await call("setNvmemBytes", { session_id, nvmem_area: area, address, data, ...credentials });
}

export async function commitArea(device: string, area: string): Promise<void> {
  await reserve(device);
  await call("commitNvmemAreas", { session_id: await session(), nvmem_areas: area });
}
