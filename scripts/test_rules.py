"""The rules that the tests are named and written by, held against the files below tests/.

    test_rules.py        prints one line a broken rule; the exit status is 1 where there is one

1. A file's name stands once in the tree, and its tests are one suite of its name: what CTest calls
   FrameTest.X stands in FrameTest.cpp.
2. That file belongs to one program, and the program is called <room>_<subject>_test.
3. EXPECT_EQ(expected, actual): what can be read off stands on the left.
"""
import os
import re
import subprocess
import sys
from collections import defaultdict

TEST = re.compile(r"^(?:TYPED_)?TEST(?:_F|_P)?\(\s*(\w+)\s*,", re.MULTILINE)
PROGRAM = re.compile(r"\bmrtu_test\(\s*([\w-]+)([^)]*)\)")
EQUALITY = re.compile(r"\b(?:EXPECT|ASSERT)_(?:EQ|STREQ)\(")
HIDDEN = re.compile(r"""
    (?P<quoted> R"(?P<end>[^(\s]*)\(.*?\)(?P=end)" | "(?:\\.|[^"\\\n])*"
              | (?<!\w)'(?:\\.|[^'\\\n])*')
    | //[^\n]* | /\*.*?\*/""", re.DOTALL | re.VERBOSE)


def blanked(text):
    """The same text, as long, with quotes and comments filled: only code can match in it."""
    def fill(match):
        mark = "q" if match["quoted"] else " "
        return re.sub(r"[^\n]", mark, match[0])
    return HIDDEN.sub(fill, text)


def arguments_of(code, opening):
    """Where the arguments behind the opening parenthesis stand: pairs of positions in `code`."""
    spans, depth, start = [], 0, opening + 1
    for at in range(opening, len(code)):
        if code[at] in "([{":
            depth += 1
        elif code[at] in ")]}":
            depth -= 1
        if depth == 0 or (depth == 1 and code[at] == ","):
            spans.append((start, at))
            start = at + 1
        if depth == 0:
            break
    return spans


# How far an expression is a value that can be read off where it stands.
COMPUTED, NAMED, WRITTEN = range(3)
LITERAL = re.compile(r"""
    (?:0[xX][0-9a-fA-F']+|0[bB][01']+|(?:\d[\d']*\.?[\d']*|\.\d+)(?:[eE][-+]?\d+)?)\w*  # 2.5e3f
    | q+(?:s|sv)?                                                              # quoted
    | true\b | false\b | nullptr\b | NULL\b""", re.VERBOSE)
# Constants and enumerators, the rows of a table, and what says itself that it is expected.
CONSTANT = re.compile(r"""
    (?:k[A-Z]\w*|[A-Z][A-Z0-9_]{2,}|(?:\w+::)+\w+)\b(?!\s*[({<:.\[]|->)
    | sizeof\s*\([^()]*\)
    | (?:row|each|GetParam\(\))\.\w+\b(?!\s*[({.\[]|->)
    | expected\w*\b(?!\s*[({.\[]|->)""", re.VERBOSE)
TYPE = re.compile(
    r"(?:(?:std::)?(?:string_view|string|vector|array|optional|pair|map|set|byte|\w+_t)|static_cast"
    r"|char|short|int|long|float|double|bool|unsigned|(?:\w+::)*[A-Z]\w*)\b"
    r"(?:<[\w:,\s*<>]*>)?(?=\s*[({])")
OPERATOR = re.compile(r"[-+*/%|&^~<>!,(){}\s]+")


def weight(code):
    """COMPUTED, NAMED (with constants) or WRITTEN (nothing but literals) of an expression."""
    least, at = WRITTEN, 0
    seen = False
    while at < len(code):
        for pattern in (OPERATOR, LITERAL, CONSTANT, TYPE):
            match = pattern.match(code, at)
            if match and match.end() > at:
                break
        else:
            return COMPUTED
        if pattern is CONSTANT:
            least = NAMED
        seen = seen or pattern is not OPERATOR
        at = match.end()
    return least if seen else COMPUTED


def reversed_equalities(text):
    """The spans (left, right) of each equality whose right side is the one that can be read off."""
    code = blanked(text)
    for match in EQUALITY.finditer(code):
        spans = arguments_of(code, match.end() - 1)
        if len(spans) == 2:
            left, right = (code[start:end].strip() for start, end in spans)
            if weight(right) > weight(left):
                yield spans


def line_of(text, position):
    return text.count("\n", 0, position) + 1


def stem_of(path):
    return os.path.splitext(os.path.basename(path))[0]


def suite_faults(path, text):
    for match in TEST.finditer(blanked(text)):
        if match[1] != stem_of(path):
            line = line_of(text, match.start())
            yield f"{path}:{line}: the suite {match[1]} has not its file's name"


def equality_faults(path, text):
    for (start, _), _ in reversed_equalities(text):
        yield f"{path}:{line_of(text, start)}: what is expected stands on the right"


def room_of(path):
    """tests/unit/cli/check/CMakeLists.txt is of the room cli, tests/line/CMakeLists.txt of line."""
    folders = path.split("/")[1:-1]
    return folders[1] if folders[0] == "unit" else folders[0]


def programs_of(lists):
    """The programs in the CMake lists {path: text}: (path of the list, name, its suites' files)."""
    for path, text in lists.items():
        for name, rest in PROGRAM.findall(re.sub(r"#[^\n]*", "", text)):
            sources = re.findall(r"\S+Test\.cpp\b", rest)
            yield path, name, [os.path.join(os.path.dirname(path), source) for source in sources]


def program_faults(lists, suites):
    """`suites` are the files that hold tests."""
    owners = defaultdict(list)
    for path, name, sources in programs_of(lists):
        if not re.fullmatch(room_of(path) + r"_[a-z0-9_]+_test", name):
            yield f"{path}: the program {name} is not called {room_of(path)}_<subject>_test"
        for source in sources:
            owners[source].append(name)
    for suite in suites:
        if len(owners[suite]) != 1:
            yield f"{suite}: belongs to {' and '.join(owners[suite]) or 'no program'}"


def name_faults(paths):
    homes = defaultdict(list)
    for path in paths:
        homes[os.path.basename(path)].append(path)
    for name, found in homes.items():
        if len(found) > 1:
            yield f"{found[0]}: the name stands elsewhere too: {', '.join(found[1:])}"


def faults_of(files):
    """All broken rules in {path: text}."""
    lists = {path: text for path, text in files.items() if path.endswith("/CMakeLists.txt")}
    suites = [path for path, text in files.items()
              if path.endswith(".cpp") and TEST.search(blanked(text))]
    yield from name_faults(path for path in files if path.endswith((".cpp", ".h")))
    yield from program_faults(lists, suites)
    for path, text in files.items():
        if path.endswith((".cpp", ".h")):
            yield from equality_faults(path, text)
        if path.endswith(".cpp"):
            yield from suite_faults(path, text)


def main():
    tracked = subprocess.run(
        ["git", "ls-files", "--cached", "--others", "--exclude-standard", "tests/"],
        capture_output=True, text=True, check=True).stdout.split()
    files = {}
    for path in tracked:
        if path.endswith((".cpp", ".h", "CMakeLists.txt")) and os.path.exists(path):
            with open(path, encoding="utf-8") as file:
                files[path] = file.read()
    faults = list(faults_of(files))
    print(*faults, sep="\n", end="\n" if faults else "")
    return 1 if faults else 0


if __name__ == "__main__":
    sys.exit(main())
