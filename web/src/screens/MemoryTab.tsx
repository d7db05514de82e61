// The non-volatile memory of a device as bytes and text.
import { useState } from "preact/hooks";
import { download } from "../parts/download.ts";
import { hexAddress, HexGrid } from "../parts/HexGrid.tsx";
import { useAttempt, usePeriodic, type Attempt } from "../parts/useAsync.ts";
import { commitArea, describeArea, readBytes, writeBytes, type Area, type Credentials } from "../service/memory.ts";
import type { Device } from "../store.ts";
import { texts } from "../texts/texts.ts";

const PAGE = 256;
const PERIOD = 2000;

interface AreaState {
  area: Area;
  bytes: number[];
}

type Drafts = Map<number, number>;

function CredentialFields({ area, credentials, change }: {
  area: Area; credentials: Credentials; change: (credentials: Credentials) => void;
}) {
  const t = texts();
  return (
    <>
      {area.wantsSerial && (
        <label class="field">{t.serial} <input value={credentials.serial_number} autocomplete="off"
          onInput={(event) => change({ ...credentials, serial_number: event.currentTarget.value })} /></label>
      )}
      {area.wantsPassword && (
        <label class="field">{t.password} <input type="password" value={credentials.password} autocomplete="off"
          onInput={(event) => change({ ...credentials, password: event.currentTarget.value })} /></label>
      )}
    </>
  );
}

function Pager({ start, size, go }: { start: number; size: number; go: (start: number) => void }) {
  const t = texts();
  if (size <= PAGE) return null;
  return (
    <span class="pager">
      <button type="button" disabled={start === 0} onClick={() => go(start - PAGE)} aria-label={t.previous}>‹</button>
      <span class="mono">{hexAddress(start)}–{hexAddress(Math.min(start + PAGE, size) - 1)}</span>
      <button type="button" disabled={start + PAGE >= size} onClick={() => go(start + PAGE)} aria-label={t.next}>›</button>
    </span>
  );
}

function ImportButton({ accept }: { accept: (bytes: Uint8Array) => void }) {
  const read = async (event: Event) => {
    const field = event.currentTarget as HTMLInputElement;
    const file = field.files?.[0];
    if (!file) return;
    accept(new Uint8Array(await file.arrayBuffer()));
    field.value = ""; // else the same file could not be chosen again
  };
  return <label class="button">{texts().importFile}<input type="file" class="hidden-file" onChange={read} /></label>;
}

function importedDrafts(bytes: Uint8Array, area: Area, present: number[]): Drafts {
  if (bytes.length > area.size) throw new Error(texts().fileTooLong(String(area.size)));
  return new Map([...bytes].map((byte, i): [number, number] => [i, byte]).filter(([i, byte]) => present[i] !== byte));
}

function PendingState({ drafts, area, commit, work }: { drafts: Drafts; area: Area; commit: () => void; work: Attempt }) {
  const t = texts();
  if (drafts.size > 0) return <span class="chip pending">{t.notWritten(drafts.size)}</span>;
  if (!area.pending) return null;
  return (
    <div class="banner pending" role="status">
      <span>{t.notCommitted}</span>
      <button type="button" class="primary" disabled={work.busy} onClick={commit}>{t.commit}</button>
    </div>
  );
}

function AreaEditor({ device, name }: { device: string; name: string }) {
  const t = texts();
  const [state, setState] = useState<AreaState | null>(null);
  const [drafts, setDrafts] = useState<Drafts>(new Map());
  const [start, setStart] = useState(0);
  const [credentials, setCredentials] = useState<Credentials>({ serial_number: "", password: "" });
  const work = useAttempt();
  const load = async () => {
    const area = await describeArea(name);
    setState({ area, bytes: area.size === 0 ? [] : await readBytes(name, 0, area.size) });
  };
  usePeriodic(PERIOD, load, [name]);
  if (state === null) return <p class="quiet">{t.loading}</p>;
  const { area, bytes } = state;
  const change = (address: number, byte: number) => setDrafts((old) => {
    const now = new Map(old);
    if (bytes[address] === byte) now.delete(address); else now.set(address, byte);
    return now;
  });
  const write = () => work.attempt(async () => {
    await writeBytes(device, name, drafts, credentials);
    await load();
    setDrafts(new Map());
  });
  const commit = () => void work.attempt(async () => { await commitArea(device, name); await load(); });
  const accept = (file: Uint8Array) => void work.attempt(async () => setDrafts(importedDrafts(file, area, bytes)));
  return (
    <>
      <div class="toolbar">
        <Pager start={start} size={area.size} go={setStart} />
        <button type="button" onClick={() => download(`${name.replaceAll("/", "-")}.bin`, new Blob([new Uint8Array(bytes)]))}>{t.exportFile}</button>
        {area.writable ? <ImportButton accept={accept} /> : <span class="chip">{t.readOnly}</span>}
        <CredentialFields area={area} credentials={credentials} change={setCredentials} />
        {drafts.size > 0 && <button type="button" class="primary" disabled={work.busy} onClick={write}>{t.write}</button>}
        {drafts.size > 0 && <button type="button" onClick={() => setDrafts(new Map())}>{t.undo}</button>}
      </div>
      <PendingState drafts={drafts} area={area} commit={commit} work={work} />
      {work.fault && <p class="fault" role="alert">{work.fault}</p>}
      <HexGrid start={start} bytes={bytes.slice(start, start + PAGE)} drafts={drafts} readOnly={!area.writable} change={change} />
    </>
  );
}

export function MemoryTab({ device }: { device: Device }) {
  const [chosen, setChosen] = useState(device.areas[0]);
  return (
    <>
      <label class="field">{texts().area}{" "}
        <select value={chosen} onChange={(event) => setChosen(event.currentTarget.value)}>
          {device.areas.map((area) => <option key={area}>{area}</option>)}
        </select>
      </label>
      <AreaEditor key={chosen} device={device.name} name={chosen} />
    </>
  );
}
