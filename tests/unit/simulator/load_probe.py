"""The loader of chassis descriptions as a process that is asked again and again."""

import json
import os
import subprocess
from pathlib import Path

REPOSITORY = Path(__file__).resolve().parents[3]
BUILD = Path(os.environ.get("QITRMC_BUILD_DIR", REPOSITORY / "build" / "dev"))
CHASSIS = REPOSITORY / "simulator" / "chassis"


class LoadProbe:
    """Answers whether descriptions load.

        with LoadProbe() as probe:
            assert probe.load('{"devices": []}') is None
            assert probe.load("{}") == ("/devices", "is missing; must be an array of devices")
    """

    def __init__(self):
        self.process = subprocess.Popen([BUILD / "bin" / "simulator_load_probe"],
                                        stdin=subprocess.PIPE, stdout=subprocess.PIPE)

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.process.stdin.close()
        self.process.stdout.close()
        assert self.process.wait(60) == 0

    def load(self, description):
        """None when a description (bytes, text, or a value to be written as JSON) loads, else the
        JSON pointer of the fault and its words."""
        if not isinstance(description, (bytes, str)):
            description = json.dumps(description)
        if isinstance(description, str):
            description = description.encode()
        self.process.stdin.write(b"%d\n%b" % (len(description), description))
        self.process.stdin.flush()
        answer = self.process.stdout.readline().decode(errors="replace").rstrip("\n")
        if answer == "loaded":
            return None
        pointer, words = answer.split("\t", 1)
        return pointer, words
