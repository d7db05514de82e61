// The commands of a device and its channels, with the time that they take.
import { useEffect, useState } from "preact/hooks";
import { useAttempt, usePeriodic } from "../parts/useAsync.ts";
import { commandInformation, executeCommand, listCommands, type Resource } from "../service/resources.ts";
import { call } from "../service/rpc.ts";
import { ignoreRefusal, session } from "../service/session.ts";
import { parseDecimal } from "../service/values.ts";
import type { Device } from "../store.ts";
import { texts } from "../texts/texts.ts";

interface Command {
  name: string;
  description: string;
  document: string;
}

const TICK = 100;

function useElapsed(running: boolean): number {
  const [elapsed, setElapsed] = useState(0);
  useEffect(() => {
    if (!running) return;
    const start = performance.now();
    setElapsed(0);
    const timer = setInterval(() => setElapsed((performance.now() - start) / 1000), TICK);
    return () => clearInterval(timer);
  }, [running]);
  return elapsed;
}

async function describeCommands(resource: Resource): Promise<Command[]> {
  const names = (await listCommands(resource).catch(ignoreRefusal)) ?? [];
  return Promise.all(names.map(async (name) => {
    const information = await commandInformation(resource, name).catch(ignoreRefusal);
    return { name, description: information?.description ?? "", document: information?.document ?? "" };
  }));
}

function CommandCard({ resource, command, timeout }: { resource: Resource; command: Command; timeout: string }) {
  const t = texts();
  const { busy, fault, attempt } = useAttempt();
  const [done, setDone] = useState<number | null>(null);
  const elapsed = useElapsed(busy);
  const run = () => {
    setDone(null);
    const start = performance.now();
    void attempt(async () => {
      await executeCommand(resource, command.name, parseDecimal(timeout));
      setDone((performance.now() - start) / 1000);
    });
  };
  const stop = async () => call("abortSession", { session_id: await session() }).catch(() => {});
  return (
    <li class="command">
      <div>
        <span class="property-name">{command.name}</span>
        {command.description && <span class="description">{command.description}</span>}
        {command.document && <span class="description">{command.document}</span>}
      </div>
      <div class="command-run">
        {busy && <progress aria-label={command.name} />}
        {busy && <span class="elapsed">{elapsed.toFixed(1)} s</span>}
        {done !== null && <span class="chip own" role="status">{t.doneIn(done.toFixed(2))}</span>}
        {busy ? <button type="button" onClick={stop}>{t.stop}</button>
          : <button type="button" class="primary" onClick={run} aria-label={`${t.run} ${command.name}`}>{t.run}</button>}
      </div>
      {fault && <p class="fault" role="alert">{fault}</p>}
    </li>
  );
}

export function CommandsTab({ device }: { device: Device }) {
  const t = texts();
  const [chosen, setChosen] = useState<string | null>(null);
  const [commands, setCommands] = useState<Command[] | null>(null);
  const [timeout, setTimeoutText] = useState("60");
  const resource = { device: device.name, channel: chosen };
  usePeriodic(5000, async () => setCommands(await describeCommands(resource)), [device.name, chosen]);
  return (
    <>
      <div class="toolbar">
        <label class="field">{t.on_}{" "}
          <select value={chosen ?? ""} onChange={(event) => { setCommands(null); setChosen(event.currentTarget.value || null); }}>
            <option value="">{device.name}</option>
            {device.channels.map((channel) => <option key={channel}>{channel}</option>)}
          </select>
        </label>
        <label class="field">{t.timeLimit}{" "}
          <input class="number" size={5} inputMode="decimal" value={timeout}
                 onInput={(event) => setTimeoutText(event.currentTarget.value)} /> s
        </label>
      </div>
      {commands === null && <p class="quiet">{t.loading}</p>}
      {commands?.length === 0 && <p class="quiet">{t.noCommands}</p>}
      <ul class="commands">
        {commands?.map((command) =>
          <CommandCard key={`${chosen}/${command.name}`} resource={resource} command={command} timeout={timeout} />)}
      </ul>
    </>
  );
}
