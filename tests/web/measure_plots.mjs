// Measures the live plot when its memory of an hour is full: node tests/web/measure_plots.mjs [SECONDS]
// Needs a build of the service in build/dev (or QITRMC_BUILD_DIR) and its page beside it, as the tests do.
//
// An hour has 36,000 samples. The page takes three times as many as fast as it can, from answers that the
// service gave before, and then ten a second from the service for some SECONDS while the frames are timed.
import test from "node:test";
import { Host, open } from "./support.mjs";

const SECONDS = Number(process.argv[2] ?? 60);
const PERIOD = 100; // of the page's recorder, in milliseconds
const KEPT = 36_000;
const SERIES = [["Bench", "Dev.Temperature"], ["Mod1", "Dev.Temperature"], ["Mod2", "Dev.Temperature"], ["Mod4", "Dev.Temperature"],
  ["Mod2/ch0", "PSU.MeasuredVoltage"], ["Mod2/ch1", "PSU.MeasuredVoltage"], ["Mod1/ch0", "DMM.Voltage"], ["Mod1/ch1", "DMM.Voltage"]];

// Runs in the page before its program: the timer of the recorder can be made faster, its samples are
// counted, and what the service answered can be answered again.
function takeChargeOfTime(period) {
  const { setInterval, fetch } = globalThis;
  const recorder = globalThis.recorder = { period, samples: 0, hurries: false };
  const answers = new Map();
  globalThis.setInterval = (work, wanted) => {
    if (wanted !== period) return setInterval(work, wanted);
    const channel = new MessageChannel(); // a timer would wait four milliseconds
    const run = () => { work(); if (recorder.hurries) channel.port2.postMessage(0); else setTimeout(run, period); };
    channel.port1.onmessage = run;
    return setTimeout(run, wanted);
  };
  globalThis.fetch = async (address, options) => {
    const request = String(options?.body ?? "");
    const key = request.slice(request.indexOf("params"));
    if (key.includes("PSU.MeasuredVoltage") && key.includes("physical_channels")) ++recorder.samples;
    if (recorder.hurries && answers.has(key)) return new Response(answers.get(key));
    const response = await fetch(address, options);
    if (key.includes("property")) answers.set(key, await response.clone().text());
    return response;
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

async function fill(page, wanted) {
  const samples = () => page.evaluate(() => globalThis.recorder.samples);
  const end = await samples() + wanted;
  await page.getByLabel("Window").selectOption("10");
  await page.evaluate(() => { globalThis.recorder.hurries = true; });
  while (await samples() < end) await new Promise((resolve) => setTimeout(resolve, 500));
  await page.evaluate(() => { globalThis.recorder.hurries = false; });
  await page.getByLabel("Window").selectOption("3600");
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
  for (const hours of [1, 2, 3]) {
    const start = Date.now();
    await fill(page, KEPT);
    console.log(`${hours} h of samples after ${Math.round((Date.now() - start) / 1000)} s, heap ${await heapMegabytes(session)} MB`);
  }
  const before = await page.evaluate(() => globalThis.recorder.samples);
  report("8 series, memory full", await page.evaluate(timeFrames, SECONDS));
  const after = await page.evaluate(() => globalThis.recorder.samples);
  console.log(`${((after - before) / SECONDS).toFixed(1)} samples a second, heap ${await heapMegabytes(session)} MB`);
});
