// The one session of this page. It is opened when the page first needs it and reserves nothing until
// something is to be changed.
import { statusCodes } from "../../../clients/typescript/qitrmc.ts";
import { current, update } from "../store.ts";
import { call, requestText, SERVICE, ServiceError } from "./rpc.ts";

// The timeout of the session, in seconds, with a fraction that is this page's own. It marks the
// session; the comment of a session would tell more, but cannot be read.
const USUAL_TIMEOUT = 10;
const MARK = USUAL_TIMEOUT + (1 + Math.floor(Math.random() * 999_998)) / 1_000_000;
const TIME_BETWEEN_ATTEMPTS = 1000;

let opening: Promise<string> | null = null;

export function session(): Promise<string> {
  const open = current().session;
  if (open !== null) return Promise.resolve(open);
  opening ??= openSession().finally(() => { opening = null; });
  return opening;
}

async function openSession(): Promise<string> {
  const { session_id } = await call("initializeSession", {});
  update({ session: session_id, reserved: [] });
  await call("setProperty", { session_id, property: "Session.Timeout", value: MARK }).catch(ignoreRefusal);
  return session_id;
}

export function ignoreRefusal(failure: unknown): undefined {
  if (failure instanceof ServiceError) return undefined;
  throw failure;
}

export function forgetSession(): void {
  update({ session: null, reserved: [], waiting: [] });
}

export function isMark(timeout: unknown): boolean {
  return typeof timeout === "number" && timeout > USUAL_TIMEOUT && timeout < USUAL_TIMEOUT + 1;
}

// A restarted service gives the ids of former sessions out again, so an id alone does not tell whose
// a session is.
export async function checkSession(): Promise<void> {
  const session_id = await session();
  try {
    const { value } = await call("getProperty", { session_id, property: "Session.Timeout" });
    if (value !== MARK) forgetSession();
  } catch (failure) {
    ignoreRefusal(failure);
    if ((failure as ServiceError).code === statusCodes.unknownSession) forgetSession();
  }
}

export function closeSessionWithPage(): void {
  addEventListener("pagehide", () => {
    const session_id = current().session;
    if (session_id === null) return;
    navigator.sendBeacon(SERVICE, requestText("closeSession", { session_id }));
    forgetSession();
  });
}

// The numbers of sessions that refusals have named as holders of a device.
export const namedHolders = new Set<number>();

function noteHolders(failure: unknown): never {
  if (isReserved(failure))
    for (const [, id] of (failure as ServiceError).message.matchAll(/_session(\d+)/g)) namedHolders.add(Number(id));
  throw failure;
}

export async function reserve(device: string): Promise<void> {
  if (current().reserved.includes(device)) return;
  const session_id = await session();
  await call("reserveDevices", { session_id, devices: device, access: "ReadWrite" }).catch(noteHolders);
  update({ reserved: [...current().reserved, device] });
}

export async function release(device: string): Promise<void> {
  const session_id = await session();
  await call("unreserveDevices", { session_id, devices: device });
  update({ reserved: current().reserved.filter((name) => name !== device) });
}

export function isReserved(failure: unknown): boolean {
  return failure instanceof ServiceError && failure.code === statusCodes.deviceReserved;
}

// Tries until the holder gives the device up or cancelWait is called. A request that waits inside
// the service would hold up the holder's own requests.
export async function waitFor(device: string): Promise<void> {
  update({ waiting: [...current().waiting, device] });
  while (current().waiting.includes(device)) {
    try {
      await reserve(device);
      cancelWait(device);
    } catch (failure) {
      if (!isReserved(failure)) {
        cancelWait(device);
        throw failure;
      }
      await new Promise((resolve) => setTimeout(resolve, TIME_BETWEEN_ATTEMPTS));
    }
  }
}

export function cancelWait(device: string): void {
  update({ waiting: current().waiting.filter((name) => name !== device) });
}
