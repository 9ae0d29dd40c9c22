"""The program, the Tcl packages, the Python module and the pages, installed and moved away."""

import os
import re
import subprocess

import pytest

from conftest import BUILD, SOURCE, clean_environment, preloaded, run

VERSION = os.environ["VORKEL_VERSION"]


def failing(*words):
    """The result of a command that may fail."""
    return subprocess.run(words, capture_output=True, text=True, env=clean_environment(), cwd="/")


def test_nothing_knows_the_build_tree(installed):
    found = []
    for path in installed.rglob("*"):
        if path.is_file() and not path.is_symlink() and path.suffix not in (".so", ".dll"):
            if os.fsencode(BUILD) in path.read_bytes() and path.name != "vorkel":
                found.append(path)
    assert not found
    for path in [installed / "bin/vorkel", *installed.rglob("*.so*"), *installed.rglob("*.dll")]:
        dynamic = run("readelf", "-d", path)
        for line in dynamic.splitlines():
            if "RPATH" in line or "RUNPATH" in line:
                assert "[$ORIGIN]" in line


def test_the_program_finds_its_devices(installed):
    program = installed / "bin/vorkel"
    assert run(program, "version") == f"vorkel {VERSION}\n"
    report = run(program, "plan", "--in", "27MHz", "--out", "148.5,74.25,27")
    assert report.startswith("device        vk40b484-2 TSYN\n")
    listed = run(program, "devices")
    for path in (SOURCE / "devices").glob("*.toml"):
        assert re.search(rf"^{path.stem} ", listed, re.MULTILINE)
        assert (installed / "share/vorkel/devices" / path.name).read_bytes() == path.read_bytes()


def test_the_program_is_called_by_its_name(installed):
    shown = run("vorkel", "help", env={"PATH": f"{installed}/bin:{os.environ['PATH']}"})
    assert shown.startswith("usage: vorkel COMMAND")
    assert run(installed / "bin/vorkel", "help").startswith("usage: vorkel COMMAND")


def test_requests_in_tcl(installed, tmp_path):
    request = tmp_path / "video.tcl"
    request.write_text("device vk40\ninput 27MHz\nforeach n {2 4} { output [expr {297.0 / $n}] }\n")
    report = run(installed / "bin/vorkel", "plan", "--request", request, "--format", "tcl")
    assert "requested 148.5" in report and "requested 74.25" in report


def test_the_program_knows_when_something_is_missing(installed, tmp_path):
    alone = tmp_path / "bin"
    alone.mkdir()
    (alone / "vorkel").write_bytes((installed / "bin/vorkel").read_bytes())
    (alone / "vorkel").chmod(0o755)
    result = failing(alone / "vorkel", "plan", "--in", "27", "--out", "27")
    assert result.returncode == 2
    assert "unknown device" in result.stderr
    request = tmp_path / "video.tcl"
    request.write_text("device vk40\ninput 27MHz\noutput 27\n")
    result = failing(alone / "vorkel", "plan", "--request", request)
    assert result.returncode == 4
    assert "tcl_request.tcl" in result.stderr


def test_both_tcl_packages(installed, tmp_path):
    script = tmp_path / "script.tcl"
    script.write_text(
        "lappend auto_path [lindex $argv 0]\n"
        "puts [package require vorkel]\n"
        "puts [package require Ip_vorkel]\n"
        "set plan [vorkel::plan -in 27MHz -out {148.5 74.25 27}]\n"
        "puts [dict get [lindex [dict get $plan answers] 0] settings m]\n"
        "set clock [Ip::Vorkel::Init]\n"
        "$clock SetDevice vk40\n"
        'puts [$clock TSYNCalculateActualOutFreqs "200 100" 100 0 2 false false false]\n'
    )
    shown = run(os.environ["VORKEL_TCLSH"], script, installed / "lib/tcltk", env=preloaded())
    assert shown.split() == [VERSION, VERSION, "44", "1"]


def test_the_python_module(installed):
    folder = installed / os.environ["VORKEL_PYTHON_DIR"]
    code = (
        "import vorkel; plan = vorkel.plan(['27 MHz'], ['148.5 MHz', 74.25]);"
        "print(vorkel.__version__, vorkel.__file__, plan.outputs[1].actual)"
    )
    environment = {"PYTHONPATH": str(folder), **preloaded()}
    shown = run(os.environ["VORKEL_PYTHON"], "-c", code, env=environment)
    assert shown == f"{VERSION} {folder}/vorkel/__init__.py 297/4\n"


@pytest.mark.parametrize(
    "section, name, sentence",
    [
        ("1", "vorkel", "plan the clocks of a device"),
        ("n", "vorkel", "Plan the clocks of a device"),
        ("n", "ip_vorkel", "Find the settings of a device's clock-management primitives"),
    ],
)
def test_man_finds_the_pages(installed, section, name, sentence):
    shown = run(
        "man",
        section,
        name,
        env={"MANPATH": str(installed / "share/man"), "MANWIDTH": "200", "LC_ALL": "C"},
    )
    assert sentence in re.sub(".\b", "", shown)


def test_completion(installed):
    script = installed / "share/bash-completion/completions/vorkel"
    code = (
        'source "$1"; COMP_WORDS=(vorkel pl); COMP_CWORD=1; _vorkel vorkel pl vorkel;'
        "echo ${COMPREPLY[@]}"
    )
    path = {"PATH": f"{installed}/bin:{os.environ['PATH']}"}
    assert run("bash", "-c", code, "bash", script, env=path) == "plan pll\n"
    registered = 'source "$1"; complete -p vorkel'
    assert "_vorkel" in run("bash", "-c", registered, "bash", script, env=path)


def test_documents_models_and_examples(installed):
    for path in (SOURCE / "doc").glob("*.md"):
        assert (installed / "share/doc/vorkel" / path.name).exists(), path.name
    models = SOURCE / "hdl"
    for path in models.rglob("*") if models.exists() else []:
        if path.is_file():
            assert (installed / "share/vorkel/hdl" / path.relative_to(models)).exists()
    assert list((installed / "share/doc/vorkel/examples").rglob("*"))
    assert not list(installed.rglob("__pycache__"))


def test_make_packages_says_what_is_wrong_with_its_words():
    script = SOURCE / "tools/make_packages"
    assert run(script, "--help").startswith("usage: tools/make_packages [FOLDER]\n")
    for words in (["--frob"], ["one", "two"]):
        result = failing(script, *words)
        assert (result.returncode, result.stdout) == (2, "")
        assert "usage: tools/make_packages" in result.stderr
