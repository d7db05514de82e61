// One device: what it is, who has it, and its parts on a tab each.
import { Lamp, Temperature } from "../parts/DeviceState.tsx";
import { Reservation } from "../parts/Reservation.tsx";
import { address } from "../route.ts";
import { useStore, type Device } from "../store.ts";
import { texts } from "../texts/texts.ts";
import { ChannelsTab } from "./ChannelsTab.tsx";
import { CommandsTab } from "./CommandsTab.tsx";
import { MemoryTab } from "./MemoryTab.tsx";
import { PropertiesTab } from "./PropertiesTab.tsx";
import { RegistersTab } from "./RegistersTab.tsx";

function Part({ device, part }: { device: Device; part: string }) {
  switch (part) {
    case "channels": return <ChannelsTab device={device} />;
    case "commands": return <CommandsTab device={device} />;
    case "registers": return <RegistersTab device={device} />;
    case "memory": return <MemoryTab device={device} />;
    default: return <PropertiesTab device={device} />;
  }
}

function Tabs({ device, part }: { device: Device; part: string }) {
  const t = texts();
  const tabs = [["properties", t.properties]];
  if (device.channels.length > 0) tabs.push(["channels", t.channels]);
  tabs.push(["commands", t.commands], ["registers", t.registers]);
  if (device.areas.length > 0) tabs.push(["memory", t.memory]);
  return (
    <nav class="tabs" aria-label={t.parts(device.name)}>
      {tabs.map(([path, text]) => (
        <a key={path} href={address("module", device.name, path)} aria-current={path === part ? "page" : undefined}>{text}</a>
      ))}
    </nav>
  );
}

function Facts({ device }: { device: Device }) {
  const t = texts();
  const facts: [string, string][] = [
    [t.slot, device.slot === null ? "" : String(device.slot)], [t.serial, device.serial], [t.firmware, device.firmware],
  ];
  return (
    <dl class="facts">
      {facts.filter(([, value]) => value !== "").map(([name, value]) =>
        <div key={name}><dt>{name}</dt><dd>{value}</dd></div>)}
    </dl>
  );
}

export function ModuleScreen({ name, part }: { name: string; part: string }) {
  const t = texts();
  const device = useStore((state) => state.devices).find((one) => one.name === name);
  const loaded = useStore((state) => state.loaded);
  if (!device) {
    return (
      <>
        <h1>{name}</h1>
        <p class="quiet" role="status">{loaded ? t.notThere(name) : t.loading}</p>
        <p><a href={address()}>{t.backToChassis}</a></p>
      </>
    );
  }
  return (
    <>
      <header class="module-head">
        <div>
          <p class="crumb"><a href={address()}>{t.chassis}</a></p>
          <h1><Lamp device={device} /> {device.name}</h1>
          <p class="product">{device.product} <Temperature device={device} /></p>
        </div>
        <Facts device={device} />
        <Reservation device={device.name} />
      </header>
      {device.fault && <p class="banner bad" role="alert">{device.fault}</p>}
      <Tabs device={device} part={part} />
      <Part device={device} part={part} />
    </>
  );
}
