"""Prints how much of each part the tests reached, and lists what they did not.

usage: coverage-table.py COVERAGE.json UNREACHED.txt
The first is what gcovr --json writes; the second is written here. Status 1 where a part has
less than it must.
"""

import json
import sys

# The parts, the folders of each, and the least share of lines that is accepted.
PARTS = (
    ("provider", ("include/", "src/"), 95.0),
    ("platform", ("platform/",), 90.0),
    ("host", ("host/",), 90.0),
)


def counted(files, folders):
    """Lines reached, lines, branches taken, branches of the files in the folders."""
    figures = [0, 0, 0, 0]
    for file in files:
        if not file["file"].startswith(folders):
            continue
        for line in file["lines"]:
            if line.get("gcovr/noncode"):
                continue
            figures[1] += 1
            figures[0] += line["count"] > 0
            figures[3] += len(line["branches"])
            figures[2] += sum(branch["count"] > 0 for branch in line["branches"])
    return figures


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


def unreached(file):
    return {
        line["line_number"]
        for line in file["lines"]
        if not line.get("gcovr/noncode") and line["count"] == 0
    }


def share(part, whole):
    return 100.0 * part / whole if whole else 100.0


def main():
    with open(sys.argv[1], encoding="utf-8") as report:
        files = json.load(report)["files"]
    enough = True
    print(f"{'part':10}{'lines':>8}{'reached':>9}{'least':>8}{'branches':>10}{'taken':>8}")
    for name, folders, least in PARTS:
        lines_reached, lines, taken, branches = counted(files, folders)
        reached = share(lines_reached, lines)
        enough = enough and reached >= least
        print(
            f"{name:10}{lines:8}{reached:8.1f}%{least:7.0f}%{branches:10}"
            f"{share(taken, branches):7.1f}%{'' if reached >= least else '  TOO LITTLE'}"
        )
    with open(sys.argv[2], "w", encoding="utf-8") as listing:
        for file in sorted(files, key=lambda file: file["file"]):
            missing = unreached(file)
            if missing:
                listing.write(f"{file['file']}: {ranges(missing)}\n")
    return 0 if enough else 1


if __name__ == "__main__":
    sys.exit(main())
