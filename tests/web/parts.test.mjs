// Parts of the program of the page by themselves.
import assert from "node:assert/strict";
import { createRequire } from "node:module";
import path from "node:path";
import test from "node:test";
import { ROOT } from "./support.mjs";

const { buildSync } = createRequire(path.join(ROOT, "web/package.json"))("esbuild");

function load(source) {
  const { outputFiles } = buildSync({ entryPoints: [path.join(ROOT, "web/src", source)], bundle: true, write: false,
    format: "esm", jsx: "automatic", jsxImportSource: "preact" });
  return import("data:text/javascript;base64," + Buffer.from(outputFiles[0].contents).toString("base64"));
}

test("reads long fractions as numbers and long integers exactly", async () => {
  const { parseJson } = await load("service/json.ts");
  assert.deepEqual(
    parseJson('[0.00055341234567890123, -1.2345678901234567e-05, 18446744073709551615, -9007199254740993, 9007199254740991]'),
    [0.00055341234567890123, -1.2345678901234567e-05, 18446744073709551615n, -9007199254740993n, 9007199254740991]);
  assert.deepEqual(parseJson('{"a": "12345678901234567890", "b\\"1": ["\\\\", 1]}'), { a: "12345678901234567890", 'b"1': ["\\", 1] });
});

test("prints integers of 64 bits without quotes", async () => {
  const { printJson } = await load("service/json.ts");
  assert.equal(printJson({ value: 18446744073709551615n, text: "18446744073709551615", half: 0.5 }),
    '{"value":18446744073709551615,"text":"18446744073709551615","half":0.5}');
});

test("drops the oldest samples of a plot after an hour", async () => {
  const { addTrack, csv, keep, recording, removeTrack } = await load("service/recorder.ts");
  addTrack({ device: "Mod1", channel: null }, "A", "V");
  const [track] = recording.tracks;
  for (let i = 0; i < 100_000; ++i) keep(i / 10, new Map([[track, i]]));
  assert.ok(recording.times.length >= 36_000 && recording.times.length < 37_000, String(recording.times.length));
  assert.equal(track.values.length, recording.times.length);
  assert.deepEqual([track.values.at(-1), recording.times.at(-1)], [99_999, 9999.9]);
  assert.match(csv(), /\r\n1970-01-01T02:46:39.900Z,99999\r\n$/);
  removeTrack("Mod1 A");
  assert.deepEqual([recording.times.length, recording.tracks.length], [0, 0]);
});

test("writes bytes that follow each other with one request", async () => {
  const { runsOf } = await load("service/memory.ts");
  assert.deepEqual(runsOf(new Map([[9, 1], [3, 2], [4, 3], [11, 4], [10, 5]])), [[3, [2, 3]], [9, [1, 5, 4]]]);
});
