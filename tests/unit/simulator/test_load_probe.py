"""Reading from the loader of chassis descriptions ends, whatever the loader does."""

import signal

import pytest

from load_probe import LoadProbe


def test_a_loader_that_never_answers_does_not_hang_the_run():
    probe = LoadProbe(["tail", "-f", "/dev/null"], patience=0.1)
    with pytest.raises(AssertionError, match="the loader took more than 0.1 s"):
        probe.load("{}")
    assert probe.process.wait(60) == -signal.SIGKILL


def test_a_loader_that_never_ends_fails_the_test():
    with pytest.raises(AssertionError, match="the loader did not end"):
        with LoadProbe(["tail", "-f", "/dev/null"], patience=0.1):
            pass
