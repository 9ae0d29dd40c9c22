"""A copy of the tree, built with the test programs of some sources, in which a source is changed."""

import hashlib
import os
import pathlib
import resource
import shutil
import subprocess

# A test program may take so many times what it takes without a change, and at least so many
# seconds: of the processor, so that a busy machine makes nobody fail.
PATIENCE = 10
LEAST_SECONDS = 60
MEMORY = 8 << 30
FILE_SIZE = 1 << 30


class BuildFailed(Exception):
    pass


def run(command, folder, seconds=None, log=None, environment=None):
    """The exit status of a command, and the seconds of processor time that it took."""

    def limit():
        resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
        if seconds is not None:
            resource.setrlimit(resource.RLIMIT_CPU, (seconds, seconds))
            resource.setrlimit(resource.RLIMIT_AS, (MEMORY, MEMORY))
            resource.setrlimit(resource.RLIMIT_FSIZE, (FILE_SIZE, FILE_SIZE))

    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    done = subprocess.run(
        [str(word) for word in command], cwd=folder, preexec_fn=limit, stdin=subprocess.DEVNULL,
        stdout=log or subprocess.DEVNULL, stderr=subprocess.STDOUT,
        env={**os.environ, **(environment or {})},
    )
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    took = after.ru_utime - before.ru_utime + after.ru_stime - before.ru_stime
    return done.returncode, took


class Workplace:
    """A checkout of its own, built as `./test` builds: what a compiler cache has is not built anew."""

    def __init__(self, root, folder, jobs):
        self.root, self.folder, self.jobs = pathlib.Path(root), pathlib.Path(folder), jobs
        self.tree = self.folder / "tree"
        self.build = self.tree / "build"
        self.log = self.folder / "build.log"
        self._copy()
        self._configure()
        self.prepared = set()
        self.binaries = {}
        self.seconds = {}

    def _copy(self):
        """The sources as git knows them, and those that it is yet to know."""
        listed = subprocess.run(
            ["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"],
            cwd=self.root, check=True, capture_output=True, text=True,
        ).stdout.split("\0")
        wanted = {name for name in listed if name and (self.root / name).is_file()}
        for path in self.tree.rglob("*"):
            name = path.relative_to(self.tree)
            if path.is_file() and name.parts[0] != "build" and str(name) not in wanted:
                path.unlink()
        for name in wanted:
            source, copy = self.root / name, self.tree / name
            # What is the same keeps its time of change, so that it is not compiled again.
            if copy.exists() and copy.read_bytes() == source.read_bytes():
                continue
            copy.parent.mkdir(parents=True, exist_ok=True)
            shutil.copyfile(source, copy)
            shutil.copymode(source, copy)

    def _configure(self):
        command = [
            "cmake", "-G", "Ninja", "-S", self.tree, "-B", self.build, "-DVORKEL_TESTS=ON",
            "-DVORKEL_PYTHON=OFF", "-DCMAKE_BUILD_TYPE=Release", "-DVORKEL_SANITIZE=OFF",
        ]
        with open(self.log, "wb") as log:
            if run(command, self.folder, log=log)[0] != 0:
                raise BuildFailed

    def make(self, targets):
        with open(self.log, "ab") as log:
            command = ["ninja", "-C", self.build, "-j", self.jobs, *targets]
            return run(command, self.folder, log=log)[0] == 0

    def prepare(self, programs):
        """Builds the programs; each of their tests has to pass without a change."""
        if programs in self.prepared:
            return
        self.prepared.add(programs)
        if not self.make((*programs.programs, *programs.targets)):
            raise BuildFailed
        for name in programs.programs:
            if name not in self.binaries:
                found = [path for path in (self.build / "tests").rglob(name) if path.is_file()]
                self.binaries[name] = found[0]
        for name, command in self._commands(programs):
            if name not in self.seconds:
                self.seconds[name] = max(LEAST_SECONDS, int(PATIENCE * self._took(name, command)))

    def _took(self, name, command):
        """The seconds of a test that passes; those of an earlier run of the same binaries."""
        digest = hashlib.sha256(name.encode())
        for path in (self.binaries.get(name, self.tree / name), *self._libraries()):
            digest.update(path.read_bytes())
        note = self.folder / f"seconds-{digest.hexdigest()[:32]}"
        if not note.exists():
            status, took = self._run(command)
            if status != 0:
                raise BuildFailed(f"{name} fails without a change")
            note.write_text(str(took))
        return float(note.read_text())

    def _libraries(self):
        return sorted(path for path in self.build.glob("ip_vorkel1.1/*") if path.is_file())

    def _commands(self, programs):
        for name in programs.programs:
            yield name, [self.binaries[name], "--gtest_fail_fast", "--gtest_brief=1"]
        runner = self.tree / "tests/support/run_tcl_test.tcl"
        for name in programs.scripts:
            # That test installs the whole project, of which only what matters is built.
            yield name, ["tclsh8.6", runner, self.tree / name, "-skip", "package-3.6"]

    def _run(self, command, seconds=None):
        environment = {
            "VORKEL_PACKAGE_DIR": str(self.build / "ip_vorkel1.1"),
            "VORKEL_SOURCE_DIR": str(self.tree),
            "VORKEL_STA": "sta",
        }
        return run(command, self.build, seconds=seconds, environment=environment)

    def who_notices(self, change, programs):
        """The first program that fails with the change; "the compiler"; None when nobody does."""
        path = self.tree / change.file
        text = (self.root / change.file).read_text()
        path.write_text(change.apply(text))
        try:
            if not self.make((*programs.programs, *programs.targets)):
                return "the compiler"
            for name, command in self._commands(programs):
                if self._run(command, self.seconds[name])[0] != 0:
                    return name
            return None
        finally:
            path.write_text(text)
