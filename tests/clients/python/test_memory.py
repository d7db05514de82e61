"""Registers, and NVMEM as something to slice."""

import pytest

import qitrmc


@pytest.fixture
def registers(held):
    return held["Mod1"].registers


def test_registers_are_read_and_written(registers):
    registers.write(256, 0x12345678)
    assert registers.read(256) == 0x12345678
    assert registers.read(256, width=8) == 0x78
    registers.write(256, 18446744073709551615, width=64)
    assert registers.read(256, width=64) == 18446744073709551615


def test_blocks_step_by_the_width(registers):
    registers.write_block(256, [0x0102, 0x0304, 0x0506], width=16)
    assert registers.read_block(256, 3, width=16) == [0x0102, 0x0304, 0x0506]
    assert registers.read_block(256, 6, width=8) == [2, 1, 4, 3, 6, 5]
    assert registers.read(258, width=16) == 0x0304


def test_blocks_of_bytes_are_in_the_order_of_their_addresses(registers):
    registers.write_bytes(256, b"abcdefgh", width=32)
    assert registers.read_bytes(256, 8) == b"abcdefgh"
    assert registers.read_bytes(256, 8, width=64) == b"abcdefgh"
    assert registers.read_bytes(0, 4, width=32) == b"MOD1"


@pytest.mark.parametrize("work", [lambda registers: registers.read_block(256, 1, width=12),
                                  lambda registers: registers.read_bytes(256, 7, width=32),
                                  lambda registers: registers.write_bytes(256, b"abc", width=16)])
def test_a_wrong_width_is_refused_before_anything_is_sent(bench, registers, work):
    before = len(bench.trace)
    with pytest.raises(qitrmc.WrongValue):
        work(registers)
    assert len(bench.trace) == before


def test_data_that_does_not_fit_is_refused(registers):
    with pytest.raises(qitrmc.DataTooWide):
        registers.write(256, 256, width=8)


def test_an_area_is_sliced(held):
    area = held["Mod1/user"]
    area[0:4] = b"abcd"
    area[255] = 7
    assert area[0:5] == b"abcd\0"
    assert area[1] == ord("b")
    assert area[-1] == 7
    assert area[253:] == b"\0\0\7"
    assert len(area[:]) == len(area.nvmem) == 256
    assert area["NVMEMArea.Size"] == 256


def test_bytes_of_another_length_are_refused(held):
    with pytest.raises(qitrmc.WrongValue, match="3 bytes cannot take the place of 4"):
        held["Mod1/user"][0:4] = b"abc"
    with pytest.raises(qitrmc.WrongValue, match="no step"):
        held["Mod1/user"][0:4:2]


def test_a_guarded_area_asks_for_its_password(held):
    area = held["Mod1/calibration"]
    with pytest.raises(qitrmc.WrongSerialNumber):
        area[0:1] = b"x"
    area.nvmem.unlock(password="guess", serial_number="0C5110B1")
    with pytest.raises(qitrmc.WrongPassword):
        area[0:1] = b"x"
    area.nvmem.unlock(password="calibrate", serial_number="0C5110B1")
    area[0:1] = b"x"
    assert held["Mod1/calibration"][0:2] == b"x\1"


def test_bytes_last_when_they_are_committed(held):
    area = held["Mod2/user"]
    area[0:2] = b"ab"
    area.commit()
    area[1:3] = b"xy"
    held["Mod2"].reset()
    assert area[0:3] == b"ab\0"


def test_a_large_area_moves_in_pieces():
    from qitrmc.testing import chassis as simulated
    description = {"devices": [{"name": "Rack", "category": 1, "modules": [
        {"name": "Store", "category": 2, "slot": 1, "nvmem_areas": [{"name": "log", "size": 10000}]}]}]}
    with simulated(description) as rack, rack.connect() as chassis, chassis.session("Store/log") as session:
        data = bytes(range(250)) * 40
        moved = []
        session["Store/log"].nvmem.write(0, data, progress=moved.append)
        assert moved == [4096, 8192, 10000]
        assert session["Store/log"].nvmem.read(progress=moved.append) == data
        assert moved[3:] == [4096, 8192, 10000]
