// Each method with a form of its own, the request and the answer as text.
import { useEffect, useState } from "preact/hooks";
import { useAttempt } from "../parts/useAsync.ts";
import { explanationOf, loadDescription, resolved, type Description, type Method, type Param, type Schema } from "../service/description.ts";
import { parseJson, printJson, type Json } from "../service/json.ts";
import { post, requestText, SERVICE } from "../service/rpc.ts";
import { session } from "../service/session.ts";
import { asCurl, asPython } from "../service/snippets.ts";
import { parseDecimal } from "../service/values.ts";
import { current } from "../store.ts";
import { texts } from "../texts/texts.ts";

const LONGEST_HISTORY = 50;

interface Exchange {
  method: string;
  entries: Entries;
  request: string;
  answer: string;
}

type Entries = Record<string, string>;

const history: Exchange[] = [];

function typed(schema: Schema, text: string): Json {
  if (schema.enum) return schema.enum.find((item) => String(item) === text) ?? text;
  if (schema.type === "boolean") return text === "true";
  if (schema.type === "integer") return parseJson(String(BigInt(text.trim())));
  if (schema.type === "number") return parseDecimal(text);
  if (schema.type === "array") return text.split(/[\s,;[\]]+/).filter((item) => item !== "").map(Number);
  if (schema.oneOf) return jsonOrText(text);
  return text;
}

function jsonOrText(text: string): Json {
  try {
    return parseJson(text);
  } catch {
    return text;
  }
}

function paramsOf(method: Method, entries: Entries, all: Description): Record<string, Json> {
  const given = method.params.filter((param) => (entries[param.name] ?? "") !== "");
  return Object.fromEntries(given.map((param) => [param.name, typed(resolved(param.schema, all), entries[param.name])]));
}

async function entriesFor(method: Method): Promise<Entries> {
  const needsSession = method.params.some((param) => param.name === "session_id");
  return needsSession ? { session_id: await session() } : {};
}

function ParamField({ param, schema, text, change }: {
  param: Param; schema: Schema; text: string; change: (text: string) => void;
}) {
  const choices = schema.enum ?? (schema.type === "boolean" ? ["true", "false"] : null);
  const id = `param-${param.name}`;
  return (
    <div class="param">
      <label for={id}>{param.name}{param.required && <span class="required" title={texts().required}> *</span>}</label>
      {choices ? (
        <select id={id} value={text} onChange={(event) => change(event.currentTarget.value)}>
          <option value="" />
          {choices.map((choice) => <option key={String(choice)}>{String(choice)}</option>)}
        </select>
      ) : <input id={id} value={text} autocomplete="off" spellcheck={false} onInput={(event) => change(event.currentTarget.value)} />}
      <small>{param.description}</small>
    </div>
  );
}

function CopyButton({ label, text }: { label: string; text: string }) {
  const [done, setDone] = useState(false);
  const copy = async () => {
    await navigator.clipboard.writeText(text);
    setDone(true);
    setTimeout(() => setDone(false), 2000);
  };
  return <button type="button" onClick={copy}>{done ? texts().copied : label}</button>;
}

function pretty(text: string): string {
  try {
    return printJson(parseJson(text), 2);
  } catch {
    return text;
  }
}

function ErrorExplanation({ answer, all }: { answer: string; all: Description }) {
  const parsed = jsonOrText(answer) as { error?: { code: number; data?: { qitrmc_code: number } } };
  if (!parsed?.error) return null;
  const code = parsed.error.data?.qitrmc_code ?? parsed.error.code;
  const explanation = explanationOf(code, all);
  return (
    <div class="banner bad" role="alert">
      <strong>{code} {explanation?.name}</strong> <span>{explanation?.words}</span>
    </div>
  );
}

function Result({ exchange, all }: { exchange: Exchange; all: Description }) {
  const t = texts();
  const url = location.origin + SERVICE;
  return (
    <section class="panel result">
      <h2>{t.request}</h2>
      <pre tabIndex={0}>{exchange.request}</pre>
      <div class="toolbar">
        <CopyButton label={t.copyAsCurl} text={asCurl(url, exchange.request)} />
        <CopyButton label={t.copyAsPython} text={asPython(url, exchange.request)} />
      </div>
      <h2>{t.answer}</h2>
      <pre class="answer" tabIndex={0}>{pretty(exchange.answer)}</pre>
      <ErrorExplanation answer={exchange.answer} all={all} />
    </section>
  );
}

function Console({ all }: { all: Description }) {
  const t = texts();
  const [method, setMethod] = useState(all.methods[0]);
  const [entries, setEntries] = useState<Entries>({});
  const [shown, setShown] = useState<Exchange | null>(history[0] ?? null);
  const { busy, fault, attempt } = useAttempt();
  const choose = async (name: string, given?: Entries) => {
    const chosen = all.methods.find((one) => one.name === name)!;
    setMethod(chosen);
    setEntries(given ?? await entriesFor(chosen).catch(() => ({})));
  };
  const send = (event: Event) => {
    event.preventDefault();
    void attempt(async () => {
      const request = requestText(method.name, paramsOf(method, entries, all));
      const exchange = { method: method.name, entries, request, answer: await post(request) };
      history.unshift(exchange);
      history.length = Math.min(history.length, LONGEST_HISTORY);
      setShown(exchange);
    });
  };
  return (
    <div class="console">
      <form class="panel" onSubmit={send}>
        <label class="field">{t.method}{" "}
          <select value={method.name} onChange={(event) => choose(event.currentTarget.value)}>
            {all.methods.map((one) => <option key={one.name}>{one.name}</option>)}
          </select>
        </label>
        <p class="description">{method.summary}</p>
        {method.params.map((param) => (
          <ParamField key={`${method.name} ${param.name}`} param={param} schema={resolved(param.schema, all)}
                      text={entries[param.name] ?? ""} change={(text) => setEntries({ ...entries, [param.name]: text })} />
        ))}
        <button type="submit" class="primary" disabled={busy}>{t.send}</button>
        {fault && <p class="fault" role="alert">{fault}</p>}
      </form>
      {shown && <Result exchange={shown} all={all} />}
      {history.length > 0 && (
        <section class="panel history">
          <h2>{t.history}</h2>
          <ol>
            {history.map((exchange, i) => (
              <li key={history.length - i}>
                <button type="button" class="plain" onClick={() => { void choose(exchange.method, exchange.entries); setShown(exchange); }}>
                  {exchange.method} <small>{exchange.request.slice(0, 120)}</small>
                </button>
              </li>
            ))}
          </ol>
        </section>
      )}
    </div>
  );
}

export function ConsoleScreen() {
  const t = texts();
  const [all, setAll] = useState<Description | null>(null);
  const { fault, attempt } = useAttempt();
  useEffect(() => void attempt(async () => setAll(await loadDescription())), [current().link]);
  return (
    <>
      <h1>{t.console}</h1>
      {all ? <Console all={all} /> : <p class="quiet">{fault || t.loading}</p>}
    </>
  );
}
