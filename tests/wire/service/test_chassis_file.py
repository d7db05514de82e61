"""What the host reports about a chassis file that the simulated driver cannot load."""

import os
import subprocess

import pytest

from hostlib import BUILD_DIR


def run_host(tmp_path, text):
    chassis = tmp_path / "chassis.json"
    chassis.write_text(text)
    result = subprocess.run(
        [BUILD_DIR / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0", "--chassis", chassis],
        capture_output=True, text=True, timeout=60)
    return result.returncode, result.stdout, result.stderr.replace(str(chassis), "FILE")


def test_a_broken_chassis_file_ends_the_start_and_names_the_place(tmp_path):
    code, out, err = run_host(tmp_path, '{"devices": [], "colour": "red"}')
    assert (code, out) == (1, "")
    driver, host = err.splitlines()
    assert driver.startswith("qitrmcapi: FILE: /colour is not a known member")
    assert host == ("qitrmc-host: The simulated chassis does not start. Mend what the line above "
                    "names, and try again.")


def test_a_chassis_file_that_is_not_json_ends_the_start(tmp_path):
    code, out, err = run_host(tmp_path, '{"devices": [')
    assert (code, out) == (1, "")
    assert err.splitlines()[0].startswith("qitrmcapi: FILE: ")


def test_the_check_at_the_start_uses_up_no_session_number(own_host):
    body = b'{"jsonrpc":"2.0","id":1,"method":"initializeSession"}'
    assert own_host.post(body)[2] == (
        b'{"jsonrpc":"2.0","id":1,"result":{"session_id":"_session1"}}')
    own_host.post(b'{"jsonrpc":"2.0","id":1,"method":"closeSession","params":'
                  b'{"session_id":"_session1"}}')


@pytest.mark.parametrize("variable, value, right", [
    ("QITRMC_SIM_SEED", "many", "a whole number from 0 to 18446744073709551615"),
    ("QITRMC_SIM_SEED", "-1", "a whole number from 0 to 18446744073709551615"),
    ("QITRMC_SIM_TIME_SCALE", "fast", "a number from 0.001 to 1000000, or the word calls"),
    ("QITRMC_SIM_TIME_SCALE", "0,5", "a number from 0.001 to 1000000, or the word calls"),
])
def test_a_variable_that_the_driver_refuses_ends_the_start_with_1(variable, value, right):
    result = subprocess.run([BUILD_DIR / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0"],
                            capture_output=True, text=True, timeout=60,
                            env={**os.environ, variable: value})
    driver, host = result.stderr.splitlines()
    assert (result.returncode, result.stdout) == (1, "")
    assert driver == f'qitrmcapi: {variable}: is "{value}"; must be {right}'
    assert host.startswith("qitrmc-host: The simulated chassis does not start. ")
