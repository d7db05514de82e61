// Bytes as hexadecimal digits and as text, sixteen in a row.
import { texts } from "../texts/texts.ts";

const PER_ROW = 16;
const STEPS: Record<string, number> = { ArrowUp: -PER_ROW, ArrowDown: PER_ROW };

interface Props {
  start: number;
  bytes: number[];
  drafts: Map<number, number>; // entered and not written
  readOnly: boolean;
  change: (address: number, byte: number) => void;
}

export function hexByte(byte: number): string {
  return byte.toString(16).toUpperCase().padStart(2, "0");
}

function character(byte: number): string {
  return byte >= 0x20 && byte < 0x7f ? String.fromCharCode(byte) : "·";
}

function focusByte(table: Element | null, address: number): void {
  const field = table?.querySelector<HTMLInputElement>(`[data-address="${address}"]`);
  field?.focus();
  field?.select();
}

function ByteField({ address, byte, draft, readOnly, change }: {
  address: number; byte: number; draft: number | undefined; readOnly: boolean; change: Props["change"];
}) {
  const enter = (event: Event) => {
    const field = event.currentTarget as HTMLInputElement;
    if (!/^[0-9a-fA-F]{1,2}$/.test(field.value)) return;
    if (field.value.length < 2) return;
    change(address, parseInt(field.value, 16));
    focusByte(field.closest("table"), address + 1);
  };
  const move = (event: KeyboardEvent) => {
    const field = event.currentTarget as HTMLInputElement;
    if (event.key in STEPS) focusByte(field.closest("table"), address + STEPS[event.key]);
  };
  return (
    <input class={draft === undefined ? "byte" : "byte draft"} value={hexByte(draft ?? byte)} maxLength={2}
           data-address={address} aria-label={texts().byteAt(hexAddress(address))} readOnly={readOnly}
           spellcheck={false} autocomplete="off" onInput={enter} onKeyDown={move}
           onFocus={(event) => event.currentTarget.select()}
           onBlur={(event) => { event.currentTarget.value = hexByte(draft ?? byte); }} />
  );
}

export function hexAddress(address: number): string {
  return address.toString(16).toUpperCase().padStart(4, "0");
}

export function HexGrid({ start, bytes, drafts, readOnly, change }: Props) {
  const rows = Array.from({ length: Math.ceil(bytes.length / PER_ROW) }, (_, i) => i * PER_ROW);
  return (
    <div class="scroll" tabIndex={0} role="group" aria-label={texts().memory}>
      <table class="hex">
        <tbody>
          {rows.map((row) => (
            <tr key={start + row}>
              <th scope="row">{hexAddress(start + row)}</th>
              {bytes.slice(row, row + PER_ROW).map((byte, i) => {
                const address = start + row + i;
                return <td key={address}><ByteField address={address} byte={byte} draft={drafts.get(address)} readOnly={readOnly} change={change} /></td>;
              })}
              <td class="text">
                {bytes.slice(row, row + PER_ROW).map((byte, i) => character(drafts.get(start + row + i) ?? byte)).join("")}
              </td>
            </tr>
          ))}
        </tbody>
      </table>
    </div>
  );
}
