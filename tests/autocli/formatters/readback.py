#!/usr/bin/env python3
"""Reads the golden texts back with the readers that users have, to the values they were made from.

Some values give texts that a reader refuses or takes for something else; those are named here, and
docs/formats.md tells what a script author must know of them.
"""

import ast
import csv
import html.parser
import io
import json
import pathlib
import re
import unittest
import xml.etree.ElementTree

import yaml

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


def repaired(text):
    """A text of the values, as formats of UTF-8 have it."""
    return EVERY_BYTE.decode(errors="replace") if text == VALUES["every byte"] else text


def rows(value):
    """The value as a header and cells, what is nested in JSON."""
    items = value if isinstance(value, list) else [value]
    columns = list(items[0]) if items and isinstance(items[0], dict) else ["Value"]
    cells = [list(item.values()) if isinstance(item, dict) else [item] for item in items]
    return [columns, *([cell if isinstance(cell, str) else json.dumps(
        cell, ensure_ascii=False, separators=(",", ":")) for cell in row] for row in cells)]


class HtmlRows(html.parser.HTMLParser):
    """The texts of the cells."""

    def __init__(self, text):
        super().__init__()
        self.rows, self.text = [], ""
        self.feed(text)
        self.close()

    def handle_starttag(self, tag, attributes):
        if tag == "tr":
            self.rows.append([])
        elif tag in ("td", "th"):
            self.text = ""

    def handle_endtag(self, tag):
        if tag in ("td", "th"):
            self.rows[-1].append(self.text)

    def handle_data(self, text):
        self.text += text


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

    def test_csv(self):
        for text, value in self.each("csv", leave_out=("every byte", "no structs")):
            self.assertEqual(list(csv.reader(io.StringIO(text.decode(), newline=""))), rows(value))
        text = documents("csv")["every byte"].decode("latin-1")
        self.assertEqual(list(csv.reader(io.StringIO(text, newline=""))), rows(VALUES["every byte"]))

    def test_tsv(self):
        backslashes = {"\\t": "\t", "\\n": "\n", "\\r": "\r", "\\\\": "\\"}
        for text, value in self.each("tsv", leave_out=("every byte", "no structs")):
            read = [[re.sub(r"\\.", lambda match: backslashes[match[0]], cell)
                     for cell in line.split("\t")] for line in text.decode().split("\n")[:-1]]
            self.assertEqual(read, rows(value))

    def test_jsonl(self):
        for text, value in self.each("jsonl"):
            read = [json.loads(line) for line in text.decode().split("\n")[:-1]]
            self.assertEqual(read if isinstance(value, list) else read[0],
                             with_texts(value, repaired))

    def test_yaml(self):
        for text, value in self.each("yaml", leave_out=("every byte",)):
            self.assertEqual(yaml.safe_load(text), value)

    def test_html(self):
        for text, value in self.each("html", leave_out=("struct", "structs", "no structs")):
            read = HtmlRows(text.decode()).rows
            self.assertEqual(read, rows(with_texts(value, lambda t: repaired(t).replace("\0", "\uFFFD"))))


if __name__ == "__main__":
    unittest.main()
