// Numbers as they move.
import assert from "node:assert/strict";
import { readFile } from "node:fs/promises";
import test from "node:test";
import { Host, open } from "./support.mjs";

async function plot(page, resource, property) {
  await page.getByLabel("Device or channel").selectOption(resource);
  await page.getByLabel(property).check();
}

const samples = (page) => page.evaluate(() => document.querySelector(".plot canvas")?.toDataURL());

test("draws several properties that move, and stops at a pause", async () => {
  const page = await open(await Host.start(), "#/plots");
  await plot(page, "Mod1", "Dev.Temperature");
  await plot(page, "Mod2/ch0", "PSU.MeasuredVoltage");
  await page.locator(".u-legend").getByText("Mod2/ch0 PSU.MeasuredVoltage").waitFor();
  const before = await samples(page);
  await page.waitForFunction((old) => document.querySelector(".plot canvas").toDataURL() !== old, before);
  await page.getByRole("button", { name: "Pause" }).click();
  await page.getByRole("button", { name: "Go on" }).waitFor();
  assert.deepEqual(page.errors, []);
});

test("gives the values away as CSV and the drawing as PNG", async () => {
  const page = await open(await Host.start(), "#/plots");
  await plot(page, "Mod1", "Dev.Temperature");
  await page.waitForFunction(() => /\d\d\.\d+ °C/.test(document.querySelector(".u-legend")?.innerText ?? "") ||
    document.querySelector(".plot canvas"));
  const [csv] = await Promise.all([page.waitForEvent("download"), page.getByRole("button", { name: "CSV" }).click()]);
  assert.equal(csv.suggestedFilename(), "plot.csv");
  const lines = (await readFile(await csv.path(), "utf8")).split("\r\n");
  assert.equal(lines[0], '"time","Mod1 Dev.Temperature [°C]"');
  const [png] = await Promise.all([page.waitForEvent("download"), page.getByRole("button", { name: "PNG" }).click()]);
  assert.deepEqual([...(await readFile(await png.path())).subarray(0, 8)], [0x89, 0x50, 0x4e, 0x47, 0x0d, 0x0a, 0x1a, 0x0a]);
});

test("goes on recording while another screen is shown", async () => {
  const page = await open(await Host.start(), "#/plots");
  await plot(page, "Mod1", "Dev.Temperature");
  await page.locator(".plot").waitFor();
  await page.getByRole("link", { name: "Console" }).click();
  await page.waitForResponse((response) => response.request().postData()?.includes("Dev.Temperature\",\"devices\":[\"Mod1\"]"));
  await page.getByRole("link", { name: "Plots" }).click();
  await page.locator(".u-legend").getByText("Mod1 Dev.Temperature").waitFor();
  assert.equal(await page.getByLabel("Device or channel").isVisible(), true);
});
