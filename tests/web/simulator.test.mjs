// The panel of the simulated chassis.
import assert from "node:assert/strict";
import test from "node:test";
import { Host, open, until } from "./support.mjs";

const moduleRow = (page, name) => page.locator(".rows li").filter({ has: page.getByText(name, { exact: true }) });

async function openPanel(options = []) {
  const host = await Host.start(options);
  const page = await open(host);
  await page.getByRole("link", { name: "Simulator" }).click();
  await moduleRow(page, "Mod2").getByText("Ready").waitFor();
  return { host, page };
}

test("is not offered where the host has no panel", async () => {
  const page = await open(await Host.start(["--no-panel"]));
  await page.locator(".slot.taken").first().waitFor();
  await page.waitForLoadState("networkidle").catch(() => {});
  assert.equal(await page.getByRole("link", { name: "Simulator" }).count(), 0);
});

test("pulls a module and puts it back", async () => {
  const { host, page } = await openPanel();
  const chassis = await open(host);
  const slot = chassis.locator(".slots > li").nth(1);
  await slot.getByText("Power supply").waitFor();
  await page.getByRole("button", { name: "Pull Mod2" }).click();
  await moduleRow(page, "Mod2").getByText("Pulled").waitFor();
  await slot.getByText("Empty").waitFor();
  await page.getByRole("button", { name: "Put back Mod2" }).click();
  await moduleRow(page, "Mod2").getByText("Ready").waitFor();
  await slot.getByText("Power supply").waitFor();
  assert.deepEqual(page.errors, []);
});

test("cuts the connection of a module", async () => {
  const { host, page } = await openPanel();
  await page.getByRole("button", { name: "Cut connection Mod1" }).click();
  await moduleRow(page, "Mod1").getByText("Not answering").waitFor();
  assert.equal(await host.value("Dev.ProductName", { devices: "Mod1" }), undefined);
});

test("strikes a fault and clears it", async () => {
  const { host, page } = await openPanel();
  const range = () => host.value("DMM.Range", { devices: "Mod1" });
  assert.equal(await range(), 10);
  await page.getByLabel("Function").fill("getGenericPropertyDouble");
  await page.getByLabel("Resource").fill("Mod1");
  await page.getByRole("button", { name: "Add fault" }).click();
  await page.locator(".rows code", { hasText: "getGenericPropertyDouble" }).waitFor();
  assert.equal(await range(), undefined);
  await page.getByRole("button", { name: "Clear" }).click();
  await page.locator(".rows code").waitFor({ state: "detached" });
  await until(async () => (await range()) === 10);
});

test("shows why a fault is refused", async () => {
  const { page } = await openPanel();
  await page.getByLabel("Resource").fill("Mod9");
  await page.getByRole("button", { name: "Add fault" }).click();
  await page.locator("form .fault", { hasText: "/faults/0/resource" }).waitFor();
  assert.equal(await page.locator(".rows code").count(), 0);
});

test("follows the trace live, and stops at a pause", async () => {
  const { host, page } = await openPanel();
  const trace = page.locator("pre.trace");
  const scratch = async (address) => {
    const { result: { session_id } } = await host.call("initializeSession");
    await host.call("readRegister", { session_id, device: "Mod1", address, size: 8 });
    await host.call("closeSession", { session_id });
  };
  await trace.getByText("getSystemPropertyStringArray").waitFor();
  await scratch(300);
  await trace.getByText(/readRegisterUInt8\(session=\d+, device="Mod1", address=300/).waitFor();
  await page.getByRole("button", { name: "Pause" }).click();
  await page.getByRole("button", { name: "Go on" }).waitFor();
  await scratch(301);
  const response = page.waitForResponse(/simulator\/devices/); // the panel goes on otherwise
  await response;
  assert.equal(await trace.getByText(/address=301/).count(), 0);
  await page.getByRole("button", { name: "Go on" }).click();
  await trace.getByText(/address=301/).waitFor();
});

test("names the registers that the chassis file describes", async () => {
  const page = await open(await Host.start(), "#/module/Mod1/registers");
  await page.getByRole("button", { name: "Identification" }).click();
  const rows = page.locator("table.registers tbody tr");
  await rows.nth(3).waitFor();
  const names = await rows.evaluateAll((all) => all.map((row) => row.cells[1].firstChild.data + (row.cells[1].childNodes[1]?.data ?? "")));
  assert.deepEqual(names, ["Identification", "Identification + 4", "Identification + 8", "Identification + 12"]);
  await rows.nth(0).getByText("The name of the module in ASCII, and its product number.").waitFor();
});

test("has no names of registers without the panel", async () => {
  const page = await open(await Host.start(["--no-panel"]), "#/module/Mod1/registers");
  await page.getByRole("button", { name: "Read registers" }).click();
  await page.locator("table.registers tbody tr").first().waitFor();
  assert.equal(await page.locator("table.registers thead th").count(), 6);
});
