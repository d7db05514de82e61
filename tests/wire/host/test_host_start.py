"""Command line, start and refusal to start."""

import os
import socket
import subprocess

import pytest

from hostlib import BUILD_DIR, TEST_PLUGIN


def test_prints_exactly_one_line_with_the_port_it_took(host):
    assert host.first_line == f"Listening on http://127.0.0.1:{host.address[1]}/qitrmc/Call\n"
    assert host.address[1] != 0
    host.process.terminate()
    assert host.process.stdout.read() == b""


def test_listens_on_the_address_and_port_it_is_given(start_host):
    with socket.create_server(("127.0.0.2", 0)) as probe:
        port = probe.getsockname()[1]
    host = start_host("--listen", f"127.0.0.2:{port}")
    assert host.first_line == f"Listening on http://127.0.0.2:{port}/qitrmc/Call\n"
    assert host.post(b"")[0] == 200


def test_listens_on_an_ipv6_address_in_brackets(start_host):
    host = start_host("--listen", "[::1]:0")
    assert host.first_line == f"Listening on http://[::1]:{host.address[1]}/qitrmc/Call\n"
    assert host.post(b"")[0] == 200


def test_initialises_the_plugin_before_it_listens_and_finalises_it_once(start_host, tmp_path):
    log = tmp_path / "log"
    host = start_host(HOST_PLUGIN_LOG=str(log))
    assert log.read_text() == "init\n"
    host.post(b"", "Nothing")
    assert host.stop() == 0
    assert log.read_text() == "init\nrun Nothing\nfinalize\n"


def test_hands_the_chassis_state_and_faults_to_the_driver(start_host, tmp_path):
    chassis = tmp_path / "chassis.json"
    chassis.write_text("")
    host = start_host("--chassis", chassis, "--state", tmp_path / "state",
                      "--faults", tmp_path / "faults.json")
    lines = host.post(b"")[2].decode().splitlines()
    assert f"chassis {chassis}" in lines
    assert f"state {tmp_path / 'state'}" in lines
    assert f"faults {tmp_path / 'faults.json'}" in lines


def test_hands_the_seed_and_the_time_scale_to_the_driver(start_host):
    host = start_host("--seed", 18446744073709551615, "--time-scale", "calls")
    lines = host.post(b"")[2].decode().splitlines()
    assert "seed 18446744073709551615" in lines
    assert "time scale calls" in lines


def test_without_options_the_environment_of_the_driver_is_unchanged(start_host):
    host = start_host(QITRMC_SIM_SEED="5", QITRMC_SIM_TIME_SCALE="10")
    lines = host.post(b"")[2].decode().splitlines()
    assert "seed 5" in lines
    assert "time scale 10" in lines


@pytest.mark.parametrize("option", ["--help", "-h"])
def test_help_goes_to_standard_output(run_host, option):
    result = run_host(option)
    assert (result.returncode, result.stderr) == (0, "")
    assert result.stdout.startswith("Usage: qitrmc-host ")


def test_version_is_one_line(run_host):
    result = run_host("--version")
    assert (result.returncode, result.stderr) == (0, "")
    name, version = result.stdout.split()
    assert name == "qitrmc-host"
    assert all(part.isdigit() for part in version.split("."))


@pytest.mark.parametrize("arguments, message", [
    (["--nonsense"], 'Unknown argument "--nonsense". Try --help.'),
    (["--plugin"], "--plugin: 1 required PATH missing. Try --help."),
    (["--listen", "8080"],
     '--listen takes ADDR:PORT, such as 127.0.0.1:8080 or [::1]:8080, not "8080".'),
    (["--timeout", "soon"], '--timeout takes a number from 1 to 86400, not "soon".'),
    (["--seed", "-1"], '--seed takes a number from 0 to 18446744073709551615, not "-1".'),
    (["--time-scale", "fast"],
     '--time-scale takes a number from 0.001 to 1000000 or the word calls, not "fast".'),
    (["--host-name", "lab:80"], "--host-name takes a name or address without a port, such as "
     'lab-pc.example, not "lab:80".'),
    (["--allow-origin", "null"], "--allow-origin takes SCHEME://HOST[:PORT], such as "
     'http://localhost:3000, not "null".'),
    (["--tls-key", "key.pem"], "--tls-cert and --tls-key are given together or not at all."),
])
def test_a_wrong_command_line_ends_with_status_2(refused_start, arguments, message):
    assert refused_start(*arguments, status=2) == message


def test_a_port_in_use_is_named_before_the_plugin_is_initialised(refused_start, tmp_path):
    log = tmp_path / "log"
    with socket.create_server(("127.0.0.1", 0)) as taken:
        where = f"127.0.0.1:{taken.getsockname()[1]}"
        message = refused_start("--listen", where, "--plugin", TEST_PLUGIN,
                                HOST_PLUGIN_LOG=str(log))
    assert message == (f"Cannot listen on {where}: the port is in use. Stop the program that uses "
                       "it, or choose another port with --listen.")
    assert not log.exists()


def test_an_address_of_another_machine_is_refused(refused_start):
    message = refused_start("--listen", "192.0.2.1:0", "--plugin", TEST_PLUGIN)
    assert message.startswith("Cannot listen on 192.0.2.1:0: Cannot assign requested address.")


def test_a_name_that_is_not_an_address_is_refused(refused_start):
    message = refused_start("--listen", "no.such.host.invalid:0", "--plugin", TEST_PLUGIN)
    assert message.startswith("Cannot listen on no.such.host.invalid:0: ")


def test_a_missing_plugin_file_is_named(refused_start, tmp_path):
    path = tmp_path / "none.so"
    assert refused_start("--listen", "127.0.0.1:0", "--plugin", path) == (
        f"There is no plug-in file {path}. Build it, or name another with --plugin.")


def test_a_file_that_is_not_a_library_is_refused(refused_start, tmp_path):
    path = tmp_path / "text.so"
    path.write_text("not a library")
    message = refused_start("--listen", "127.0.0.1:0", "--plugin", path)
    assert message.startswith(f"The plug-in cannot be loaded: {path}: ")


def test_a_missing_function_is_named(refused_start):
    path = BUILD_DIR / "lib" / "libhost_incomplete_plugin.so"
    assert refused_start("--listen", "127.0.0.1:0", "--plugin", path) == (
        f"The library {path} has no function qitrmcRun. Name a plug-in of this service with "
        "--plugin.")


def copy_of_the_program(folder):
    """The program in <folder>/bin, with the build's runtime."""
    (folder / "bin").mkdir()
    (folder / "lib").mkdir()
    program = folder / "bin" / "qitrmc-host"
    program.write_bytes((BUILD_DIR / "bin" / "qitrmc-host").read_bytes())
    program.chmod(0o755)
    return program


def test_without_a_plugin_option_the_folders_beside_the_program_are_searched(tmp_path):
    program = copy_of_the_program(tmp_path)
    result = subprocess.run([program, "--listen", "127.0.0.1:0"], capture_output=True, text=True)
    assert result.returncode == 1
    assert result.stderr == (
        f"qitrmc-host: There is no plug-in at {tmp_path}/lib/libqitrmcsvc.so nor at "
        f"{tmp_path}/bin/libqitrmcsvc.so. Build it, or name another with --plugin.\n")


@pytest.mark.parametrize("folder", ["lib", "bin"])
def test_a_plugin_beside_the_program_is_found(tmp_path, folder):
    program = copy_of_the_program(tmp_path)
    (tmp_path / folder / "libqitrmcsvc.so").symlink_to(TEST_PLUGIN)
    process = subprocess.Popen([program, "--listen", "127.0.0.1:0"], stdout=subprocess.PIPE)
    with process:
        assert process.stdout.readline().startswith(b"Listening on http://127.0.0.1:")
        process.terminate()
    assert process.returncode == 0


def test_a_plugin_name_without_a_slash_is_a_file_of_the_working_directory(tmp_path):
    (tmp_path / "service.so").symlink_to(TEST_PLUGIN)
    process = subprocess.Popen(
        [BUILD_DIR / "bin" / "qitrmc-host", "--listen", "127.0.0.1:0", "--plugin", "service.so"],
        stdout=subprocess.PIPE, cwd=tmp_path)
    with process:
        assert process.stdout.readline().startswith(b"Listening on http://127.0.0.1:")
        process.terminate()
    assert process.returncode == 0


def test_a_chassis_file_that_cannot_be_read_is_refused(refused_start, tmp_path):
    missing = tmp_path / "none.json"
    assert refused_start("--plugin", TEST_PLUGIN, "--chassis", missing) == (
        f"The chassis file {missing} cannot be read: No such file or directory. Name a readable "
        "file with --chassis.")
    assert refused_start("--plugin", TEST_PLUGIN, "--chassis", tmp_path) == (
        f"The chassis file {tmp_path} cannot be read: Is a directory. Name a readable file with "
        "--chassis.")


def test_a_plugin_that_cannot_initialise_is_reported_and_not_finalised(refused_start, tmp_path):
    log = tmp_path / "log"
    message = refused_start("--listen", "127.0.0.1:0", "--plugin", TEST_PLUGIN,
                            HOST_PLUGIN_LOG=str(log), HOST_PLUGIN_INIT_THROWS="1")
    assert message == ("The plug-in's qitrmcInit failed: no service today. Look into the plug-in "
                       "and its configuration.")
    assert log.read_text() == "init\n"


def test_a_plugin_that_cannot_finalise_is_reported(start_host):
    host = start_host(HOST_PLUGIN_FINALIZE_THROWS="1")
    host.process.terminate()
    assert host.process.wait(60) == 1
    assert "The plug-in's qitrmcFinalize failed: no end today." in host.stderr


def test_the_runtime_exports_exactly_the_five_functions():
    library = BUILD_DIR / "lib" / "libws_runtime.so.13"
    listing = subprocess.run(["nm", "-D", "--defined-only", library], check=True,
                             capture_output=True, text=True).stdout
    assert sorted(line.split()[1:] for line in listing.splitlines()) == [
        ["T", "ReadPostData_C_REST_QI_QVWS_"],
        ["T", "ReadRequestVariable_C_REST_QI_QVWS_"],
        ["T", "SetHTTPResponseCode_QI_QVWS_"],
        ["T", "SetHTTPResponseMimeType_C_REST_QI_QVWS_"],
        ["T", "WriteOutput_C_REST_QI_QVWS_"],
    ]


def test_the_runtime_has_its_versioned_soname_and_is_loaded_by_the_host():
    def dynamic_section(path):
        return subprocess.run(["readelf", "-d", os.fspath(path)], check=True, capture_output=True,
                              text=True).stdout

    assert "soname: [libws_runtime.so.13]" in dynamic_section(BUILD_DIR / "lib/libws_runtime.so")
    assert "Shared library: [libws_runtime.so.13]" in dynamic_section(BUILD_DIR / "bin/qitrmc-host")
