"""The package as a whole: its documentation, its types, and what it links with."""

import doctest
import importlib
import inspect
import os
import pathlib
import shutil
import subprocess
import sys

import pytest

import vorkel
from vorkel import _planner


def test_the_examples_in_descriptions_work():
    tried = {}
    for name in ("vorkel", "vorkel._calls", "vorkel._evaluation", "vorkel._reach"):
        module = importlib.import_module(name)
        failed, tried[name] = doctest.testmod(module, extraglobs={"vorkel": vorkel})
        assert failed == 0, name
    assert all(tried.values())


def test_all_that_is_public_is_there_and_described():
    for name in vorkel.__all__:
        one = getattr(vorkel, name)
        if inspect.isclass(one) or inspect.isfunction(one):
            assert inspect.getdoc(one), name
    assert sorted(vorkel.__all__) == vorkel.__all__


def test_the_stub_is_what_the_extension_has():
    stub = pathlib.Path(vorkel.__file__).with_name("_planner.pyi").read_text()
    for line in stub.splitlines():
        words = line.replace("(", " ").replace(":", " ").split()
        if not words:
            continue
        if words[0] in ("class", "def") and not line.startswith(" "):
            assert hasattr(_planner, words[1]), line
        if line.startswith("class "):
            owner = getattr(_planner, words[1])
        elif line.startswith("    def "):
            assert hasattr(owner, words[1]), line
    public = {name for name in dir(_planner) if not name.startswith("_")}
    assert all(name in stub for name in public)
    assert pathlib.Path(vorkel.__file__).with_name("py.typed").exists()


def test_the_version_is_that_of_the_program(build_dir):
    command = [f"{build_dir}/vorkel", "version"]
    shown = subprocess.run(command, capture_output=True, text=True).stdout
    assert shown == f"vorkel {vorkel.__version__}\n"


def test_no_tcl_in_it():
    libraries = subprocess.run(["ldd", _planner.__file__], capture_output=True, text=True).stdout
    assert "libtcl" not in libraries


# Takes a while, and a program that the other tests do not need.
@pytest.mark.skipif(
    "VORKEL_TEST_LONG" not in os.environ or not shutil.which("mypy"),
    reason="only with ./test --long and mypy",
)
def test_types(tmp_path):
    folder = pathlib.Path(vorkel.__file__).parent
    user = tmp_path / "user.py"
    user.write_text(
        "from fractions import Fraction\n"
        "import vorkel\n"
        "plan = vorkel.plan(\n"
        "    inputs=['27 MHz'], outputs=[148.5, vorkel.Output(27, phase=90), None])\n"
        "actual: Fraction = plan.outputs[0].actual\n"
        "wrong: str = plan.outputs[0].actual\n"
    )
    result = subprocess.run(
        ["mypy", "--strict", "--cache-dir", str(tmp_path / "cache"), str(folder), str(user)],
        capture_output=True,
        text=True,
    )
    assert result.stdout.count("error:") == 1, result.stdout
    assert "user.py:6" in result.stdout


def test_it_can_be_loaded_again():
    assert importlib.reload(vorkel).plan(27, [27]).within
    assert sys.modules["vorkel"] is vorkel
