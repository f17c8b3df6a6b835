#!/usr/bin/env python3
"""Checks that the tree keeps its floors: each knows only what stands below it.

Complains about an include that runs upwards, a public header that needs what is not installed with
it, libxml2 outside its two rooms, a public header that the umbrella leaves out, and a source that
no target builds.
"""

import argparse
import json
import pathlib
import re
import sys

# The first pattern that a path matches is its floor.
FLOORS = [
    (0, r"zelmar/(Export|ZelmarException)\.\w+"),
    (0, r"zelmar/internal/(platform/.*|[^/]*)"),
    (1, r"zelmar/(metaobj|internal/text)/.*"),
    (2, r"zelmar/callspec/.*"),
    (3, r"zelmar/autocli/formatters/.*"),
    (4, r"zelmar/autocli/(NamespaceNode|Namespace|CommandSpec|Command|CommandInput|CommandOutput"
        r"|CommandHelp|Plugin)\.\w+"),
    (5, r"zelmar/(internal/xml|autocli/extension)/.*"),
    (6, r"zelmar/autocli/[^/]*"),
    (7, r"kelvash/.*"),
]
UMBRELLA = "zelmar/zelmar.h"
LIBXML_ROOMS = ("zelmar/internal/xml/", "zelmar/autocli/extension/")

# Not part of an ordinary build: projects of their own, and what an option switches on.
BUILT_APART = ("benchmarks/", "tests/install/")

INCLUDE = re.compile(r'^\s*#\s*include\s*([<"])([^>"]+)[>"]', re.MULTILINE)


def floor(path):
    return next((number for number, pattern in FLOORS if re.fullmatch(pattern, path)), None)


def is_public_header(path):
    return (path.startswith("zelmar/") and path.endswith(".h")
            and not path.startswith("zelmar/internal/"))


def files(root, directories, suffixes):
    return sorted(path.relative_to(root).as_posix()
                  for directory in directories
                  for path in (root / directory).rglob("*") if path.suffix in suffixes)


def includes(root, path):
    """What the file includes, one of ours by its path from the root."""
    for quote, name in INCLUDE.findall((root / path).read_text(encoding="utf-8")):
        beside = pathlib.PurePath(path).parent / name
        yield beside.as_posix() if quote == '"' and (root / beside).is_file() else name


def judge_include(path, name):
    """The complaints about one include of one file."""
    if is_public_header(path) and name.startswith(("zelmar/internal/", "libxml/", "boost/")):
        yield f"{path} is public and includes {name}"
    elif name.startswith("libxml/") and not path.startswith(LIBXML_ROOMS):
        yield f"{path} includes {name}, which only {' and '.join(LIBXML_ROOMS)} may"
    if path == UMBRELLA or not name.startswith(("zelmar/", "kelvash/")):
        return
    if name == UMBRELLA:
        if path.startswith("zelmar/"):
            yield f"{path} includes the umbrella"
    elif floor(name) is None:
        yield f"{path} includes {name}, which stands on no floor"
    elif floor(path) is not None and floor(name) > floor(path):
        yield f"{path} (floor {floor(path)}) includes {name} (floor {floor(name)})"


def judge_includes(root):
    for path in files(root, ("zelmar", "kelvash"), (".h", ".cpp")):
        if path != UMBRELLA and floor(path) is None:
            yield f"{path} stands on no floor"
        for name in includes(root, path):
            yield from judge_include(path, name)


def judge_umbrella(root):
    covered = set(includes(root, UMBRELLA))
    for path in files(root, ("zelmar",), (".h",)):
        if is_public_header(path) and path != UMBRELLA and path not in covered:
            yield f"{UMBRELLA} leaves out {path}"


def is_listed(root, path):
    """Whether the list of sources beside the file names it."""
    lists = (root / path).parent / "CMakeLists.txt"
    return lists.is_file() and pathlib.PurePath(path).name in re.split(r"[\s()]+", lists.read_text())


def judge_sources(root, built):
    directories = ("zelmar", "kelvash", "examples", "tests", "fuzz", "benchmarks")
    for path in files(root, directories, (".c", ".cpp")):
        if path in built or (path.startswith(BUILT_APART) and is_listed(root, path)):
            continue
        yield f"{path} is built by no target"


def read_database(root, database):
    return {pathlib.Path(entry["file"]).relative_to(root).as_posix()
            for entry in json.loads(database.read_text())
            if pathlib.Path(entry["file"]).is_relative_to(root)}


def judge(root, built):
    return [*judge_includes(root), *judge_umbrella(root), *judge_sources(root, built)]


def main():
    parser = argparse.ArgumentParser(description="Checks that the tree keeps its floors.")
    parser.add_argument("root", type=pathlib.Path)
    parser.add_argument("database", type=pathlib.Path, help="compile_commands.json of a build")
    arguments = parser.parse_args()
    complaints = judge(arguments.root, read_database(arguments.root, arguments.database))
    print("\n".join(complaints))
    return 1 if complaints else 0


if __name__ == "__main__":
    sys.exit(main())
