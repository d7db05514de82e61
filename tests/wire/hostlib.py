"""A running qitrmc-host for tests: on a free loopback port, with a temporary directory of its own.

    with Host(plugin=path) as host:
        status, headers, body = host.post(b"{}")
"""

import contextlib
import http.client
import os
import pathlib
import re
import select
import shutil
import signal
import socket
import ssl
import subprocess
import tempfile
import urllib.parse

ROOT = pathlib.Path(__file__).resolve().parents[2]
BUILD_DIR = pathlib.Path(os.environ.get("QITRMC_BUILD_DIR", ROOT / "build" / "dev")).resolve()
# A plug-in that answers with what it received.
TEST_PLUGIN = BUILD_DIR / "lib" / "libhost_test_plugin.so"

# Far more than anything here takes: it only ends a test that would otherwise hang.
PATIENCE = 60

# Longer than any test leaves its connection idle, so that no test meets a connection closed by the
# host.
IDLE_SECONDS = 600


class HostError(AssertionError):
    """The host broke an assumption that every test relies on."""


class Host:
    """One process of qitrmc-host.

    build_dir  the build folder (QITRMC_BUILD_DIR, else build/dev)
    plugin     path of the plug-in; None for the host's own choice
    options    further options of the command line; they may name another --listen
    env        variables added to the environment
    files      contents of files, by path below the temporary directory, laid out before the start

    Attributes: process (subprocess.Popen), directory (temporary pathlib.Path, also the working
    directory; gone after kill()), first_line (what it printed on stdout).
    """

    def __init__(self, build_dir=None, plugin=None, options=(), env=None, files=None):
        self.directory = pathlib.Path(tempfile.mkdtemp(prefix="qitrmc-host-"))
        for path, content in (files or {}).items():
            (self.directory / path).parent.mkdir(parents=True, exist_ok=True)
            (self.directory / path).write_bytes(content)
        self.program = pathlib.Path(build_dir or BUILD_DIR) / "bin" / "qitrmc-host"
        command = [str(self.program), "--listen", "127.0.0.1:0"]
        if plugin is not None:
            command += ["--plugin", str(plugin)]
        if not any(str(option).startswith("--web") for option in options):
            # Not the page that a build may have.
            (self.directory / "no-page").mkdir()
            command += ["--web", "no-page"]
        self._stderr = open(self.directory / "stderr", "wb")
        self.process = subprocess.Popen(
            command + [str(option) for option in options],
            stdout=subprocess.PIPE, stderr=self._stderr, cwd=self.directory,
            env={**os.environ, **(env or {})})
        try:
            self.first_line = self._read_first_line()
            self._url = urllib.parse.urlsplit(self.first_line.split()[-1])
        except BaseException:
            self.kill()
            raise

    def _read_first_line(self):
        ready, _, _ = select.select([self.process.stdout], [], [], PATIENCE)
        line = self.process.stdout.readline().decode() if ready else ""
        if not re.fullmatch(r"Listening on https?://\S+/qitrmc/Call\n", line):
            raise HostError(f"the host did not start: {line!r}, stderr: {self.stderr!r}")
        return line

    def __enter__(self):
        return self

    def __exit__(self, *_):
        self.kill()

    @property
    def base_url(self):
        """Scheme, address and port, without a path."""
        return f"{self._url.scheme}://{self._url.netloc}"

    @property
    def address(self):
        """The address and port as socket functions take them."""
        return self._url.hostname, self._url.port

    @property
    def stderr(self):
        """What the host has written on standard error so far."""
        return (self.directory / "stderr").read_text(errors="replace")

    def request(self, method, path, body=None, headers=None):
        """One request on a connection of its own: (status, headers, body)."""
        connection = self.connection()
        try:
            connection.request(method, path, body, headers or {})
            response = connection.getresponse()
            return response.status, response.headers, response.read()
        finally:
            connection.close()

    def post(self, body, entry="Call", headers=None):
        """POST of bytes to an entry, which is put into the path unchanged."""
        return self.request("POST", f"/qitrmc/{entry}", body, headers)

    def connection(self):
        """An http.client connection, for several requests on one. To be closed by the caller."""
        if self._url.scheme == "https":
            trusting = ssl._create_unverified_context()  # the certificates of tests sign themselves
            return http.client.HTTPSConnection(*self.address, timeout=PATIENCE, context=trusting)
        return http.client.HTTPConnection(*self.address, timeout=PATIENCE)

    def raw_socket(self):
        """A connected TCP socket. To be closed by the caller."""
        return socket.create_connection(self.address, timeout=PATIENCE)

    def stop(self):
        """Ends the host as a service manager does. Returns its exit status."""
        self.process.send_signal(signal.SIGTERM)
        return self.process.wait(PATIENCE)

    def kill(self):
        """Leaves nothing behind, whatever state the host is in. May be called again."""
        self.process.kill()
        self.process.wait()
        self.process.stdout.close()
        self._stderr.close()
        shutil.rmtree(self.directory, ignore_errors=True)


@contextlib.contextmanager
def clean_host(options=(), files=None):
    """A host of the service for the length of the block. It must end as a service manager ends it,
    and have complained of nothing; built with sanitizers it reports leaks and races here."""
    with Host(options=("--timeout", IDLE_SECONDS, *options), files=files) as running:
        yield running
        status = running.stop()
        assert (status, running.stderr) == (0, "")
