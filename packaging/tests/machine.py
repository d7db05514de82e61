"""A small Debian machine for the tests of the packages: a root folder of its own with its own network.

The base system is made once and kept in build/package-root, with all that was downloaded. Root is
needed, as for every chroot.
"""

import contextlib
import os
import pathlib
import shutil
import subprocess
import tempfile

ROOT = pathlib.Path(__file__).resolve().parents[2]
CACHE = ROOT / "build" / "package-root"
PACKAGES = ROOT / "build" / "packages"
SOURCES = sorted(pathlib.Path("/etc/apt/sources.list.d").glob("*.sources"))

# systemd brings the checker of the units; it does not run here.
INCLUDED = "curl,systemd"

# Starts the program of a unit as systemctl does, with its settings, but without the hardening.
SYSTEMCTL = r"""#!/bin/bash
set -eu
[ "$1" = start ]
name=${2%.service}
instance=
[[ $name != *@* ]] || instance=${name#*@}
unit=/lib/systemd/system/${name%"$instance"}.service
value() { sed -n "s#^$1=##p" "$unit" | sed "s#%i#$instance#g; s#%S#/var/lib#g"; }
set -a
. "$(value EnvironmentFile)"
eval "$(value Environment)"
mkdir -p "/var/lib/$(value StateDirectory)"
eval "setsid $(value ExecStart) </dev/null >/var/log/unit.log 2>&1 &"
"""


def packages(architecture):
    return {path.name.split("_")[0]: path for path in (PACKAGES / architecture).glob("*.deb")}


def make_base():
    base = CACHE / "base.tar"
    if not base.exists():
        CACHE.mkdir(parents=True, exist_ok=True)
        unfinished = CACHE / "unfinished.tar"
        subprocess.run(["mmdebstrap", "--quiet", "--variant=minbase", f"--include={INCLUDED}",
                        "bookworm", unfinished, *SOURCES], check=True)
        unfinished.rename(base)
    return base


class Machine:
    """root: its root folder, a pathlib.Path."""

    def __init__(self, root):
        self.root = root
        subprocess.run(["tar", "-xpf", make_base(), "-C", root], check=True)
        stand_in = root / "usr/local/sbin/systemctl"
        stand_in.write_text(SYSTEMCTL)
        stand_in.chmod(0o755)
        (root / "packages").mkdir()

    def bring(self, *paths):
        """Copies packages into /packages, and into the cache of apt all that they depend on, so that
        apt needs no network."""
        for path in paths:
            shutil.copy(path, self.root / "packages")
        archives = CACHE / "archives"
        (archives / "partial").mkdir(parents=True, exist_ok=True)
        state = CACHE / "state"
        (state / "lists" / "partial").mkdir(parents=True, exist_ok=True)
        options = ["-qq", "-o", f"Dir::State={state}", "-o", f"Dir::Cache={CACHE}/cache",
                   "-o", f"Dir::Cache::archives={archives}/",
                   "-o", f"Dir::State::status={self.root}/var/lib/dpkg/status",
                   "-o", "APT::Sandbox::User=root", "-o", "APT::Keep-Downloaded-Packages=true"]
        (CACHE / "cache").mkdir(exist_ok=True)
        if not (state / "updated").exists():
            subprocess.run(["apt-get", *options, "update"], check=True)
            (state / "updated").touch()
        subprocess.run(["apt-get", *options, "install", "-y", "--download-only",
                        "--no-install-recommends", *paths], check=True, stdout=subprocess.DEVNULL)
        for path in archives.glob("*.deb"):
            shutil.copy(path, self.root / "var/cache/apt/archives")
        shutil.copytree(state / "lists", self.root / "var/lib/apt/lists", dirs_exist_ok=True)

    def run(self, script):
        """Runs a script of bash in /packages as root, and ends all that it has started with it.
        The network is a loopback device that nothing else uses."""
        inside = ('ip link set lo up && mount -t proc proc "$0/proc" && '
                  'exec chroot "$0" /bin/bash -euo pipefail -c "cd /packages; $1"')
        return subprocess.run(
            ["unshare", "--net", "--mount", "--pid", "--fork", "--kill-child",
             "bash", "-c", inside, self.root, script],
            capture_output=True, text=True, timeout=240,
            env={"PATH": os.environ["PATH"] + ":/usr/sbin:/sbin", "HOME": "/root", "LC_ALL": "C.UTF-8",
                 "DEBIAN_FRONTEND": "noninteractive"})

    def output(self, script):
        result = self.run(script)
        assert result.returncode == 0, (script, result.stdout, result.stderr)
        return result.stdout


@contextlib.contextmanager
def machine():
    with tempfile.TemporaryDirectory(prefix="qitrmc-machine-") as folder:
        os.chmod(folder, 0o755)
        yield Machine(pathlib.Path(folder))
