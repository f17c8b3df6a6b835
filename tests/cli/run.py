#!/usr/bin/env python3
"""Runs whole-tool cases: a command line, and the exact bytes that it gives.

A case is one file <topic>/<name>.case:

    # What the case shows; any number of such lines.
    $ printf 'host info get\\n' |
    > kelvash --input STDIN
    === stdin
    === stdout
    === stderr
    === status 1

The command is what a shell session would show, "> " continuing it, and is given to sh. A section
is the text up to the next line that starts with "=== ". One that is missing stands for no text,
or for status 0. After the name of a text may stand

    (no newline)  the line feed before the next section is not part of the text
    (escaped)     for bytes that a file of lines shows badly: \\xHH is a byte, \\\\ a backslash, and
                  a backslash at the end of a line takes the line feed out of the text

--update writes what a run gave, in the form it needs. The command runs in a directory of its own,
in which

    here          is the directory of the topic
    commands      is examples/commands
    plugins       is where the example plugins are built
    test-plugins  is where the plugins of the tests are built

with the built tool first in PATH, HOME in that directory, KELVASH_COMMANDS at the scripts of
examples/commands, standard input empty unless there is a section, and no locale nor any other
variable of the caller except those of the sanitizers.
"""

import argparse
import difflib
import os
import pathlib
import re
import subprocess
import sys
import tempfile

CASES = pathlib.Path(__file__).resolve().parent
ROOT = CASES.parent.parent
TIME_LIMIT = 120  # seconds: a case that waits for ever is a fault

SECTION = re.compile(rb"^=== (.*)\n", re.MULTILINE)
ESCAPE = re.compile(rb"\\(?:x([0-9a-f]{2})|(\\)|\n)")
PLAIN_LINE = re.compile(r"(?!=== )[^\x00-\x08\x0b-\x1f\x7f]*")


class BadCase(Exception):
    """The file is not a case."""


def decode(text, form):
    if form == "":
        return text
    if form == "(no newline)":
        return text.removesuffix(b"\n")
    if form == "(escaped)":
        return ESCAPE.sub(lambda m: bytes.fromhex(m[1].decode()) if m[1] else m[2] or b"", text)
    raise BadCase(f"unknown form {form}")


def is_plain(text):
    try:
        return all(PLAIN_LINE.fullmatch(line) for line in text.decode("utf-8").split("\n"))
    except UnicodeDecodeError:
        return False


def encode(name, text):
    """The section that `decode` reads as this text."""
    head = b"=== " + name.encode()
    if is_plain(text):
        return head + (b"\n" + text if text.endswith(b"\n") else b" (no newline)\n" + text + b"\n")
    text = re.sub(rb"[^\n -~]|\\|^=", lambda m: b"\\\\" if m[0] == b"\\" else b"\\x%02x" % m[0][0],
                  text, flags=re.MULTILINE)
    return head + b" (escaped)\n" + text + (b"" if text.endswith(b"\n") else b"\\\n")


class Case:
    def __init__(self, path):
        self.path = path
        head, *sections = SECTION.split(path.read_bytes())
        self.head = head
        self.command = "\n".join(line[2:] for line in head.decode().split("\n")
                                 if line.startswith(("$ ", "> ")))
        self.stdin_section = b""
        self.stdin = b""
        self.expected = {"stdout": b"", "stderr": b"", "status": 0}
        if not self.command:
            raise BadCase("no line starts with \"$ \"")
        for title, text in zip(sections[::2], sections[1::2]):
            self._read_section(title, text)

    def _read_section(self, title, text):
        name, _, form = title.decode().partition(" ")
        if name == "status" and form.isdecimal() and not text.strip():
            self.expected["status"] = int(form)
        elif name == "stdin":
            self.stdin_section = b"=== " + title + b"\n" + text
            self.stdin = decode(text, form)
        elif name in ("stdout", "stderr"):
            self.expected[name] = decode(text, form)
        else:
            raise BadCase(f"unknown section {title.decode()}")

    def run(self, build):
        with tempfile.TemporaryDirectory(prefix="kelvash-case-") as directory:
            for name, target in (("here", self.path.parent),
                                 ("commands", ROOT / "examples" / "commands"),
                                 ("plugins", build / "plugins"),
                                 ("test-plugins", build / "test-plugins")):
                os.symlink(target, os.path.join(directory, name))
            environment = {name: value for name, value in os.environ.items()
                           if name.endswith("SAN_OPTIONS")}
            environment["PATH"] = f"{build}/bin:/usr/local/bin:/usr/bin:/bin:/usr/sbin:/sbin"
            environment["HOME"] = directory
            environment["KELVASH_COMMANDS"] = "commands/scripts"
            done = subprocess.run(["sh", "-c", self.command], input=self.stdin, cwd=directory,
                                  env=environment, capture_output=True, timeout=TIME_LIMIT,
                                  start_new_session=True, check=False)
        # A command that a signal ended is shown as a shell shows it.
        status = done.returncode if done.returncode >= 0 else 128 - done.returncode
        return {"stdout": done.stdout, "stderr": done.stderr, "status": status}

    def text(self, results):
        """The file of this case, were these its results."""
        parts = [self.head, self.stdin_section]
        parts += [encode(name, results[name]) for name in ("stdout", "stderr") if results[name]]
        if results["status"] != 0:
            parts.append(b"=== status %d\n" % results["status"])
        return b"".join(parts)


def show_difference(case, results):
    expected, actual = (case.text(r).decode("utf-8", "backslashreplace").splitlines(keepends=True)
                        for r in (case.expected, results))
    sys.stdout.writelines(difflib.unified_diff(expected, actual, "expected", "actual"))


def check(path, build, update):
    """Whether the case passes; says so when it does not."""
    try:
        case = Case(path)
        results = case.run(build)
    except (BadCase, UnicodeDecodeError, subprocess.TimeoutExpired) as failure:
        print(f"{path}: {failure}")
        return False
    if results == case.expected:
        return True
    if update:
        path.write_bytes(case.text(results))
        print(f"{path}: updated")
        return True
    print(f"{path}: {case.command}")
    show_difference(case, results)
    return False


def find_cases(names):
    """The cases that the arguments name: files, topics, or all when there are none."""
    for name in names or sorted(path.name for path in CASES.iterdir() if path.is_dir()):
        path = pathlib.Path(name)
        if path.is_file():
            yield path.resolve()
        else:
            yield from sorted((CASES / name).glob("*.case"))


def main():
    parser = argparse.ArgumentParser(description="Runs whole-tool cases; the head of this file "
                                                 "tells how one is written.")
    parser.add_argument("--build", type=pathlib.Path, default=ROOT / "build" / "release",
                        help="the build whose tool is run (build/release)")
    parser.add_argument("--update", action="store_true",
                        help="write what the cases gave into their files")
    parser.add_argument("names", nargs="*", help="topics or case files; all when there are none")
    arguments = parser.parse_args()

    build = arguments.build.resolve()
    cases = list(find_cases(arguments.names))
    failed = sum(not check(path, build, arguments.update) for path in cases)
    print(f"{len(cases)} cases, {failed} failed")
    return 1 if failed or not cases else 0


if __name__ == "__main__":
    sys.exit(main())
