// Keeps the state of the chassis up to date, about once a second, for as long as the page is there.
import { statusCodes, type Methods } from "../../../clients/typescript/qitrmc.ts";
import { current, update, type Device, type Holder } from "../store.ts";
import { texts } from "../texts/texts.ts";
import { call, ServiceError } from "./rpc.ts";
import { checkSession, ignoreRefusal, isMark, namedHolders, session } from "./session.ts";

const PERIOD = 900;
const CHASSIS = 1;
// How far ahead of the newest known session others are looked for, and how far back at first.
const SESSIONS_AHEAD = 4;
const SESSIONS_BACK = 32;

type Parameters = Omit<Methods["getProperty"]["params"], "session_id">;

export async function read<Value>(params: Parameters): Promise<Value> {
  const session_id = await session();
  const { value } = await call("getProperty", { ...params, session_id } as Methods["getProperty"]["params"]);
  return value as Value;
}

async function readIf<Value>(property: string, devices: string, otherwise: Value): Promise<Value> {
  return (await read<Value>({ property, devices }).catch(ignoreRefusal)) ?? otherwise;
}

export function keepWatching(): void {
  void watchOnce().finally(() => setTimeout(keepWatching, PERIOD));
}

async function watchOnce(): Promise<void> {
  try {
    await checkSession();
    await watchDevices();
    await watchHolders();
    if (current().link !== "up") update({ link: "up", linkFault: "" });
  } catch (failure) {
    if (failure instanceof ServiceError && failure.code === statusCodes.unknownSession) return;
    update({ link: "lost", linkFault: failure instanceof Error ? failure.message : String(failure) });
  }
}

async function watchDevices(): Promise<void> {
  const names = await read<string[]>({ property: "Sys.Devices" });
  const known = current().link === "up" ? current().devices : [];
  const kept = known.filter((device) => names.includes(device.name));
  const added = await describe(names.filter((name) => !kept.some((device) => device.name === name)));
  const devices = names.map((name) => [...kept, ...added].find((device) => device.name === name)!);
  if (current().loaded) announceChanges(current().devices, devices);
  update({ devices: await withReadings(devices), loaded: true });
}

// One request for all devices, or one for each when some cannot answer it.
async function readOfEach<Value>(property: string, names: string[], otherwise: Value): Promise<Value[]> {
  if (names.length > 1) {
    const values = await read<Value[]>({ property, devices: names }).catch(ignoreRefusal);
    if (values) return values;
  }
  return Promise.all(names.map((name) => readIf(property, name, otherwise)));
}

async function describe(names: string[]): Promise<Device[]> {
  const listOfEach = (property: string, of: string[]) =>
    Promise.all(of.map((name) => readIf<string[]>(property, name, [])));
  const categories = await readOfEach("Dev.ProductCategory", names, 0);
  const inSlots = names.filter((_, i) => categories[i] !== CHASSIS);
  const [products, serials, firmwares, slots, channels, areas] = await Promise.all([
    readOfEach("Dev.ProductName", names, ""), readOfEach("Dev.SerialNum", names, ""),
    readOfEach("Dev.FirmwareVersion", names, ""), readOfEach<number | null>("Dev.SlotNum", inSlots, null),
    listOfEach("Dev.PhysChans", names), listOfEach("Dev.NVMEM.Areas", names)]);
  return Promise.all(names.map(async (name, i) => ({
    name, product: products[i], category: categories[i], serial: serials[i], firmware: firmwares[i],
    slot: slots[inSlots.indexOf(name)] ?? null, slots: categories[i] === CHASSIS ? await slotCount(name) : 0,
    modules: [], channels: channels[i], areas: areas[i], temperature: null, fault: "" })));
}

// There is no common property for the number of slots: a chassis has one of its own, or none.
async function slotCount(chassis: string): Promise<number> {
  const session_id = await session();
  const lists = await call("getDevicePropertyList", { session_id, device: chassis }).catch(ignoreRefusal);
  const property = lists?.dynamic_properties?.find((name) => name.endsWith("SlotCount"));
  return property === undefined ? 0 : readIf(property, chassis, 0);
}

async function withReadings(devices: Device[]): Promise<Device[]> {
  const temperatures = await readOfEach<number | null>("Dev.Temperature", devices.map((device) => device.name), null);
  return Promise.all(devices.map(async (device, i) => ({
    ...device, temperature: temperatures[i],
    modules: device.category === CHASSIS ? await readIf("Dev.Modules", device.name, device.modules) : [],
    fault: temperatures[i] === null ? await faultOf(device.name) : "" })));
}

// Some devices have no temperature; each one has a name of its product.
async function faultOf(devices: string): Promise<string> {
  return read({ property: "Dev.ProductName", devices }).then(() => "", (failure) => {
    ignoreRefusal(failure);
    return (failure as ServiceError).message;
  });
}

function announceChanges(before: Device[], now: Device[]): void {
  const gone = before.find((device) => !now.some((other) => other.name === device.name));
  const added = now.find((device) => !before.some((other) => other.name === device.name));
  const { moduleGone, moduleAdded } = texts();
  if (gone) update({ notice: moduleGone(gone.name) });
  else if (added) update({ notice: moduleAdded(added.name) });
}

const openSessions = new Set<number>();
let newest = 0;
let latestOwn = 0;

// The service does not list its sessions, so the reserved devices are read from each session whose id is
// near the newest known one. A reservation for reading in a batch would name the holders too, but a batch
// keeps the requests of all clients waiting until one that goes on has ended, which may take long.
async function watchHolders(): Promise<void> {
  const own = Number((await session()).replace("_session", ""));
  if (own !== latestOwn) { // at first, and after each restart of the service
    openSessions.clear();
    latestOwn = newest = own;
    for (let id = Math.max(1, own - SESSIONS_BACK); id < own; ++id) openSessions.add(id);
  }
  namedHolders.forEach(noteSession);
  namedHolders.clear();
  const ahead = Array.from({ length: SESSIONS_AHEAD }, (_, i) => newest + 1 + i);
  const ids = [...openSessions, ...ahead].filter((id) => id !== own);
  const holders = await Promise.all(ids.map(holderOf));
  update({ holders: holders.filter((holder): holder is Holder => holder !== null) });
}

function noteSession(id: number): void {
  openSessions.add(id);
  newest = Math.max(newest, id);
}

async function holderOf(id: number): Promise<Holder | null> {
  const session_id = `_session${id}`;
  const readOf = (property: string) => call("getProperty", { session_id, property }).catch(ignoreRefusal);
  const devices = (await readOf("Session.ReservedDevices"))?.value as string[] | undefined;
  if (devices === undefined) {
    openSessions.delete(id);
    return null;
  }
  noteSession(id);
  if (devices.length === 0) return null;
  const timeout = (await readOf("Session.Timeout"))?.value;
  return { session: session_id, isPage: isMark(timeout), devices };
}
