"""The generator refuses faulty tables and reports where and what is wrong."""

import shutil

import pytest

from status_catalogue import FOLDERS, GAPS, ROOT, generate

CATALOGUE = "share/statuses/catalogue.tsv"
DRIVER = "share/statuses/driver.tsv"
SIMULATOR = "simulator/status/statuses.tsv"


class Project:
    """A copy of the generator with its tables in the same places."""

    def __init__(self, root):
        self.root = root
        for name in (SIMULATOR, CATALOGUE, DRIVER, "share/statuses/make_explanations.py",
                     "share/statuses/status_tables.py", "share/languages.py",
                     "share/languages.tsv"):
            (root / name).parent.mkdir(parents=True, exist_ok=True)
            shutil.copy(ROOT / name, root / name)

    def change_cell(self, name, line, column, value):
        lines = self.lines(name)
        cells = lines[line - 1].split("\t")
        cells[lines[0].split("\t").index(column)] = value
        lines[line - 1] = "\t".join(cells)
        self.write(name, lines)

    def lines(self, name):
        return (self.root / name).read_text(encoding="utf-8").removesuffix("\n").split("\n")

    def write(self, name, lines):
        (self.root / name).write_text("\n".join(lines) + "\n", encoding="utf-8")

    def refusal(self):
        """Run the generator, which must fail and write nothing, and return its message."""
        result = generate("--shared", self.root / "out", "--page", self.root / "page.md",
                          generator=self.root / "share/statuses/make_explanations.py")
        assert result.returncode == 1
        assert not (self.root / "out").exists() and not (self.root / "page.md").exists()
        assert "Traceback" not in result.stderr
        return result.stderr.replace(f"{self.root}/", "").splitlines()


@pytest.fixture
def project(tmp_path):
    return Project(tmp_path)


@pytest.mark.parametrize("column, value, fault", [
    ("eng_remedy", "", "eng_remedy is empty"),
    ("eng_remedy", "Try again. ", "eng_remedy has a blank at an end or two blanks in a row"),
    ("eng_remedy", "Try  again.", "eng_remedy has a blank at an end or two blanks in a row"),
    ("eng_remedy", "</qierror>", "eng_remedy holds one of the characters < > &"),
    ("eng_remedy", "Try\0again.", "eng_remedy holds a control or formatting character"),
    ("eng_remedy", "Try\ragain.", "eng_remedy holds a control or formatting character"),
    ("eng_remedy", "Essaye\u0301.", "eng_remedy is not in Unicode normalization form C"),
    ("code", "x", "code 'x' is no number from -2147483648 to 2147483647 other than 0"),
    ("code", "0", "code '0' is no number from -2147483648 to 2147483647 other than 0"),
    ("code", "-010",
     "code '-010' is no number from -2147483648 to 2147483647 other than 0"),
    ("code", "-2147483649",
     "code '-2147483649' is no number from -2147483648 to 2147483647 other than 0"),
    ("constant", "Bad Name", "constant 'Bad Name' is no name in lower camel case"),
    ("raiser", "someone", "raiser 'someone' is none of json-rpc, service, platform"),
    ("raiser", "driver", "raiser 'driver' is none of json-rpc, service, platform"),
])
def test_a_faulty_cell_is_named_with_its_line(project, column, value, fault):
    project.change_cell(CATALOGUE, 3, column, value)
    assert f"{CATALOGUE}:3: {fault}" in project.refusal()


def test_a_repeated_code_is_named_with_both_places(project):
    project.change_cell(CATALOGUE, 4, "code", "-32700")
    assert project.refusal() == [
        f"{CATALOGUE}:4: code -32700 stands already at {CATALOGUE}:2"]


def test_a_code_of_both_tables_is_named_with_both_places(project):
    project.change_cell(CATALOGUE, 4, "code", "-250950")
    line = next(number for number, text in enumerate(project.lines(SIMULATOR), start=1)
                if text.startswith("-250950\t"))
    assert project.refusal() == [
        f"{SIMULATOR}:{line}: code -250950 stands already at {CATALOGUE}:4"]


def test_a_repeated_constant_is_named_with_both_places(project):
    project.change_cell(CATALOGUE, 4, "constant", "parseError")
    assert project.refusal() == [
        f"{CATALOGUE}:4: constant parseError stands already at {CATALOGUE}:2"]


def test_a_new_code_of_the_driver_needs_a_row_of_translations(project):
    lines = project.lines(SIMULATOR)
    project.write(SIMULATOR, [*lines, "-250999\tsomething\tIt happened.\tTry again."])
    assert project.refusal() == [
        f"{SIMULATOR}:{len(lines) + 1}: code -250999 has no row in {DRIVER}"]


def test_translations_of_a_code_that_the_driver_lacks_are_refused(project):
    *lines, last = project.lines(SIMULATOR)
    project.write(SIMULATOR, lines)
    code = last.split("\t")[0]
    assert project.refusal() == [
        f"{DRIVER}:{len(lines) + 1}: code {code} has no row in {SIMULATOR}"]


@pytest.mark.parametrize("language", FOLDERS)
def test_an_explanation_fits_in_one_line_of_the_reader(project, language):
    cells = dict(zip(project.lines(CATALOGUE)[0].split("\t"),
                     project.lines(CATALOGUE)[1].split("\t")))
    room = 1022 - len((cells[f"{language}_happened"] + GAPS[language]).encode())
    project.change_cell(CATALOGUE, 2, f"{language}_remedy", "x" * (room + 1))
    assert project.refusal() == [
        f"{CATALOGUE}:2: the {language} texts make a line of 1024 bytes; 1023 fit"]
    project.change_cell(CATALOGUE, 2, f"{language}_remedy", "x" * room)
    assert generate("--shared", project.root / "out",
                    generator=project.root / "share/statuses/make_explanations.py").returncode == 0


def test_a_translation_that_repeats_the_english_text_is_refused(project):
    project.change_cell(CATALOGUE, 2, "deu_remedy", project.lines(CATALOGUE)[1].split("\t")[4])
    assert project.refusal() == [f"{CATALOGUE}:2: deu repeats an English text"]


def test_a_row_with_a_missing_column_is_named(project):
    lines = project.lines(CATALOGUE)
    lines[5] = lines[5].rpartition("\t")[0]
    project.write(CATALOGUE, lines)
    assert project.refusal() == [f"{CATALOGUE}:6: 14 columns instead of 15"]


@pytest.mark.parametrize("name", (CATALOGUE, DRIVER, SIMULATOR))
def test_a_table_with_another_header_is_refused(project, name):
    lines = project.lines(name)
    project.write(name, [lines[0].replace("code", "number"), *lines[1:]])
    refusal = project.refusal()
    assert len(refusal) == 1
    assert refusal[0].startswith(f"{name}:1: the header must name the columns code, ")


@pytest.mark.parametrize("name", (CATALOGUE, DRIVER, SIMULATOR))
def test_a_missing_table_is_named(project, name):
    (project.root / name).unlink()
    assert project.refusal() == [f"{name}: No such file or directory"]


def test_bytes_that_are_not_utf_8_are_named_with_their_place(project):
    path = project.root / CATALOGUE
    path.write_bytes(path.read_bytes().replace(b"-32601\tunknown", b"-32601\tunkn\xffwn"))
    assert project.refusal() == [f"{CATALOGUE}:4: not UTF-8 at byte 12 of the line"]


def test_every_fault_is_reported_at_once(project):
    project.change_cell(CATALOGUE, 2, "eng_remedy", "")
    project.change_cell(DRIVER, 3, "raiser", "nobody")
    assert project.refusal() == [
        f"{CATALOGUE}:2: eng_remedy is empty",
        f"{DRIVER}:3: raiser 'nobody' is none of driver, simulated-driver"]


def test_a_folder_that_cannot_be_written_is_named(tmp_path):
    (tmp_path / "file").write_text("")
    result = generate("--shared", tmp_path / "file")
    assert result.returncode == 1
    assert str(tmp_path / "file") in result.stderr and "Traceback" not in result.stderr
