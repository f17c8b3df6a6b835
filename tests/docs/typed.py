#!/usr/bin/python3
"""Runs a command on a terminal of its own.

    typed [WAIT KEYS]... -- COMMAND...

It types KEYS when WAIT has been shown, for a WAIT that begins with `*` when the terminal does not
echo, either, and tells what the terminal showed, whether it echoes at the end, and the status.
"""

import os, pty, sys, termios, time

cut = sys.argv.index("--")
child, terminal = pty.fork()
if child == 0:
    os.execvp(sys.argv[cut + 1], sys.argv[cut + 1:])


def echoes():
    return bool(termios.tcgetattr(terminal)[3] & termios.ECHO)


def read_on():
    global shown
    try:
        text = os.read(terminal, 4096)
    except OSError:  # the last one has closed it
        text = b""
    shown += text
    return text


shown, seen = b"", 0
for wait, keys in zip(sys.argv[1:cut:2], sys.argv[2:cut:2]):
    while wait.lstrip("*").encode() not in shown[seen:] and read_on():
        pass
    for _ in range(1000):
        if not wait.startswith("*") or not echoes():
            break
        time.sleep(0.01)
    time.sleep(0.2)  # a prompt is shown before its line is read: what is typed between may be lost
    seen = len(shown)
    os.write(terminal, keys.encode().decode("unicode_escape").encode())
while read_on():
    pass
print(shown.decode().replace("\r\n", "\n"), end="")
print("[echo %s, status %d]" % ("on" if echoes() else "off",
                                os.waitstatus_to_exitcode(os.waitpid(child, 0)[1])))
