"""What is in the packages, and what they ask for: as docs/deployment.md says, on both architectures."""

import os
import re
import subprocess

import machine
import pages

NAMES = {"libqitrmcsvc", "qitrmc-tools", "qitrmc-dev", "qitrmc-host", "qitrmc-simulator",
         "python3-qitrmc", "qitrmc-web"}


def dynamic(path, kind):
    text = subprocess.run(["readelf", "-dW", path], check=True, capture_output=True, text=True).stdout
    return re.findall(rf"\({kind}\).*\[(.*)\]", text)


def is_documentation(package, path):
    return (path.startswith(f"/usr/share/doc/{package}/") and path.endswith(("/copyright", "/changelog.gz"))
            or path.startswith("/usr/share/man/man1/")
            or path == f"/usr/share/lintian/overrides/{package}")


def test_all_packages_are_made(packages):
    assert set(packages) == NAMES


def test_every_file_is_documented_and_every_documented_file_is_there(packages):
    found = {name: {pages.as_documented(name, path) for path in package.files()
                    if not is_documentation(name, path)}
             for name, package in packages.items()}
    assert found == pages.documented_files()


def test_every_package_has_its_licence_and_its_changelog(packages):
    for name, package in packages.items():
        assert {f"/usr/share/doc/{name}/copyright", f"/usr/share/doc/{name}/changelog.gz"} <= set(
            package.files())


def test_only_the_server_has_a_run_path_and_it_is_relative(packages):
    found = {name: (dynamic(path, "RUNPATH"), dynamic(path, "RPATH"))
             for package in packages.values() for name, path in package.programs().items()}
    assert found.pop("/usr/bin/qitrmc-host") == (["$ORIGIN/../lib/qitrmc/host"], [])
    assert set(found) == {"/usr/bin/qitrmc-explain", "/usr/lib/qitrmc/plugin/libqitrmcsvc.so",
                          "/usr/lib/qitrmc/host/libws_runtime.so.13",
                          "/usr/lib/qitrmc/simulator/libqitrmcapi.so.1"}
    assert set(map(str, found.values())) == {"([], [])"}


def test_no_file_names_the_folder_that_it_was_built_in(packages):
    for package in packages.values():
        for name, path in package.files().items():
            assert str(machine.ROOT).encode() not in path.read_bytes(), name


def test_no_program_has_room_for_the_path_that_it_was_linked_with(packages):
    """A run path that the installation removes leaves zero bytes in its place, so that packages that are
    built in another folder would differ."""
    for package in packages.values():
        for name, path in package.programs().items():
            sections = subprocess.run(["readelf", "-SW", path], check=True, capture_output=True, text=True)
            found = re.search(r" \.dynstr +STRTAB +[0-9a-f]+ ([0-9a-f]+) ([0-9a-f]+) ", sections.stdout)
            start, size = (int(number, 16) for number in found.groups())
            assert b"\0\0" not in path.read_bytes()[start:start + size], name


def test_the_plug_in_needs_the_documented_libraries(packages):
    path = packages["libqitrmcsvc"].files()["/usr/lib/qitrmc/plugin/libqitrmcsvc.so"]
    loader = re.compile(r"ld-linux.*")
    needed = {name for name in dynamic(path, "NEEDED") if not loader.match(name)}
    documented = set(pages.documented_libraries())
    if packages["libqitrmcsvc"].field("Architecture") == "amd64":
        documented.remove("libm.so.6")
    assert needed == documented


def test_the_plug_in_depends_on_the_packages_of_those_libraries(packages):
    depends = re.findall(r"(?:^|, )([a-z0-9.+-]+)", packages["libqitrmcsvc"].field("Depends"))
    documented = set(pages.documented_libraries().values()) - {"of the controller"}
    assert set(depends) == documented


def test_the_server_depends_on_the_plug_in_and_does_not_bring_a_driver(packages):
    host = packages["qitrmc-host"]
    assert f"libqitrmcsvc (= {host.field('Version')})" in host.field("Depends")
    assert "qitrmc-simulator" not in host.field("Depends")


def test_the_settings_are_configuration_files(packages):
    found = {name: (package.folder / "DEBIAN/conffiles").read_text().split()
             for name, package in packages.items() if (package.folder / "DEBIAN/conffiles").exists()}
    assert found == {"libqitrmcsvc": ["/etc/qinstal/share/qitrmc.ini"],
                     "qitrmc-host": ["/etc/default/qitrmc-host"]}


def test_the_machine_of_the_programs_is_that_of_the_package(packages):
    wanted = {"amd64": "Advanced Micro Devices X86-64", "armel": "ARM"}
    for package in packages.values():
        for name, path in package.programs().items():
            text = subprocess.run(["readelf", "-h", path], check=True, capture_output=True, text=True)
            assert wanted[package.field("Architecture")] in text.stdout, name


def test_the_programs_are_stripped(packages):
    for package in packages.values():
        for name, path in package.programs().items():
            text = subprocess.run(["readelf", "-SW", path], check=True, capture_output=True, text=True)
            assert ".symtab" not in text.stdout, name


def test_lintian_finds_nothing(packages):
    result = subprocess.run(
        ["lintian", "--allow-root", "--fail-on=error,warning", "--tag-display-limit=0",
         *(package.path for package in packages.values())], capture_output=True, text=True)
    assert (result.returncode, result.stdout) == (0, "")


def test_an_installation_without_packages_puts_the_same_files_in_place(packages, tmp_path):
    architecture = packages["libqitrmcsvc"].field("Architecture")
    build = machine.ROOT / "build" / {"amd64": "controller", "armel": "controller-armel"}[architecture]
    subprocess.run(["cmake", "--install", build, "--strip"], check=True, stdout=subprocess.DEVNULL,
                   env={**os.environ, "DESTDIR": str(tmp_path)})
    found = {"/" + str(path.relative_to(tmp_path)): path for path in tmp_path.rglob("*")
             if not path.is_dir()}
    packed = {path: file for package in packages.values() for path, file in package.files().items()}
    assert set(found) == set(packed)
    assert {path for path in packed if found[path].read_bytes() != packed[path].read_bytes()} == set()
