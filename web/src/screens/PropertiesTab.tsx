import { PropertyGrid } from "../parts/PropertyGrid.tsx";
import type { Device } from "../store.ts";

export function PropertiesTab({ device }: { device: Device }) {
  return <PropertyGrid resources={[{ device: device.name, channel: null }]} />;
}
