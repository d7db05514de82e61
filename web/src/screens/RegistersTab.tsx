// Registers of a device by address and width, to read, write and watch.
import { useEffect, useState } from "preact/hooks";
import { useAttempt, usePeriodic } from "../parts/useAsync.ts";
import { call } from "../service/rpc.ts";
import { reserve, session } from "../service/session.ts";
import { describeRegisters, type Registers } from "../service/simulator.ts";
import { parseInteger } from "../service/values.ts";
import { useStore, type Device } from "../store.ts";
import { texts } from "../texts/texts.ts";

type Width = 8 | 16 | 32 | 64;

interface Row {
  address: number;
  width: Width;
  value: bigint | null;
  changed: boolean;
  watched: boolean;
  fault: string;
}

const WIDTHS: Width[] = [8, 16, 32, 64];
const WATCH_PERIOD = 500;
const MOST_ADDRESS = 2n ** 32n - 1n;
const MOST_ROWS = 256n;
const MOST_AT_ONCE = 16; // with a click on a name

function hexOf(value: bigint | number, bits: number): string {
  return "0x" + value.toString(16).toUpperCase().padStart(bits / 4, "0");
}

async function readRow(device: string, row: Row): Promise<Row> {
  try {
    const { data } = await call("readRegister", { session_id: await session(), device, address: row.address, size: row.width });
    const value = BigInt(data);
    return { ...row, value, changed: row.value !== null && row.value !== value, fault: "" };
  } catch (failure) {
    return { ...row, value: null, changed: false, fault: (failure as Error).message };
  }
}

async function writeRow(device: string, row: Row, text: string): Promise<void> {
  const data = parseInteger(text, 0n, 2n ** BigInt(row.width) - 1n);
  await reserve(device);
  // The generated type knows no bigints, which stand for the integers beyond 2 ** 53.
  await call("writeRegister", { session_id: await session(), device, address: row.address, size: row.width, data: data as number });
}

function useDescription(device: string): Registers[] {
  const simulated = useStore((state) => state.simulated);
  const [blocks, setBlocks] = useState<Registers[]>([]);
  useEffect(() => void describeRegisters(device).then(setBlocks, () => setBlocks([])), [device, simulated]);
  return blocks;
}

function RegisterName({ blocks, address }: { blocks: Registers[]; address: number }) {
  const block = blocks.find((one) => one.address <= address && address < one.address + one.size);
  if (!block?.name) return <td />;
  const offset = address - block.address;
  return offset > 0 ? <td title={block.description}>{block.name}{` + ${offset}`}</td>
    : <td>{block.name}{block.description && <small class="description">{block.description}</small>}</td>;
}

function RegisterRow({ device, blocks, row, replace, remove }: {
  device: string; blocks: Registers[]; row: Row; replace: (row: Row) => void; remove: () => void;
}) {
  const t = texts();
  const [text, setText] = useState("");
  const { busy, fault, attempt } = useAttempt();
  const name = hexOf(row.address, 32);
  const read = () => attempt(async () => replace(await readRow(device, row)));
  const write = (event: Event) => {
    event.preventDefault();
    void attempt(async () => {
      await writeRow(device, row, text);
      setText("");
      replace(await readRow(device, row));
    });
  };
  return (
    <tr class={row.changed ? "changed" : ""}>
      <th scope="row" class="mono">{name}</th>
      {blocks.length > 0 && <RegisterName blocks={blocks} address={row.address} />}
      <td>{row.width}</td>
      <td class="mono">{row.value === null ? "–" : hexOf(row.value, row.width)}{row.changed && <span class="chip pending">{t.changed}</span>}</td>
      <td class="mono number">{row.value === null ? "–" : String(row.value)}</td>
      <td>
        <form class="value-field" onSubmit={write}>
          <input class="number" size={12} value={text} aria-label={`${t.write} ${name}`} placeholder="0x…"
                 onInput={(event) => setText(event.currentTarget.value)} />
          <button type="submit" disabled={busy || text === ""}>{t.write}</button>
          {(fault || row.fault) && <span class="fault" role="alert">{fault || row.fault}</span>}
        </form>
      </td>
      <td class="row-buttons">
        <button type="button" onClick={read} disabled={busy} aria-label={`${t.read} ${name}`}>{t.read}</button>
        <label class="check"><input type="checkbox" checked={row.watched} aria-label={`${t.watch} ${name}`}
               onChange={() => replace({ ...row, watched: !row.watched })} />{t.watch}</label>
        <button type="button" class="plain" onClick={remove} aria-label={`${t.remove} ${name}`}>✕</button>
      </td>
    </tr>
  );
}

function sameRegister(one: Row, other: Row): boolean {
  return one.address === other.address && one.width === other.width;
}

function AddForm({ add }: { add: (address: number, count: number, width: Width) => Promise<void> }) {
  const t = texts();
  const [address, setAddress] = useState("0x0");
  const [count, setCount] = useState("4");
  const [width, setWidth] = useState<Width>(32);
  const { busy, fault, attempt } = useAttempt();
  const submit = (event: Event) => {
    event.preventDefault();
    void attempt(() => add(Number(parseInteger(address, 0n, MOST_ADDRESS)), Number(parseInteger(count, 1n, MOST_ROWS)), width));
  };
  return (
    <form class="toolbar" onSubmit={submit}>
      <label class="field">{t.address} <input class="number mono" size={12} value={address} onInput={(event) => setAddress(event.currentTarget.value)} /></label>
      <label class="field">{t.width}{" "}
        <select value={width} onChange={(event) => setWidth(Number(event.currentTarget.value) as Width)}>
          {WIDTHS.map((bits) => <option key={bits} value={bits}>{bits}</option>)}
        </select>
      </label>
      <label class="field">{t.count} <input class="number" size={4} value={count} onInput={(event) => setCount(event.currentTarget.value)} /></label>
      <button type="submit" class="primary" disabled={busy}>{t.readRegisters}</button>
      {fault && <span class="fault" role="alert">{fault}</span>}
    </form>
  );
}

// The registers that have names, to be read with a click.
function NamedRegisters({ blocks, add }: { blocks: Registers[]; add: (address: number, count: number, width: Width) => Promise<void> }) {
  const read = ({ address, size, width }: Registers) => {
    const bits = width ?? (size % 4 === 0 && address % 4 === 0 ? 32 : 8);
    return add(address, Math.min(size / (bits / 8), MOST_AT_ONCE), bits);
  };
  return (
    <div class="toolbar">
      {blocks.filter(({ name }) => name).map((block) => (
        <button type="button" key={block.address} title={block.description} onClick={() => void read(block)}>{block.name}</button>
      ))}
    </div>
  );
}

export function RegistersTab({ device }: { device: Device }) {
  const t = texts();
  const [rows, setRows] = useState<Row[]>([]);
  const blocks = useDescription(device.name);
  const heads = [t.address, ...(blocks.length > 0 ? [t.name] : []), t.width, t.hexadecimal, t.decimal, t.write, ""];
  const replace = (row: Row) => setRows((old) => old.map((one) => (sameRegister(one, row) ? row : one)));
  const add = async (first: number, count: number, width: Width) => {
    const wanted = Array.from({ length: count }, (_, i): Row => ({
      address: first + i * (width / 8), width, value: null, changed: false, watched: false, fault: "" }));
    const read = await Promise.all(wanted.map((row) => readRow(device.name, row)));
    setRows((old) => [...old.filter((one) => !read.some((row) => sameRegister(one, row))), ...read]
      .sort((one, other) => one.address - other.address || one.width - other.width));
  };
  usePeriodic(WATCH_PERIOD, async () => {
    const watched = await Promise.all(rows.filter((row) => row.watched).map((row) => readRow(device.name, row)));
    for (const { address, width, value, changed, fault } of watched)
      setRows((old) => old.map((one) => (one.address === address && one.width === width ? { ...one, value, changed, fault } : one)));
  }, [device.name]);
  return (
    <>
      <AddForm add={add} />
      <NamedRegisters blocks={blocks} add={add} />
      {rows.length === 0 ? <p class="quiet">{t.noRegisters}</p> : (
        <div class="scroll" tabIndex={0} role="group" aria-label={t.registers}>
          <table class="grid registers">
            <thead><tr>{heads.map((head) => <th scope="col" key={head}>{head}</th>)}</tr></thead>
            <tbody>
              {rows.map((row) => (
                <RegisterRow key={`${row.address} ${row.width}`} device={device.name} blocks={blocks} row={row} replace={replace}
                             remove={() => setRows((old) => old.filter((one) => !sameRegister(one, row)))} />
              ))}
            </tbody>
          </table>
        </div>
      )}
    </>
  );
}
