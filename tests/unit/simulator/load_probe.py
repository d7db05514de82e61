"""The loader of chassis descriptions as a process that answers many queries."""

import json
import os
import select
import subprocess
from pathlib import Path

REPOSITORY = Path(__file__).resolve().parents[3]
BUILD = Path(os.environ.get("QITRMC_BUILD_DIR", REPOSITORY / "build" / "dev"))
CHASSIS = REPOSITORY / "simulator" / "chassis"


# Far more time than a description takes: it only ends a loader that hangs.
PATIENCE_SECONDS = 30

FAULTS = (BUILD / "bin" / "simulator_load_probe", "faults")


def expect_sentence(words):
    """What is wrong and what would be right are two parts of one sentence, without a full stop."""
    wrong, right = words.split("; ", 1)
    for part in (wrong, right):
        assert part == part.strip() and part and part[-1] not in ".;,", words


class LoadProbe:
    """Answers whether descriptions load; with the command FAULTS, whether descriptions of faults in
    the built-in chassis do.

        with LoadProbe() as probe:
            assert probe.load('{"devices": []}') is None
            assert probe.load("{}") == ("/devices", "is missing; must be an array of devices")

    A loader that hangs is killed, and its description fails the test.
    """

    def __init__(self, command=(BUILD / "bin" / "simulator_load_probe",),
                 patience=PATIENCE_SECONDS):
        self.patience = patience
        self.process = subprocess.Popen(command, stdin=subprocess.PIPE, stdout=subprocess.PIPE)

    def __enter__(self):
        return self

    def __exit__(self, *_):
        try:
            self.process.communicate(timeout=self.patience)
        except subprocess.TimeoutExpired:
            self.process.kill()
            self.process.communicate()
            raise AssertionError("the loader did not end") from None
        assert self.process.returncode == 0

    def load(self, description):
        """None when a description (bytes, text, or a value to be written as JSON) loads, else the
        JSON pointer of the fault and its message."""
        if not isinstance(description, (bytes, str)):
            description = json.dumps(description)
        if isinstance(description, str):
            description = description.encode()
        self.process.stdin.write(b"%d\n%b" % (len(description), description))
        self.process.stdin.flush()
        answer = self._read_line()
        if answer == "loaded":
            return None
        pointer, words = answer.split("\t", 1)
        expect_sentence(words)
        return pointer, words

    def _read_line(self):
        ready, _, _ = select.select([self.process.stdout], [], [], self.patience)
        if not ready:
            self.process.kill()
            raise AssertionError(f"the loader took more than {self.patience} s")
        return self.process.stdout.readline().decode().rstrip("\n")
