"""Which files clang-tidy has to compile to see the files named on standard input, one a line.

    lint_units.py COMPILE_COMMANDS [--with-headers]

Prints the .cpp files among them that the build compiles. With --with-headers a header that none of
these includes brings one more: its own .cpp file where that includes it, else the one that pulls in
the fewest files.
"""
import json
import os
import re
import subprocess
import sys

INCLUDE = re.compile(r'^\s*#\s*include\s+"([^"]+)"', re.MULTILINE)


def direct_includes(path, files):
    """The files of the project that this one names, looked up beside it and from the top."""
    with open(path, encoding="utf-8") as file:
        names = INCLUDE.findall(file.read())
    beside = (os.path.normpath(os.path.join(os.path.dirname(path), name)) for name in names)
    return {found for pair in zip(beside, names) for found in pair if found in files}


def reach_of(path, includes):
    """All that the file includes, directly or not, and the file itself."""
    reached, waiting = {path}, [path]
    while waiting:
        for each in includes.get(waiting.pop(), ()):
            if each not in reached:
                reached.add(each)
                waiting.append(each)
    return reached


def units_for(paths, compiled, includes, with_headers):
    """The .cpp files to compile, in the order of `paths`."""
    units = [path for path in paths if path in compiled]
    if not with_headers:
        return units
    reach = {unit: reach_of(unit, includes) for unit in compiled}
    for header in (path for path in paths if path.endswith(".h")):
        if any(header in reach[unit] for unit in units):
            continue
        users = [unit for unit in compiled if header in reach[unit]]
        own = os.path.splitext(header)[0] + ".cpp"
        if users:
            units.append(min(users, key=lambda unit: (unit != own, len(reach[unit]), unit)))
    return units


def main():
    with open(sys.argv[1], encoding="utf-8") as file:
        compiled = {os.path.relpath(entry["file"]) for entry in json.load(file)}
    paths = sys.stdin.read().split()
    tracked = subprocess.run(["git", "ls-files", "--cached", "--others", "--exclude-standard"],
                             capture_output=True, text=True, check=True).stdout.split()
    files = {path for path in tracked if path.endswith((".h", ".cpp")) and os.path.exists(path)}
    includes = {path: direct_includes(path, files) for path in files}
    for unit in units_for(paths, compiled & files, includes, "--with-headers" in sys.argv):
        print(unit)


if __name__ == "__main__":
    main()
