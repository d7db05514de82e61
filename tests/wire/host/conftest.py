"""Fixtures for the tests of the host: its test plug-in, and hosts that serve it."""

import os
import subprocess

import pytest

from hostlib import BUILD_DIR, TEST_PLUGIN, Host


@pytest.fixture
def start_host():
    """Starts hosts of the test plug-in with further options and environment.

    Hosts that still run at the end of the test must exit cleanly, without a sanitizer report.
    """
    hosts = []

    def start(*options, **env):
        hosts.append(Host(plugin=TEST_PLUGIN, options=options, env=env))
        return hosts[-1]

    yield start
    try:
        for host in hosts:
            assert host.process.poll() is not None or host.stop() == 0, host.stderr
            assert "Sanitizer" not in host.stderr, host.stderr
    finally:
        for host in hosts:
            host.kill()


@pytest.fixture
def host(start_host):
    return start_host()


@pytest.fixture
def run_host():
    """Runs the program to its end, for command lines that cannot serve."""

    def run(*arguments, **env):
        return subprocess.run([BUILD_DIR / "bin" / "qitrmc-host", *map(str, arguments)],
                              capture_output=True, text=True, timeout=60,
                              env={**os.environ, **env})

    return run


@pytest.fixture
def refused_start(run_host):
    """Expects a start to fail with one line on standard error, which it returns."""

    def run(*arguments, status=1, **env):
        result = run_host(*arguments, **env)
        assert (result.returncode, result.stdout) == (status, ""), result
        assert result.stderr.startswith("qitrmc-host: ")
        assert result.stderr.endswith("\n") and result.stderr.count("\n") == 1, result.stderr
        return result.stderr.removeprefix("qitrmc-host: ").rstrip("\n")

    return run


@pytest.fixture(scope="session")
def certificate(tmp_path_factory):
    """A certificate that signs itself, and its key: two paths."""
    folder = tmp_path_factory.mktemp("tls")
    cert, key = folder / "cert.pem", folder / "key.pem"
    subprocess.run(["openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-days", "2",
                    "-subj", "/CN=localhost", "-keyout", key, "-out", cert],
                   check=True, capture_output=True)
    return cert, key
