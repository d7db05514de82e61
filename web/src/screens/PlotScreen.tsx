// Numbers as they move.
import { useState } from "preact/hooks";
import { download } from "../parts/download.ts";
import { PlotCanvas } from "../parts/PlotCanvas.tsx";
import { usePeriodic } from "../parts/useAsync.ts";
import { informationOf, listProperties, type Resource } from "../service/resources.ts";
import { addTrack, csv, recording, removeTrack } from "../service/recorder.ts";
import { ignoreRefusal } from "../service/session.ts";
import { isNumeric } from "../service/values.ts";
import { useStore } from "../store.ts";
import { texts } from "../texts/texts.ts";

const WINDOWS = [10, 60, 600, 3600];

async function numericProperties(resource: Resource): Promise<[string, string][]> {
  const names = await listProperties(resource);
  const all = await Promise.all(names.map(async (name) => ({
    name, information: await informationOf(resource, name).catch(ignoreRefusal) })));
  return all.flatMap(({ name, information }) =>
    information && isNumeric(information) && information.access !== "WriteOnly"
      ? [[name, information.unit ?? ""] as [string, string]] : []);
}

function savePicture(): void {
  const drawn = document.querySelector<HTMLCanvasElement>(".plot canvas");
  if (!drawn) return;
  const picture = document.createElement("canvas");
  picture.width = drawn.width;
  picture.height = drawn.height;
  const context = picture.getContext("2d")!;
  context.fillStyle = getComputedStyle(document.body).backgroundColor;
  context.fillRect(0, 0, picture.width, picture.height);
  context.drawImage(drawn, 0, 0);
  picture.toBlob((blob) => { if (blob) download("plot.png", blob); });
}

function Chooser({ changed }: { changed: () => void }) {
  const t = texts();
  const devices = useStore((state) => state.devices);
  const [chosen, setChosen] = useState("");
  const [numbers, setNumbers] = useState<[string, string][]>([]);
  const name = chosen || devices[0]?.name || "";
  const device = devices.find((one) => one.name === name || one.channels.includes(name));
  const resource = device && { device: device.name, channel: device.name === name ? null : name };
  usePeriodic(3_600_000, async () => setNumbers(resource ? await numericProperties(resource) : []), [name]);
  const isOn = (property: string) => recording.tracks.some((track) => track.label === `${name} ${property}`);
  const toggle = (property: string, unit: string) => {
    if (isOn(property)) removeTrack(`${name} ${property}`);
    else if (resource) addTrack(resource, property, unit);
    changed();
  };
  return (
    <fieldset class="chooser">
      <legend>{t.whatToPlot}</legend>
      <select aria-label={t.deviceOrChannel} value={name} onChange={(event) => setChosen(event.currentTarget.value)}>
        {devices.map((one) => (
          <optgroup key={one.name} label={one.name}>
            {[one.name, ...one.channels].map((option) => <option key={option}>{option}</option>)}
          </optgroup>
        ))}
      </select>
      {numbers.map(([property, unit]) => (
        <label key={`${name} ${property}`} class="check">
          <input type="checkbox" checked={isOn(property)} onChange={() => toggle(property, unit)} />
          {property} {unit && <small>{unit}</small>}
        </label>
      ))}
    </fieldset>
  );
}

export function PlotScreen() {
  const t = texts();
  const [seconds, setSeconds] = useState(60);
  const [, redraw] = useState(0);
  const changed = () => redraw((count) => count + 1);
  const pause = () => { recording.paused = !recording.paused; changed(); };
  return (
    <>
      <h1>{t.plots}</h1>
      <div class="plot-screen">
        <Chooser changed={changed} />
        <section class="panel">
          <div class="toolbar">
            <label class="field">{t.window}{" "}
              <select value={seconds} onChange={(event) => setSeconds(Number(event.currentTarget.value))}>
                {WINDOWS.map((length) => <option key={length} value={length}>{length < 60 ? `${length} s` : `${length / 60} min`}</option>)}
              </select>
            </label>
            <button type="button" aria-pressed={recording.paused} onClick={pause}>{recording.paused ? t.goOn : t.pause}</button>
            <button type="button" disabled={recording.tracks.length === 0}
                    onClick={() => download("plot.csv", new Blob([csv()], { type: "text/csv" }))}>CSV</button>
            <button type="button" disabled={recording.tracks.length === 0} onClick={savePicture}>PNG</button>
            <span class="quiet">{t.zoomHint}</span>
          </div>
          {recording.tracks.length === 0 ? <p class="quiet">{t.nothingPlotted}</p>
            : <PlotCanvas seconds={seconds} paused={recording.paused} tracks={recording.tracks.map((track) => track.label).join("\n")} />}
        </section>
      </div>
    </>
  );
}
