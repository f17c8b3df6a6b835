#!/usr/bin/env python3
"""Checks that the tree keeps its floors: each knows only what stands below it.

    layout.py ROOT COMPILE_COMMANDS

Complains about an include that runs upwards, about what is public (the headers that the umbrella
names) or a program using what is not, about libxml2 outside its room, and about a source that no
target builds.
"""

import json
import pathlib
import re
import sys

# The first pattern that a path matches is its floor.
FLOORS = [
    (0, r"zelmar/((Export|Version|ZelmarException)\.\w+|internal/.*)"),
    (1, r"zelmar/metaobj/.*"),
    (2, r"zelmar/callspec/.*"),
    (3, r"zelmar/autocli/formatters/.*"),
    (4, r"zelmar/autocli/(NamespaceNode|Namespace|CommandSpec|Command|CommandInput|CommandOutput"
        r"|CommandHelp|Plugin|PluginEntry)\.\w+"),
    (5, r"zelmar/autocli/extension/.*"),
    (6, r"zelmar/autocli/(?!Cli)[^/]*"),
    (7, r"zelmar/autocli/.*"),
    (8, r"(kelvash|author|mcp|plugins|examples)/.*"),
]
UMBRELLA = "zelmar/zelmar.h"
LIBXML_ROOM = "zelmar/autocli/extension/"
# Not part of an ordinary build: projects of their own, and what an option switches on.
BUILT_APART = ("benchmarks/",)


def floor(path):
    return next((number for number, pattern in FLOORS if re.fullmatch(pattern, path)), None)


def includes(path):
    return re.findall(r"^\s*#\s*include\s*<([^>]+)>", path.read_text(), re.MULTILINE)


def judge_include(path, name, public):
    """The complaints about one include of one file."""
    here, there = floor(path), floor(name)
    closed = path in public or here == 8
    if closed and name.startswith(("boost/", "zelmar/")) and name not in public:
        yield f"{path} uses what is installed, and includes {name}, which is not"
    if name.startswith("libxml/") and (path in public or not path.startswith(LIBXML_ROOM)):
        if here != 8:
            yield f"{path} includes {name}"
    if here is None:
        yield f"{path} stands on no floor"
    elif here < 8 and (name == UMBRELLA or (there is not None and there > here)):
        yield f"{path} (floor {here}) includes {name} (floor {there})"


def judge(root, built):
    public = {UMBRELLA, *includes(root / UMBRELLA)}
    for path in sorted(root.glob("*/**/*.*")):
        name = path.relative_to(root).as_posix()
        if name.startswith("build/") or path.suffix not in (".h", ".cpp"):
            continue
        if name.startswith(("zelmar/", "kelvash/", "author/", "mcp/", "plugins/", "examples/")):
            for included in includes(path) if name != UMBRELLA else ():
                yield from judge_include(name, included, public)
        if path.suffix == ".cpp" and name not in built and not name.startswith(BUILT_APART):
            yield f"{name} is built by no target"


def main():
    root = pathlib.Path(sys.argv[1])
    built = {pathlib.Path(entry["file"]).relative_to(root).as_posix()
             for entry in json.loads(pathlib.Path(sys.argv[2]).read_text())
             if pathlib.Path(entry["file"]).is_relative_to(root)}
    complaints = list(judge(root, built))
    print("\n".join(complaints))
    return 1 if complaints else 0


if __name__ == "__main__":
    sys.exit(main())
