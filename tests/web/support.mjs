// A browser and hosts for the tests of the page. What a test starts ends with it.
import { spawn } from "node:child_process";
import { mkdtemp, rm, writeFile } from "node:fs/promises";
import { createRequire } from "node:module";
import os from "node:os";
import path from "node:path";
import readline from "node:readline";
import { after, afterEach } from "node:test";

export const ROOT = path.resolve(import.meta.dirname ?? path.dirname(new URL(import.meta.url).pathname), "../..");
export const BUILD = path.resolve(process.env.QITRMC_BUILD_DIR ?? path.join(ROOT, "build/dev"));
export const PAGE = path.resolve(process.env.QITRMC_PAGE ?? path.join(BUILD, "share/web"));
const require = createRequire(path.join(ROOT, "web/package.json"));
export const axeSource = () => require.resolve("axe-core/axe.min.js");

// Far more than anything here takes on a busy machine.
export const PATIENCE = 30_000;
// Chromium without its windows, which takes half of the processor time.
const CHROMIUM = "/usr/bin/chromium-headless-shell";
// Draws without a process of its own for that, and looks for nothing outside of the machine.
const SWITCHES = ["--disable-gpu", "--disable-software-rasterizer", "--in-process-gpu",
  "--disable-quic", "--no-first-run", "--disable-background-networking", "--disable-component-update", "--disable-sync"];

const started = [];
let browser = null;

afterEach(async () => {
  for (const end of started.splice(0).reverse()) await end();
});

after(() => browser?.close());

export async function temporaryFolder() {
  const folder = await mkdtemp(path.join(os.tmpdir(), "qitrmc-web-"));
  started.push(() => rm(folder, { recursive: true, force: true }));
  return folder;
}

export class Host {
  // port: "0" takes a free one
  static async start(options = [], port = "0") {
    const host = new Host();
    host.options = options;
    host.process = spawn(path.join(BUILD, "bin/qitrmc-host"),
      ["--listen", `127.0.0.1:${port}`, "--web", PAGE, ...options], { stdio: ["ignore", "pipe", "inherit"] });
    host.ended = new Promise((resolve) => host.process.once("exit", resolve));
    started.push(() => host.kill());
    const lines = readline.createInterface({ input: host.process.stdout });
    const first = await new Promise((resolve, reject) => {
      lines.once("line", resolve);
      host.process.once("exit", (code) => reject(new Error(`the host ended with ${code}`)));
    });
    host.url = first.replace("Listening on ", "").replace("/qitrmc/Call", "");
    host.port = new URL(host.url).port;
    return host;
  }

  async stop() {
    this.process.kill("SIGTERM");
    return this.ended;
  }

  async kill() {
    this.process.kill("SIGKILL");
    await this.ended;
  }

  async call(method, params = {}) {
    const response = await fetch(`${this.url}/qitrmc/Call`, {
      method: "POST", body: JSON.stringify({ jsonrpc: "2.0", id: 1, method, params }) });
    return response.json();
  }

  // The value of a property, as another client of the service reads it.
  async value(property, resources) {
    const { result: { session_id } } = await this.call("initializeSession");
    const answer = await this.call("getProperty", { session_id, property, ...resources });
    await this.call("closeSession", { session_id });
    return answer.result?.value;
  }
}

export async function newBrowser() {
  const { chromium } = require("playwright-core");
  browser ??= await chromium.launch({ executablePath: CHROMIUM, args: SWITCHES, chromiumSandbox: false });
  return browser;
}

// A page of its own, in English, that remembers what went wrong in it.
export async function open(host, address = "", options = {}) {
  const context = await (await newBrowser()).newContext({ locale: "en-GB", viewport: { width: 1280, height: 900 }, ...options });
  started.push(() => context.close());
  const page = await context.newPage();
  page.setDefaultTimeout(PATIENCE);
  page.errors = [];
  page.on("pageerror", (error) => page.errors.push(String(error)));
  page.on("console", (message) => { if (/Content Security Policy/.test(message.text())) page.errors.push(message.text()); });
  await page.goto(host.url + "/" + address);
  return page;
}

// A chassis file of its own in a temporary folder.
export async function chassisFile(description) {
  const file = path.join(await temporaryFolder(), "chassis.json");
  await writeFile(file, JSON.stringify(description));
  return file;
}

// Waits for a condition that no part of the page shows.
export async function until(condition) {
  const end = Date.now() + PATIENCE;
  while (Date.now() < end) {
    const value = await condition();
    if (value) return value;
    await new Promise((resolve) => setTimeout(resolve, 20));
  }
  throw new Error("the condition was not met in time");
}
