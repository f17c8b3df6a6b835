#!/usr/bin/env python3
"""Runs the snippets of documentation pages, so that the pages cannot rot.

    run.py --build BUILD [--update] PAGE...

With --update the pages get what their commands printed, to be read before it is kept.

A page is one shell session in an empty folder, with the tool of BUILD on the PATH, the library
installed where pkg-config and CMake find it, and two links: `examples` to the examples of this
repository and `plugins` to where its plugins are built. Its fenced blocks are taken in order:

    ```xml file=hello.xml         is written to this file; any language will do
    ```sh file=hello.sh mode=755  the same, with these permissions
    ```console                    a line "$ ..." is a command, lines "> ..." go on with it, and the
                                  lines below are exactly what it prints on both streams; a line
                                  "..." stands for any lines
    ```text                       is an illustration and left alone

Any other fenced block is a fault of the page.
"""

import argparse
import difflib
import os
import pathlib
import re
import subprocess
import sys
import tempfile

ROOT = pathlib.Path(__file__).resolve().parents[2]
TIME_LIMIT = 120  # seconds for a page
FENCE = re.compile(r"^```(\S*)([^\n`]*)\n(.*?)^```$", re.MULTILINE | re.DOTALL)


class Session:
    """One page as a shell script; its commands print into numbered files."""

    def __init__(self, page, folder):
        self.page, self.folder = page, folder
        self.script = ""
        self.commands = []  # (line in the page, command, expected text)

    def add_block(self, language, options, body, line):
        if "file" in options:
            self.add_file(options["file"], options.get("mode", "644"), body, line)
        elif language == "console" and not options:
            self.add_commands(body, line)
        elif language != "text" or options:
            raise SystemExit(f"{self.page}:{line}: a block is a file, or console, or text")

    def add_file(self, name, mode, body, line):
        copy = self.folder / f"file-{line}"
        copy.write_text(body)
        self.script += f"install -D -m {mode} '{copy}' '{name}'\n"

    def add_commands(self, body, line):
        commands = []
        for number, text in enumerate(body.splitlines(keepends=True), line + 1):
            if text.startswith("$ "):
                commands.append([number, text[2:], ""])
            elif not commands:
                raise SystemExit(f"{self.page}:{number}: output in front of the first command")
            elif text.startswith("> ") and not commands[-1][2]:
                commands[-1][1] += text[2:]
            else:
                commands[-1][2] += text
        for number, command, _ in commands:
            self.script += f"{{ {command}}} >'{self.folder}/out-{number}' 2>&1\n"
        self.commands += commands

    def run(self, build):
        work = self.folder / "work"
        work.mkdir()
        (work / "examples").symlink_to(ROOT / "examples")
        (work / "plugins").symlink_to(build / "plugins")
        environment = dict(
            os.environ,
            PATH=f"{build / 'bin'}:{os.environ['PATH']}",
            KELVASH_COMMANDS=str(ROOT / "examples/commands/scripts"),
            LANG="C.UTF-8",
        )
        (self.folder / "script").write_text(self.script)
        subprocess.run(["/bin/sh", self.folder / "script"], cwd=work, env=environment,
                       stdin=subprocess.DEVNULL, timeout=TIME_LIMIT, check=False)
        # (line in the page, command, expected text, printed text) of each that gave something else
        results = [(*command, self.printed(command[0])) for command in self.commands]
        return [result for result in results if not re.fullmatch(pattern(result[2]), result[3])]

    def printed(self, line):
        try:
            return (self.folder / f"out-{line}").read_text(errors="backslashreplace")
        except FileNotFoundError:
            return "(did not run: the session ended before it)\n"

    def complaint(self, line, command, expected, printed):
        lines = difflib.unified_diff(expected.splitlines(), printed.splitlines(), lineterm="", n=99)
        return f"{self.page}:{line}: $ {command}" + "\n".join(list(lines)[3:]) + "\n"

    def update(self, differences):
        lines = self.page.read_text().splitlines(keepends=True)
        for line, command, expected, printed in reversed(differences):
            start = line - 1 + command.count("\n")
            lines[start:start + expected.count("\n")] = [printed]
        self.page.write_text("".join(lines))


def pattern(expected):
    """The expression for the text that a page expects."""
    return "".join(r"(?:.*\n)*" if line == "...\n" else re.escape(line)
                   for line in expected.splitlines(keepends=True))


def check(page, build, update):
    """What the page shows wrongly."""
    text = page.read_text()
    with tempfile.TemporaryDirectory() as folder:
        session = Session(page, pathlib.Path(folder))
        for fence in FENCE.finditer(text):
            options = dict(option.split("=", 1) for option in fence[2].split())
            session.add_block(fence[1], options, fence[3], text.count("\n", 0, fence.start()) + 1)
        differences = session.run(build)
    if update:
        session.update(differences)
    return [session.complaint(*difference) for difference in differences]


def install(build, prefix):
    """Installs the build where the pages' commands find it."""
    subprocess.run(["cmake", "--install", build, "--prefix", prefix],
                   stdout=subprocess.DEVNULL, check=True)
    os.environ["CMAKE_PREFIX_PATH"] = prefix
    os.environ["PKG_CONFIG_PATH"] = ":".join(map(str, pathlib.Path(prefix).rglob("pkgconfig")))


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--build", type=pathlib.Path, required=True)
    parser.add_argument("--update", action="store_true")
    parser.add_argument("pages", type=pathlib.Path, nargs="+")
    arguments = parser.parse_args()
    build = arguments.build.resolve()
    with tempfile.TemporaryDirectory() as prefix:
        install(build, prefix)
        complaints = [complaint for page in arguments.pages
                      for complaint in check(page, build, arguments.update)]
    sys.exit("\n".join(complaints) or 0)


if __name__ == "__main__":
    main()
