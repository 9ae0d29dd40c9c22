"""doc/library.md: its program, built against the installed library in both ways."""

import os
import pathlib
import re

import pytest

from conftest import SOURCE, run

VERSION = os.environ["VORKEL_VERSION"]
LIBRARY_DIR = os.environ["VORKEL_LIB_DIR"]
FLAGS = os.environ.get("VORKEL_CXX_FLAGS", "").split()
CXX = os.environ["VORKEL_CXX"]
PAGE = (SOURCE / "doc/library.md").read_text()


def listing(language):
    (text,) = re.findall(rf"```{language}\n(.*?)```", PAGE, re.DOTALL)
    return text


def lines_of(program, installed):
    """What the program prints: 27 x 44 / 8 is 148.5, and half of that 74.25 MHz."""
    shown = run(program, env={"LD_LIBRARY_PATH": str(installed / LIBRARY_DIR)})
    lines = shown.splitlines()
    assert lines[:2] == ["148.500000 MHz, 0.00 ppm", "74.250000 MHz, 0.00 ppm"]
    assert "create_generated_clock" in shown
    return lines


@pytest.fixture(scope="module")
def source(tmp_path_factory):
    folder = tmp_path_factory.mktemp("program")
    (folder / "clocks.cpp").write_text(listing("cpp"))
    (folder / "CMakeLists.txt").write_text(listing("cmake"))
    return folder


def test_the_program_is_short():
    body = listing("cpp").split("int main() {\n")[1]
    assert len(body.splitlines()) <= 20


def test_with_pkg_config(installed, source):
    env = {"PKG_CONFIG_PATH": str(installed / LIBRARY_DIR / "pkgconfig")}
    assert run("pkg-config", "--modversion", "vorkel", env=env) == f"{VERSION}\n"
    words = run("pkg-config", "--cflags", "--libs", "vorkel", env=env).strip()
    # As a shell takes them: blanks in the prefix are quoted.
    program = source / "by-pkg-config"
    command = f'"$1" -std=c++20 -Wall -Wextra -Werror clocks.cpp {words} $3 -o "$2"'
    run("bash", "-c", command, "bash", CXX, program, " ".join(FLAGS), cwd=source)
    lines_of(program, installed)
    # It knows the library by the first two numbers of the version.
    assert f"[libvorkel.so.{VERSION}]" in run("readelf", "-d", program)


def test_with_cmake(installed, source):
    build = source / "build"
    run(
        os.environ["VORKEL_CMAKE"],
        *("-G", "Ninja", "-S", source, "-B", build),
        *(f"-DCMAKE_PREFIX_PATH={installed}", f"-DCMAKE_CXX_COMPILER={CXX}"),
        f"-DCMAKE_CXX_FLAGS={' '.join(FLAGS)}",
    )
    run(os.environ["VORKEL_CMAKE"], "--build", build)
    lines_of(build / "clocks", installed)


def test_all_commands_are_in_it(installed, tmp_path):
    """What the program makes of settings and of reach, from the library alone."""
    (tmp_path / "more.cpp").write_text(
        """
#include <iostream>
#include "planner/answer/Evaluate.h"
#include "planner/device/Catalogue.h"
#include "planner/device/Files.h"
#include "planner/reach/Find.h"
#include "planner/read/Settings.h"
#include "planner/report/ReachText.h"
#include "planner/report/ReportText.h"

int main() {
  const auto files = planner::device::HostFiles();
  const planner::Device device = planner::device::Catalogue(*files).FindDevice("vk40");
  const planner::read::Option options[] = {{"--in", "27"}, {"--m", "44"}, {"--d", "1"},
                                           {"--divide", "8,16"}};
  planner::read::Mistakes mistakes;
  const auto draft = planner::read::ReadOptions({options, 1}, &mistakes);
  const auto settings = planner::read::ReadSettingOptions(options, &mistakes);
  const auto evaluation = FinishEvaluation(draft, settings, device, &mistakes);
  if (!evaluation) return 1;
  const planner::Request& request = evaluation->reading.request;
  const auto answer = planner::answer::Evaluate(request, device, evaluation->settings, {});
  std::cout << planner::report::EvaluationText(request, device, answer, {false, 80});
  const planner::reach::Reach reach(request, device, planner::Primitive::kPll, 0);
  for (const auto& point : planner::reach::Nearest(reach, {297, 2}, reach.range(), 2)) {
    std::cout << reach.FrequencyOf(point).Fixed(6) << "\\n";
  }
  return planner::reach::AskableOf(request, device).primitives.empty();
}
"""
    )
    folder = installed / LIBRARY_DIR
    program = tmp_path / "more"
    run(
        *(CXX, "-std=c++20", *FLAGS, "-I", installed / "include/vorkel", tmp_path / "more.cpp"),
        *("-L", folder, "-lvorkel", "-o", program),
    )
    shown = run(program, env={"LD_LIBRARY_PATH": str(folder)})
    words = "evaluate --in 27 --m 44 --d 1 --divide 8,16 --device vk40".split()
    # 27 x 33 / 6, and 27 x 38 / 7.
    assert shown == run(installed / "bin/vorkel", *words) + "148.500000\n146.571429\n"


@pytest.mark.parametrize("version", ["2.0", "1.0", "1.2"])
def test_cmake_takes_no_other_version(installed, tmp_path, version):
    (tmp_path / "CMakeLists.txt").write_text(
        "cmake_minimum_required(VERSION 3.25)\nproject(other LANGUAGES NONE)\n"
        f"find_package(vorkel {version} QUIET)\n"
        'if(vorkel_FOUND)\n  message(FATAL_ERROR "found")\nendif()\n'
    )
    prefix = f"-DCMAKE_PREFIX_PATH={installed}"
    run(os.environ["VORKEL_CMAKE"], "-S", tmp_path, "-B", tmp_path / "build", prefix)


def headers(installed):
    folder = installed / "include/vorkel"
    return sorted(str(path.relative_to(folder)) for path in folder.rglob("*.h"))


def compiles(installed, text, tmp_path):
    source = tmp_path / "all.cpp"
    source.write_text(text)
    run(
        *(CXX, "-std=c++20", "-Wall", "-Wextra", "-Werror", "-fsyntax-only"),
        *("-I", installed / "include/vorkel", source),
    )


def test_headers_are_complete(installed, tmp_path):
    found = headers(installed)
    compiles(installed, "".join(f'#include "{name}"\n' for name in found), tmp_path)
    others = set()
    for name in found:
        text = (installed / "include/vorkel" / name).read_text()
        others.update(re.findall(r"#include <([^>]*/[^>]*|[^>]*\.h[^>]*)>", text))
    # They need nothing but the standard library.
    assert not others


@pytest.mark.skipif("VORKEL_TEST_LONG" not in os.environ, reason="only with ./test --long")
def test_each_header_is_complete(installed, tmp_path):
    for name in headers(installed):
        compiles(installed, f'#include "{name}"\n', tmp_path)


def test_the_documented_headers_are_installed(installed):
    table = PAGE.split("| Header |")[1].split("\n\n")[0]
    found = headers(installed)
    documented = set()
    for row in table.splitlines()[2:]:
        folder = ""
        for name in re.findall(r"`([\w/]+\.h)`", row):
            folder = str(pathlib.Path(name).parent) if "/" in name else folder
            path = name if "/" in name else f"{folder}/{name}"
            assert path in found, path
            documented.add(path)
    listed = set((SOURCE / "library/headers.txt").read_text().split())
    assert documented - listed == set()


def test_what_programs_see_of_it(installed):
    library = installed / LIBRARY_DIR / "libvorkel.so"
    assert library.is_symlink() and os.readlink(library) == f"libvorkel.so.{VERSION}"
    dynamic = run("readelf", "-d", library)
    assert "SONAME" in dynamic and f"[libvorkel.so.{VERSION}]" in dynamic
    assert "libtcl" not in dynamic
    names = [line.split()[2] for line in run("nm", "-D", "--defined-only", library).splitlines()]
    assert any(name.startswith("_ZN7planner4plan4Make") for name in names)
    own = re.compile(r"_Z(T[ISV])?NK?(7planner|8hardware|6Device)")
    assert not [name for name in names if not own.match(name)]
