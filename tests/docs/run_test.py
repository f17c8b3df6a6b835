#!/usr/bin/env python3
"""The runner passes a page only when its session gives what the page shows."""

import contextlib
import io
import pathlib
import tempfile
import unittest

import run

PAGE = """# Greeting

```sh file=bin/greet mode=755
#!/bin/sh
echo "Hello $1"; echo "from $0" >&2
```

```console
$ bin/greet "you
> there"
Hello you
there
from bin/greet
$ name=me; false
$ echo "$? $name"; seq 9
1 me
...
9
```

```text
not run
```
"""


class RunTest(unittest.TestCase):
    def check(self, text, update=False):
        """The complaints about a page with this text, and its text afterwards."""
        with tempfile.TemporaryDirectory() as directory:
            page = pathlib.Path(directory) / "page.md"
            page.write_text(text)
            return run.check(page, run.ROOT, update), page.read_text()

    def test_a_page_passes_only_when_all_of_it_is_as_shown(self):
        self.assertEqual(self.check(PAGE), ([], PAGE))
        for right, wrong in [("Hello you\n", "Hello you \n"), ("from bin/greet\n", ""),
                             ("...\n9\n", "...\n8\n"), ("...\n", ""), (" mode=755", ""),
                             ("name=me; false", "exit")]:
            with self.subTest(wrong):
                self.assertNotEqual(self.check(PAGE.replace(right, wrong))[0], [])

    def test_a_block_that_would_not_run_is_a_fault(self):
        for right, wrong in [("```text", "```"), ("```console", "```sh"), ("$ bin", "% bin")]:
            with self.subTest(wrong), contextlib.redirect_stderr(io.StringIO()):
                self.assertRaises(SystemExit, self.check, PAGE.replace(right, wrong))

    def test_update_writes_what_the_commands_gave(self):
        bare = PAGE.replace("Hello you\nthere\nfrom bin/greet\n", "old\n")
        self.assertEqual(self.check(bare, update=True)[1], PAGE)


if __name__ == "__main__":
    unittest.main()
