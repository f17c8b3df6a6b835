"""What a command script prints, declared. A script that stands beside this file is a function:

    #!/usr/bin/python3 -B
    import os
    from dataclasses import dataclass
    from typing import Annotated

    import kelvash
    from kelvash import Failure, Parameter, Unit

    @dataclass
    class Backup:
        Name: str
        Size: Annotated[int, Unit("MiB")]

    def backups(
        folder: Annotated[str, Parameter("Where to look", short="f")] = "backups",
        min_size: Annotated[int, Parameter("At least this size, %REGEX%", range=(0, 9999))] = 0,
    ) -> list[Backup]:
        '''List the backups'''
        if not os.path.isdir(folder):
            raise Failure(f"There is no folder '{folder}'")
        for file in os.scandir(folder):
            size = file.stat().st_size >> 20
            if size >= min_size:
                yield Backup(file.name, size)

    kelvash.run("backup.list", backups, read_only=True)

Called with --descriptor it prints the descriptor of the command backup.list. Called by the command
it gets `--folder backups --min-size 3`, calls the function and prints what that returns, when the
whole of it fits what is declared: int, bool, str, a dataclass, or a list of these, as deep as it
may be (a list may be any iterable, so that the function can yield). What does not fit is told with
its place, as is any exception, in ERROR: lines; Failure is for what the caller did wrong and is
told as it stands. What the script prints by the way goes to the error stream.

A parameter is a str, int or bool, or a list of these for an option that may be repeated. One
without a default is required; a bool with the default False is a flag. A secret comes through
standard input, of which no process list tells.

Text may hold anything: what XML cannot carry is shown, as \\x1b.

Needs Python 3.9 and nothing else.
"""

import dataclasses
import inspect
import os
import re
import sys
import typing
from collections.abc import Iterable


class Failure(Exception):
    """What the caller is to read, without a place in the script."""


@dataclasses.dataclass(frozen=True)
class Parameter:
    """What a descriptor says of a parameter. `values` are those there are with what each means;
    `values_from` tells where they are found, as in "account user list:Name"."""

    description: str
    short: str = ""
    range: "tuple[int, int] | None" = None
    values: "dict[str, str] | None" = None
    pattern: str = ""
    secret: bool = False
    values_from: str = ""


class Unit(str):
    """What stands behind the value of a field."""


def run(path, function, *, namespaces=None, read_only=False, examples=()):
    """Runs `function` as the command `path`, such as "backup.list", on the words of the command
    line. `namespaces` describes "backup"; `examples` are texts "ARGUMENTS : SENTENCE"."""
    result = os.dup(1)
    os.dup2(2, 1)
    describe = sys.argv[1:] == ["--descriptor"]
    try:
        command = _Command(path, function)
        if describe:
            text = command.descriptor(namespaces or {}, read_only, examples)
        else:
            text = command.document(sys.argv[1:])
        status = 0
    except (Exception, SystemExit) as fault:
        text = _errors(fault)
        status = 1
    with open(2 if describe and status else result, "wb", closefd=False) as stream:
        stream.write(text.encode())
    sys.exit(status)


def progress(done, total, text=""):
    """Draws a bar on the error stream if that is a terminal; it goes when all is done."""
    if not os.isatty(2):
        return
    bar = ""
    if done < total:
        shown = "".join(char if char.isprintable() else "?" for char in text[:36])
        bar = f"[{'#' * (30 * done // total):30}] {100 * done // total:3} % {shown}"
    os.write(2, f"\r{bar}\033[K".encode("utf-8", "replace"))


def _errors(fault):
    if isinstance(fault, SystemExit) and not isinstance(fault.code, str):
        raise fault
    progress(1, 1)
    if isinstance(fault, Failure):
        text = "\n".join(map(str, fault.args))
    elif isinstance(fault, SystemExit):
        text = fault.code
    else:
        text = f"{_place(fault)}: {type(fault).__name__}: {fault}"
    lines = [line for line in text.splitlines() if line] or ["It failed"]
    return "".join(f"ERROR:{_show(line)}\n" for line in lines)


def _place(fault):
    """The last line of the script that led to the fault, or else of a module that it uses."""
    script = getattr(sys.modules["__main__"], "__file__", sys.argv[0])
    lines = {}
    trace = fault.__traceback__
    while trace:
        lines[trace.tb_frame.f_code.co_filename] = trace.tb_lineno
        trace = trace.tb_next
    lines.pop(__file__, None)
    file = script if script in lines or not lines else list(lines)[-1]
    return ":".join(str(part) for part in (os.path.basename(file), lines.get(file)) if part)


class _Command:
    def __init__(self, path, function):
        self.path, self.function = path, function
        hints = typing.get_type_hints(function, include_extras=True)
        if "return" not in hints:
            raise TypeError(f"{function.__name__} does not declare what it returns")
        self.shape = _shape(hints.pop("return"))
        self.options = {}
        for parameter in inspect.signature(function).parameters.values():
            option = _Option(parameter, hints.get(parameter.name))
            self.options[f"--{option.name}"] = option

    def document(self, words):
        arguments = self.arguments(iter(words))
        out, faults = ["<output>\n"], []
        self.shape.print("result", self.function(**arguments), out, faults)
        if faults:
            raise Failure(*faults[:10])
        return "".join([*out, "\n</output>\n"])

    def arguments(self, words):
        given = {}
        for word in words:
            if word not in self.options or self.options[word].extra.secret:
                raise Failure(f"Unknown option: {word}")
            self.options[word].read(word, words, given)
        for word, option in self.options.items():
            if option.extra.secret:
                given[option.key] = sys.stdin.buffer.read().decode("utf-8", "surrogateescape")
            elif option.required and option.key not in given:
                raise Failure(f"{word} is missing")
        return given

    def descriptor(self, namespaces, read_only, examples):
        import xml.etree.ElementTree as tree  # needed here alone

        def add(parent, tag, text=None, **attributes):
            element = tree.SubElement(parent, tag, attributes)
            element.text = text
            return element

        root = tree.Element("plugin")
        add(root, "version", "1.0.0")
        spaces = add(root, "namespaces")
        parts = self.path.split(".")
        for depth in range(1, len(parts)):
            space = ".".join(parts[:depth])
            text = namespaces.get(space, f"Commands of {' '.join(parts[:depth])}")
            add(add(spaces, "namespace", path=space), "description", text)

        command = add(add(root, "commands"), "command", path=self.path)
        add(command, "description", " ".join((inspect.getdoc(self.function) or "").split()))
        notes = [("read-only", "true")] if read_only else []
        notes += [(f"values:{option.name}", option.extra.values_from)
                  for option in self.options.values() if option.extra.values_from]
        notes += [("example", example) for example in examples]
        if notes:
            data = add(command, "meta-data")
            for name, text in notes:
                add(data, "meta-data-entry", text, name=name)
        inputs = add(command, "input-spec")
        for option in self.options.values():
            option.describe(inputs, add)
        self.shape.describe(add(command, "output-spec"), add)

        formats = add(command, "format-parameters")
        add(formats, "formatter", "table" if self.shape.is_flat() else "simple")
        for shape in {shape.name: shape for shape in self.shape.structures()}.values():
            add(formats, "format-parameter", ",".join(shape.fields), name=f"fields:{shape.name}")
            for name, unit in shape.units.items():
                add(formats, "format-parameter", unit, name=f"units:{shape.name}.{name}")
        script = os.path.abspath(sys.argv[0])
        if re.search(r"[^\w./+,@-]", script):
            raise Failure(f"'{script}' is no name for a script: it needs quotes in a shell")
        forms = [option.form() for option in self.options.values() if not option.extra.secret]
        add(command, "execute", " ".join([script, *forms]))
        for option in self.options.values():
            if option.extra.secret:
                add(command, "stdin", f"$val{{{option.name}}}")
        tree.indent(root)
        return '<?xml version="1.0" encoding="UTF-8"?>\n' + tree.tostring(root, "unicode") + "\n"


_WORDS = {bool: "bool", int: "int", str: "string"}


class _Option:
    def __init__(self, parameter, hint):
        self.key = parameter.name
        self.name = parameter.name.replace("_", "-")
        kind, extras = _bare(hint)
        self.extra = next((extra for extra in extras if isinstance(extra, Parameter)), None)
        if self.extra is None:
            raise TypeError(f"{self.key}: write Annotated[TYPE, Parameter(DESCRIPTION)]")
        self.is_list = typing.get_origin(kind) is list
        self.kind = typing.get_args(kind)[0] if self.is_list else kind
        if self.kind not in _WORDS:
            raise TypeError(f"{self.key}: a parameter is int, bool, str or a list of these")
        self.required = parameter.default is parameter.empty
        self.is_flag = kind is bool and parameter.default is False
        if self.extra.secret and (kind is not str or not self.required):
            raise TypeError(f"{self.key}: a secret is a str without a default")

    def read(self, word, words, given):
        if self.is_flag:
            given[self.key] = True
            return
        text = next(words, None)
        if text is None:
            raise Failure(f"{word} needs a value")
        try:
            value = _READ[self.kind](text)
        except (KeyError, ValueError):
            raise Failure(f"{word}: '{text}' is no {_NAMES[self.kind]}") from None
        if self.is_list:
            given.setdefault(self.key, []).append(value)
        else:
            given[self.key] = value

    def describe(self, parent, add):
        kind = "flag" if self.is_flag else _WORDS[self.kind] + "-list" * self.is_list
        attributes = {"name": self.name, "type": kind,
                      "required": "true" if self.required else "false"}
        if self.extra.short:
            attributes["shortname"] = self.extra.short
        if self.extra.secret:
            attributes["secret"] = "true"
        element = add(parent, "parameter", **attributes)
        add(element, "description", self.extra.description)
        if self.extra.range:
            least, most = map(str, self.extra.range)
            add(add(element, "constraint", type="range"), "range", min=least, max=most)
        elif self.extra.values:
            enum = add(add(element, "constraint", type=_WORDS[self.kind] + "enum"), "enum")
            for value, meaning in self.extra.values.items():
                add(enum, "enum-value", meaning, value=str(value))
        elif self.kind is str:
            pattern = self.extra.pattern or self.safe()
            add(add(element, "constraint", type="regex"), "regex", pattern)

    def safe(self):
        """What may stand where the form of this parameter puts it."""
        if self.extra.secret:
            return r"[^{}\x00]+"
        return r'[^{}"$\\`]*' if self.is_list else "[^{}']*"

    def form(self):
        if self.is_flag:
            return f"$if{{{self.name},--{self.name}}}"
        if self.is_list:
            form = f"$multilist{{{self.name},--{self.name},true}}"
        else:
            form = f"--{self.name} '$val{{{self.name}}}'"
        return form if self.required else f"$if{{{self.name},{form}}}"


_READ = {
    int: int,
    bool: {word: word[0] in "1ytT" for word in
           "1 yes y true True t T 0 no n false False f F".split()}.__getitem__,
    str: str,
}
_NAMES = {int: "whole number", bool: "truth value", str: "text"}


def _bare(hint):
    """A type without what is said of it: Annotated[int, ...] and Optional[int] are int."""
    extras = ()
    while True:
        if typing.get_origin(hint) is typing.Annotated:
            extras += hint.__metadata__
            hint = hint.__origin__
            continue
        kinds = [kind for kind in typing.get_args(hint) if kind is not type(None)]
        if len(kinds) != 1 or type(None) not in typing.get_args(hint):
            return hint, extras
        hint = kinds[0]


def _shape(hint, outer=()):
    kind, _ = _bare(hint)
    if kind in _WORDS:
        return _Scalar(kind)
    if dataclasses.is_dataclass(kind) and kind not in outer:
        return _Structure(kind, (*outer, kind))
    origin, arguments = typing.get_origin(kind), typing.get_args(kind)
    if origin is not None and issubclass(origin, Iterable) and len(arguments) == 1:
        item = _shape(arguments[0], outer)
        if not isinstance(item, _List):
            return _List(item)
    name = kind.__name__ if isinstance(kind, type) else kind
    raise TypeError(f"{name} cannot be printed: what can is int, bool, str, a dataclass that does"
                    " not hold itself, or a list of one of these")


class _Scalar:
    def __init__(self, kind):
        self.kind, self.word = kind, _WORDS[kind]

    def is_flat(self):
        return False

    def structures(self):
        return ()

    def describe(self, parent, add):
        add(parent, self.word)

    def print(self, place, value, out, faults):
        if not isinstance(value, self.kind) or (self.kind is int and isinstance(value, bool)):
            faults.append(f"{place}: {_short(value)} is no {_NAMES[self.kind]}")
        elif self.kind is int and not -(2**63) <= value < 2**63:
            faults.append(f"{place}: {_short(value)} does not fit into 64 bits")
        elif self.kind is int:
            out.append(f"<int>{int(value)}</int>")
        elif self.kind is bool:
            out.append(f"<bool>{'true' if value else 'false'}</bool>")
        else:
            out.append(f"<string>{_escape(value)}</string>")


class _List:
    def __init__(self, item):
        self.item, self.word = item, "list"

    def is_flat(self):
        """Whether it is a table: rows of cells."""
        return isinstance(self.item, _Structure) and all(
            isinstance(field, _Scalar) for field in self.item.fields.values())

    def structures(self):
        return self.item.structures()

    def describe(self, parent, add):
        element = add(parent, "list", type=self.item.word)
        if isinstance(self.item, _Structure):
            self.item.describe(element, add)

    def print(self, place, value, out, faults):
        if not isinstance(value, Iterable) or isinstance(value, (str, bytes, dict)):
            faults.append(f"{place}: {_short(value)} is no list")
            return
        out.append(f'<list type="{self.item.word}">\n')
        for index, item in enumerate(value):
            self.item.print(f"{place}[{index}]", item, out, faults)
            out.append("\n")
        out.append("</list>")


class _Structure:
    def __init__(self, kind, outer):
        self.kind, self.name, self.word = kind, kind.__name__, "structure"
        if not re.fullmatch("[a-zA-Z0-9]+", self.name):
            raise TypeError(f"{self.name}: a structure is named with letters and digits")
        self.fields, self.units = {}, {}
        hints = typing.get_type_hints(kind, include_extras=True)
        for field in dataclasses.fields(kind):
            self.fields[field.name] = _shape(hints[field.name], outer)
            for extra in _bare(hints[field.name])[1]:
                if isinstance(extra, Unit):
                    self.units[field.name] = extra

    def is_flat(self):
        return False

    def structures(self):
        yield self
        for field in self.fields.values():
            yield from field.structures()

    def describe(self, parent, add):
        element = add(parent, "structure", typeName=self.name)
        for name, shape in self.fields.items():
            shape.describe(add(element, "field", name=name), add)

    def print(self, place, value, out, faults):
        if not isinstance(value, self.kind):
            faults.append(f"{place}: {_short(value)} is no {self.name}")
            return
        out.append(f'<structure typeName="{self.name}">\n')
        for name, shape in self.fields.items():
            out.append(f'<field name="{name}">')
            shape.print(f"{place}.{name}", getattr(value, name), out, faults)
            out.append("</field>\n")
        out.append("</structure>")


def _short(value):
    text = repr(value)
    return text if len(text) <= 60 else text[:57] + "..."


_UNFIT = re.compile("[^\t\n\r -~\u00a0-\ud7ff\ue000-\ufffd\U00010000-\U0010ffff]")


def _escape(text):
    text = _show(text).replace("&", "&amp;").replace("<", "&lt;").replace(">", "&gt;")
    return text.replace("\r", "&#13;")


def _show(text):
    return _UNFIT.sub(_show_bytes, text)


def _show_bytes(match):
    char = match[0]
    how = "surrogateescape" if "\udc80" <= char <= "\udcff" else "surrogatepass"
    return "".join(f"\\x{byte:02x}" for byte in char.encode("utf-8", how))
