"""An installed copy, below a DESTDIR and a prefix with a blank in it."""

import os
import pathlib
import subprocess

import pytest

BUILD = os.environ["VORKEL_BUILD_DIR"]
SOURCE = pathlib.Path(os.environ["VORKEL_SOURCE_DIR"])


def run(*words, env=None, cwd="/", **options):
    """What a command prints; the test fails when the command does."""
    result = subprocess.run(
        [str(word) for word in words],
        capture_output=True,
        text=True,
        cwd=cwd,
        env={**clean_environment(), **(env or {})},
        **options,
    )
    assert result.returncode == 0, f"{words}\n{result.stdout}\n{result.stderr}"
    return result.stdout


def clean_environment():
    """That of this process without what could lead to another copy."""
    dropped = ("VORKEL_", "PYTHONPATH", "TCLLIBPATH", "MANPATH", "LD_LIBRARY_PATH", "DESTDIR")
    return {name: value for name, value in os.environ.items() if not name.startswith(dropped)}


def preloaded():
    """For interpreters that load what is built with sanitizers."""
    libraries = os.environ.get("VORKEL_PRELOAD")
    return {"LD_PRELOAD": libraries} if libraries else {}


@pytest.fixture(scope="session")
def installed(tmp_path_factory):
    """The prefix of the installed copy, where it stands now."""
    root = tmp_path_factory.mktemp("root")
    prefix = "/opt/a prefix"
    install = (os.environ["VORKEL_CMAKE"], "--install", BUILD, "--prefix", prefix)
    run(*install, env={"DESTDIR": str(root)})
    return pathlib.Path(str(root) + prefix)
