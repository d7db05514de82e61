// The rack as it stands there: each chassis with its slots, and the modules in them.
import { address } from "../route.ts";
import { useStore, type Device } from "../store.ts";
import { texts } from "../texts/texts.ts";
import { HolderChip, Lamp, Temperature } from "../parts/DeviceState.tsx";

const CHASSIS = 1;
const MOST_JACKS = 40;

function Jacks({ count }: { count: number }) {
  return (
    <span class="jacks" aria-hidden="true">
      {Array.from({ length: Math.min(count, MOST_JACKS) }, (_, i) => <i key={i} />)}
    </span>
  );
}

function ModuleFace({ device }: { device: Device }) {
  const t = texts();
  return (
    <li class={`slot taken ${device.fault ? "failing" : ""}`}>
      <a href={address("module", device.name)}>
        <span class="slot-number">{device.slot}</span>
        <span class="face-head"><Lamp device={device} /><strong>{device.name}</strong></span>
        <span class="product">{device.product}</span>
        <Jacks count={device.channels.length} />
        <span class="face-foot">
          {device.fault ? <span class="fault">{t.notAnswering}</span> : <Temperature device={device} />}
          <HolderChip device={device} />
        </span>
      </a>
    </li>
  );
}

function EmptySlot({ slot }: { slot: number }) {
  return (
    <li class="slot empty">
      <span class="slot-number">{slot}</span>
      <span class="product">{texts().empty}</span>
    </li>
  );
}

function Rack({ chassis, devices }: { chassis: Device; devices: Device[] }) {
  const modules = devices.filter((device) => device.slot !== null && chassis.modules.includes(device.name));
  const last = Math.max(chassis.slots, ...modules.map((module) => module.slot ?? 0));
  return (
    <section class="rack" aria-label={chassis.name}>
      <header>
        <h2><Lamp device={chassis} /><a href={address("module", chassis.name)}>{chassis.name}</a></h2>
        <span class="product">{chassis.product}</span>
        <span class="serial">{texts().serial} {chassis.serial}</span>
        <Temperature device={chassis} />
        <HolderChip device={chassis} />
      </header>
      <ol class={last > 9 ? "slots many" : "slots"}>
        {Array.from({ length: last }, (_, i) => i + 1).map((slot) => {
          const module = modules.find((device) => device.slot === slot);
          return module ? <ModuleFace key={slot} device={module} /> : <EmptySlot key={slot} slot={slot} />;
        })}
      </ol>
    </section>
  );
}

export function ChassisScreen() {
  const devices = useStore((state) => state.devices);
  const loaded = useStore((state) => state.loaded);
  const t = texts();
  const racks = devices.filter((device) => device.category === CHASSIS);
  const housed = new Set(racks.flatMap((rack) => [rack.name, ...rack.modules]));
  const others = devices.filter((device) => !housed.has(device.name));
  return (
    <>
      <h1>{t.chassis}</h1>
      {!loaded && <p class="quiet">{t.loading}</p>}
      {loaded && devices.length === 0 && <p class="quiet">{t.noDevices}</p>}
      {racks.map((rack) => <Rack key={rack.name} chassis={rack} devices={devices} />)}
      {others.length > 0 && (
        <section class="rack"><header><h2>{t.otherDevices}</h2></header>
          <ol class="slots">{others.map((device) => <ModuleFace key={device.name} device={device} />)}</ol>
        </section>
      )}
    </>
  );
}
