"""Draws changes of sources and shows which of them no test notices.

Each change is made in a copy of the tree, in build-mutants/; the test programs that matter for the
source are built and run. The same seed draws the same changes. Changes that nobody can notice are
listed with the reason in tests/mutation/equivalent.toml. The exit status is 1 when another one is
not noticed.
"""

import argparse
import os
import pathlib
import random
import sys
import tomllib

from changes import changes_of
from programs import programs_for
from workplace import BuildFailed, Workplace

ROOT = pathlib.Path(__file__).resolve().parent.parent.parent
LIST = pathlib.Path(__file__).with_name("equivalent.toml")
FOLDERS = ("binding", "engine", "host", "hardware", "planner")


def arguments():
    parser = argparse.ArgumentParser(prog="tools/mutate", description=__doc__)
    parser.add_argument("--count", type=int, default=50, help="changes to draw; 0 for all (50)")
    parser.add_argument("--seed", type=int, default=1, help="of the draw (1)")
    parser.add_argument("--jobs", type=int, default=os.cpu_count(), help="of the compiler")
    parser.add_argument("--list", action="store_true", help="show the drawn changes and do nothing")
    parser.add_argument("--without", metavar="PROGRAM", help="a test program that is not to be run")
    parser.add_argument("--text", help="only changes of lines with this text")
    parser.add_argument("sources", nargs="*", help="files and folders; all by default")
    return parser.parse_args()


def files_of(names):
    """Sources; headers are changed when they are named, since all that includes them is built."""
    files = set()
    for name in names or FOLDERS:
        path = (ROOT / name).resolve()
        if not path.exists():
            sys.exit(f"there is no {name}")
        found = [path] if path.is_file() else path.rglob("*.cpp")
        files.update(str(file.relative_to(ROOT)) for file in found)
    return sorted(files)


def key(change):
    return change.file, change.old, change.new


def reasons():
    """Of the changes that nobody can notice."""
    entries = tomllib.loads(LIST.read_text()).get("change", [])
    return {(entry["file"], entry["old"], entry["new"]): entry["reason"] for entry in entries}


def tell_old_entries(known):
    """An entry of a change that there is not any more says nothing."""
    there = set()
    for file in {file for file, _, _ in known}:
        if (ROOT / file).exists():
            there |= {key(change) for change in changes_of(file, (ROOT / file).read_text())}
    for file, old, new in sorted(set(known) - there):
        print(f"{LIST.name}: {file} has no change of\n  {old}\n  {new}", file=sys.stderr)


def drawn(options, known):
    changes = []
    for file in files_of(options.sources):
        text = (ROOT / file).read_text()
        changes += [
            change
            for change in changes_of(file, text)
            if key(change) not in known and (options.text is None or options.text in change.old)
        ]
    if 0 < options.count < len(changes):
        # In the order of the files, so that what is built for one serves the next.
        places = random.Random(options.seed).sample(range(len(changes)), options.count)
        changes = [changes[place] for place in sorted(places)]
    return changes


def show(change, verdict):
    print(f"{change.file}:{change.line}: {verdict}\n  {change.old}\n  {change.new}", flush=True)


def main():
    options = arguments()
    known = reasons()
    tell_old_entries(known)
    changes = drawn(options, known)
    if options.list:
        for change in changes:
            show(change, "drawn")
        return 0

    folder = ROOT / "build-mutants"
    folder.mkdir(exist_ok=True)
    unnoticed, refused = [], 0
    try:
        workplace = Workplace(ROOT, folder, options.jobs)
        for change in changes:
            programs = programs_for(change.file).without(options.without)
            workplace.prepare(programs)
            who = workplace.who_notices(change, programs)
            show(change, f"noticed by {who}" if who else "NOT NOTICED")
            refused += who == "the compiler"
            if who is None:
                unnoticed.append(change)
    except BuildFailed as failure:
        sys.exit(f"{failure or 'the build fails without a change'}; see {folder.name}/build.log")

    print(f"== {len(unnoticed)} not noticed")
    for change in unnoticed:
        show(change, "not noticed")
    compiled = len(changes) - refused
    print(f"{len(changes)} changes drawn with seed {options.seed}, {compiled} that compile, "
          f"{compiled - len(unnoticed)} noticed, {len(unnoticed)} not")
    return 1 if unnoticed else 0


if __name__ == "__main__":
    sys.exit(main())
