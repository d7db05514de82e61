// Requests to the service.
import type { Failure, MethodName, Methods } from "../../../clients/typescript/qitrmc.ts";
import { parseJson, printJson } from "./json.ts";

export const SERVICE = "/qitrmc/Call";

// What the service answers a request with that it cannot carry out.
export class ServiceError extends Error {
  constructor(readonly failure: Failure) {
    super(failure.data?.qitrmc_message ?? failure.message);
  }

  get code(): number {
    return this.failure.data?.qitrmc_code ?? this.failure.code;
  }
}

// There was no answer of the service at all.
export class Unreachable extends Error {}

const PATIENCE = 60_000;
let lastId = 0;

export function requestText(method: string, params: object, indent?: number): string {
  return printJson({ jsonrpc: "2.0", id: ++lastId, method, params }, indent);
}

export async function post(body: string): Promise<string> {
  let response: Response;
  let text: string;
  try {
    response = await fetch(SERVICE, { method: "POST", body, signal: AbortSignal.timeout(PATIENCE) });
    text = await response.text();
  } catch (failure) {
    throw new Unreachable(String(failure));
  }
  if (!response.ok) throw new Unreachable(`HTTP ${response.status}: ${text.trim()}`);
  return text;
}

export async function call<Name extends MethodName>(
  method: Name, params: Methods[Name]["params"],
): Promise<Methods[Name]["result"]> {
  const answer = parseJson(await post(requestText(method, params))) as {
    result?: Methods[Name]["result"]; error?: Failure;
  };
  if (answer.error) throw new ServiceError(answer.error);
  return answer.result!;
}
