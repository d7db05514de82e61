// Bundles the page into a folder: node build.mjs FOLDER. The names of program and styles hold a hash
// of their content, so that browsers may keep them.
import { build } from "esbuild";
import { copyFile, mkdir, readFile, rm, writeFile } from "node:fs/promises";
import path from "node:path";

const here = path.dirname(new URL(import.meta.url).pathname);
const folder = path.resolve(process.argv[2] ?? "../build/web");

await rm(path.join(folder, "assets"), { recursive: true, force: true });
await mkdir(folder, { recursive: true });
const { metafile } = await build({
  absWorkingDir: here,
  entryPoints: { app: "src/main.tsx" },
  bundle: true,
  minify: true,
  metafile: true,
  format: "esm",
  target: "es2022",
  jsx: "automatic",
  jsxImportSource: "preact",
  charset: "utf8",
  legalComments: "inline",
  entryNames: "[name]-[hash]",
  outdir: path.join(folder, "assets"),
});
const outputs = Object.keys(metafile.outputs).map((name) => path.basename(name));
const page = (await readFile(path.join(here, "index.html"), "utf8"))
  .replace("app.js", outputs.find((name) => name.endsWith(".js")))
  .replace("app.css", outputs.find((name) => name.endsWith(".css")));
await writeFile(path.join(folder, "index.html"), page);
await copyFile(path.join(here, "icon.svg"), path.join(folder, "icon.svg"));
await copyFile(path.join(here, "../docs/openrpc.json"), path.join(folder, "openrpc.json"));
