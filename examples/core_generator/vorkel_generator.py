#!/usr/bin/env python3
"""A generator for build tools with cores: a request in YAML becomes a core with a clock module.

    vorkel_generator.py REQUEST.yml

The request has `vlnv`, the name of the core, and `parameters`: the entries of a request (inputs,
outputs, device and so on), and

    name        of the module, "clocks" by default
    language    verilog (default) or vhdl
    simulation  whether the core has a target "sim", with a testbench and the models; yes by default

It leaves in the current folder NAME.v or NAME.vhd, NAME.sdc and NAME.core, and for the target "sim"
NAME_tb and the models, in models/. The exit status is 0; 1 when nothing serves the request; 2 when
that is wrong, or a file cannot be written; 3 when the best plan misses a demand. Only with 0 files
are left: else the folder is as it was before.
"""

import errno
import os
import sys
import tempfile

import yaml

import vorkel

OWN = ("name", "language", "simulation")
KINDS = {"verilog": (".v", "verilogSource"), "vhdl": (".vhd", "vhdlSource")}


class WrongRequest(Exception):
    """What is wrong with a file, as a sentence."""


def read(path):
    """The name of the core, what is the generator's own, and the request."""
    try:
        with open(path, encoding="utf-8") as stream:
            document = yaml.safe_load(stream)
    except (OSError, UnicodeDecodeError) as error:
        raise WrongRequest(f"{path}: {getattr(error, 'strerror', None) or error}") from error
    except yaml.YAMLError as error:
        raise WrongRequest(f"{path}: {error}") from error
    if not isinstance(document, dict) or not isinstance(document.get("parameters"), dict):
        raise WrongRequest(f"{path}: there are no parameters")
    core = document.get("vlnv")
    if not isinstance(core, str) or not core:
        raise WrongRequest(f"{path}: vlnv is missing, the name of the core")
    request = dict(document["parameters"])
    own = {key: request.pop(key) for key in OWN if key in request}
    own.setdefault("name", "clocks")
    own.setdefault("language", "verilog")
    if own["language"] not in KINDS:
        raise WrongRequest(f"{path}: language: {own['language']!r} must be verilog or vhdl")
    if not isinstance(own["name"], str):
        raise WrongRequest(f"{path}: name: {own['name']!r} is no name")
    if not isinstance(own.setdefault("simulation", True), bool):
        raise WrongRequest(f"{path}: simulation: {own['simulation']!r} must be true or false")
    return core, own, request


def core_file(core, name, language, simulation):
    """The description of the core."""
    ending, kind = KINDS[language]
    filesets = {
        "rtl": {"files": [name + ending], "file_type": kind},
        "constraints": {"files": [name + ".sdc"], "file_type": "SDC"},
    }
    targets = {"default": {"filesets": ["rtl", "constraints"]}}
    if simulation:
        models = [f"models/{path.name}" for path in vorkel.models(language)]
        filesets["models"] = {"files": models, "file_type": kind}
        filesets["testbench"] = {"files": [f"{name}_tb{ending}"], "file_type": kind}
        targets["sim"] = {
            "default_tool": "icarus" if language == "verilog" else "ghdl",
            # The order in which tools for VHDL compile them.
            "filesets": ["models", "rtl", "testbench"],
            "toplevel": f"{name}_tb",
        }
    body = {
        "name": core,
        "description": "Clocks, planned by vorkel",
        "filesets": filesets,
        "targets": targets,
    }
    return "CAPI=2:\n" + yaml.safe_dump(body, sort_keys=False)


def generate(core, own, request):
    """The plan, and the files of the core by their names."""
    plan = vorkel.plan(request=request)
    name, language = own["name"], own["language"]
    write = plan.to_verilog if language == "verilog" else plan.to_vhdl
    ending = KINDS[language][0]
    files = {name + ending: write(name), name + ".sdc": plan.to_sdc()}
    if own["simulation"]:
        files[f"{name}_tb{ending}"] = plan.to_testbench(name, language=language)
        for path in vorkel.models(language):
            files[f"models/{path.name}"] = path.read_text(encoding="utf-8")
    files[name + ".core"] = core_file(core, name, language, own["simulation"])
    return plan, files


class Exchange:
    """Files that take their places together, or not at all."""

    def __init__(self):
        self._new = []  # of each file the temporary one and its name
        self._earlier = []  # of files that made room: where they are, and their names
        self._placed = []
        self._folders = []

    def add(self, name, text):
        """Writes a file beside its place."""
        if os.path.isdir(name):
            raise IsADirectoryError(errno.EISDIR, os.strerror(errno.EISDIR), name)
        folder, base = os.path.split(name)
        if folder and not os.path.isdir(folder):
            os.mkdir(folder)
            self._folders.append(folder)
        handle, path = tempfile.mkstemp(prefix=base + ".", dir=folder or ".")
        self._new.append((path, name))
        with os.fdopen(handle, "w", encoding="utf-8") as stream:
            stream.write(text)
        os.chmod(path, 0o644)

    def place(self):
        """Gives all files their names; what is there already makes room until all have theirs."""
        for path, name in self._new:
            if os.path.lexists(name):
                earlier = path + ".earlier"
                os.rename(name, earlier)
                self._earlier.append((earlier, name))
            os.rename(path, name)
            self._placed.append(name)

    def finish(self):
        """Removes what was there before."""
        for earlier, _ in self._earlier:
            os.unlink(earlier)

    def take_back(self):
        """Leaves all as it was."""
        for name in self._placed:
            os.unlink(name)
        for earlier, name in self._earlier:
            os.rename(earlier, name)
        for path, _ in self._new[len(self._placed) :]:
            os.unlink(path)
        for folder in self._folders:
            os.rmdir(folder)


def write_all(files):
    """Writes all files or, when one cannot be written, none."""
    exchange = Exchange()
    try:
        for name, text in files.items():
            exchange.add(name, text)
        exchange.place()
    except BaseException:
        exchange.take_back()
        raise
    exchange.finish()


def main(words):
    if len(words) != 1:
        print("usage: vorkel_generator.py REQUEST.yml", file=sys.stderr)
        return 2
    try:
        plan, files = generate(*read(words[0]))
        if not plan.within:
            remarks = [*plan.answer.misses, *plan.answer.violations]
            print("\n".join(remarks), file=sys.stderr)
            return 3
        write_all(files)
    except vorkel.UnsolvedError as error:
        print(error, file=sys.stderr)
        return 1
    except (WrongRequest, vorkel.VorkelError, OSError) as error:
        print(error, file=sys.stderr)
        return 2
    return 0


if __name__ == "__main__":
    sys.exit(main(sys.argv[1:]))
