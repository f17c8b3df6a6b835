#!/usr/bin/env python3
"""The layout check finds each fault it is there for, and nothing in a tidy tree."""

import pathlib
import tempfile
import unittest

import layout

TIDY = {
    "zelmar/zelmar.h": ["<zelmar/Export.h>", "<zelmar/metaobj/MetaObject.h>",
                        "<zelmar/autocli/Command.h>", "<zelmar/autocli/Dispatcher.h>"],
    "zelmar/Export.h": [],
    "zelmar/metaobj/MetaObject.h": ["<zelmar/Export.h>", "<string>"],
    "zelmar/metaobj/MetaObject.cpp": ['"MetaObject.h"', "<boost/regex.hpp>"],
    "zelmar/internal/Text.h": [],
    "zelmar/internal/xml/Node.h": ["<libxml/tree.h>", "<zelmar/autocli/Command.h>"],
    "zelmar/autocli/Command.h": ["<zelmar/metaobj/MetaObject.h>"],
    "zelmar/autocli/Dispatcher.h": ["<zelmar/autocli/Command.h>"],
    "zelmar/autocli/Dispatcher.cpp": ["<zelmar/internal/xml/Node.h>", "<zelmar/internal/Text.h>"],
    "kelvash/main.cpp": ["<zelmar/zelmar.h>"],
    "benchmarks/table_benchmark.cpp": [],
}
BUILT = {path for path in TIDY if path.endswith(".cpp") and not path.startswith("benchmarks")}


class LayoutTest(unittest.TestCase):
    def complaints(self, changes):
        """What is said of the tidy tree with these files changed or added."""
        with tempfile.TemporaryDirectory() as directory:
            root = pathlib.Path(directory)
            for path, names in {**TIDY, **changes}.items():
                (root / path).parent.mkdir(parents=True, exist_ok=True)
                (root / path).write_text("".join(f"#include {name}\n" for name in names))
            (root / "benchmarks/CMakeLists.txt").write_text(
                "add_executable(table_benchmark\n  table_benchmark.cpp\n)\n")
            return layout.judge(root, BUILT)

    def test_nothing_is_said_of_a_tidy_tree(self):
        self.assertEqual(self.complaints({}), [])

    def test_each_fault_is_told(self):
        cases = [
            ("zelmar/metaobj/MetaObject.cpp", ["<zelmar/autocli/Command.h>"],
             "zelmar/metaobj/MetaObject.cpp (floor 1) includes zelmar/autocli/Command.h (floor 4)"),
            ("zelmar/autocli/Command.h", ['"Dispatcher.h"'],
             "zelmar/autocli/Command.h (floor 4) includes zelmar/autocli/Dispatcher.h (floor 6)"),
            ("zelmar/metaobj/MetaObject.cpp", ["<zelmar/zelmar.h>"],
             "zelmar/metaobj/MetaObject.cpp includes the umbrella"),
            ("zelmar/autocli/Dispatcher.h", ["<zelmar/internal/Text.h>"],
             "zelmar/autocli/Dispatcher.h is public and includes zelmar/internal/Text.h"),
            ("zelmar/autocli/Dispatcher.h", ["<libxml/tree.h>"],
             "zelmar/autocli/Dispatcher.h is public and includes libxml/tree.h"),
            ("zelmar/autocli/Dispatcher.h", ["<boost/regex.hpp>"],
             "zelmar/autocli/Dispatcher.h is public and includes boost/regex.hpp"),
            ("zelmar/autocli/Dispatcher.cpp", ["<libxml/tree.h>"],
             "zelmar/autocli/Dispatcher.cpp includes libxml/tree.h, which only"
             " zelmar/internal/xml/ and zelmar/autocli/extension/ may"),
            ("zelmar/attic/Old.h", None, "zelmar/attic/Old.h stands on no floor"),
            ("zelmar/autocli/Plugin.h", [], "zelmar/zelmar.h leaves out zelmar/autocli/Plugin.h"),
            ("examples/embed/main.cpp", [], "examples/embed/main.cpp is built by no target"),
            ("benchmarks/lost.cpp", [], "benchmarks/lost.cpp is built by no target"),
        ]
        for path, names, complaint in cases:
            with self.subTest(complaint):
                self.assertIn(complaint, self.complaints({path: names or []}))


if __name__ == "__main__":
    unittest.main()
