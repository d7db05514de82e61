import type { ComponentChildren } from "preact";
import { address } from "./route.ts";
import { ChassisScreen } from "./screens/ChassisScreen.tsx";
import { ConsoleScreen } from "./screens/ConsoleScreen.tsx";
import { ModuleScreen } from "./screens/ModuleScreen.tsx";
import { PlotScreen } from "./screens/PlotScreen.tsx";
import { SimulatorScreen } from "./screens/SimulatorScreen.tsx";
import { useStore } from "./store.ts";
import { LANGUAGES, setLanguage, texts } from "./texts/texts.ts";

function screenOf(route: string[]): ComponentChildren {
  switch (route[0]) {
    case "module": return <ModuleScreen key={route[1]} name={route[1] ?? ""} part={route[2] ?? "properties"} />;
    case "plots": return <PlotScreen />;
    case "console": return <ConsoleScreen />;
    case "simulator": return <SimulatorScreen />;
    default: return <ChassisScreen />;
  }
}

function Navigation() {
  const here = useStore((state) => state.route[0] ?? "");
  const simulated = useStore((state) => state.simulated);
  const t = texts();
  const items = [["", t.chassis], ["plots", t.plots], ["console", t.console]];
  if (simulated) items.push(["simulator", t.simulator]);
  return (
    <nav aria-label={t.mainNavigation}>
      {items.map(([path, text]) => (
        <a key={path} href={address(...(path ? [path] : []))}
           aria-current={path === (here === "module" ? "" : here) ? "page" : undefined}>{text}</a>
      ))}
    </nav>
  );
}

function LinkState() {
  const link = useStore((state) => state.link);
  const t = texts();
  const words = { connecting: t.connecting, up: t.connected, lost: t.lost };
  return <span class={`link ${link}`} role="status"><i class="lamp" />{words[link]}</span>;
}

function LanguageChoice() {
  const language = useStore((state) => state.language);
  return (
    <select class="language" aria-label={texts().language} value={language}
            onChange={(event) => setLanguage(event.currentTarget.value)}>
      {Object.entries(LANGUAGES).map(([word, { name }]) => <option key={word} value={word}>{name}</option>)}
    </select>
  );
}

function LossBanner() {
  const link = useStore((state) => state.link);
  const fault = useStore((state) => state.linkFault);
  if (link !== "lost") return null;
  return (
    <div class="banner bad" role="alert">
      <strong>{texts().serviceLost}</strong> {texts().tryingAgain} <small>{fault}</small>
    </div>
  );
}

export function App() {
  const route = useStore((state) => state.route);
  const notice = useStore((state) => state.notice);
  const language = useStore((state) => state.language);
  return (
    <div class="app" key={language}>
      <header class="top">
        <a class="brand" href={address()}><img src="/icon.svg" alt="" width="28" height="28" />{texts().title}</a>
        <Navigation />
        <LinkState />
        <LanguageChoice />
      </header>
      <LossBanner />
      <p class="notice" role="status" aria-live="polite">{notice}</p>
      <main>{screenOf(route)}</main>
    </div>
  );
}
