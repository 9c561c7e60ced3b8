"""Programs on a pseudo terminal."""

import fcntl
import os
import pty
import re
import struct
import subprocess
import termios

from workspace_fixture import DRIVE

WIDE = 250  # what shows the console of another system wraps lines by itself, and moves the cursor


def on_terminal(command, folder, columns=80, until=None, kill=None, **environment):
    """What the command writes to a terminal, and its exit status. `until`: bytes, behind which the signal `kill` is sent.
    A variable of the environment that is None is left out."""
    if DRIVE:
        columns = max(columns, WIDE)
    terminal, its_end = pty.openpty()
    fcntl.ioctl(its_end, termios.TIOCSWINSZ, struct.pack("HHHH", 24, columns, 0, 0))
    variables = {name: value for name, value in {**os.environ, "TERM": "xterm", **environment}.items() if value is not None}
    process = subprocess.Popen(command, cwd=folder, stdin=its_end, stdout=its_end, stderr=its_end, env=variables)
    os.close(its_end)
    output = b""
    while True:
        try:
            part = os.read(terminal, 65536)
        except OSError:  # the last writer has closed it
            break
        output += part
        if until and until in output:
            os.kill(process.pid, kill)
            until = None
    os.close(terminal)
    text = output.decode().replace("\r\n", "\n")
    if DRIVE:  # it goes over blanks
        text = re.sub(r"\x1b\[(\d*)C", lambda moved: " " * int(moved[1] or 1), text)
        text = re.sub(r"\x1b\[(\?25[lh]|K|m)|\r(?=\n)", "", text)
    return text, process.wait(timeout=60)
