// A line of JSON for each test, for browser.py.
export default async function* report(events) {
  for await (const { type, data } of events) {
    if (type !== "test:pass" && type !== "test:fail") continue;
    const error = data.details?.error;
    const fault = type === "test:fail" ? String(error?.cause?.stack ?? error?.stack ?? error) : "";
    yield JSON.stringify({ name: data.name, passed: type === "test:pass", fault }) + "\n";
  }
}
