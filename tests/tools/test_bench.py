"""What scripts/bench prints and draws, from results that are written by hand."""

import importlib
import json
import pathlib
import sys
import xml.etree.ElementTree as ElementTree

import pytest

FOLDER = pathlib.Path(__file__).resolve().parents[2] / "bench"
SVG = "{http://www.w3.org/2000/svg}"


@pytest.fixture
def bench(monkeypatch):
    """Imports a module of the benchmarks."""
    monkeypatch.syspath_prepend(str(FOLDER))
    return importlib.import_module


def medians(**times):
    """Results of the benchmark library: the processor time in nanoseconds by name."""
    return {"benchmarks": [
        {"name": f"{name}_median", "run_name": name, "aggregate_name": "median", "cpu_time": time,
         "time_unit": "ns", "family_index": index, "per_family_instance_index": 0}
        for index, (name, time) in enumerate(times.items())]}


@pytest.fixture
def report(bench, tmp_path, monkeypatch, capsys):
    """Writes results, and returns the lines that are printed about them."""
    def run(**results):
        for name, content in results.items():
            (tmp_path / f"{name.replace('_', '-')}.json").write_text(json.dumps(content))
        monkeypatch.setattr(sys, "argv", ["report.py", str(tmp_path)])
        bench("report").main()
        return capsys.readouterr().out.splitlines()
    return run


def test_without_results_only_the_heading_of_the_ratios_is_printed(report):
    assert report() == ["", "Ratios"]


def test_an_empty_file_of_a_filtered_run_counts_as_no_results(report, tmp_path):
    (tmp_path / "driver-4.json").write_text("")
    assert report() == ["", "Ratios"]


def test_calls_of_the_driver_are_compared_between_few_and_many_devices(report):
    lines = report(driver_4=medians(**{"driver/4/readDouble": 80, "driver/4/getProperty": 3000}),
                   driver_4000=medians(**{"driver/4000/readDouble": 100,
                                          "driver/4000/getProperty": 6000}))
    assert lines == [
        "", "The simulated driver, and a whole request with it",
        "  calls of the simulated driver  4 devices, ns  4000 devices, ns  ratio",
        "  readDouble                                80               100   1.25",
        "  getProperty                             3000              6000   2.00",
        "", "Ratios",
        "getProperty with the simulated driver, 4000 devices to 4: 2.00 (goal: at most 1.1; missed)"]


def test_a_ratio_that_reaches_its_goal_is_not_marked(report):
    lines = report(driver_4=medians(**{"driver/4/getProperty": 3000}),
                   driver_4000=medians(**{"driver/4000/getProperty": 3150}))
    assert lines[-1] == ("getProperty with the simulated driver, 4000 devices to 4: 1.05 "
                         "(goal: at most 1.1)")


def test_a_driver_that_was_measured_with_one_size_only_is_left_out(report):
    assert report(driver_4=medians(**{"driver/4/getProperty": 3000})) == ["", "Ratios"]


@pytest.mark.parametrize("series, power", [
    ([(1, 5.0), (10, 50.0), (100, 500.0)], 1.0),
    ([(1, 3.0), (2, 12.0), (4, 48.0)], 2.0),
    ([(8, 7.0), (64, 7.0)], 0.0),
])
def test_the_exponent_is_the_power_with_which_the_time_grows(bench, series, power):
    assert bench("report").exponent(series) == pytest.approx(power)


def test_growth_over_http_names_the_steepest_series_and_its_goal(report):
    lines = report(http_growth={"linear": [[10, 100.0], [100, 1000.0]],
                                "quadratic": [[10, 1.0], [100, 100.0]]})
    assert lines[-1] == ("steepest growth over HTTP, as an exponent: 2.00 "
                         "(quadratic; goal: at most 1.04; missed)")
    assert lines[-3:-1] == ["", "Ratios"]


def test_growth_within_the_goal_is_not_marked(report):
    lines = report(http_growth={"linear": [[10, 100.0], [100, 1000.0]]})
    assert lines[-1].endswith("1.00 (linear; goal: at most 1.04)")


def test_growth_is_drawn_the_same_way_each_time(report, tmp_path):
    growth = {"names": [[10, 100.0], [100, 1000.0]], "bytes": [[16, 30.0], [1024, 90.0]]}
    report(http_growth=growth)
    first = (tmp_path / "growth-over-http.svg").read_text()
    report(http_growth=growth)
    assert (tmp_path / "growth-over-http.svg").read_text() == first
    assert sorted(path.name for path in tmp_path.glob("*.svg")) == ["growth-over-http.svg"]


def plotted(bench, lines):
    return ElementTree.fromstring(bench("plot").svg(lines, ("count", "microseconds")))


def test_a_plot_shows_each_point_and_the_name_of_each_line(bench):
    picture = plotted(bench, {"names & ranges": [(10, 1.0), (100, 10.0)], "bytes": [(10, 10.0)]})
    texts = [text.text for text in picture.iter(f"{SVG}text")]
    assert [name for name in texts if name in ("names & ranges", "bytes")] == ["names & ranges", "bytes"]
    assert {"count", "microseconds", "10", "100", "1"} <= set(texts)
    assert len(list(picture.iter(f"{SVG}circle"))) == 3


def test_a_plot_has_logarithmic_axes(bench):
    picture = plotted(bench, {"line": [(1, 1.0), (10, 10.0), (100, 100.0)]})
    points = [(float(circle.get("cx")), float(circle.get("cy")))
              for circle in picture.iter(f"{SVG}circle")]
    (x1, y1), (x2, y2), (x3, y3) = points
    assert x2 - x1 == pytest.approx(x3 - x2, abs=0.2) and x2 > x1
    assert y1 - y2 == pytest.approx(y2 - y3, abs=0.2) and y2 < y1


def test_a_plot_has_a_background_of_its_own(bench):
    """Otherwise its dark texts could not be read on a dark page."""
    background = next(plotted(bench, {"line": [(1, 1.0), (10, 10.0)]}).iter(f"{SVG}rect"))
    assert background.get("fill") == "white"
    assert (background.get("width"), background.get("height")) == ("680", "420")


def test_no_two_of_fourteen_lines_look_alike(bench):
    lines = {f"line {number}": [(1, 1.0), (10, 10.0 + number)] for number in range(14)}
    looks = [(line.get("stroke"), line.get("stroke-dasharray"))
             for line in plotted(bench, lines).iter(f"{SVG}polyline")]
    # The line itself, and the sample in the legend.
    assert looks[0::2] == looks[1::2]
    assert len(set(looks)) == 14


def test_a_refusal_under_load_names_the_server(bench, monkeypatch):
    measure = bench("measure_service")

    class Server:
        url = "http://127.0.0.1:1/"

        @staticmethod
        def used():
            return 0.0, 0.0, 0

    class Report:
        stdout = "  10 requests in 1.00s\n  Non-2xx or 3xx responses: 3\n"

    monkeypatch.setattr(measure.subprocess, "run", lambda *_, **__: Report)
    with pytest.raises(SystemExit, match="(?s)^Node, 64 connections:.*Non-2xx or 3xx responses: 3"):
        measure.load("Node", Server, "post.lua", "{}", 64)
