#!/usr/bin/env python3
"""The runner reads what it writes, and passes a case only when every byte is as told."""

import contextlib
import io
import itertools
import pathlib
import tempfile
import unittest

import run

CASE = b"""# What a shell would do.
$ cat; printf 'a \\377';
> printf 'oh' >&2; exit 3
=== stdin
in
=== stdout (escaped)
in
a \\xff\\
=== stderr (no newline)
oh
=== status 3
"""


class RunTest(unittest.TestCase):
    def check(self, text, update=False):
        """Whether a case with this text passes, and its text afterwards."""
        with tempfile.TemporaryDirectory() as directory:
            path = pathlib.Path(directory) / "one.case"
            path.write_bytes(text)
            with contextlib.redirect_stdout(io.StringIO()):
                return run.check(path, run.ROOT, update), path.read_bytes()

    def test_every_text_reads_back_as_it_was_written(self):
        pieces = [b"", b"\n", b"a ", b"\\", b"=== stdout\n", b"\xff", b"\x00", b"\xd0\xaf", b"\t"]
        for text in map(b"".join, itertools.product(pieces, repeat=3)):
            _, title, body = run.SECTION.split(run.encode("stdout", text))
            self.assertEqual(run.decode(body, title.decode().partition(" ")[2]), text)

    def test_a_case_passes_only_when_all_of_it_is_as_told(self):
        self.assertEqual(self.check(CASE), (True, CASE))
        for right, wrong in [(b"=== status 3", b"=== status 4"), (b"\noh\n", b"\noh \n"),
                             (b"\\xff\\\n", b"\\xff\n"), (b"=== stderr (no newline)\noh\n", b""),
                             (b"=== status 3", b"=== state 3"), (b"$ ", b"")]:
            with self.subTest(wrong):
                self.assertFalse(self.check(CASE.replace(right, wrong))[0])

    def test_update_writes_what_the_command_gave(self):
        start = CASE.index(b"=== stdout")
        self.assertEqual(self.check(CASE[:start], update=True), (True, CASE))


if __name__ == "__main__":
    unittest.main()
