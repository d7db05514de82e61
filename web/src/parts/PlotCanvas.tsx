// Draws what the recorder has.
import { useEffect, useRef } from "preact/hooks";
import uPlot from "uplot";
import { firstIndexSince, recording } from "../service/recorder.ts";

const HEIGHT = 360;
// Parts of the window, about half a pixel each: less than that is not worth drawing an hour again for.
const STEPS = 2000;
const COLOURS = ["#1f7a99", "#c2571a", "#5a8f29", "#9b4f96", "#b8860b", "#3b6fd1", "#c0392b", "#2f8f83"];

export function colourOf(index: number): string {
  return COLOURS[index % COLOURS.length];
}

function dataSince(time: number): uPlot.AlignedData {
  const first = firstIndexSince(time);
  return [recording.times.slice(first), ...recording.tracks.map((track) => track.values.slice(first))];
}

function plotOptions(width: number, host: HTMLElement): uPlot.Options {
  const style = getComputedStyle(host);
  const axis = { stroke: style.getPropertyValue("--muted"), grid: { stroke: style.getPropertyValue("--line"), width: 1 },
                 ticks: { stroke: style.getPropertyValue("--line"), width: 1 } };
  return {
    width, height: HEIGHT,
    cursor: { drag: { x: true, y: false } },
    scales: { x: { time: true } },
    axes: [axis, { ...axis, size: 70 }],
    series: [{}, ...recording.tracks.map((track, i) => ({
      label: track.label, stroke: colourOf(i), width: 1.5, points: { show: false },
      value: (_: uPlot, value: number | null) => (value === null ? "–" : `${Number(value.toPrecision(7))} ${track.unit}`),
    }))],
  };
}

export interface PlotView {
  seconds: number;
  paused: boolean;
  tracks: string; // changes with the tracks
}

export function PlotCanvas({ seconds, paused, tracks }: PlotView) {
  const place = useRef<HTMLDivElement>(null);
  useEffect(() => {
    const host = place.current!;
    const plot = new uPlot(plotOptions(host.clientWidth, host), dataSince(Date.now() / 1000 - seconds), host);
    const resize = new ResizeObserver(() => plot.setSize({ width: host.clientWidth, height: HEIGHT }));
    resize.observe(host);
    let frame = 0;
    let drawn = -1;
    const draw = () => {
      const latest = recording.times.at(-1) ?? 0;
      if (latest - drawn > seconds / STEPS && !paused) {
        plot.setData(dataSince(latest - seconds));
        drawn = latest;
      }
      frame = requestAnimationFrame(draw);
    };
    frame = requestAnimationFrame(draw);
    return () => { cancelAnimationFrame(frame); resize.disconnect(); plot.destroy(); };
  }, [seconds, paused, tracks]);
  return <div class="plot" ref={place} />;
}
