#!/usr/bin/python3
"""A small Debian machine for the tests of the packages: a root folder of its own with its own network.

The base system is made once a week and kept in the user's cache folder, with all that was downloaded, for
all copies of the repository. Root is needed, as for every chroot. Run as a program, it makes the base
system.
"""

import contextlib
import fcntl
import os
import pathlib
import shutil
import subprocess
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
USERS_CACHE = pathlib.Path(os.environ.get("XDG_CACHE_HOME") or pathlib.Path.home() / ".cache")
KEPT = USERS_CACHE / "qitrmc-package-root"
PACKAGES = ROOT / "build" / "packages"
SOURCES = sorted(pathlib.Path("/etc/apt/sources.list.d").glob("*.sources"))

# systemd brings the checker of the units; it does not run here.
INCLUDED = "curl,openssl,systemd"
CACHE = KEPT / f"{time.strftime('%G-%V')}-{INCLUDED}"

# Starts the program of a unit as systemctl does, with its settings, but without the hardening.
SYSTEMCTL = r"""#!/bin/bash
set -eu
[[ $1 = start || $1 = restart ]]
name=${2%.service}
if [ "$1" = restart ] && [ -f "/run/$name.pid" ]; then
  kill "$(cat "/run/$name.pid")"
  while kill -0 "$(cat "/run/$name.pid")" 2>/dev/null; do sleep 0.1; done
fi
instance=
[[ $name != *@* ]] || instance=${name#*@}
unit=/lib/systemd/system/${name%"$instance"}.service
value() { sed -n "s#^$1=##p" "$unit" | sed "s#%i#$instance#g; s#%S#/var/lib#g"; }
set -a
. "$(value EnvironmentFile)"
eval "$(value Environment)"
mkdir -p "/var/lib/$(value StateDirectory)"
eval "setsid $(value ExecStart) </dev/null >/var/log/unit.log 2>&1 &"
echo $! >"/run/$name.pid"
"""


def packages(architecture):
    return {path.name.split("_")[0]: path for path in (PACKAGES / architecture).glob("*.deb")}


@contextlib.contextmanager
def alone():
    """Held while files in CACHE may change, since several tests run at the same time."""
    CACHE.mkdir(parents=True, exist_ok=True)
    with open(CACHE / "lock", "w", encoding="ascii") as lock:
        fcntl.flock(lock, fcntl.LOCK_EX)
        yield


def make_base():
    base = CACHE / "base.tar"
    with alone():
        if not base.exists():
            for older in set(KEPT.iterdir()) - {CACHE}:
                shutil.rmtree(older)
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
        # The scripts of packages start nothing.
        policy = root / "usr/sbin/policy-rc.d"
        policy.write_text("#!/bin/sh\nexit 101\n")
        policy.chmod(0o755)
        (root / "packages").mkdir()

    def bring(self, *paths, names=()):
        """Copies packages into /packages, and into the cache of apt all that they and the packages of
        Debian in `names` depend on, so that apt needs no network."""
        for path in paths:
            shutil.copy(path, self.root / "packages")
        with alone():
            self.download(*paths, *names)

    def download(self, *packages):
        archives = CACHE / "archives"
        (archives / "partial").mkdir(parents=True, exist_ok=True)
        state = CACHE / "state"
        (state / "lists" / "partial").mkdir(parents=True, exist_ok=True)
        options = ["-qq", "-o", f"Dir::State={state}", "-o", f"Dir::Cache={CACHE}/cache",
                   "-o", f"Dir::Cache::archives={archives}/",
                   "-o", f"Dir::State::status={self.root}/var/lib/dpkg/status",
                   "-o", "APT::Sandbox::User=root", "-o", "APT::Keep-Downloaded-Packages=true"]
        (CACHE / "cache").mkdir(exist_ok=True)
        install = ["apt-get", *options, "install", "-y", "--download-only", "--no-install-recommends",
                   *packages]
        # At first there are no lists; later they may name versions that are gone.
        if subprocess.run(install, capture_output=True).returncode != 0:
            subprocess.run(["apt-get", *options, "update"], check=True)
            subprocess.run(install, check=True, stdout=subprocess.DEVNULL)
        for path in archives.glob("*.deb"):
            shutil.copy(path, self.root / "var/cache/apt/archives")
        shutil.copytree(state / "lists", self.root / "var/lib/apt/lists", dirs_exist_ok=True)

    def run(self, script, keep=False):
        """Runs a script of bash in /packages as root, on a copy of the machine that is gone afterwards
        with all that was started, unless it is to be kept. The network is a loopback device that
        nothing else uses."""
        copy = ('mount -t tmpfs tmpfs "$2" && mkdir "$2/new" "$2/work" "$2/root" && mount -t overlay '
                'overlay -o lowerdir="$0",upperdir="$2/new",workdir="$2/work" "$2/root" && set -- '
                '"$1" "$2/root" && ')
        inside = ('ip link set lo up && set -- "$1" "${2:-$0}" && ' + ("" if keep else copy)
                  + 'mount -t proc proc "$2/proc" && '
                  'exec chroot "$2" /bin/bash -euo pipefail -c "cd /packages; $1"')
        with tempfile.TemporaryDirectory(prefix="qitrmc-copy-") as place:
            return subprocess.run(
                ["unshare", "--net", "--mount", "--pid", "--fork", "--kill-child",
                 "bash", "-c", inside, self.root, script, *([] if keep else [place])],
                capture_output=True, text=True, timeout=240,
                env={"PATH": os.environ["PATH"] + ":/usr/sbin:/sbin", "HOME": "/root",
                     "LC_ALL": "C.UTF-8", "DEBIAN_FRONTEND": "noninteractive"})

    def output(self, script, keep=False):
        result = self.run(script, keep)
        assert result.returncode == 0, (script, result.stdout, result.stderr)
        return result.stdout

    def install(self, *names):
        """Installs packages of ours and of Debian, for good."""
        found = {**packages("amd64")}
        ours = [found[name] for name in names if name in found]
        debian = [name for name in names if name not in found]
        self.bring(*ours, names=debian)
        self.output("apt-get install -qq -y --no-install-recommends "
                    + " ".join([f"./{path.name}" for path in ours] + debian) + " >/dev/null", keep=True)


@contextlib.contextmanager
def machine():
    with tempfile.TemporaryDirectory(prefix="qitrmc-machine-") as folder:
        os.chmod(folder, 0o755)
        yield Machine(pathlib.Path(folder))


if __name__ == "__main__":
    make_base()
