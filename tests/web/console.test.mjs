// The console: every method as a form.
import assert from "node:assert/strict";
import { execFile } from "node:child_process";
import { readFile } from "node:fs/promises";
import path from "node:path";
import test from "node:test";
import { promisify } from "node:util";
import { Host, open, ROOT } from "./support.mjs";

const run = promisify(execFile);

async function send(page, method, params = {}) {
  await page.getByLabel("Method").selectOption(method);
  await page.getByLabel("session_id").waitFor();
  for (const [name, value] of Object.entries(params)) await page.getByRole("textbox", { name, exact: false }).first().fill(value);
  await page.getByRole("button", { name: "Send" }).click();
}

test("has a form with the parameters of each of the 26 methods", async () => {
  const { methods } = JSON.parse(await readFile(path.join(ROOT, "docs/openrpc.json"), "utf8"));
  assert.equal(methods.length, 26);
  const page = await open(await Host.start(), "#/console");
  for (const method of methods) {
    await page.getByLabel("Method").selectOption(method.name);
    await page.getByText(method.summary, { exact: true }).waitFor();
    assert.deepEqual(await page.locator(".param label").evaluateAll((labels) => labels.map((label) => label.htmlFor)),
      method.params.map((param) => `param-${param.name}`));
  }
  assert.deepEqual(page.errors, []);
});

test("sends a request with values of the right types and shows the answer", async () => {
  const page = await open(await Host.start(), "#/console");
  await page.getByLabel("Method").selectOption("readRegister");
  await page.locator("#param-address").fill("0");
  await page.locator("#param-size").selectOption("32");
  await page.locator("#param-device").fill("Mod1");
  await page.getByRole("button", { name: "Send" }).click();
  await page.locator("pre.answer", { hasText: '"data": 826560333' }).waitFor();
  assert.match(await page.locator(".result pre").first().innerText(), /"address":0,"size":32,"device":"Mod1"/);
});

test("explains an error from the catalogue", async () => {
  const page = await open(await Host.start(), "#/console");
  await page.getByLabel("Method").selectOption("getProperty");
  await page.locator("#param-property").fill("No.Such");
  await page.locator("#param-devices").fill("Mod1");
  await page.getByRole("button", { name: "Send" }).click();
  const alert = page.locator(".result [role=alert]");
  await alert.getByText("qitrmcsim_unknownProperty").waitFor();
  assert.match(await alert.innerText(), /-250964 .*The resource has no property of this name\./s);
});

test("copies a request that does the same in a shell and in Python", async () => {
  const host = await Host.start();
  const page = await open(host, "#/console", { permissions: ["clipboard-read", "clipboard-write"] });
  await page.getByLabel("Method").selectOption("setProperty");
  await page.locator("#param-property").fill("Dev.Comment");
  await page.locator("#param-value").fill("it's $HOME \"quoted\" 😀 \\n");
  await page.locator("#param-devices").fill("Mod1");
  await page.getByRole("button", { name: "Send" }).click();
  await page.locator("pre.answer", { hasText: "String" }).waitFor();
  const copied = async (button) => {
    await page.getByRole("button", { name: button }).click();
    return page.evaluate(() => navigator.clipboard.readText());
  };
  for (const [button, program, flag] of [["Copy as curl", "sh", "-c"], ["Copy as Python", "/usr/bin/python3", "-c"]]) {
    const { result: { session_id } } = await host.call("initializeSession");
    await host.call("setProperty", { session_id, property: "Dev.Comment", devices: "Mod1", value: "" });
    const { stdout } = await run(program, [flag, await copied(button)]);
    assert.match(stdout, /"data_type":"String"/);
    assert.equal(await host.value("Dev.Comment", { devices: "Mod1" }), "it's $HOME \"quoted\" 😀 \\n");
  }
});

test("keeps a history that brings a request back", async () => {
  const page = await open(await Host.start(), "#/console");
  await send(page, "getProperty", { property: "Sys.Devices" });
  await page.locator("pre.answer", { hasText: "Mod5" }).waitFor();
  await send(page, "getSessionPropertyList");
  await page.locator("pre.answer", { hasText: "Session.Timeout" }).waitFor();
  await page.locator(".history button", { hasText: "getProperty" }).click();
  await page.locator("pre.answer", { hasText: "Mod5" }).waitFor();
  assert.equal(await page.locator("#param-property").inputValue(), "Sys.Devices");
});
