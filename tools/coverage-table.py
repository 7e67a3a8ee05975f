"""Prints how much of each part the tests reached, and lists what they did not.

usage: coverage-table.py SOURCES BUILD UNREACHED.txt
SOURCES is the project's folder, BUILD one that was built with counters and whose programs have
run. Reads the counters through gcov; branches that only an exception takes are left out, for the
compiler makes one of nearly every call. Writes UNREACHED.txt: the lines of each file that nothing
reached. Status 1 where a part has less than it must.
"""

import concurrent.futures
import json
import os
import pathlib
import subprocess
import sys

# The parts, the folders of each, and the least share of lines that is accepted.
PARTS = (
    ("provider", ("include/", "src/"), 95.0),
    ("platform", ("platform/",), 90.0),
    ("host", ("host/",), 90.0),
)
FOLDERS = tuple(folder for _, folders, _ in PARTS for folder in folders)


def counted_by(counters):
    """What gcov tells of one object file: a list of files with their lines."""
    command = ["gcov", "--json-format", "--stdout", "--branch-probabilities", str(counters)]
    told = subprocess.run(
        command, cwd=counters.parent, check=True, capture_output=True, text=True
    ).stdout
    files = []
    for document in told.splitlines():
        files += json.loads(document)["files"]
    return files


def relative(name, folders):
    """The name of a source as seen from the project's folder, or none. The compiler was told to
    call that folder ".", for which gcov takes the one that was built in."""
    for folder in folders:
        inside = os.path.relpath(os.path.join(folder, name), folder)
        if inside.startswith(FOLDERS):
            return inside
    return None


def merged(folders, objects):
    """For each file and line: how often it was run, and its branches."""
    lines = {}
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        for files in pool.map(counted_by, objects):
            for file in files:
                name = relative(file["file"], folders)
                if name is None:
                    continue
                known = lines.setdefault(name, {})
                for line in file["lines"]:
                    entry = known.setdefault(line["line_number"], [0, {}])
                    entry[0] += line["count"]
                    real = [branch for branch in line["branches"] if not branch["throw"]]
                    for number, branch in enumerate(real):
                        entry[1][number] = entry[1].get(number, 0) + branch["count"]
    return lines


def figures(lines, folders):
    """Lines reached, lines, branches taken, branches of the files in the folders."""
    entries = [
        entry
        for name, file in lines.items()
        if name.startswith(folders)
        for entry in file.values()
    ]
    taken = [count for _, branches in entries for count in branches.values()]
    return (
        sum(count > 0 for count, _ in entries),
        len(entries),
        sum(count > 0 for count in taken),
        len(taken),
    )


def ranges(numbers):
    """1, 2, 3, 7 as the text 1-3, 7."""
    texts = []
    start = last = None
    for number in sorted(numbers) + [None]:
        if last is not None and number == last + 1:
            last = number
            continue
        if last is not None:
            texts.append(str(start) if start == last else f"{start}-{last}")
        start = last = number
    return ", ".join(texts)


def share(part, whole):
    return 100.0 * part / whole if whole else 100.0


def table(lines):
    """Prints it; whether every part has enough."""
    enough = True
    print(f"{'part':10}{'lines':>8}{'reached':>10}{'least':>8}{'branches':>10}{'taken':>9}")
    for name, folders, least in PARTS:
        lines_reached, of_lines, taken, branches = figures(lines, folders)
        reached = share(lines_reached, of_lines)
        enough = enough and reached >= least
        print(
            f"{name:10}{of_lines:8}{reached:9.1f}%{least:7.0f}%{branches:10}"
            f"{share(taken, branches):8.1f}%{'' if reached >= least else '  TOO LITTLE'}"
        )
    return enough


def main():
    sources, build, listing = sys.argv[1:]
    objects = sorted(
        path
        for path in pathlib.Path(build).resolve().rglob("*.gcda")
        if not os.path.relpath(path, build).startswith("tests/")
    )
    if not objects:
        sys.exit("there are no counters: nothing was built with them, or nothing has run")
    lines = merged((os.path.realpath(build), os.path.realpath(sources)), objects)
    enough = table(lines)
    with open(listing, "w", encoding="utf-8") as out:
        for name in sorted(lines):
            missing = {number for number, entry in lines[name].items() if entry[0] == 0}
            if missing:
                out.write(f"{name}: {ranges(missing)}\n")
    return 0 if enough else 1


if __name__ == "__main__":
    sys.exit(main())
