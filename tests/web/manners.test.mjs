// Sizes, languages, the keyboard and programs that read the screen out.
import assert from "node:assert/strict";
import { readFile } from "node:fs/promises";
import test from "node:test";
import { axeSource, Host, open } from "./support.mjs";

const SCREENS = ["", "#/module/Mod1", "#/module/Mod2/channels", "#/module/Mod1/commands", "#/module/Mod1/registers",
  "#/module/Mod1/memory", "#/plots", "#/console", "#/simulator"];
const CONTENT = { "": ".slot.taken", "#/module/Mod1": "tbody tr", "#/module/Mod2/channels": "tbody tr",
  "#/module/Mod1/commands": ".command", "#/module/Mod1/registers": "form.toolbar", "#/module/Mod1/memory": ".byte",
  "#/plots": ".chooser .check", "#/console": ".param", "#/simulator": ".rows li" };

async function show(page, host, screen) {
  await page.goto(`${host.url}/${screen}`);
  await page.locator(CONTENT[screen]).first().waitFor();
}

// What is wider than the page, apart from what scrolls by itself.
function overflow(page) {
  return page.evaluate(() => document.documentElement.scrollWidth - document.documentElement.clientWidth);
}

// Buttons and links whose words do not fit into them.
function clipped(page) {
  return page.evaluate(() => [...document.querySelectorAll("button, nav a, .chip, h1, h2, .slot a")]
    .filter((element) => element.scrollWidth > element.clientWidth + 1 && element.clientWidth > 0).map((element) => element.innerText));
}

test("fits into 360 pixels in every language", async () => {
  const host = await Host.start();
  const page = await open(host, "", { viewport: { width: 360, height: 740 } });
  for (const language of ["eng", "deu", "fra", "jpn", "kor", "chs"]) {
    await page.locator("select.language").selectOption(language);
    for (const screen of SCREENS) {
      await show(page, host, screen);
      assert.equal(await overflow(page), 0, `${language} ${screen}`);
      assert.deepEqual(await clipped(page), [], `${language} ${screen}`);
    }
  }
});

test("speaks each of the six languages and remembers the choice", async () => {
  const host = await Host.start();
  const page = await open(host, "#/module/Mod1");
  const words = { eng: ["en", "Properties"], deu: ["de", "Eigenschaften"], fra: ["fr", "Propriétés"], jpn: ["ja", "プロパティ"],
    kor: ["ko", "속성"], chs: ["zh", "属性"] };
  for (const [language, [tag, properties]] of Object.entries(words)) {
    await page.locator("select.language").selectOption(language);
    await page.locator(".tabs").getByText(properties, { exact: true }).waitFor();
    assert.equal(await page.locator("html").getAttribute("lang"), tag);
  }
  await page.reload();
  await page.locator(".tabs").getByText("属性", { exact: true }).waitFor();
});

test("begins in the language of the browser", async () => {
  const page = await open(await Host.start(), "", { locale: "fr-CA" });
  await page.getByRole("heading", { name: "Châssis" }).waitFor();
});

test("has nothing serious for programs that read the screen out, in dark and light", async () => {
  const host = await Host.start();
  const axe = await readFile(axeSource(), "utf8");
  for (const colorScheme of ["light", "dark"]) {
    const page = await open(host, "", { colorScheme });
    for (const screen of SCREENS) {
      await show(page, host, screen);
      await page.evaluate(axe);
      const { violations } = await page.evaluate(() => globalThis.axe.run(document));
      const serious = violations.filter(({ impact }) => ["serious", "critical"].includes(impact));
      assert.deepEqual(serious.map(({ id, nodes }) => [id, nodes[0].html]), [], `${colorScheme} ${screen}`);
    }
  }
});

test("can be used by keyboard alone from the chassis to a committed property", async () => {
  const host = await Host.start();
  const page = await open(host);
  await page.locator(".slot.taken").first().waitFor();
  const tabTo = async (condition) => {
    for (let i = 0; i < 200; ++i) {
      await page.keyboard.press("Tab");
      if (await page.evaluate(condition)) return;
    }
    throw new Error("not reached");
  };
  await tabTo(() => document.activeElement.innerText?.includes("Multimeter"));
  await page.keyboard.press("Enter");
  await page.getByLabel("Mod1 DMM.ApertureTime", { exact: true }).waitFor();
  await tabTo(() => document.activeElement.ariaLabel === "Mod1 DMM.ApertureTime");
  await page.keyboard.press("Control+A");
  await page.keyboard.type("0,25");
  await page.keyboard.press("Enter");
  await page.getByText("1 change waits for a commit.").waitFor();
  for (let i = 0; i < 200; ++i) {
    await page.keyboard.press("Shift+Tab");
    if (await page.evaluate(() => document.activeElement.innerText === "Commit")) break;
  }
  await page.keyboard.press("Enter");
  await page.getByText("1 change waits for a commit.").waitFor({ state: "detached" });
  assert.equal(await host.value("DMM.ApertureTime", { devices: "Mod1" }), 0.25);
});
