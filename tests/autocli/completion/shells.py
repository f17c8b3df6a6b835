#!/usr/bin/env python3
"""Presses Tab in bash, zsh and fish, each on a terminal of its own.

    shells.py KELVASH SCRIPTS

What is completed is then made the arguments of a function, which writes down what the shell reads:
it must be the very value, and nothing in it may have run.
"""

import contextlib
import os
import pathlib
import pty
import select
import signal
import sys
import tempfile
import time
import unittest
from xml.sax.saxutils import quoteattr

KELVASH, SCRIPTS = (pathlib.Path(argument).resolve() for argument in sys.argv[1:3])
SHELLS = {
    "bash": ("bash --noprofile --norc -i", f". /usr/share/bash-completion/bash_completion; "
             f". {SCRIPTS}/kelvash.bash; bind 'set completion-query-items 0'; PS1=REA''DY"),
    "zsh": ("zsh -f -i", f"fpath=({SCRIPTS} $fpath); autoload -U compinit; compinit -u -D; "
            "PS1=REA''DY"),
    "fish": ("fish --no-config -i", f"source {SCRIPTS}/kelvash.fish; "
             "function fish_prompt; printf REA''DY; end"),
}
# Each begins with another letter.
VALUES = ["a $(touch ran) `touch ran`;touch ran|touch ran&<>()", "b'\"\\$HOME ${HOME} !! end'",
          "c:d=e,f@{1,2}*?[a-z]~#^%s", "line\nfeed\n", "non-ASCII: Ää€ 日本 ", "x\x7f\x7f",
          "y\u009b2J\u202e", "z\ttab\""]
NOT_IN_FISH = 2  # the last ones: it would show the one as it is and has no way to take the other
DESCRIPTOR = f"""<plugin><version>1.0.0</version>
<namespaces><namespace path="job"><description>Jobs</description></namespace></namespaces>
<commands><command path="job.run"><description>Run a job</description>
<input-spec><parameter name="name" type="string" required="true">
<description>Its name</description><constraint type="stringenum"><enum>
{''.join(f'<enum-value value={quoteattr(value, {chr(10): "&#10;", chr(9): "&#9;"})}>A job</enum-value>'
         for value in VALUES)}
</enum></constraint></parameter></input-spec><output-spec><string/></output-spec>
<format-parameters><formatter>simple</formatter></format-parameters><execute>true</execute></command>
</commands></plugin>"""


class Shell:
    def __init__(self, name, folder):
        command, setup = SHELLS[name]
        self.name, self.folder, self.screen = name, folder, b""
        process, self.terminal = pty.fork()
        if process == 0:
            os.chdir(folder)
            os.execvpe("env", ["env", *command.split()], {
                "PATH": f"{KELVASH.parent}:/usr/bin:/bin", "HOME": str(folder), "TERM": "xterm",
                "LANG": "C.UTF-8", "INPUTRC": "/dev/null", "HISTFILE": "",
                **{k: v for k, v in os.environ.items() if k.endswith("SAN_OPTIONS")}})
        self.stop = lambda: (os.kill(process, signal.SIGKILL), os.waitpid(process, 0))
        self.type(f"{setup}; function args {{ printf '%s\\0' \"$@\" >part; mv part seen; }}\r"
                  if name != "fish" else
                  f"{setup}; function args; printf '%s\\0' $argv >part; mv part seen; end\r")
        self.wait(lambda: b"READY" in self.screen)

    def type(self, keys):
        os.write(self.terminal, keys.encode())

    def wait(self, is_done):
        end = time.monotonic() + 20
        while not is_done():
            if time.monotonic() > end:
                raise AssertionError(f"{self.name} shows {self.screen!r}")
            if select.select([self.terminal], [], [], 0.02)[0]:
                self.screen += os.read(self.terminal, 65536)

    def words(self, keys):
        """What the shell reads in the line that these keys make."""
        seen = self.folder / "seen"
        seen.unlink(missing_ok=True)
        self.type(keys + "\x01" * 4 + "args \r")  # to the beginning, over several lines
        self.wait(seen.exists)
        return seen.read_text().split("\0")[:-1]


class Tab(unittest.TestCase):
    @contextlib.contextmanager
    def shell(self, name):
        with self.subTest(name), tempfile.TemporaryDirectory() as folder:
            folder = pathlib.Path(folder)
            (folder / "job.xml").write_text(DESCRIPTOR)
            shell = Shell(name, folder)
            try:
                yield shell
            finally:
                shell.stop()
            self.assertFalse((folder / "ran").exists())

    def test_the_shell_reads_back_the_very_value(self):
        for name in SHELLS:
            with self.shell(name) as shell:
                for value in VALUES if name != "fish" else VALUES[:-NOT_IN_FISH]:
                    for typed in ("--name ", "--name '", '--name "', "--name=", "--name='"):
                        line = f"kelvash --plugin job.xml job run {typed}{value[0]}"
                        option = ["--name=" + value] if "=" in typed else ["--name", value]
                        self.assertEqual(shell.words(line + "\t")[5:], option, line)

    def test_a_cursor_within_the_line_completes_what_stands_before_it(self):
        for name in SHELLS:
            with self.shell(name) as shell:
                line = "kelvash kel command"
                self.assertEqual(shell.words(line + "\x1b[D" * len(" command") + "\t"),
                                 ["kelvash", "kelvash", "command"])

    def test_several_candidates_are_shown_with_their_descriptions(self):
        for name in SHELLS:
            with self.shell(name) as shell:
                shell.type("kelvash --format\t\t")
                shell.wait(lambda: b"Override the formatter" in shell.screen)


if __name__ == "__main__":
    unittest.main(argv=sys.argv[:1])
