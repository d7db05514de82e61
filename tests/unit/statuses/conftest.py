import pytest

from status_catalogue import generate


@pytest.fixture(scope="session")
def shared(tmp_path_factory):
    """A shared directory with the explanation files and nothing else."""
    directory = tmp_path_factory.mktemp("shared")
    result = generate("--shared", directory)
    assert (result.returncode, result.stdout, result.stderr) == (0, "", "")
    return directory
