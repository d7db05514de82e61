"""The programs in examples/, run as a new user runs them."""

import subprocess

from hostlib import BUILD_DIR


def test_the_voltage_example_prints_what_it_did():
    result = subprocess.run([BUILD_DIR / "bin" / "example_voltage"], capture_output=True, text=True,
                            timeout=60)
    assert (result.returncode, result.stderr) == (0, "")
    lines = result.stdout.splitlines()
    assert lines[0] == "The system has 5 devices: Bench Mod1 Mod2 Mod4 Mod5"
    assert lines[1] == "Mod2/ch0 is set to 3.30 V and switched on."
    measured = lines[2].removeprefix("Mod1/ch0, which is wired to it, measures ")
    assert abs(float(measured.removesuffix(" V.")) - 3.3) < 0.02
    assert lines[3:] == ["Mod3 is not there, so a question about it fails with -250956."]
