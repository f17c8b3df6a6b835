#!/usr/bin/env python3
"""Runs the console blocks of pages, so that what a page shows is what happens.

    run.py [--path FOLDER] [--link NAME=TARGET]... [--env NAME=VALUE]... [--update] PAGE...

A page is one session of sh in an empty folder, with these links in it, with FOLDER first on the
PATH, and no other variable of the caller than the options of sanitizers. Its fenced blocks are taken
in order:

    ```xml file=hello.xml         is written to this file; any language will do
    ```sh file=hello.sh mode=755  the same, with these permissions
    ```console                    a line "$ ..." is a command, lines "> ..." go on with it, and the
                                  lines below are exactly what it prints on both streams; a line
                                  "..." stands for any lines
    ```console exact              the same, but with the streams apart: what the command prints on
                                  standard output, then on the error stream, each line of this with
                                  "2> " in front, then "[status N]" unless it ends with 0
    ```text                       is an illustration and left alone

Any other fenced block is a fault of the page. Standard input is empty. A byte that is no UTF-8 is
shown as \\xHH, and text without a line feed at its end with "(no line feed)" behind it. When a page
ends, or lasts too long, all processes that it has started end with it.

With --update, or UPDATE_GOLDEN=1 in the environment, pages get what their commands printed, to be
read before it is kept.
"""

import argparse
import contextlib
import difflib
import os
import pathlib
import re
import signal
import subprocess
import sys
import tempfile

TIME_LIMIT = 240  # seconds for a page
FENCE = re.compile(r"^```(\S*)([^\n`]*)\n(.*?)^```$", re.MULTILINE | re.DOTALL)
STATUS_KEEPER = 'keep_status() { set -- "$1" $?; echo "$2" >"$1"; return "$2"; }\n'


class Session:
    """One page as a shell script; its commands print into numbered files."""

    def __init__(self, page, folder):
        self.page, self.folder = page, folder
        self.script = STATUS_KEEPER
        self.commands = []  # (line in the page, command, expected text, whether streams are apart)

    def add_block(self, language, options, body, line):
        if options[:1] and options[0].startswith("file="):
            options = dict(option.split("=", 1) for option in options)
            self.add_file(options["file"], options.get("mode", "644"), body, line)
        elif language == "console" and options in ([], ["exact"]):
            self.add_commands(body, line, bool(options))
        elif language != "text" or options:
            raise SystemExit(f"{self.page}:{line}: a block is a file, or console, or text")

    def add_file(self, name, mode, body, line):
        copy = self.folder / f"file-{line}"
        copy.write_text(body)
        self.script += f"install -D -m {mode} '{copy}' '{name}'\n"

    def add_commands(self, body, line, apart):
        commands = []
        for number, text in enumerate(lines_of(body), line + 1):
            if text.startswith("$ "):
                commands.append([number, text[2:], "", apart])
            elif not commands:
                raise SystemExit(f"{self.page}:{number}: output in front of the first command")
            elif text.startswith("> ") and not commands[-1][2]:
                commands[-1][1] += text[2:]
            else:
                commands[-1][2] += text
        for number, command, _, _ in commands:
            out, err, status = (f"'{self.folder}/{kind}-{number}'" for kind in ("out", "err", "status"))
            self.script += f"{{ {command}}} >{out} 2>{err if apart else '&1'}; keep_status {status}\n"
        self.commands += commands

    def run(self, arguments):
        """Each command that gave something else: line, command, expected and printed text."""
        work = self.folder / "work"
        work.mkdir()
        for name, target in arguments.link:
            (work / name).symlink_to(target)
        sanitizers = {name: os.environ[name] for name in os.environ if name.endswith("SAN_OPTIONS")}
        environment = dict(sanitizers, HOME=str(work), PATH=f"{arguments.path}:{os.environ['PATH']}",
                           **dict(arguments.env))
        (self.folder / "script").write_text(self.script)
        shell = subprocess.Popen(["/bin/sh", self.folder / "script"], cwd=work, env=environment,
                                 stdin=subprocess.DEVNULL, start_new_session=True)
        try:
            shell.wait(TIME_LIMIT)
        except subprocess.TimeoutExpired:
            print(f"{self.page}: lasted longer than {TIME_LIMIT} seconds")
        finally:
            with contextlib.suppress(ProcessLookupError):
                os.killpg(shell.pid, signal.SIGKILL)
            shell.wait()
        results = [(*command[:3], self.printed(command[0], command[3])) for command in self.commands]
        return [result for result in results if not re.fullmatch(pattern(result[2]), result[3])]

    def printed(self, line, apart):
        status = self.read(f"status-{line}").strip()
        if not status:
            return "(did not end: the session ended before it)\n"
        text = self.read(f"out-{line}")
        if apart:
            text += "".join(f"2> {err}" for err in lines_of(self.read(f"err-{line}")))
            text += f"[status {status}]\n" if status != "0" else ""
        return text

    def read(self, name):
        try:
            text = (self.folder / name).read_bytes().decode(errors="backslashreplace")
        except FileNotFoundError:
            return ""
        return text if text.endswith("\n") or not text else text + "(no line feed)\n"

    def complaint(self, line, command, expected, printed):
        lines = difflib.unified_diff(lines_of(expected), lines_of(printed), n=99)
        return f"{self.page}:{line}: $ {command}" + "".join(list(lines)[3:])

    def update(self, differences):
        lines = lines_of(self.page.read_bytes().decode())
        for line, command, expected, printed in reversed(differences):
            start = line - 1 + command.count("\n")
            lines[start:start + expected.count("\n")] = [printed]
        self.page.write_text("".join(lines))


def lines_of(text):
    return re.findall(r"[^\n]*\n|[^\n]+", text)  # no other character ends a line


def pattern(expected):
    """The expression for the text that a page expects."""
    return "".join(r"(?:.*\n)*" if line == "...\n" else re.escape(line)
                   for line in lines_of(expected))


def check(page, arguments):
    """What the page shows wrongly."""
    text = page.read_bytes().decode()
    with tempfile.TemporaryDirectory() as folder:
        session = Session(page, pathlib.Path(folder))
        for fence in FENCE.finditer(text):
            line = text.count("\n", 0, fence.start()) + 1
            session.add_block(fence[1], fence[2].split(), fence[3], line)
        differences = session.run(arguments)
    if arguments.update:
        session.update(differences)
    return [session.complaint(*difference) for difference in differences]


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--path", default=".")
    parser.add_argument("--link", type=lambda text: text.split("=", 1), action="append", default=[])
    parser.add_argument("--env", type=lambda text: text.split("=", 1), action="append", default=[])
    parser.add_argument("--update", action="store_true", default="UPDATE_GOLDEN" in os.environ)
    parser.add_argument("pages", type=pathlib.Path, nargs="+")
    arguments = parser.parse_args()
    sys.exit("\n".join(complaint for page in arguments.pages
                       for complaint in check(page, arguments)) or 0)


if __name__ == "__main__":
    main()
