// Registers and NVMEM.
import assert from "node:assert/strict";
import { readFile, writeFile } from "node:fs/promises";
import path from "node:path";
import test from "node:test";
import { Host, open, temporaryFolder } from "./support.mjs";

async function readRegisters(page, address, width, count) {
  await page.getByLabel("Address").fill(address);
  await page.getByLabel("Width").selectOption(width);
  await page.getByLabel("Count").fill(count);
  await page.getByRole("button", { name: "Read registers" }).click();
}

const row = (page, address) => page.locator("table.registers tbody tr", { hasText: address });

async function bytesOf(host, nvmem_area, address, size) {
  const { result: { session_id } } = await host.call("initializeSession");
  const { result } = await host.call("getNvmemBytes", { session_id, nvmem_area, address, size });
  await host.call("closeSession", { session_id });
  return result.data;
}

const byteAt = (page, address) => page.getByLabel(`Byte at ${address}`, { exact: true });

test("reads registers in hexadecimal and decimal", async () => {
  const page = await open(await Host.start(), "#/module/Mod1/registers");
  await readRegisters(page, "0x0", "32", "2");
  await row(page, "0x00000000").getByText("0x31444F4D", { exact: true }).waitFor();
  await row(page, "0x00000000").getByText("826560333", { exact: true }).waitFor();
  await row(page, "0x00000004").getByText("0x0C105100", { exact: true }).waitFor();
  assert.deepEqual(page.errors, []);
});

test("writes a register of 64 bits with all its digits", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1/registers");
  await readRegisters(page, "256", "64", "1");
  await page.getByLabel("Write 0x00000100").fill("18446744073709551615");
  await page.getByLabel("Write 0x00000100").press("Enter");
  await row(page, "0x00000100").getByText("0xFFFFFFFFFFFFFFFF").waitFor();
  await row(page, "0x00000100").getByText("18446744073709551615", { exact: true }).waitFor();
});

test("refuses a value that is too wide, and shows the service's words for a register that is not there", async () => {
  const page = await open(await Host.start(), "#/module/Mod1/registers");
  await readRegisters(page, "0x100", "8", "1");
  await page.getByLabel("Write 0x00000100").fill("256");
  await page.getByLabel("Write 0x00000100").press("Enter");
  await row(page, "0x00000100").getByText("Allowed: 0 to 255.").waitFor();
  await readRegisters(page, "0x200", "32", "1");
  await row(page, "0x00000200").getByText("The device has no register of this size at this address.").waitFor();
});

test("watches a register and marks what changes", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1/registers");
  await readRegisters(page, "0x100", "8", "2");
  await page.getByLabel("Watch 0x00000101").check();
  const { result: { session_id } } = await host.call("initializeSession");
  const changed = row(page, "0x00000101").getByText("changed").waitFor();
  await host.call("writeRegister", { session_id, device: "Mod1", address: 257, size: 8, data: 90 });
  await changed;
  await row(page, "0x00000101").getByText("0x5A").waitFor();
  assert.equal(await row(page, "0x00000100").getByText("changed").count(), 0);
});

test("edits bytes, marks what is not written or committed, and keeps them over a restart", async () => {
  const state = path.join(await temporaryFolder(), "state");
  const host = await Host.start(["--state", state]);
  const page = await open(host, "#/module/Mod1/memory");
  await byteAt(page, "0010").fill("48");
  await page.keyboard.type("69");
  await page.getByText("2 bytes not written").waitFor();
  assert.match(await page.locator("table.hex tr").nth(1).locator(".text").innerText(), /^Hi·/);
  await page.getByRole("button", { name: "Write", exact: true }).click();
  await page.getByText("Written bytes wait for a commit.").waitFor();
  await page.getByRole("button", { name: "Commit" }).click();
  await page.getByText("Written bytes wait for a commit.").waitFor({ state: "detached" });
  await host.stop();
  const again = await Host.start(["--state", state], host.port);
  assert.deepEqual(await bytesOf(again, "Mod1/user", 15, 4), [0, 0x48, 0x69, 0]);
});

test("asks for serial number and password where the area wants them", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1/memory");
  await page.getByLabel("Area").selectOption("Mod1/calibration");
  await byteAt(page, "0000").fill("FF");
  await page.getByRole("button", { name: "Write", exact: true }).click();
  await page.getByText("The serial number").waitFor();
  await page.getByLabel("Serial number").fill("0C5110B1");
  await page.getByLabel("Password").fill("calibrate");
  await page.getByRole("button", { name: "Write", exact: true }).click();
  await page.getByText("Written bytes wait for a commit.").waitFor();
  assert.deepEqual(await bytesOf(host, "Mod1/calibration", 0, 3), [255, 1, 2]);
});

test("imports and exports files", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1/memory");
  const file = path.join(await temporaryFolder(), "bytes.bin");
  await writeFile(file, Buffer.from([0, 1, 2, 255]));
  await page.getByLabel("Import").setInputFiles(file);
  await page.getByText("3 bytes not written").waitFor();
  await page.getByRole("button", { name: "Write", exact: true }).click();
  await page.getByText("Written bytes wait for a commit.").waitFor();
  const [saved] = await Promise.all([page.waitForEvent("download"), page.getByRole("button", { name: "Export" }).click()]);
  assert.equal(saved.suggestedFilename(), "Mod1-user.bin");
  const bytes = await readFile(await saved.path());
  assert.equal(bytes.length, 256);
  assert.deepEqual([...bytes.subarray(0, 5)], [0, 1, 2, 255, 0]);
  await writeFile(file, Buffer.alloc(257));
  await page.getByLabel("Import").setInputFiles(file);
  await page.getByText("The file is longer than the area, which has 256 bytes.").waitFor();
});

test("does not let an area be edited that cannot be written", async () => {
  const page = await open(await Host.start(), "#/module/Mod5/memory");
  await page.getByLabel("Area").selectOption("Mod5/calibration");
  await page.getByText("read only").waitFor();
  assert.equal(await byteAt(page, "0000").getAttribute("readonly"), "");
});
