"""How the installed binaries are made: what makes a mistake in them hard to exploit."""

import os
import re

import pytest

from conftest import run

# The program, the library, the two Tcl packages with the handle library, and the Python module.
PROGRAMS = {"vorkel"}
LIBRARIES = {"libvorkel.so", "libIp_Vorkel.so", "libPtrHandleQrm.dll", "_planner.so"}


def binaries(folder):
    """Every file that is executed or loaded, by its name without versions."""
    found = {}
    for path in sorted(folder.rglob("*")):
        if path.is_file() and not path.is_symlink() and path.open("rb").read(4) == b"\x7fELF":
            name = re.sub(r"\.so\.[\d.]+$", ".so", path.name)
            found[path] = re.sub(r"\.cpython-[^.]*\.so$", ".so", name)
    return found


@pytest.fixture(scope="module")
def headers(installed):
    """What readelf shows of each: type, segments, dynamic section, symbols of other libraries."""
    return {path: run("readelf", "-hldW", "--dyn-syms", path) for path in binaries(installed)}


def lacking(headers, holds):
    return [str(path) for path, shown in headers.items() if not holds(shown)]


def test_they_are_all_there(installed):
    assert set(binaries(installed).values()) == PROGRAMS | LIBRARIES


def test_their_place_in_memory_cannot_be_known(headers):
    assert not lacking(headers, lambda shown: re.search(r"Type: +DYN", shown))
    assert not lacking(headers, lambda shown: "TEXTREL" not in shown)


def test_what_the_loader_has_bound_cannot_be_written(headers):
    assert not lacking(headers, lambda shown: re.search(r"^ +GNU_RELRO ", shown, re.MULTILINE))
    assert not lacking(headers, lambda shown: re.search(r"\(FLAGS\) .*\bBIND_NOW\b", shown))


def test_no_memory_is_both_written_and_executed(headers):
    stack = r"^ +GNU_STACK +(?:0x\w+ +){5}RW +0x"
    assert not lacking(headers, lambda shown: re.search(stack, shown, re.MULTILINE))
    assert not lacking(headers, lambda shown: not re.search(r" RWE +0x", shown))


def test_what_overruns_the_stack_ends_the_process(headers):
    assert not lacking(headers, lambda shown: "UND __stack_chk_fail@" in shown)


def test_what_overruns_a_buffer_ends_the_process(headers):
    assert not lacking(headers, lambda shown: re.search(r"UND __\w*printf_chk@", shown))


def test_a_binary_without_all_that_is_found(tmp_path):
    """The checks themselves."""
    source = tmp_path / "weak.cpp"
    source.write_text("int main() { return 0; }\n")
    weak = tmp_path / "weak"
    flags = ["-no-pie", "-fno-stack-protector", "-Wl,-z,norelro,-z,lazy,-z,execstack"]
    run(os.environ["VORKEL_CXX"], *flags, "-o", weak, source)
    shown = {"weak": run("readelf", "-hldW", "--dyn-syms", weak)}
    checks = (
        test_their_place_in_memory_cannot_be_known,
        test_what_the_loader_has_bound_cannot_be_written,
        test_no_memory_is_both_written_and_executed,
        test_what_overruns_the_stack_ends_the_process,
        test_what_overruns_a_buffer_ends_the_process,
    )
    for check in checks:
        with pytest.raises(AssertionError):
            check(shown)
