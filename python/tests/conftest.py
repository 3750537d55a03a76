import json
import os
import pathlib
import subprocess
import sys

import pytest

SOURCE = pathlib.Path(__file__).resolve().parents[2]
BUILD = pathlib.Path(os.environ["ZOR_BUILD_DIR"])
sys.path.insert(0, str(BUILD / "python"))


class Lyra:
    """The command, run beside the module on the same files."""

    def run(self, *arguments, code=0):
        done = subprocess.run([str(BUILD / "bin/lyra"), *map(str, arguments)], capture_output=True, text=True)
        assert done.returncode == code, done.stderr
        return done.stdout

    def json(self, *arguments):
        return json.loads(self.run(*arguments))

    def info(self, path):
        """What `lyra info --json` says of a document, without what the JSON says of itself."""
        printed = self.json("info", "--json", path)
        for name in ("$schema", "schemaVersion", "units", "tool", "filters"):
            del printed[name]
        return printed

    def complaint(self, *arguments):
        """The one line by which the command refuses, or None."""
        done = subprocess.run([str(BUILD / "bin/lyra"), *map(str, arguments)], capture_output=True, text=True)
        return done.stderr.removeprefix("lyra: ").rstrip("\n") if done.returncode == 1 else None


@pytest.fixture(scope="session")
def lyra():
    return Lyra()


@pytest.fixture(scope="session")
def samples():
    return SOURCE / "samples"


@pytest.fixture(autouse=True)
def no_write_beside_sources(tmp_path, monkeypatch):
    monkeypatch.chdir(tmp_path)
