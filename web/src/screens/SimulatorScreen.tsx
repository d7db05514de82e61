// What the simulated chassis does wrong on purpose, and what is called in its driver.
import { useEffect, useRef, useState } from "preact/hooks";
import { useAttempt, usePeriodic } from "../parts/useAsync.ts";
import {
  readDevices, readFaults, readTrace, setFaults,
  type Event, type Fault, type Faults, type SimulatedDevice, type Trace,
} from "../service/simulator.ts";
import { parseDecimal, parseInteger } from "../service/values.ts";
import { texts } from "../texts/texts.ts";

const PERIOD = 1000;
const MOST_LINES = 1000;

function withEvent(faults: Faults, device: string, event: Event["event"] | null): Faults {
  const others = (faults.events ?? []).filter((one) => one.device !== device);
  return { ...faults, events: event === null ? others : [...others, { device, event }] };
}

function ModuleRow({ module, faults, apply }: { module: SimulatedDevice; faults: Faults; apply: (faults: Faults) => void }) {
  const t = texts();
  const { name, state } = module;
  const words = { present: t.ready, pulled: t.pulled, connection_lost: t.notAnswering }[state];
  const button = (text: string, event: Event["event"] | null, kind: string) => (
    <button type="button" class={kind} aria-label={`${text} ${name}`} onClick={() => apply(withEvent(faults, name, event))}>{text}</button>
  );
  return (
    <li>
      <span class="quiet">{t.slot} {module.slot}</span>
      <strong>{name}</strong>
      <span>{module.product}</span>
      <span class={state === "present" ? "chip own" : "chip held"}>{words}</span>
      {state === "present" ? [button(t.pull, "pulled", ""), button(t.cutConnection, "connection_lost", "")] : button(t.putBack, null, "primary")}
    </li>
  );
}

function Modules({ devices, faults, apply }: { devices: SimulatedDevice[]; faults: Faults; apply: (faults: Faults) => void }) {
  const modules = devices.filter((device) => device.slot !== undefined).sort((one, other) => one.slot! - other.slot!);
  return (
    <section class="panel">
      <h2>{texts().modules}</h2>
      <ul class="rows">
        {modules.map((module) => <ModuleRow key={module.name} module={module} faults={faults} apply={apply} />)}
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
  const [trace, setTrace] = useState<Trace>({ lines: [], next: 0 });
  const [paused, setPaused] = useState(false);
  const view = useRef<HTMLPreElement>(null);
  usePeriodic(PERIOD, async () => {
    if (paused) return;
    const { lines, next } = await readTrace(trace.next);
    setTrace((old) => ({ lines: [...old.lines, ...lines].slice(-MOST_LINES), next }));
  }, []);
  useEffect(() => { view.current!.scrollTop = view.current!.scrollHeight; }, [trace]);
  return (
    <section class="panel">
      <div class="toolbar">
        <h2>{t.trace}</h2>
        <button type="button" onClick={() => setPaused(!paused)}>{paused ? t.goOn : t.pause}</button>
      </div>
      <pre class="trace" tabIndex={0} role="region" aria-label={t.trace} ref={view}>{trace.lines.join("\n")}</pre>
    </section>
  );
}

export function SimulatorScreen() {
  const t = texts();
  const [faults, setShown] = useState<Faults>({});
  const [devices, setDevices] = useState<SimulatedDevice[]>([]);
  const { fault, attempt } = useAttempt();
  const show = async () => {
    setShown(await readFaults());
    setDevices(await readDevices());
  };
  usePeriodic(PERIOD, show, []);
  const change = async (wanted: Faults) => {
    await setFaults(wanted);
    await show();
  };
  const apply = (wanted: Faults) => void attempt(() => change(wanted));
  return (
    <>
      <h1>{t.simulator}</h1>
      {fault && <p class="banner bad" role="alert">{fault}</p>}
      <Modules devices={devices} faults={faults} apply={apply} />
      <section class="panel">
        <h2>{t.faults}</h2>
        <FaultForm add={(added) => change({ ...faults, faults: [...(faults.faults ?? []), added] })} />
        <FaultList faults={faults} apply={apply} />
      </section>
      <TracePanel />
    </>
  );
}
