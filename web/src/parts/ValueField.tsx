// One value that can be changed: its field, what is wrong with the entry, and what the service says.
import { useRef, useState } from "preact/hooks";
import { editable, isArray, itemType, parseEntry, type Information, type Value } from "../service/values.ts";
import { texts } from "../texts/texts.ts";
import { useAttempt } from "./useAsync.ts";

interface Props {
  label: string;
  information: Information;
  value: Value | undefined;
  pending: boolean;
  write: (value: Value) => Promise<void>;
}

interface EntryProps {
  label: string;
  information: Information;
  text: string;
  invalid: boolean;
  disabled: boolean;
  describedBy: string;
  change: (text: string) => void;
}

function Entry({ label, information, text, invalid, disabled, describedBy, change }: EntryProps) {
  const common = {
    "aria-label": label, "aria-invalid": invalid, "aria-describedby": describedBy, value: text, disabled,
    onInput: (event: Event) => change((event.currentTarget as HTMLInputElement).value),
  };
  if (!isArray(information) && information.enum) {
    return (
      <select {...common}>
        {Object.entries(information.enum.values).map(([name, number]) =>
          <option key={name} value={String(number)}>{name}</option>)}
      </select>
    );
  }
  if (information.data_type === "Bool") {
    return (
      <select {...common}>
        <option value="true">{texts().on}</option>
        <option value="false">{texts().off}</option>
      </select>
    );
  }
  if (information.data_type === "StringArray")
    return <textarea rows={Math.min(6, text.split("\n").length)} {...common} />;
  const numeric = itemType(information) !== "String";
  return <input type="text" class={numeric ? "number" : ""} inputMode={numeric && !isArray(information) ? "decimal" : undefined}
                autocomplete="off" spellcheck={false} {...common} />;
}

let fields = 0;

export function ValueField({ label, information, value, pending, write }: Props) {
  const t = texts();
  const [id] = useState(() => `field-${++fields}`);
  const [draft, showDraft] = useState<string | null>(null);
  const latest = useRef(draft); // of an entry that is sent before it was drawn
  const setDraft = (text: string | null) => { latest.current = text; showDraft(text); };
  const [entryFault, setEntryFault] = useState("");
  const { busy, fault, attempt, clear } = useAttempt();
  const shown = draft ?? editable(information, value);
  // An entry that begins before the value arrives would be mixed with it.
  const awaitsValue = value === undefined && information.access !== "WriteOnly";
  const change = (text: string) => {
    clear();
    setDraft(text === editable(information, value) ? null : text);
    try {
      parseEntry(information, text);
      setEntryFault("");
    } catch (failure) {
      setEntryFault((failure as Error).message);
    }
  };
  const giveUp = () => { setDraft(null); setEntryFault(""); clear(); };
  const send = async (event: Event) => {
    event.preventDefault();
    const text = latest.current;
    if (text === null) return;
    if (await attempt(async () => write(parseEntry(information, text)))) setDraft(null);
  };
  const words = entryFault || fault;
  return (
    <form class={`value-field ${pending ? "pending" : ""}`} onSubmit={send} noValidate
          onKeyDown={(event) => { if (event.key === "Escape") giveUp(); }}>
      <Entry label={label} information={information} text={shown} invalid={words !== ""}
             disabled={awaitsValue} describedBy={id} change={change} />
      {draft !== null && <button type="submit" class="primary" disabled={busy || entryFault !== ""}>{t.set}</button>}
      {draft !== null && <button type="button" class="plain" onClick={giveUp} aria-label={t.undo} title={t.undo}>✕</button>}
      {pending && <span class="chip pending">{t.pending}</span>}
      <span id={id} class="fault" role="alert">{words}</span>
    </form>
  );
}
