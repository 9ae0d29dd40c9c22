"""The Debian packages: made, looked at, and installed in a clean Debian 12 with what they declare.

Only in the long mode, as root, with mmdebstrap, and where the archive of Debian can be reached. The
packages are made by tools/make_packages; VORKEL_PACKAGES names a folder that has them already.
"""

import os
import pathlib
import re
import shutil
import subprocess
import tarfile

import pytest

from conftest import SOURCE, run

VERSION = os.environ["VORKEL_VERSION"]
LIBRARY_PAGE = (SOURCE / "doc/library.md").read_text()
INSTALL_PAGE = (SOURCE / "doc/install.md").read_text()
NAMES = [
    "vorkel",
    "vorkel-common",
    "tcl-vorkel",
    "python3-vorkel",
    f"libvorkel{VERSION}",
    "libvorkel-dev",
]

pytestmark = pytest.mark.skipif(
    "VORKEL_TEST_LONG" not in os.environ or "VORKEL_PRELOAD" in os.environ,
    reason="only with ./test --long, and not under the sanitizers",
)


@pytest.fixture(scope="session")
def packages(tmp_path_factory):
    """The packages by their names."""
    folder = pathlib.Path(os.environ.get("VORKEL_PACKAGES", ""))
    if "VORKEL_PACKAGES" not in os.environ:
        folder = tmp_path_factory.mktemp("packages")
        run(SOURCE / "tools/make_packages", folder)
    found = {path.name.split("_")[0]: path for path in folder.glob("*.deb")}
    assert sorted(found) == sorted(NAMES)
    return found


def field(package, name):
    return run("dpkg-deb", "-f", package, name).strip()


def test_what_they_say(packages):
    for name, path in packages.items():
        assert field(path, "Version") == f"{VERSION}-1"
        depends = field(path, "Depends")
        # Libraries are found out, and versions are those of this build.
        if name in ("vorkel", "tcl-vorkel", "python3-vorkel", f"libvorkel{VERSION}"):
            assert "libc6 (>=" in depends and "libstdc++6 (>=" in depends
            assert f"vorkel-common (= {VERSION}-1)" in depends
    assert field(packages["vorkel-common"], "Architecture") == "all"
    assert "iverilog" in field(packages["vorkel-common"], "Suggests")
    assert "python3 (>= 3." in field(packages["python3-vorkel"], "Depends")
    table = INSTALL_PAGE.split("| Package |")[1].split("\n\n")[0]
    assert sorted(re.findall(r"^\| `([^`]+)`", table, re.MULTILINE)) == sorted(NAMES)


def test_no_file_is_in_two_of_them(packages):
    seen = {}
    for name, path in packages.items():
        for line in run("dpkg-deb", "-c", path).splitlines():
            if not line.startswith("d"):
                file = line.split()[5]
                assert file not in seen, (file, name, seen[file])
                seen[file] = name
    assert "./usr/bin/vorkel" in seen


@pytest.mark.skipif(not shutil.which("lintian"), reason="there is no lintian")
def test_lintian_finds_no_error(packages):
    result = subprocess.run(
        ["lintian", "--allow-root", "--fail-on", "error", *packages.values()],
        capture_output=True,
        text=True,
    )
    assert result.returncode == 0, result.stdout


class Chroot:
    """A Debian 12 of its own in a folder."""

    def __init__(self, folder):
        self.folder = folder

    def run(self, *words, **options):
        environment = {
            "PATH": "/usr/local/sbin:/usr/local/bin:/usr/sbin:/usr/bin:/sbin:/bin",
            "DEBIAN_FRONTEND": "noninteractive",
            "LC_ALL": "C.UTF-8",
            "HOME": "/root",
        }
        result = subprocess.run(
            ["chroot", str(self.folder), *[str(word) for word in words]],
            capture_output=True,
            text=True,
            env=environment,
            **options,
        )
        assert result.returncode == 0, f"{words}\n{result.stdout}\n{result.stderr}"
        return result.stdout

    def install(self, *words):
        self.run("apt-get", "install", "-y", "--no-install-recommends", *words)


@pytest.fixture(scope="session")
def chroot(tmp_path_factory, packages):
    if os.geteuid() != 0 or not shutil.which("mmdebstrap"):
        pytest.skip("a chroot takes root and mmdebstrap")
    archive = tmp_path_factory.mktemp("debian") / "debian.tar"
    made = subprocess.run(
        ["mmdebstrap", "--variant=apt", "bookworm", str(archive)], capture_output=True, text=True
    )
    if made.returncode != 0:
        pytest.skip("there is no archive of Debian: " + made.stderr.splitlines()[-1])
    folder = archive.parent / "root"
    folder.mkdir()
    with tarfile.open(archive) as content:
        content.extractall(folder, numeric_owner=True)
    archive.unlink()
    shutil.copy("/etc/resolv.conf", folder / "etc/resolv.conf")
    (folder / "debs").mkdir()
    for path in packages.values():
        shutil.copy(path, folder / "debs")
    system = Chroot(folder)
    system.run("apt-get", "update")
    yield system
    shutil.rmtree(folder, ignore_errors=True)


def build_the_program_of_the_page(chroot, debs):
    """That of doc/library.md, in both ways. 27 x 44 / 8 is 148.5, and half of that 74.25 MHz."""
    libraries = (debs["libvorkel-dev"], debs[f"libvorkel{VERSION}"])
    chroot.install(*libraries, "g++", "cmake", "make", "pkg-config")
    folder = chroot.folder / "root/library"
    folder.mkdir()
    for language, name in (("cpp", "clocks.cpp"), ("cmake", "CMakeLists.txt")):
        (text,) = re.findall(rf"```{language}\n(.*?)```", LIBRARY_PAGE, re.DOTALL)
        (folder / name).write_text(text)
    (command,) = re.findall(r"With pkg-config:\n\n    (.*)\n", LIBRARY_PAGE)
    for words in (command, "cmake -B build", "cmake --build build"):
        chroot.run("sh", "-e", "-c", f"cd /root/library; {words}")
    for program in ("clocks", "build/clocks"):
        shown = chroot.run(f"/root/library/{program}")
        assert shown.startswith("148.500000 MHz, 0.00 ppm\n74.250000 MHz, 0.00 ppm\n")
        assert "create_generated_clock" in shown


def test_they_work_in_a_clean_debian(chroot, packages):
    debs = {name: f"/debs/{path.name}" for name, path in packages.items()}
    before = chroot.run("find", "/usr", "-path", "*vorkel*")
    assert before == ""

    chroot.install(debs["vorkel"], debs["vorkel-common"])
    assert chroot.run("vorkel", "version") == f"vorkel {VERSION}\n"
    assert "148.500000" in chroot.run("vorkel", "plan", "--in", "27MHz", "--out", "148.5,74.25,27")
    request = "device vk40\ninput 27MHz\noutput 148.5MHz\n"
    read = ("vorkel", "plan", "--request", "-", "--format", "json")
    assert '"requested_exact": "297/2"' in chroot.run(*read, input=request)
    assert chroot.run("gzip", "-dc", "/usr/share/man/man1/vorkel.1.gz").startswith(".TH VORKEL 1")

    chroot.install(debs["tcl-vorkel"])
    script = (
        "puts [package require vorkel]; puts [package require Ip_vorkel];"
        "puts [dict get [lindex [dict get [vorkel::plan -in 27 -out 148.5] answers] 0] within];"
        "set c [Ip::Vorkel::Init]; $c SetDevice vk40;"
        'puts [$c TSYNCalculateActualOutFreqs "200 100" 100 0 2 false false false]'
    )
    assert chroot.run("tclsh8.6", input=script).split()[:2] == [VERSION, VERSION]
    assert chroot.run("tclsh8.6", input=script).split()[3] == "1"

    chroot.install(debs["python3-vorkel"])
    code = "import vorkel; print(vorkel.plan(27, [148.5]).outputs[0].actual, len(vorkel.models()))"
    assert chroot.run("python3", "-c", code).startswith("297/2 ")

    build_the_program_of_the_page(chroot, debs)

    # From a crystal to a simulation and timing constraints: the commands of doc/install.md.
    (commands,) = re.findall(r"`vorkel-common` suggests:\n\n((?:    .*\n)+)", INSTALL_PAGE)
    simulator, *lines = [line.strip() for line in commands.splitlines()]
    assert simulator.startswith("apt install ") and len(lines) == 5
    chroot.install(*simulator.split()[2:])
    shown = [chroot.run("sh", "-e", "-c", f"cd /root; {line}") for line in lines]
    assert "PASS" in shown[-1]
    assert "create_generated_clock" in (chroot.folder / "root/clocks.sdc").read_text()

    # They leave nothing behind.
    chroot.run("apt-get", "purge", "-y", *NAMES)
    assert chroot.run("find", "/usr", "-path", "*vorkel*", "-not", "-type", "d") == ""
