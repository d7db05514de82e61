// How the page shares devices with others, and what it does when the service goes.
import assert from "node:assert/strict";
import test from "node:test";
import { Host, open, until } from "./support.mjs";

const range = (page) => page.getByLabel("Mod1 DMM.Range", { exact: true });

async function setRange(page, value) {
  await range(page).fill(value);
  await range(page).press("Enter");
}

// Done when the service has taken the value.
async function waitUntilSet(page) {
  await page.locator("form.value-field").filter({ has: range(page) }).getByRole("button").first().waitFor({ state: "detached" });
}

// The answer to a request that names a session tells whether it is open.
async function isOpen(host, session_id) {
  const { result } = await host.call("getProperty", { session_id, property: "Session.ReservedDevices" });
  return result !== undefined;
}

test("reserves nothing while one only looks", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await range(page).waitFor();
  const { result } = await host.call("getProperty", { session_id: "_session1", property: "Session.ReservedDevices" });
  assert.deepEqual(result.value, []);
  assert.equal((await host.call("initializeSession", { devices: "Mod1" })).error, undefined);
});

test("closes its session when the page goes", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await setRange(page, "5");
  await page.getByText("Reserved by this page").waitFor();
  assert.equal(await isOpen(host, "_session1"), true);
  await page.goto("about:blank");
  await until(async () => !(await isOpen(host, "_session1")));
});

test("says who holds a device, waits for it on demand and never takes it by force", async () => {
  const host = await Host.start();
  const { result: { session_id } } = await host.call("initializeSession", { devices: "Mod1" });
  const page = await open(host, "#/module/Mod1");
  await page.getByText(`Mod1 is in use by ${session_id}.`).waitFor();
  await setRange(page, "5");
  await page.locator("tr", { hasText: "DMM.Range" }).getByText("The device is reserved by another session.").waitFor();
  assert.equal(await isOpen(host, session_id), true);
  await page.getByRole("button", { name: "Wait for it" }).click();
  await page.getByText("Waiting for Mod1…").waitFor();
  assert.equal(await isOpen(host, session_id), true);
  await host.call("closeSession", { session_id });
  await page.getByText("Reserved by this page").waitFor();
  await page.getByRole("button", { name: "Release" }).click();
  await page.getByRole("button", { name: "Reserve" }).waitFor();
});

test("learns from a refusal who holds a device, however many sessions there were meanwhile", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await range(page).waitFor();
  await page.route("**/qitrmc/Call", (route) => route.abort());
  for (let i = 0; i < 40; ++i)
    await host.call("closeSession", { session_id: (await host.call("initializeSession")).result.session_id });
  const { result: { session_id } } = await host.call("initializeSession", { devices: "Mod1" });
  await page.unroute("**/qitrmc/Call");
  await page.getByText("Connected").waitFor();
  await setRange(page, "5");
  await page.getByText(`Mod1 is in use by ${session_id}.`).waitFor();
});

test("lets two pages take turns with a device", async () => {
  const host = await Host.start();
  const first = await open(host, "#/module/Mod1");
  await setRange(first, "5");
  await first.getByText("Reserved by this page").waitFor();
  const second = await open(host, "#/module/Mod1");
  await second.getByText(/Mod1 is in use by _session1 \(another web page\)\./).waitFor();
  await second.getByRole("button", { name: "Wait for it" }).click();
  await second.getByText("Waiting for Mod1…").waitFor();
  await first.getByRole("button", { name: "Release" }).click();
  await second.getByText("Reserved by this page").waitFor();
  await first.getByText(/Mod1 is in use by _session2/).waitFor();
  await setRange(second, "6");
  await until(async () => (await host.value("DMM.Range", { devices: "Mod1" })) === 6);
});

test("shows the loss of the service at once and heals by itself", async () => {
  const host = await Host.start();
  const page = await open(host);
  await page.getByText("Connected").waitFor();
  await host.stop();
  await page.getByText("The service does not answer.").waitFor();
  await Host.start([], host.port);
  await page.getByText("Connected").waitFor();
  await page.getByText("The service does not answer.").waitFor({ state: "detached" });
});

test("goes on after a restart of the service under an open page", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await setRange(page, "5");
  await waitUntilSet(page);
  await host.stop();
  const again = await Host.start([], host.port);
  await page.getByText("Connected").waitFor();
  await page.waitForFunction(() => document.querySelector("[aria-label='Mod1 DMM.Range']")?.value === "10");
  await setRange(page, "7");
  await until(async () => (await again.value("DMM.Range", { devices: "Mod1" })) === 7);
});

test("does not use the session of another who got its id after a restart", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await range(page).waitFor();
  await page.route("**/qitrmc/Call", (route) => route.abort());
  await host.stop();
  const again = await Host.start([], host.port);
  assert.equal((await again.call("initializeSession", { devices: "Mod1" })).result.session_id, "_session1");
  await page.unroute("**/qitrmc/Call");
  await page.getByText("Mod1 is in use by _session1.").waitFor();
});
