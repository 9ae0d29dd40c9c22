"""The examples for Python flows and for build tools with cores."""

import importlib
import os
import pathlib
import re
import shutil
import subprocess
import sys

import pytest
import yaml

import vorkel

EXAMPLES = pathlib.Path(os.environ["VORKEL_SOURCE_DIR"], "examples")
GENERATOR = EXAMPLES / "core_generator/vorkel_generator.py"
VIDEO = EXAMPLES / "core_generator/clocks.yml"


def run(script, *words, cwd):
    return subprocess.run(
        [sys.executable, script, *words], cwd=cwd, capture_output=True, text=True
    )


def run_tool(*words, cwd):
    """A simulator, without what the module under test needs loaded first."""
    environment = {name: value for name, value in os.environ.items() if name != "LD_PRELOAD"}
    return subprocess.run(words, cwd=cwd, capture_output=True, text=True, env=environment)


def test_settings_are_those_of_the_module(tmp_path):
    result = run(EXAMPLES / "python/clock_settings.py", "27", "148.5", "74.25", cwd=tmp_path)
    assert result.returncode == 0, result.stderr
    shown = dict(re.findall(r"^    [pio]_(\w+)='?(\w+)'?,$", result.stdout, re.MULTILINE))
    module = vorkel.plan(27, [148.5, 74.25]).to_verilog()
    written = dict(re.findall(r'\.(\w+)\("?(\w+)"?\)', module))
    assert len(shown) > 10
    assert {name: written[name] for name in shown} == shown
    # 1000 / 148.5 is 6.734007.
    assert re.search(r"^clk_out0: 6.734007 ns, ", result.stdout, re.MULTILINE)


@pytest.mark.parametrize(
    "words, status",
    [
        ((), 2),
        (("27",), 2),
        (("27", "x"), 2),
        (("1kHz", "5GHz"), 1),
        (("27", "148.5", "33.7", "101.01"), 3),
    ],
)
def test_settings_of_a_bad_request(tmp_path, words, status):
    result = run(EXAMPLES / "python/clock_settings.py", *words, cwd=tmp_path)
    assert result.returncode == status
    assert "Traceback" not in result.stderr
    assert bool(result.stderr) == (status in (1, 2))


def core_of(folder, name):
    lines = (folder / f"{name}.core").read_text().splitlines()
    assert lines[0] == "CAPI=2:"
    return yaml.safe_load("\n".join(lines[1:]))


# What the description of a core can have in each place, as far as it is used here.
TOP = {"name", "description", "filesets", "generate", "generators", "targets"}
ENTRIES = {
    "filesets": {"files", "file_type", "depend"},
    "targets": {"filesets", "default_tool", "generate", "toplevel"},
    "generate": {"generator", "parameters"},
    "generators": {"interpreter", "command", "description", "usage"},
}
FILE_TYPES = {"verilogSource", "vhdlSource", "SDC"}


def check_form(core):
    """A build tool takes a core with this form."""
    assert set(core) <= TOP
    assert re.fullmatch(r"[\w-]+:[\w-]+:[\w-]+:\d[\w.]*", core["name"])
    for section, known in ENTRIES.items():
        for name, entry in core.get(section, {}).items():
            assert re.fullmatch(r"\w+", name) and set(entry) <= known, (section, name)
    for fileset in core.get("filesets", {}).values():
        assert fileset["file_type"] in FILE_TYPES
        assert all(isinstance(path, str) and not path.startswith("/") for path in fileset["files"])
        assert len(set(fileset["files"])) == len(fileset["files"])
    for target in core.get("targets", {}).values():
        assert set(target["filesets"]) <= set(core["filesets"])
        assert set(target.get("generate", [])) <= set(core.get("generate", {}))
    assert "default" in core.get("targets", {"default": None})


def files_of(core, target):
    return [
        path
        for fileset in core["targets"][target]["filesets"]
        for path in core["filesets"][fileset]["files"]
    ]


def generated(tmp_path, **parameters):
    document = yaml.safe_load(VIDEO.read_text())
    document["parameters"].update(parameters)
    request = tmp_path / "request.yml"
    request.write_text(yaml.safe_dump(document))
    folder = tmp_path / "core"
    folder.mkdir()
    return run(GENERATOR, str(request), cwd=folder), folder


def test_a_core_in_verilog_simulates(tmp_path):
    result, folder = generated(tmp_path)
    assert (result.returncode, result.stdout, result.stderr) == (0, "", "")
    core = core_of(folder, "video_clocks")
    check_form(core)
    assert core["name"] == "example:clocks:video:1.0"
    assert core["targets"]["sim"]["default_tool"] == "icarus"
    assert core["filesets"]["constraints"] == {"files": ["video_clocks.sdc"], "file_type": "SDC"}
    assert files_of(core, "default") == ["video_clocks.v", "video_clocks.sdc"]
    used = {path for target in core["targets"] for path in files_of(core, target)}
    there = {str(path.relative_to(folder)) for path in folder.rglob("*") if path.is_file()}
    assert there == used | {"video_clocks.core"}
    plan = vorkel.plan(
        "27 MHz", ["148.5MHz", vorkel.Output(74.25, phase=90), 27], input_jitter=50, device="vk40"
    )
    assert (folder / "video_clocks.v").read_text() == plan.to_verilog("video_clocks")
    assert (folder / "video_clocks.sdc").read_text() == plan.to_sdc()
    if not shutil.which("iverilog"):
        pytest.skip("there is no iverilog")
    top = core["targets"]["sim"]["toplevel"]
    options = ("-g2005", "-Wall", "-s", top, "-o", "sim")
    built = run_tool("iverilog", *options, *files_of(core, "sim"), cwd=folder)
    assert (built.returncode, built.stderr) == (0, "")
    shown = run_tool("vvp", "-n", "sim", cwd=folder)
    assert shown.returncode == 0 and "PASS" in shown.stdout, shown.stdout


def test_a_core_in_vhdl_can_be_compiled_in_its_order(tmp_path):
    result, folder = generated(tmp_path, language="vhdl", name="pixel")
    assert result.returncode == 0, result.stderr
    core = core_of(folder, "pixel")
    check_form(core)
    assert core["targets"]["sim"]["default_tool"] == "ghdl"
    assert core["filesets"]["rtl"] == {"files": ["pixel.vhd"], "file_type": "vhdlSource"}
    if not shutil.which("ghdl"):
        pytest.skip("there is no ghdl")
    # Each file names units of those before it alone, which some tools want.
    names = set()
    for path in files_of(core, "sim"):
        text = (folder / path).read_text()
        used = re.findall(r"\bwork\.(\w+)|^ *component (\w+)", text, re.IGNORECASE | re.MULTILINE)
        assert {(unit or component).lower() for unit, component in used} - {"all"} <= names, path
        units = re.findall(r"^(?:entity|package) (\w+) is", text, re.IGNORECASE | re.MULTILINE)
        names.update(unit.lower() for unit in units)
        built = run_tool("ghdl", "-a", "--std=08", path, cwd=folder)
        assert (built.returncode, built.stderr) == (0, ""), path
    top = core["targets"]["sim"]["toplevel"]
    shown = run_tool("ghdl", "--elab-run", "--std=08", top, cwd=folder)
    assert shown.returncode == 0 and "PASS" in shown.stdout, shown.stdout


def test_a_core_without_a_simulation(tmp_path):
    result, folder = generated(tmp_path, simulation=False)
    assert result.returncode == 0
    assert sorted(path.name for path in folder.iterdir()) == [
        "video_clocks.core", "video_clocks.sdc", "video_clocks.v",
    ]


def test_a_design_with_the_generator(tmp_path):
    """What a build tool does with the cores of the example."""
    for name in ("vorkel_generator", "video"):
        check_form(core_of(EXAMPLES / "core_generator", name))
    tool = core_of(EXAMPLES / "core_generator", "vorkel_generator")
    design = core_of(EXAMPLES / "core_generator", "video")
    assert design["filesets"]["rtl"]["depend"] == [tool["name"].rpartition(":")[0]]
    (asked,) = design["targets"]["default"]["generate"]
    generate = design["generate"][asked]
    generator = tool["generators"][generate["generator"]]
    assert generator["interpreter"] == "python3"
    request = tmp_path / "request.yml"
    vlnv = design["name"].replace(":1.0", f"-{asked}:1.0")
    request.write_text(
        yaml.safe_dump(
            {
                "gapi": "1.0",
                "files_root": str(EXAMPLES / "core_generator"),
                "vlnv": vlnv,
                "parameters": generate["parameters"],
            }
        )
    )
    folder = tmp_path / "core"
    folder.mkdir()
    result = run(EXAMPLES / "core_generator" / generator["command"], str(request), cwd=folder)
    assert (result.returncode, result.stderr) == (0, "")
    core = core_of(folder, "video_clocks")
    check_form(core)
    assert core["name"] == vlnv
    if not shutil.which("verilator"):
        pytest.skip("there is no verilator")
    video = EXAMPLES / "core_generator" / design["filesets"]["rtl"]["files"][0]
    top = design["targets"]["default"]["toplevel"]
    options = ("--lint-only", "--timing", "-Wall", "-y", "models", "--top-module", top)
    checked = run_tool("verilator", *options, video, "video_clocks.v", cwd=folder)
    assert (checked.returncode, checked.stderr) == (0, "")


@pytest.mark.parametrize(
    "parameters, status, said",
    [
        (dict(outputs=["148,5"]), 2, "decimal point"),
        (dict(name="module"), 2, "module"),
        (dict(name=3), 2, "name"),
        (dict(language="c"), 2, "language"),
        (dict(simulation="no"), 2, "simulation"),
        (dict(colour="red"), 2, "colour"),
        (dict(device="nothing"), 2, "nothing"),
        (dict(inputs=["1kHz"], outputs=["5GHz"]), 1, "PLL"),
        (dict(outputs=[148.5, 33.7, 101.01]), 3, "off by"),
    ],
)
def test_a_bad_request_leaves_no_file(tmp_path, parameters, status, said):
    result, folder = generated(tmp_path, **parameters)
    assert result.returncode == status
    assert said in result.stderr
    assert "Traceback" not in result.stderr
    assert list(folder.iterdir()) == []


@pytest.mark.parametrize(
    "text",
    [None, "", "- 1", "a: [", "vlnv: x", "vlnv: 3\nparameters: {}", "parameters: {}", "\x00"],
)
def test_a_file_that_is_no_request(tmp_path, text):
    request = tmp_path / "request.yml"
    if text is not None:
        request.write_text(text)
    folder = tmp_path / "core"
    folder.mkdir()
    result = run(GENERATOR, str(request), cwd=folder)
    assert result.returncode == 2
    assert "request.yml" in result.stderr
    assert "Traceback" not in result.stderr
    assert list(folder.iterdir()) == []


def content(folder):
    """All that is in a folder: the text of each file, and None for a folder."""
    return {
        str(path.relative_to(folder)): path.read_text() if path.is_file() else None
        for path in folder.rglob("*")
    }


FILES = ["video_clocks.v", "video_clocks.sdc", "video_clocks_tb.v", "video_clocks.core"]


@pytest.mark.parametrize("name", [*FILES, "models/VORKEL_TSYN.v"])
def test_a_folder_in_the_way_leaves_all_as_it_was(tmp_path, name):
    folder = tmp_path / "core"
    (folder / name).mkdir(parents=True)
    for other in FILES:
        if other != name:
            (folder / other).write_text("earlier")
    before = content(folder)
    result = run(GENERATOR, str(VIDEO), cwd=folder)
    assert result.returncode == 2
    assert "Is a directory" in result.stderr and name in result.stderr
    assert "Traceback" not in result.stderr
    assert content(folder) == before


def test_a_file_in_place_of_the_folder_of_the_models(tmp_path):
    folder = tmp_path / "core"
    folder.mkdir()
    (folder / "models").write_text("earlier")
    result = run(GENERATOR, str(VIDEO), cwd=folder)
    assert result.returncode == 2
    assert "Traceback" not in result.stderr
    assert content(folder) == {"models": "earlier"}


def test_files_of_an_earlier_run_are_replaced(tmp_path):
    result, folder = generated(tmp_path)
    assert result.returncode == 0
    written = content(folder)
    for name in FILES:
        (folder / name).write_text("earlier")
    assert run(GENERATOR, str(tmp_path / "request.yml"), cwd=folder).returncode == 0
    assert content(folder) == written


# Of the two files the first stands in place of an earlier one: that makes room, it takes its place,
# and the second takes its own.
@pytest.mark.parametrize("failing", [1, 2, 3])
def test_a_name_that_cannot_be_given_takes_all_back(tmp_path, monkeypatch, failing):
    monkeypatch.syspath_prepend(GENERATOR.parent)
    generator = importlib.import_module("vorkel_generator")
    (tmp_path / "a.v").write_text("earlier")
    monkeypatch.chdir(tmp_path)
    rename, calls = os.rename, []

    def rename_but_one(*paths):
        calls.append(paths)
        if len(calls) == failing:
            raise OSError("no")
        rename(*paths)

    monkeypatch.setattr(generator.os, "rename", rename_but_one)
    with pytest.raises(OSError, match="no"):
        generator.write_all({"a.v": "new", "models/b.v": "new"})
    assert content(tmp_path) == {"a.v": "earlier"}


def test_models():
    verilog = vorkel.models()
    assert {path.name for path in verilog} >= {"VORKEL_PLL.v", "VORKEL_TSYN.v", "VORKEL_KRU_SP.v"}
    assert len(vorkel.models("vhdl")) == len({path.name for path in vorkel.models("vhdl")}) > 5
    with pytest.raises(vorkel.RequestError):
        vorkel.models("c")
