// Work that a screen waits for.
import { useCallback, useEffect, useRef, useState } from "preact/hooks";

// Runs the work now and then again each time `period` milliseconds after it was done; failures go to
// the last argument. Ends with the screen.
export function usePeriodic(period: number, work: () => Promise<void>, inputs: unknown[],
                            fail: (failure: unknown) => void = () => {}): void {
  const latest = useRef(work);
  latest.current = work;
  useEffect(() => {
    let timer = 0;
    let ended = false;
    const run = () => latest.current().catch((failure) => { if (!ended) fail(failure); }).finally(() => {
      if (!ended) timer = setTimeout(run, period);
    });
    void run();
    return () => { ended = true; clearTimeout(timer); };
  }, inputs);
}

export interface Attempt {
  busy: boolean;
  fault: string; // why the latest work failed; empty when it did not
  failure: unknown;
  attempt: (work: () => Promise<void>) => Promise<boolean>;
  clear: () => void;
}

// For work that a person starts: whether it goes on, and how it failed.
export function useAttempt(): Attempt {
  const [busy, setBusy] = useState(false);
  const [failure, setFailure] = useState<unknown>(null);
  const attempt = useCallback(async (work: () => Promise<void>) => {
    setBusy(true);
    setFailure(null);
    try {
      await work();
      return true;
    } catch (fault) {
      setFailure(fault);
      return false;
    } finally {
      setBusy(false);
    }
  }, []);
  const fault = failure === null ? "" : failure instanceof Error ? failure.message : String(failure);
  return { busy, fault, failure, attempt, clear: () => setFailure(null) };
}
