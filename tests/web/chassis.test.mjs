// The drawing of the chassis.
import assert from "node:assert/strict";
import path from "node:path";
import test from "node:test";
import { chassisFile, Host, open, ROOT } from "./support.mjs";

test("shows each module in its slot and empty slots as empty", async () => {
  const page = await open(await Host.start());
  const slots = page.locator(".slots > li");
  await slots.nth(4).waitFor();
  assert.deepEqual(await slots.evaluateAll((items) => items.map((item) => item.innerText.split("\n").slice(0, 3).join("|"))),
    ["1|Mod1|Multimeter", "2|Mod2|Power supply", "3|Empty", "4|Mod4|Digitizer", "5|Mod5|Switch matrix"]);
  assert.equal(await slots.nth(3).locator(".jacks i").count(), 8);
  await page.getByText("Five-slot chassis").waitFor();
  assert.deepEqual(page.errors, []);
});

test("opens a module with a click", async () => {
  const page = await open(await Host.start());
  await page.getByRole("link", { name: "Mod2" }).click();
  await page.getByRole("heading", { level: 1, name: "Mod2" }).waitFor();
  assert.match(page.url(), /#\/module\/Mod2$/);
});

// What the page promises for changes that others make.
const TWO_SECONDS = { timeout: 2000 };

async function setEvents(host, events) {
  const { status } = await fetch(`${host.url}/simulator/faults`, { method: "POST", body: JSON.stringify({ events }) });
  assert.equal(status, 204);
}

test("shows within two seconds that a module is pulled, added or does not answer", async () => {
  const host = await Host.start();
  const page = await open(host);
  const slot = page.locator(".slots > li").nth(1);
  await slot.getByText("Power supply").waitFor();
  await setEvents(host, [{ device: "Mod2", event: "pulled" }]);
  await slot.getByText("Empty").waitFor(TWO_SECONDS);
  await page.getByText("Mod2 has been removed.").waitFor();
  await setEvents(host, []);
  await slot.getByText("Power supply").waitFor(TWO_SECONDS);
  await setEvents(host, [{ device: "Mod2", event: "connection_lost" }]);
  await slot.getByText("Not answering").waitFor(TWO_SECONDS);
});

test("shows a new name within two seconds", async () => {
  const host = await Host.start();
  const page = await open(host);
  await page.getByRole("link", { name: "Mod5" }).waitFor();
  const { result: { session_id } } = await host.call("initializeSession");
  await host.call("renameDevice", { session_id, device: "Mod5", new_device_name: "Relays" });
  await page.getByRole("link", { name: "Relays" }).waitFor(TWO_SECONDS);
});

test("shows who holds a module", async () => {
  const host = await Host.start();
  const page = await open(host);
  await page.locator(".slots > li").nth(4).waitFor();
  const { result: { session_id } } = await host.call("initializeSession", { devices: "Mod4" });
  await page.locator(".slots > li").nth(3).getByText(`In use: ${session_id}`).waitFor();
  assert.equal(await page.locator(".slots > li").nth(0).getByText("In use").count(), 0);
});

test("draws a rack of eighteen slots", async () => {
  const page = await open(await Host.start(["--chassis", path.join(ROOT, "simulator/chassis/full.json")]));
  await page.locator(".slots > li").nth(17).waitFor();
  assert.equal(await page.locator(".slots > li.taken").count(), 17);
});

test("shows names that are scripts as text", async () => {
  const name = "<img src=x onerror=alert(1)>";
  const product = "<script>document.title = 'owned'</script>";
  const file = await chassisFile({ devices: [{ name: "Rack", category: 1, modules: [{
    name, category: 2, slot: 1, values: { "Dev.ProductName": product, "Dev.SerialNum": "\"><svg onload=alert(2)>" },
    properties: { "X.<b>bold</b>": { type: "String", access: "ReadWrite", value: "<i>x</i>", description: "<script>alert(3)<\u002fscript>" } },
  }] }] });
  const page = await open(await Host.start(["--chassis", file]));
  let dialogs = 0;
  page.on("dialog", (dialog) => { ++dialogs; void dialog.dismiss(); });
  await page.getByText(product).waitFor();
  await page.locator(".slots a").click();
  await page.getByRole("heading", { level: 1, name }).waitFor();
  await page.locator(".property-name", { hasText: "X.<b>bold</b>" }).waitFor();
  assert.equal(await page.locator("main img, main svg, main script, main b").count(), 0);
  assert.equal(await page.title(), "Instrument chassis");
  assert.equal(dialogs, 0);
});
