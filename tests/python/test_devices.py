"""Devices, their files, explanations and certificates in Python."""

import json
import pathlib
import subprocess
from fractions import Fraction

import pytest

import vorkel


def test_devices_are_listed(source_dir):
    files = sorted(path.stem for path in pathlib.Path(source_dir, "devices").glob("*.toml"))
    found = vorkel.devices()
    assert [one.name for one in found] == files
    assert all(one.usable and one.grades for one in found)


# The numbers of the file's own lines, read by a plainer reader.
def test_limits_are_those_of_the_file(source_dir):
    (device,) = vorkel.devices("vk40-1")
    (grade,) = device.grades
    assert (device.default_grade, grade.name) == ("2", "1")
    limits = {one.keyword: one for one in grade.limits}
    text = pathlib.Path(source_dir, "devices", "vk40.toml").read_text()
    section = text.split("[grade.1]")[1].split("[grade.")[0]
    wanted = [
        line.split("#")[0].split("=")
        for line in section.splitlines()
        if line.startswith(("VCOCLK", "PFD", "TSYN"))
    ]
    compared = 0
    for name, value in wanted:
        keyword = name.strip()
        if keyword in limits:
            assert limits[keyword].value == Fraction(value.strip())
            compared += 1
    assert compared > 0
    loops = {one.primitive: one for one in grade.primitives}
    assert loops["PLL"].vco.lowest < loops["PLL"].vco.highest
    assert loops["KRU_SP"].vco is None


def test_devices_of_the_user(tmp_path, source_dir, monkeypatch):
    text = pathlib.Path(source_dir, "devices", "vk10.toml").read_text()
    (tmp_path / "mine.toml").write_text(text.replace('"vk10"', '"mine"'))
    (tmp_path / "bad.toml").write_text("device = 3\n")
    monkeypatch.setenv("VORKEL_DEVICES", str(tmp_path))
    by_name = {one.name: one for one in vorkel.devices()}
    assert by_name["mine"].usable
    assert not by_name["bad"].usable
    assert by_name["bad"].reason
    assert vorkel.plan(27, [27], device="mine").device.startswith("mine")
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.plan(27, [27], device="bad")
    assert caught.value.mistakes[0].kind == "bad_file"


@pytest.mark.parametrize("name", ["nothing", "", "vk40-9", 40])
def test_devices_that_there_are_not(name):
    with pytest.raises(vorkel.RequestError):
        vorkel.devices(name)


def test_check_of_files(tmp_path, source_dir):
    good = vorkel.check(pathlib.Path(source_dir, "devices", "vk40.toml"))
    assert good.usable and not good.mistakes
    assert [one.name for one in good.grades] == ["1", "2"]
    text = pathlib.Path(source_dir, "devices", "vk10.toml").read_text().replace('"vk10"', '"own"')
    line = next(one for one in text.splitlines() if one.startswith("VCOCLK_FREQ_MAX"))
    bad = tmp_path / "own.toml"
    bad.write_text(text.replace(line, "VCOCLK_FREQ_MOST = 7\n" + line, 1))
    found = vorkel.check(str(bad))
    assert not found.usable
    assert found.mistakes[0].unknown == "VCOCLK_FREQ_MOST"
    assert "VCOCLK_FREQ_MAX" in found.mistakes[0].known
    assert found.mistakes[0].places[0][0] == text.splitlines().index(line) + 1
    lowest = next(one for one in text.splitlines() if one.startswith("VCOCLK_FREQ_MIN"))
    bad.write_text(text.replace(lowest, "VCOCLK_FREQ_MIN = 99999"))
    found = vorkel.check(bad)
    assert found.usable
    assert "PLL" in [one for warning in found.warnings for one in warning.lost]


def test_files_that_cannot_be_checked(tmp_path):
    with pytest.raises(FileNotFoundError):
        vorkel.check(tmp_path / "none.toml")
    with pytest.raises(vorkel.RequestError):
        vorkel.check(tmp_path / "device.txt")
    large = tmp_path / "large.toml"
    large.write_bytes(b"#" * 1_000_001)
    with pytest.raises(vorkel.RequestError):
        vorkel.check(large)
    (tmp_path / "bytes.toml").write_bytes(b"\xff\x00")
    assert not vorkel.check(tmp_path / "bytes.toml").usable


def test_verify(video):
    assert vorkel.verify(video) == ()
    assert vorkel.verify(video.to_json()) == ()
    document = video.to_dict()
    assert vorkel.verify(document) == ()
    document["answers"][0]["outputs"][1]["jitter"] += 1
    (wrong,) = vorkel.verify(document)
    assert wrong.path == "answers[0].outputs[1].jitter"
    assert float(wrong.found) == float(wrong.expected) + 1
    lines = json.dumps(document, indent=2).splitlines()
    assert "jitter" in lines[wrong.line - 1]
    assert wrong.message


@pytest.mark.parametrize("text", ["", "{", "[]", '{"request": 3}', "{}"])
def test_verify_of_what_is_no_plan(text):
    assert vorkel.verify(text)


def test_verify_of_a_plan_of_no_device(video):
    document = video.to_dict()
    document["request"]["device"] = "nothing"
    with pytest.raises(vorkel.RequestError):
        vorkel.verify(document)


# 333 MHz is a third of 999 MHz, which no M up to 64 makes of 100 MHz with a D of 1 to 5, the most
# with a PFD of 20 MHz.
def test_explain(build_dir):
    found = vorkel.explain(100, [vorkel.Output(333, phase=90)])
    assert not found.possible
    by_name = {one.primitive: one for one in found.primitives}
    conflict = by_name["PLL"].conflicts[0]
    assert ("frequency", 0) in [(one.kind, one.output) for one in conflict.demands]
    change = next(one for one in conflict.changes if one.kind == "frequency")
    assert change.before == 333
    # A change that is proposed works.
    assert conflict.changes_lift_all
    changed = vorkel.plan(100, [vorkel.Output(change.value, phase=90)], primitive="PLL")
    assert changed.within
    command = [f"{build_dir}/vorkel", "explain", "--in", "100", "--out", "333", "--phase", "90deg"]
    shown = subprocess.run(
        [*command, "--format", "json"], check=True, capture_output=True, text=True
    ).stdout
    assert found.to_json() == shown
    assert "333" in found.to_text()


def test_explain_with_oscillators():
    found = vorkel.explain(100, [333], oscillators=["33.3MHz", Fraction(100, 3), 24], exact=True)
    served = [one.frequency for one in found.inputs]
    assert Fraction(333, 10) in served
    for one in found.inputs:
        assert vorkel.plan(one.frequency, [333], exact=True, primitive=one.primitives[0]).within
    with pytest.raises(vorkel.RequestError) as caught:
        vorkel.explain(100, [333], oscillators=[1, "x"])
    assert (caught.value.mistakes[0].entry, caught.value.mistakes[0].index) == ("oscillators", 1)
    assert vorkel.explain(27, [27]).possible
