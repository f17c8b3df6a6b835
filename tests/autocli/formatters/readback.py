#!/usr/bin/env python3
"""Reads the golden texts back with the readers that users have, to the values they were made from.

Some values give texts that a reader refuses or takes for something else; those are named here, and
docs/formats.md tells what a script author must know of them.
"""

import ast
import json
import pathlib
import re
import unittest
import xml.etree.ElementTree

DATA = pathlib.Path(__file__).resolve().parent / "data"
EVERY_BYTE = bytes(range(256))


def from_values(element):
    """A value of values.xml."""
    if element.tag == "structure":
        return {field.get("name"): from_values(field[0]) for field in element}
    if element.tag == "list":
        return [from_values(item) for item in element]
    return {"int": int, "bool": "true".__eq__, "string": str}[element.tag](element.text or "")


VALUES = {**from_values(xml.etree.ElementTree.parse(DATA / "values.xml").getroot()[0]),
          "every byte": EVERY_BYTE.decode("latin-1"), "no structs": []}


def documents(formatter):
    """The texts, as bytes, by the names of the values."""
    pieces = re.split(rb"^=== (.*)\n", (DATA / f"{formatter}.txt").read_bytes(), flags=re.M)
    return {name.decode(): text for name, text in zip(pieces[1::2], pieces[2::2])}


def with_texts(value, change):
    """The value, with each text in it changed."""
    if isinstance(value, list):
        return [with_texts(item, change) for item in value]
    if isinstance(value, dict):
        return {name: with_texts(field, change) for name, field in value.items()}
    return change(value) if isinstance(value, str) else value


def bytes_as_characters(text):
    return text if text == VALUES["every byte"] else text.encode().decode("latin-1")


def from_xml(element):
    if element.tag == "structure":
        return {field.get("name"): from_xml(field[0]) for field in element}
    if element.tag == "list":
        return [from_xml(item) for item in element]
    text = element.text or ""
    return {"integer": int, "boolean": "true".__eq__, "string": str}[element.tag](text)


class ReadBack(unittest.TestCase):
    def each(self, formatter, leave_out=()):
        for name, value in VALUES.items():
            if name not in leave_out:
                yield documents(formatter)[name], value

    def test_json(self):
        for text, value in self.each("json"):
            self.assertEqual(json.loads(text), with_texts(value, bytes_as_characters))

    def test_python(self):
        # Python source holds no zero byte, and a backslash at the end of a text ends it not.
        for text, value in self.each("python", leave_out=("every byte", "texts")):
            self.assertEqual(ast.literal_eval(text.decode()), value)
        text = documents("python")["texts"].decode()
        self.assertRaises(SyntaxError, ast.literal_eval, text)
        expected = with_texts(VALUES["texts"], lambda t: t.removesuffix("\\").replace("\r", "\n"))
        self.assertEqual(ast.literal_eval(text.replace('\\"""', '"""', 1)), expected)

    def test_xml(self):
        for text, value in self.each("xml", leave_out=("every byte",)):
            read = from_xml(xml.etree.ElementTree.fromstring(b"<root>" + text + b"</root>")[0])
            # Every reader of XML takes the end of a line, in whatever form, for a line feed.
            self.assertEqual(read, with_texts(value, lambda t: t.replace("\r\n", "\n")))


if __name__ == "__main__":
    unittest.main()
