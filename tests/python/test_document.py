"""doc/python.md: its examples, and the names that it tells."""

import doctest
import pathlib
import re

import vorkel


def test_its_examples_work(source_dir):
    failed, tried = doctest.testfile(
        str(pathlib.Path(source_dir, "doc/python.md")), module_relative=False
    )
    assert failed == 0 and tried > 4


def test_the_example_of_the_readme_works(source_dir):
    failed, tried = doctest.testfile(
        str(pathlib.Path(source_dir, "README.md")), module_relative=False
    )
    assert failed == 0 and tried > 2


def test_its_names_are_there(source_dir):
    text = pathlib.Path(source_dir, "doc/python.md").read_text()
    calls = re.findall(r"^\| `(\w+)\(", text, re.MULTILINE)
    methods = re.findall(r"`(to_\w+)\(", text)
    assert calls and methods
    for name in calls:
        assert hasattr(vorkel, name) or hasattr(vorkel.Plan, name), name
    assert set(methods) == {name for name in dir(vorkel.Plan) if name.startswith("to_")}
    for name in re.findall(r"^\| `(\w+Error)`", text, re.MULTILINE):
        assert issubclass(getattr(vorkel, name), vorkel.VorkelError)
    for path in re.findall(r"`(examples/[\w/.]+)`", text):
        assert pathlib.Path(source_dir, path).exists(), path
