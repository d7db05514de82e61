"""scripts/run, in a copy of the repository that has nothing to build."""

import os
import pathlib
import shutil
import signal
import subprocess

import pytest

from hostlib import BUILD_DIR, ROOT

BUILD_STEP = """#!/bin/sh
[ -e scripts/run ] || { echo "not in the repository: $PWD" >&2; exit 1; }
"""


def write_program(path, text):
    path.write_text(text)
    path.chmod(0o755)


@pytest.fixture
def repository(tmp_path):
    """A folder with scripts/run, a finished build and build steps that only check their folder."""
    folder = tmp_path / "the repository"
    for part in ("scripts", "build/release", "tools"):
        (folder / part).mkdir(parents=True)
    shutil.copy(ROOT / "scripts" / "run", folder / "scripts")
    write_program(folder / "scripts" / "setup", BUILD_STEP)
    write_program(folder / "tools" / "cmake", BUILD_STEP)
    (folder / "build" / "release" / "bin").symlink_to(BUILD_DIR / "bin")
    return folder


@pytest.fixture
def run(repository, tmp_path):
    """Starts scripts/run in another folder. Returns the process and the two lines printed."""
    started = []
    user_folder = tmp_path / "user"
    user_folder.mkdir()

    def start(*options, command=repository / "scripts" / "run", cwd=user_folder):
        process = subprocess.Popen(
            [command, "--listen", "127.0.0.1:0", *options], cwd=cwd, stdout=subprocess.PIPE,
            stderr=subprocess.PIPE, text=True, env={
                **os.environ, "PATH": f"{repository / 'tools'}:{os.environ['PATH']}",
                "CDPATH": str(tmp_path)})
        started.append(process)
        return process, process.stdout.readline(), process.stdout.readline()

    yield start
    for process in started:
        process.send_signal(signal.SIGTERM)
        process.communicate()


def answer_to_printed_line(line):
    assert line.startswith("Try:  curl ")
    return subprocess.run(["sh", "-c", line.removeprefix("Try:  ")], capture_output=True, text=True,
                          check=True, timeout=60).stdout


def test_files_were_looked_for_in_the_repository_instead_of_the_users_folder(run, tmp_path):
    shutil.copy(ROOT / "simulator" / "chassis" / "small.json", tmp_path / "user" / "rack.json")
    (tmp_path / "user" / "faults.json").write_text('{"faults": []}')
    process, listening, line = run("--chassis", "rack.json", "--state", "state", "--faults",
                                   "faults.json", "--trace", "trace")
    assert listening.startswith("Listening on http://127.0.0.1:"), process.stderr.read()
    assert '"session_id":"_session1"' in answer_to_printed_line(line)
    process.send_signal(signal.SIGTERM)
    process.communicate(timeout=60)
    assert "initializeSession" in (tmp_path / "user" / "trace").read_text()
    assert (tmp_path / "user" / "state").is_dir()


def test_the_printed_line_failed_behind_https(run, tmp_path, certificate):
    for path, name in zip(certificate, ("cert.pem", "key.pem")):
        shutil.copy(path, tmp_path / "user" / name)
    process, listening, line = run("--tls-cert", "cert.pem", "--tls-key", "key.pem")
    assert listening.startswith("Listening on https://127.0.0.1:"), process.stderr.read()
    assert '"session_id":"_session1"' in answer_to_printed_line(line)


@pytest.mark.parametrize("command, folder", [("scripts/run", "the repository"),
                                             ("../the repository/scripts/run", "user")])
def test_the_script_finds_the_repository_from_a_relative_path(run, tmp_path, command, folder):
    process, listening, line = run(command=pathlib.Path(command), cwd=tmp_path / folder)
    assert listening.startswith("Listening on http://127.0.0.1:"), process.stderr.read()
    assert '"session_id":"_session1"' in answer_to_printed_line(line)


def test_the_printed_line_skips_the_certificate_check_only_behind_https(run):
    assert run()[2].startswith("Try:  curl -s http://127.0.0.1:")


def test_the_script_ends_where_a_build_step_fails(run, repository):
    write_program(repository / "tools" / "cmake", "#!/bin/sh\nexit 3\n")
    process, listening, _ = run()
    assert (process.wait(60), listening) == (3, "")
