#!/usr/bin/python
"""Runs a command of kelvash and returns its result as data."""

DOCUMENTATION = r"""
module: command
short_description: Run an administrative command and get its result as data
description:
  - Calls C(kelvash) on the host, which checks the options, runs the command and checks its result.
  - The result comes as JSON by the format C(jsonl) where it is installed, else by C(json).
options:
  path:
    description: The path of the command, such as C(storage filesystem list).
    type: str
    required: true
  options:
    description:
      - The options of the command by their long names.
      - The items of a list repeat the option; C(true) gives it without a value, as a flag is given,
        and C(false) and null leave it out.
    type: dict
    default: {}
  secrets:
    description:
      - Values of secret options by their long names.
      - They travel on standard input and never in a command line, and are not logged.
    type: dict
    default: {}
  plugins:
    description: Files, and folders of files, whose commands are added on the host.
    type: list
    elements: path
    default: []
  executable:
    description: The tool on the host.
    type: path
    default: kelvash
attributes:
  check_mode:
    support: partial
    description:
      - Commands that promise to change nothing run; others are skipped.
      - The promise is read by C(kelvash-mcp), which has to stand where C(kelvash) does.
"""

EXAMPLES = r"""
- name: Ask for the file systems of one type
  zelmar.kelvash.command:
    path: storage filesystem list
    options:
      type: [ext4, xfs]
  register: filesystems

- name: Give a secret
  zelmar.kelvash.command:
    path: digest text get
    secrets:
      secret: "{{ vault_text }}"
"""

RETURN = r"""
result:
  description: What the command gives. Bytes that are no UTF-8 are U+FFFD.
  returned: success
  type: raw
errors:
  description: All messages of a call that failed.
  returned: always
  type: list
  elements: str
command:
  description: The command line, without secrets.
  returned: always
  type: list
  elements: str
"""

import json
import os

from ansible.module_utils.basic import AnsibleModule

# The whole value on one line, also when it is a list.
AS_JSONL = ["--formatter", "jsonl", "--format-param", "whole=true"]
AS_JSON = ["--formatter", "json"]
NO_JSONL = "Unable to find requested formatter: jsonl"


class Usage(Exception):
    """What the task asks for cannot be said on a command line."""


def option_words(options):
    """The options as words. A value stands behind "=", so that it may begin with a dash."""
    words = []
    for name, value in options.items():
        if len(name) < 2:
            raise Usage(f"Options are given by their long names: {name}")
        for item in value if isinstance(value, list) else [value]:
            if item is True:
                words.append(f"--{name}")
            elif item == "":
                words += [f"--{name}", ""]
            elif item is not None and item is not False:
                words.append(f"--{name}={item}")
    return words


def secret_words(secrets):
    """The options without values, the input that answers the prompts, and the prompts."""
    for name, value in secrets.items():
        if len(name) < 2 or any(c in str(value) for c in "\n\0"):
            raise Usage(f"A secret has a long name and is one line of text: {name}")
    return ([f"--{name}" for name in secrets],
            "".join(f"{value}\n" for value in secrets.values()),
            "".join(f"Enter value for '{name}': \n" for name in secrets))


def undo_byte_escapes(value):
    """The format "json" writes each byte of a text as a character."""
    if isinstance(value, str):
        return value.encode("latin-1").decode("utf-8", "replace")
    if isinstance(value, list):
        return [undo_byte_escapes(item) for item in value]
    if isinstance(value, dict):
        return {name: undo_byte_escapes(item) for name, item in value.items()}
    return value


def messages(text):
    """The lines of the error stream without their heading."""
    return [line for line in text.splitlines() if line and line != "Errors: "]


class Tool:
    """The tool on the host with the plugins of the task."""

    def __init__(self, module):
        self.module = module
        self.executable = module.params["executable"]
        self.plugins = [word for plugin in module.params["plugins"]
                        for word in ("--plugin-dir" if os.path.isdir(plugin) else "--plugin", plugin)]

    def run(self, arguments, data=None):
        """Status, output and error stream."""
        try:
            return self.module.run_command([*self.start(), *arguments], data=data,
                                           binary_data=True, errors="replace",
                                           handle_exceptions=False)
        except OSError as fault:
            return 127, "", f"{self.executable}: {fault.strerror}"

    def start(self):
        """The words of each call."""
        return [self.executable, *self.plugins]

    def is_read_only(self, path):
        """Whether the command promises to change nothing; None where nobody can tell."""
        server = os.path.join(os.path.dirname(self.executable), "kelvash-mcp")
        try:
            status, output, _ = self.module.run_command(
                [server, *self.plugins, "--allow-secrets", "--print-tools"],
                handle_exceptions=False)
        except OSError:
            return None
        if status != 0:
            return None
        return "_".join(path) in (tool["name"] for tool in json.loads(output)["tools"])


def main():
    module = AnsibleModule(
        argument_spec={
            "path": {"type": "str", "required": True},
            "options": {"type": "dict", "default": {}},
            "secrets": {"type": "dict", "default": {}, "no_log": True},
            "plugins": {"type": "list", "elements": "path", "default": []},
            "executable": {"type": "path", "default": "kelvash"},
        },
        supports_check_mode=True,
    )
    tool = Tool(module)
    path = module.params["path"].split()
    try:
        secrets, data, prompts = secret_words(module.params["secrets"])
        call = [*path, *option_words(module.params["options"]), *secrets]
    except Usage as fault:
        module.fail_json(msg=str(fault), errors=[str(fault)], command=[])
    command = [*tool.start(), *call]
    read_only = tool.is_read_only(path)
    if module.check_mode and not read_only:
        reason = ("this command may change something" if read_only is False else
                  "only kelvash-mcp could tell whether this command changes anything")
        module.exit_json(skipped=True, msg=f"skipped: {reason}", errors=[], command=command)

    status, output, errors = tool.run([*AS_JSONL, *call], data)
    in_bytes = status != 0 and NO_JSONL in errors
    if in_bytes:
        status, output, errors = tool.run([*AS_JSON, *call], data)
    if status != 0:
        found = messages(errors) or [f"kelvash ended with status {status}"]
        module.fail_json(msg="; ".join(found), errors=found, command=command, rc=status)
    for line in messages(errors):
        module.warn(line)
    try:
        result = json.loads(output.removeprefix(prompts))
    except ValueError as fault:
        module.fail_json(msg=f"The result is no JSON: {fault}", errors=[str(fault)], command=command)
    module.exit_json(changed=not read_only, result=undo_byte_escapes(result) if in_bytes else result,
                     errors=[], command=command)


if __name__ == "__main__":
    main()
