// Whether the page may change a device, and who has it otherwise.
import { release, reserve, cancelWait, waitFor } from "../service/session.ts";
import { useStore } from "../store.ts";
import { texts } from "../texts/texts.ts";
import { describeHolder, useHolder } from "./DeviceState.tsx";
import { useAttempt } from "./useAsync.ts";

export function Reservation({ device }: { device: string }) {
  const t = texts();
  const own = useStore((state) => state.reserved).includes(device);
  const waiting = useStore((state) => state.waiting).includes(device);
  const holder = useHolder(device);
  const { busy, fault, attempt } = useAttempt();
  if (own) {
    return (
      <div class="reservation own">
        <span class="chip own">{t.heldByPage}</span>
        <button type="button" disabled={busy} onClick={() => attempt(() => release(device))}>{t.release}</button>
      </div>
    );
  }
  if (waiting) {
    return (
      <div class="reservation held" role="status">
        <span class="spinner" aria-hidden="true" />{t.waitingFor(device)}
        <button type="button" onClick={() => cancelWait(device)}>{t.stopWaiting}</button>
      </div>
    );
  }
  if (holder) {
    return (
      <div class="reservation held" role="status">
        <span>{t.heldByLong(device, describeHolder(holder))}</span>
        <button type="button" class="primary" onClick={() => attempt(() => waitFor(device))}>{t.wait}</button>
      </div>
    );
  }
  return (
    <div class="reservation">
      <button type="button" disabled={busy} onClick={() => attempt(() => reserve(device))}>{t.reserve}</button>
      {fault && <p class="fault" role="alert">{fault}</p>}
    </div>
  );
}
