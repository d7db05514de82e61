// How a device is, in small signs.
import { useStore, type Device, type Holder } from "../store.ts";
import { texts } from "../texts/texts.ts";

export function Lamp({ device }: { device: Device }) {
  const t = texts();
  const words = device.fault ? t.notAnswering : t.ready;
  return <i class={`lamp ${device.fault ? "bad" : "good"}`} role="img" aria-label={words} title={words} />;
}

export function Temperature({ device }: { device: Device }) {
  if (device.temperature === null) return null;
  return <span class="temperature">{device.temperature.toFixed(1)} °C</span>;
}

export function describeHolder(holder: Holder): string {
  return holder.isPage ? `${holder.session} (${texts().anotherPage})` : holder.session;
}

export function useHolder(name: string): Holder | undefined {
  const holders = useStore((state) => state.holders);
  return holders.find((holder) => holder.devices.includes(name));
}

export function HolderChip({ device }: { device: Device }) {
  const t = texts();
  const holder = useHolder(device.name);
  const own = useStore((state) => state.reserved).includes(device.name);
  if (own) return <span class="chip own">{t.heldByPage}</span>;
  if (holder) return <span class="chip held" title={describeHolder(holder)}>{t.heldBy(holder.session)}</span>;
  return null;
}
