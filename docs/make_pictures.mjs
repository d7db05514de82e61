// Takes the pictures of docs/page.md: node docs/make_pictures.mjs [FOLDER]
// Needs a build of the service in build/dev (or QITRMC_BUILD_DIR) and its page beside it, as the tests do.
import path from "node:path";
import test from "node:test";
import { Host, open, ROOT } from "../tests/web/support.mjs";

const FOLDER = path.resolve(process.argv[2] ?? path.join(ROOT, "docs/pictures"));
const SIZES = {
  wide: { viewport: { width: 1280, height: 800 }, colorScheme: "light" },
  tablet: { viewport: { width: 820, height: 1000 }, colorScheme: "dark" },
  phone: { viewport: { width: 360, height: 740 }, colorScheme: "light" },
};
const RAMP = 6000; // milliseconds that a plot runs before its picture is taken

async function plot(page) {
  for (const [resource, property] of [["Mod2/ch0", "PSU.MeasuredVoltage"], ["Mod1/ch1", "DMM.Voltage"]]) {
    await page.getByLabel("Device or channel").selectOption(resource);
    await page.getByLabel(property).check();
  }
  await page.getByLabel("Window").selectOption("10");
}

// Two voltages that go up and down while they are plotted.
async function moveVoltages(host) {
  const { result: { session_id } } = await host.call("initializeSession", { physical_channels: "Mod2/ch0:1" });
  const end = Date.now() + RAMP;
  await host.call("setProperty", { session_id, property: "PSU.OutputEnabled", value: [true, true] });
  while (Date.now() < end) {
    const turn = (end - Date.now()) / 1000;
    const value = [6 + 5 * Math.sin(turn * 2), 4 + 2 * Math.cos(turn * 3)];
    await host.call("setProperty", { session_id, property: "PSU.Voltage", value });
    await new Promise((resolve) => setTimeout(resolve, 30));
  }
  await host.call("closeSession", { session_id });
}

const VIEWS = {
  chassis: async (page, host) => {
    await host.call("initializeSession", { devices: "Mod4" });
    await page.getByText("In use").waitFor();
  },
  module: async (page, host) => {
    await page.goto(`${host.url}/#/module/Mod1`);
    const field = page.getByLabel("Mod1 DMM.ApertureTime", { exact: true });
    await field.fill("0.5");
    await field.press("Enter");
    await page.getByText("1 change waits for a commit.").waitFor();
    await page.getByLabel("Mod1 DMM.Range", { exact: true }).fill("2000");
    await page.evaluate(() => scrollTo(0, 0));
  },
  plots: async (page, host) => {
    await page.goto(`${host.url}/#/plots`);
    await plot(page);
    await moveVoltages(host);
  },
  console: async (page, host) => {
    await page.goto(`${host.url}/#/console`);
    await page.getByLabel("Method").selectOption("getProperty");
    await page.locator("#param-property").fill("Dev.Temperature");
    await page.locator("#param-devices").fill('["Bench", "Mod1"]');
    await page.getByRole("button", { name: "Send" }).click();
    await page.locator("pre.answer").waitFor();
    await page.evaluate(() => scrollTo(0, 0));
  },
  simulator: async (page, host) => {
    await page.goto(`${host.url}/#/simulator`);
    await page.getByRole("button", { name: "Pull Mod2" }).click();
    await page.getByLabel("Resource").fill("Mod1");
    await page.getByLabel("Status code").fill("-250977");
    await page.getByRole("button", { name: "Add fault" }).click();
    await page.locator(".rows code").waitFor();
    await page.locator("pre.trace").getByText("getGenericProperty").first().waitFor();
    await page.evaluate(() => scrollTo(0, 0));
  },
  memory: async (page, host) => {
    await page.goto(`${host.url}/#/module/Mod1/memory`);
    await page.getByLabel("Byte at 0010", { exact: true }).fill("48");
    await page.keyboard.type("656C6C6F");
    await page.getByText("bytes not written").waitFor();
  },
};

for (const [size, options] of Object.entries(SIZES)) {
  for (const [view, prepare] of Object.entries(VIEWS)) {
    test(`${view} ${size}`, async () => {
      const host = await Host.start();
      const page = await open(host, "", options);
      await page.locator(".slot.taken").first().waitFor();
      await prepare(page, host);
      await page.screenshot({ path: path.join(FOLDER, `${view}-${size}.png`) });
    });
  }
}
