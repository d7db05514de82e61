"""A controller in a folder: the shared libraries of the ARM sysroot with the packages, run by the
emulator."""

import pathlib
import shutil
import subprocess
import sys

import machine

sys.path.append(str(machine.ROOT / "tests" / "wire"))
import hostlib  # noqa: E402

CROSS = machine.ROOT / "build" / "cross-armel"
EMULATOR = CROSS / "tools" / "usr" / "bin" / "qemu-arm-static"
LIBRARIES = ("lib/arm-linux-gnueabi", "usr/lib/arm-linux-gnueabi")
PLUGIN = "/usr/lib/qitrmc/plugin/libqitrmcsvc.so"
# Where the emulator puts the memory of the program, so that it can be told from its own.
MEMORY_START = 0x200000000
# An empty folder of the root, served in place of the page.
NO_PAGE = "/srv"


def make(root):
    """Fills the folder. A real root, since the emulator's own translation of paths leaves some out."""
    for folder in LIBRARIES:
        (root / folder).mkdir(parents=True)
        for path in (CROSS / "sysroot" / folder).glob("*.so*"):
            shutil.copy(path, root / folder, follow_symlinks=False)
    shutil.copy(CROSS / "sysroot/lib/ld-linux.so.3", root / "lib", follow_symlinks=False)
    (root / NO_PAGE[1:]).mkdir()
    shutil.copy(EMULATOR, root / "emulator")
    for path in machine.packages("armel").values():
        subprocess.run(["dpkg-deb", "-x", path, root], check=True)


def emulated(root, program):
    """The command that runs a program of the root folder."""
    return ["chroot", str(root), "/emulator", "-B", hex(MEMORY_START), program]


def serve(command, folder):
    """A hostlib.Host that the command starts, with the simulated chassis of the packages."""
    program = pathlib.Path(folder) / "bin" / "qitrmc-host"
    program.parent.mkdir()
    program.write_text("#!/bin/sh\nexport LD_LIBRARY_PATH=/usr/lib/qitrmc/simulator:/usr/lib/qitrmc/host\n"
                       f'exec {" ".join(command)} "$@"\n')
    program.chmod(0o755)
    return hostlib.Host(build_dir=folder, plugin=PLUGIN, options=["--web", NO_PAGE])
