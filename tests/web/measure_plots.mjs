// Measures the live plot when its memory of an hour is full: node tests/web/measure_plots.mjs [SECONDS]
// Needs a build of the service in build/dev (or QITRMC_BUILD_DIR) and its page beside it, as the tests do.
//
// An hour has 36,000 samples. They are taken as fast as the service answers, twice as many as the page
// keeps, and then ten a second for some SECONDS while the frames are timed.
import test from "node:test";
import { Host, open } from "./support.mjs";

const SECONDS = Number(process.argv[2] ?? 60);
const PERIOD = 100; // of the page's recorder, in milliseconds
const KEPT = 36_000;
const SERIES = [["Bench", "Dev.Temperature"], ["Mod1", "Dev.Temperature"], ["Mod2", "Dev.Temperature"], ["Mod4", "Dev.Temperature"],
  ["Mod2/ch0", "PSU.MeasuredVoltage"], ["Mod2/ch1", "PSU.MeasuredVoltage"], ["Mod1/ch0", "DMM.Voltage"], ["Mod1/ch1", "DMM.Voltage"]];

// Runs in the page before its program: the timer of the recorder can be made faster, and is counted.
function takeChargeOfTime(period) {
  const setIntervalBefore = globalThis.setInterval;
  globalThis.recorder = { period, runs: 0 };
  globalThis.setInterval = (work, wanted) => {
    if (wanted !== period) return setIntervalBefore(work, wanted);
    const run = () => { ++globalThis.recorder.runs; work(); setTimeout(run, globalThis.recorder.period); };
    return setTimeout(run, wanted);
  };
}

// The times between frames in milliseconds.
function timeFrames(seconds) {
  return new Promise((resolve) => {
    const times = [];
    let last = performance.now();
    const end = last + seconds * 1000;
    const note = (now) => {
      times.push(now - last);
      last = now;
      if (now < end) requestAnimationFrame(note); else resolve(times.slice(1));
    };
    requestAnimationFrame(note);
  });
}

async function heapMegabytes(session) {
  await session.send("HeapProfiler.collectGarbage");
  const { usedSize } = await session.send("Runtime.getHeapUsage");
  return (usedSize / 1e6).toFixed(1);
}

async function fill(page, samples) {
  await page.evaluate(() => { globalThis.recorder.period = 1; });
  const before = await page.evaluate(() => globalThis.samples());
  await page.waitForFunction((wanted) => globalThis.samples() >= wanted, before + samples, { timeout: 1_200_000, polling: 1000 });
  await page.evaluate((period) => { globalThis.recorder.period = period; }, PERIOD);
}

function report(name, times) {
  const sorted = times.toSorted((one, other) => one - other);
  const at = (part) => sorted[Math.floor(part * (sorted.length - 1))].toFixed(1);
  const dropped = times.reduce((sum, time) => sum + Math.max(0, Math.round(time / (1000 / 60)) - 1), 0);
  console.log(`${name}: ${times.length} frames, median ${at(0.5)} ms, 99 of 100 within ${at(0.99)} ms, ` +
    `longest ${at(1)} ms, dropped ${(100 * dropped / (times.length + dropped)).toFixed(2)} %`);
}

test("live plot", { timeout: 3_600_000 }, async () => {
  const host = await Host.start();
  const page = await open(host);
  await page.addInitScript(takeChargeOfTime, PERIOD);
  // A sample is complete when each of its requests is answered; the one of the voltages tells.
  await page.addInitScript(() => {
    let count = 0;
    const fetchBefore = globalThis.fetch;
    globalThis.samples = () => count;
    globalThis.fetch = (address, options) => {
      if (String(options?.body).includes("PSU.MeasuredVoltage\",\"physical")) ++count;
      return fetchBefore(address, options);
    };
  });
  const session = await page.context().newCDPSession(page);
  await page.goto(`${host.url}/?measure#/plots`);
  const empty = await page.evaluate(timeFrames, SECONDS);
  for (const [resource, property] of SERIES) {
    await page.getByLabel("Device or channel").selectOption(resource);
    await page.getByLabel(property, { exact: false }).check();
  }
  await page.getByLabel("Window").selectOption("3600");
  report("nothing plotted", empty);
  report("8 series, first minute", await page.evaluate(timeFrames, SECONDS));
  console.log(`heap ${await heapMegabytes(session)} MB`);
  for (const hours of [1, 2]) {
    const start = Date.now();
    await fill(page, KEPT);
    console.log(`${hours} h of samples after ${Math.round((Date.now() - start) / 1000)} s, heap ${await heapMegabytes(session)} MB`);
  }
  const before = await page.evaluate(() => globalThis.samples());
  report("8 series, memory full", await page.evaluate(timeFrames, SECONDS));
  const after = await page.evaluate(() => globalThis.samples());
  console.log(`${((after - before) / SECONDS).toFixed(1)} samples a second`);
});
