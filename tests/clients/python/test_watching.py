"""Reading at an interval, and writing down what was read."""

import asyncio
import csv
import datetime
import io

import pytest

import qitrmc
from qitrmc.watching import next_turn, rows


class Clock:
    """A clock that moves when somebody pauses or reads."""

    def __init__(self, monkeypatch, reading_seconds):
        self.now = 100.0
        self.reading_seconds = reading_seconds
        monkeypatch.setattr("qitrmc.watching.time.monotonic", lambda: self.now)

    async def pause(self, seconds):
        self.now += seconds

    async def read(self, property):
        started, self.now = self.now, self.now + next(self.reading_seconds)
        return started


def watched(clock, every, count):
    async def collect():
        return [row["P"] - 100.0 async for row in rows(clock.read, ("P",), clock.pause, every, count, False)]
    return asyncio.run(collect())


def test_readings_do_not_drift(monkeypatch):
    clock = Clock(monkeypatch, iter([0.3, 0.1, 0.9, 0.2]))
    assert watched(clock, 1.0, 4) == pytest.approx([0.0, 1.0, 2.0, 3.0])


def test_a_reading_that_comes_too_late_is_left_out(monkeypatch):
    clock = Clock(monkeypatch, iter([0.1, 2.4, 0.1]))
    assert watched(clock, 1.0, 3) == pytest.approx([0.0, 1.0, 4.0])


def test_a_reading_that_is_a_little_late_is_made_at_once():
    assert next_turn(3, 3.2, 1.0) == 3
    assert next_turn(3, 4.2, 1.0) == 5
    assert next_turn(3, 2.0, 1.0) == 3
    assert next_turn(3, 99.0, 0.0) == 3


def test_rows_have_time_and_values(held):
    before = datetime.datetime.now(datetime.timezone.utc)
    read = list(held["Mod1"].watch("DMM.Range", "DMM.Function", every=0, count=2))
    assert len(read) == 2
    assert read[0].values == {"DMM.Range": 10.0, "DMM.Function": 0}
    assert read[1]["DMM.Range"] == 10.0
    assert before <= read[0].time <= read[1].time


def test_a_failure_ends_the_watch_unless_it_keeps_going(bench, held):
    bench.fail("getProperty", qitrmc.ResourceBusy, first=2, count=1)
    with pytest.raises(qitrmc.ResourceBusy):
        list(held["Mod1"].watch("DMM.Range", every=0, count=3))
    bench.restore()
    bench.fail("getProperty", qitrmc.ResourceBusy, first=2, count=1)
    read = list(held["Mod1"].watch("DMM.Range", every=0, count=3, keep_going=True))
    assert [type(row.error) for row in read] == [type(None), qitrmc.ResourceBusy, type(None)]
    assert read[2]["DMM.Range"] == 10.0


def test_a_record_is_a_csv_file(held, tmp_path):
    path = tmp_path / "log.csv"
    held["Mod2/ch0:1"]["PSU.Voltage"] = [5, 2.5]
    assert held["Mod2/ch0:1"].record("PSU.Voltage", to=path, every=0, count=2) == 2
    with path.open(newline="") as file:
        lines = list(csv.reader(file))
    assert lines[0] == ["time", "elapsed", "PSU.Voltage", "error"]
    assert [line[2:] for line in lines[1:]] == [["5.0 2.5", ""]] * 2
    assert datetime.datetime.fromisoformat(lines[1][0]).tzinfo is not None


def test_a_record_goes_to_an_open_file_and_keeps_going(bench, held):
    bench.fail("getProperty", qitrmc.ResourceBusy, first=1, count=1)
    file = io.StringIO()
    held["Mod1"].record("DMM.Range", "DMM.ApertureTime", to=file, every=0, count=2, keep_going=True)
    lines = list(csv.reader(io.StringIO(file.getvalue())))
    assert lines[1][2:4] == ["", ""] and lines[1][4].startswith("The resource is still carrying out")
    assert lines[2][2:] == ["10.0", "0.02", ""]


def test_items_are_recorded_by_name(held):
    file = io.StringIO()
    held["Mod1/ch0:1"].record("DMM.Coupling", to=file, every=0, count=1)
    assert list(csv.reader(io.StringIO(file.getvalue())))[1][2:] == ["DC DC", ""]


def test_a_record_is_a_data_frame(held):
    pytest.importorskip("pandas")
    frame = held["Mod1"].record("DMM.Range", to="pandas", every=0, count=3)
    assert list(frame["DMM.Range"]) == [10.0, 10.0, 10.0]
    assert frame.index.name == "time"
