// The channels of a device side by side.
import { useState } from "preact/hooks";
import { PropertyGrid } from "../parts/PropertyGrid.tsx";
import type { Device } from "../store.ts";
import { texts } from "../texts/texts.ts";

const AT_ONCE = 8;

export function ChannelsTab({ device }: { device: Device }) {
  const [first, setFirst] = useState(0);
  const channels = device.channels.slice(first, first + AT_ONCE);
  const starts = Array.from({ length: Math.ceil(device.channels.length / AT_ONCE) }, (_, i) => i * AT_ONCE);
  return (
    <>
      {starts.length > 1 && (
        <label class="field">{texts().channels}{" "}
          <select value={first} onChange={(event) => setFirst(Number(event.currentTarget.value))}>
            {starts.map((start) => (
              <option key={start} value={start}>
                {device.channels[start]} … {device.channels[Math.min(start + AT_ONCE, device.channels.length) - 1]}
              </option>
            ))}
          </select>
        </label>
      )}
      <PropertyGrid key={first} resources={channels.map((channel) => ({ device: device.name, channel }))} />
    </>
  );
}
