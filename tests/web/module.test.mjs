// One module: properties, channels and commands.
import assert from "node:assert/strict";
import test from "node:test";
import { Host, open } from "./support.mjs";

const field = (page, name) => page.getByLabel(name, { exact: true });
const formOf = (page, name) => page.locator("form.value-field").filter({ has: field(page, name) });

test("shows a property with its description, type, limits and unit", async () => {
  const page = await open(await Host.start(), "#/module/Mod1");
  const row = page.locator("tr", { hasText: "DMM.Range" });
  await row.getByText("The largest value that can be measured.").waitFor();
  await row.getByText("Double · 0.1 … 1000 · V").waitFor();
  await field(page, "Mod1 DMM.Range").and(page.locator(":enabled")).waitFor();
  assert.equal(await field(page, "Mod1 DMM.Range").inputValue(), "10");
  assert.deepEqual(await field(page, "Mod1 DMM.Function").locator("option").allInnerTexts(),
    ["Voltage", "Current", "Resistance", "Temperature"]);
  assert.deepEqual(page.errors, []);
});

test("finds properties by name and description", async () => {
  const page = await open(await Host.start(), "#/module/Mod1");
  await page.getByRole("searchbox").fill("time from trigger");
  await page.waitForFunction(() => document.querySelectorAll("main tbody tr").length === 1);
  assert.match(await page.locator("main tbody tr").innerText(), /DMM\.TriggerDelay/);
});

test("sets a value with either decimal sign", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  for (const [typed, value] of [["2.5", 2.5], ["7,25", 7.25]]) {
    await field(page, "Mod1 DMM.Range").fill(typed);
    await field(page, "Mod1 DMM.Range").press("Enter");
    await formOf(page, "Mod1 DMM.Range").getByRole("button").first().waitFor({ state: "detached" });
    assert.equal(await host.value("DMM.Range", { devices: "Mod1" }), value);
  }
});

test("checks an entry before it sends it", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  const set = formOf(page, "Mod1 DMM.Range").getByRole("button", { name: "Set" });
  for (const [typed, words] of [["1000.5", "Allowed: 0.1 to 1000."], ["twelve", "This is not a number."]]) {
    await field(page, "Mod1 DMM.Range").fill(typed);
    await formOf(page, "Mod1 DMM.Range").getByText(words).waitFor();
    assert.equal(await set.isDisabled(), true);
  }
  await field(page, "Mod1 DMM.Range").press("Escape");
  await set.waitFor({ state: "detached" });
  await field(page, "Mod1 DMM.Range").and(page.locator(":enabled")).waitFor();
  assert.equal(await field(page, "Mod1 DMM.Range").inputValue(), "10");
});

test("shows at the field in the service's own words why it refuses a value", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await field(page, "Mod1 Dev.Comment").fill("a".repeat(70));
  await host.call("initializeSession");
  await page.route("**/qitrmc/Call", async (route) => {
    const body = JSON.parse(route.request().postData());
    if (body.method === "setProperty") body.params.value = 5;
    await route.continue({ postData: JSON.stringify(body) });
  });
  await formOf(page, "Mod1 Dev.Comment").getByRole("button", { name: "Set" }).click();
  await formOf(page, "Mod1 Dev.Comment").getByText("The value does not have the data type of the property.").waitFor();
});

test("commits what is pending", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await field(page, "Mod1 DMM.ApertureTime").fill("0.5");
  await field(page, "Mod1 DMM.ApertureTime").press("Enter");
  await page.getByText("1 change waits for a commit.").waitFor();
  assert.equal(await host.value("DMM.ApertureTime", { devices: "Mod1" }), 0.02);
  await page.getByRole("button", { name: "Commit" }).click();
  await page.getByText("1 change waits for a commit.").waitFor({ state: "detached" });
  assert.equal(await host.value("DMM.ApertureTime", { devices: "Mod1" }), 0.5);
});

test("takes back what is pending", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await field(page, "Mod1 DMM.ApertureTime").fill("0.5");
  await field(page, "Mod1 DMM.ApertureTime").press("Enter");
  await page.getByRole("button", { name: "Take back" }).click();
  await page.getByText("1 change waits for a commit.").waitFor({ state: "detached" });
  assert.equal(await host.value("DMM.ApertureTime", { devices: "Mod1" }), 0.02);
});

test("keeps all digits of a number of 64 bits", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  await page.getByText("0; 18446744073709551615").waitFor();
  await page.getByText("-1; 0; 9223372036854775807").waitFor();
});

test("sets arrays, texts and items of an enumeration", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  const set = async (name, enter) => {
    await enter(field(page, name));
    await formOf(page, name).getByRole("button", { name: "Set" }).click();
    await formOf(page, name).getByRole("button").first().waitFor({ state: "detached" });
  };
  await set("Mod1 DMM.Trims", (input) => input.fill("1; -2; 3; 4"));
  await set("Mod1 DMM.Labels", (input) => input.fill("a;b\nc"));
  await set("Mod1 DMM.Function", (input) => input.selectOption("Temperature"));
  await set("Mod1 DMM.AutoRange", (input) => input.selectOption("Off"));
  assert.deepEqual(await host.value("DMM.Trims", { devices: "Mod1" }), [1, -2, 3, 4]);
  assert.deepEqual(await host.value("DMM.Labels", { devices: "Mod1" }), ["a;b", "c"]);
  assert.equal(await host.value("DMM.Function", { devices: "Mod1" }), 10);
  assert.equal(await host.value("DMM.AutoRange", { devices: "Mod1" }), false);
});

test("shows channels side by side and sets one of them", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod2/channels");
  await field(page, "Mod2/ch1 PSU.Voltage").fill("12,5");
  await field(page, "Mod2/ch1 PSU.Voltage").press("Enter");
  await formOf(page, "Mod2/ch1 PSU.Voltage").getByRole("button").first().waitFor({ state: "detached" });
  assert.deepEqual(await host.value("PSU.Voltage", { physical_channels: "Mod2/ch0:1" }), [0, 12.5]);
});

test("carries out a command and says how long it took", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1/commands");
  await page.getByRole("button", { name: "Run DMM.SelfTest" }).click();
  await page.getByText(/^Done in 0\.\d\d s$/).waitFor();
  assert.equal(await host.value("Dev.Comment", { devices: "Mod1" }), "self test passed");
});

test("shows that a long command goes on and stops it", async () => {
  const page = await open(await Host.start(), "#/module/Mod1/commands");
  await page.getByRole("button", { name: "Run DMM.Calibrate" }).click();
  await page.getByRole("progressbar", { name: "DMM.Calibrate" }).waitFor();
  await page.getByRole("button", { name: "Stop" }).click();
  await page.locator(".command", { hasText: "DMM.Calibrate" }).getByRole("alert").waitFor();
  await page.getByRole("button", { name: "Run DMM.Calibrate" }).waitFor();
});

test("shows why a command of a channel fails", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod2/commands");
  await page.getByRole("combobox", { name: "On" }).selectOption("Mod2/ch0");
  await page.getByRole("button", { name: "Run PSU.On" }).click();
  await page.getByText(/^Done in/).waitFor();
  await page.getByRole("button", { name: "Run PSU.Calibrate" }).click();
  await page.locator(".command", { hasText: "PSU.Calibrate" }).getByRole("alert").waitFor();
  assert.match(await page.locator(".command", { hasText: "PSU.Calibrate" }).getByRole("alert").innerText(), /PSU\.Calibrate/);
});
