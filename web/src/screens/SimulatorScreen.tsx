// What the simulated chassis does wrong on purpose, and what is called in its driver.
import { useState } from "preact/hooks";
import { useAttempt, usePeriodic } from "../parts/useAsync.ts";
import { readFaults, readTrace, setFaults, type Event, type Fault, type Faults } from "../service/simulator.ts";
import { parseDecimal, parseInteger } from "../service/values.ts";
import { useStore } from "../store.ts";
import { texts } from "../texts/texts.ts";

const PERIOD = 1000;
const MOST_TRACE = 20_000;

function eventOf(faults: Faults, device: string): Event["event"] | null {
  return faults.events?.find((event) => event.device === device)?.event ?? null;
}

function withEvent(faults: Faults, device: string, event: Event["event"] | null): Faults {
  const others = (faults.events ?? []).filter((one) => one.device !== device);
  return { ...faults, events: event === null ? others : [...others, { device, event }] };
}

function Modules({ faults, apply }: { faults: Faults; apply: (faults: Faults) => void }) {
  const t = texts();
  const devices = useStore((state) => state.devices);
  const present = devices.filter((device) => device.slot !== null).map((device) => device.name);
  const names = [...new Set([...present, ...(faults.events ?? []).map((event) => event.device)])].sort();
  return (
    <section class="panel">
      <h2>{t.modules}</h2>
      <ul class="rows">
        {names.map((name) => {
          const event = eventOf(faults, name);
          return (
            <li key={name}>
              <strong>{name}</strong>
              <span class={event ? "chip held" : "chip own"}>{event === "pulled" ? t.pulled : event ? t.notAnswering : t.ready}</span>
              {event === null ? (
                <>
                  <button type="button" onClick={() => apply(withEvent(faults, name, "pulled"))} aria-label={`${t.pull} ${name}`}>{t.pull}</button>
                  <button type="button" onClick={() => apply(withEvent(faults, name, "connection_lost"))} aria-label={`${t.cutConnection} ${name}`}>{t.cutConnection}</button>
                </>
              ) : <button type="button" class="primary" onClick={() => apply(withEvent(faults, name, null))} aria-label={`${t.putBack} ${name}`}>{t.putBack}</button>}
            </li>
          );
        })}
      </ul>
    </section>
  );
}

const NEW_FAULT = { function: "getGenericProperty*", resource: "", code: "-250989", every: "1", delay: "0" };
const CODES: [bigint, bigint] = [-(2n ** 31n), 2n ** 31n - 1n];

function faultOf(entry: typeof NEW_FAULT): Fault {
  const delay = parseDecimal(entry.delay);
  return {
    function: entry.function,
    ...(entry.resource && { resource: entry.resource }),
    ...(entry.code && { status: { code: Number(parseInteger(entry.code, ...CODES)) } }),
    ...(delay > 0 && { delay }),
    calls: { every: Number(parseInteger(entry.every, 1n, CODES[1])) },
  };
}

function FaultForm({ add }: { add: (fault: Fault) => Promise<void> }) {
  const t = texts();
  const [entry, setEntry] = useState(NEW_FAULT);
  const { fault, attempt } = useAttempt();
  const fields: [keyof typeof NEW_FAULT, string][] = [
    ["function", t.driverFunction], ["resource", t.resource], ["code", t.statusCode], ["every", t.everyCall], ["delay", t.delay]];
  return (
    <form class="toolbar" onSubmit={(event) => { event.preventDefault(); void attempt(() => add(faultOf(entry))); }}>
      {fields.map(([name, label]) => (
        <label class="field" key={name}>{label}{" "}
          <input size={name === "function" ? 22 : 9} value={entry[name]} onInput={(event) => setEntry({ ...entry, [name]: event.currentTarget.value })} />
        </label>
      ))}
      <button type="submit" class="primary">{t.strike}</button>
      {fault && <span class="fault" role="alert">{fault}</span>}
    </form>
  );
}

function FaultList({ faults, apply }: { faults: Faults; apply: (faults: Faults) => void }) {
  const t = texts();
  const list = faults.faults ?? [];
  return (
    <ul class="rows">
      {list.map((fault, i) => (
        <li key={i}>
          <code>{JSON.stringify(fault)}</code>
          <button type="button" onClick={() => apply({ ...faults, faults: list.filter((_, other) => other !== i) })}>{t.clear}</button>
        </li>
      ))}
    </ul>
  );
}

function TracePanel() {
  const t = texts();
  const [trace, setTrace] = useState<{ text: string; end: number } | null>({ text: "", end: -1 });
  usePeriodic(PERIOD, async () => {
    const more = await readTrace(trace?.end ?? -1);
    setTrace((old) => more && { text: ((old?.text ?? "") + more.text).slice(-MOST_TRACE), end: more.end });
  }, []);
  return (
    <section class="panel">
      <h2>{t.trace}</h2>
      {trace === null ? <p class="quiet">{t.noTrace}</p> : <pre class="trace" tabIndex={0}>{trace.text}</pre>}
    </section>
  );
}

export function SimulatorScreen() {
  const t = texts();
  const [faults, setShown] = useState<Faults>({});
  const { fault, attempt } = useAttempt();
  usePeriodic(PERIOD, async () => setShown(await readFaults()), []);
  const change = async (wanted: Faults) => {
    await setFaults(wanted);
    setShown(await readFaults());
  };
  const apply = (wanted: Faults) => void attempt(() => change(wanted));
  return (
    <>
      <h1>{t.simulator}</h1>
      {fault && <p class="banner bad" role="alert">{fault}</p>}
      <Modules faults={faults} apply={apply} />
      <section class="panel">
        <h2>{t.faults}</h2>
        <FaultForm add={(added) => change({ ...faults, faults: [...(faults.faults ?? []), added] })} />
        <FaultList faults={faults} apply={apply} />
      </section>
      <TracePanel />
    </>
  );
}
