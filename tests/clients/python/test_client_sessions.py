"""Sessions close themselves, wait their turn and say who holds what."""

import logging
import signal
import subprocess
import sys
import threading

import pytest

import qitrmc


def holders(chassis, device="Mod2"):
    return chassis.holders(device)


def program(*lines):
    return "\n".join(["import sys, qitrmc", "chassis = qitrmc.connect(sys.argv[1])", *lines])


def start(bench, *lines):
    return subprocess.Popen([sys.executable, "-c", program(*lines), bench.url], stdout=subprocess.PIPE,
                            stderr=subprocess.PIPE, text=True)


def test_a_session_ends_with_its_block(chassis):
    with chassis.session("Mod2") as session:
        assert holders(chassis) == [session.id]
    assert holders(chassis) == []
    with pytest.raises(qitrmc.SessionClosed):
        session["Mod2/ch0"]["PSU.Voltage"]


def test_a_session_ends_after_an_exception(chassis):
    with pytest.raises(KeyError):
        with chassis.session("Mod2"):
            raise KeyError
    assert holders(chassis) == []


def test_an_exception_is_not_hidden_by_a_session_that_is_gone(chassis):
    with pytest.raises(KeyError):
        with chassis.session("Mod2") as session:
            chassis.session("Mod2", force=True).close()
            raise KeyError(session.id)


def test_a_session_ends_with_the_program(bench, chassis):
    with start(bench, "session = chassis.session('Mod2')", "print(session.id)") as running:
        out, err = running.communicate(timeout=60)
    assert (running.returncode, err) == (0, "")
    assert out.startswith("_session")
    assert holders(chassis) == []


def test_a_session_ends_with_a_program_that_fails(bench, chassis):
    with start(bench, "session = chassis.session('Mod2')", "1 / 0") as running:
        _, err = running.communicate(timeout=60)
    assert running.returncode == 1 and err.endswith("ZeroDivisionError: division by zero\n")
    assert holders(chassis) == []


def test_a_session_ends_on_ctrl_c(bench, chassis):
    with start(bench, "with chassis.session('Mod2') as session:", "    print(session.id, flush=True)",
               "    for row in session['Mod2/ch0'].watch('PSU.Voltage', every=3600):",
               "        print('row', flush=True)",
               ) as running:
        session_id = running.stdout.readline().strip()
        assert running.stdout.readline() == "row\n"
        assert holders(chassis) == [session_id]
        running.send_signal(signal.SIGINT)
        _, err = running.communicate(timeout=60)
    assert "KeyboardInterrupt" in err
    assert holders(chassis) == []


def test_the_session_for_reading_ends_with_the_connection(bench):
    with bench.connect() as chassis:
        chassis.modules()
        reader = chassis._reader
    with bench.connect() as chassis:
        with pytest.raises(qitrmc.UnknownSession):
            chassis.call("getSessionPropertyList", session_id=reader)


def test_a_program_waits_its_turn(bench, chassis, caplog):
    caplog.set_level(logging.WARNING, "qitrmc")
    first = chassis.session("Mod2")
    logged = threading.Event()
    opened = []

    class Noticed(logging.Handler):
        def emit(self, record):
            logged.set()

    def wait():
        with bench.connect() as other, other.session("Mod2", wait=60) as second:
            opened.append(second.id)
    handler = Noticed()
    logging.getLogger("qitrmc").addHandler(handler)
    thread = threading.Thread(target=wait)
    thread.start()
    try:
        assert logged.wait(60)
        assert opened == []
        # The one that waits does not hold up the holder.
        assert first["Mod2/ch0"]["PSU.Voltage"] == 0.0
        first.close()
        thread.join(60)
    finally:
        first.close()
        logging.getLogger("qitrmc").removeHandler(handler)
    assert len(opened) == 1
    assert caplog.messages == [f"Mod2 is held by {first.id}; waiting up to 60 s."]


def test_a_wait_that_is_over_names_the_holder(chassis):
    with chassis.session("Mod2") as first:
        with pytest.raises(qitrmc.DeviceReserved) as caught:
            chassis.session("Mod2", wait=0.1)
        assert caught.value.sessions == [first.id]


def test_a_wait_asks_without_a_timeout_of_its_own(bench, chassis):
    with chassis.session("Mod2"):
        before = len(bench.trace)
        with pytest.raises(qitrmc.DeviceReserved):
            chassis.session("Mod2", wait=0.3)
        sent = [line for line in bench.trace[before:] if "initializeSessionWithDevices" in line]
        assert len(sent) >= 2
        assert all("reservationTimeout=0" in line for line in sent), sent


def test_force_ends_the_session_that_holds_a_device(chassis):
    with chassis.session("Mod2") as first, chassis.session("Mod2", force=True) as second:
        assert holders(chassis) == [second.id]
        with pytest.raises(qitrmc.UnknownSession):
            first["Mod2/ch0"]["PSU.Voltage"]


def test_readers_share_a_device_and_do_not_write(chassis):
    with chassis.session("Mod2", read_only=True) as one, chassis.session("Mod2", read_only=True) as two:
        assert one["Mod2/ch0"]["PSU.Voltage"] == two["Mod2/ch0"]["PSU.Voltage"] == 0.0
        with pytest.raises(qitrmc.ReadOnlyReservation):
            one["Mod2/ch0"]["PSU.Voltage"] = 1.0


def test_sessions_of_one_group_share_a_device(chassis):
    with chassis.session("Mod2", group="team"), chassis.session("Mod2", group="team") as second:
        second["Mod2/ch0"]["PSU.Voltage"] = 0.0


@pytest.mark.parametrize("resources", [["Mod1/ch0"], ["Mod1/ch0:3"], ["Mod1/user"], ["Mod1", "Mod4"], []])
def test_a_session_takes_any_kind_of_resource(chassis, resources):
    with chassis.session(*resources) as session:
        devices = {resource.partition("/")[0] for resource in resources}
        assert set(session.get("Session.ReservedDevices")) == devices


def test_devices_can_be_reserved_later(chassis):
    with chassis.session() as session:
        session.reserve("Mod2")
        assert holders(chassis) == [session.id]
        session.unreserve("Mod2")
        assert holders(chassis) == []


def test_asking_for_holders_leaves_nothing_behind(chassis):
    assert [module.holders for module in chassis.modules(holders=True)] == [(), (), (), ()]
    assert chassis.call("getProperty", property="Session.ReservedDevices")["value"] == []


def test_a_session_connects_and_disconnects(chassis):
    with chassis.session("Mod1", "Mod2") as session:
        session.connect("Mod1")
        assert session.get("Session.ConnectedDevices") == ["Mod1"]
        session.disconnect("Mod1")
        assert session.get("Session.ConnectedDevices") == []


def test_a_command_is_aborted_from_another_thread():
    from qitrmc.testing import chassis as simulated
    with simulated(time_scale=1) as bench, bench.connect() as chassis, chassis.session("Mod1") as session:
        caught = []

        def calibrate():
            try:
                session["Mod1"].run("DMM.Calibrate", timeout=60)
            except qitrmc.Error as error:
                caught.append(type(error))
        thread = threading.Thread(target=calibrate)
        thread.start()
        while thread.is_alive():
            session.abort()
        thread.join()
        assert caught == [qitrmc.Aborted]
