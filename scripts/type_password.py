#!/usr/bin/env python3
# Runs a command on its own terminal and types a password ($KQ_PASSWORD) whenever sudo asks for it,
# as a user would. What the terminal shows goes to standard output with plain line ends; the last
# line says how often the password was typed.
# usage: type_password.py SECONDS COMMAND...   ends with the command's status, or 124 when time is up
import os
import pty
import select
import signal
import sys
import time

PROMPT = b"[sudo] password for "


def fail(message):
    print(f"type_password: {message}", file=sys.stderr)
    sys.exit(2)


# The password is typed after the whole prompt, because sudo discards earlier input.
def converse(terminal, password, deadline):
    shown, times_typed, is_over = b"", 0, False
    while not is_over and time.monotonic() < deadline:
        if not select.select([terminal], [], [], 1)[0]:
            continue
        try:
            chunk = os.read(terminal, 65536)
        except OSError:  # the last user of the terminal has closed it
            chunk = b""
        is_over = not chunk
        sys.stdout.buffer.write(chunk.replace(b"\r\n", b"\n"))
        sys.stdout.buffer.flush()
        shown = (shown + chunk)[-4096:]
        asked = shown.rfind(PROMPT)
        if asked >= 0 and shown.endswith(b": "):
            os.write(terminal, password.encode() + b"\n")
            times_typed += 1
            shown = b""
    return times_typed, is_over


def main():
    password = os.environ.pop("KQ_PASSWORD", None)
    if len(sys.argv) < 3 or not sys.argv[1].isdecimal() or not password:
        fail("usage: KQ_PASSWORD=WORD type_password.py SECONDS COMMAND...")
    process, terminal = pty.fork()
    if process == 0:
        try:
            os.execvp(sys.argv[2], sys.argv[2:])
        except OSError as error:
            print(f"type_password: {sys.argv[2]}: {error.strerror}", file=sys.stderr)
        os._exit(127)
    times_typed, is_over = converse(terminal, password, time.monotonic() + int(sys.argv[1]))
    if not is_over:
        os.kill(process, signal.SIGKILL)
    os.close(terminal)  # sends a hang-up to whatever still runs there
    status = os.waitstatus_to_exitcode(os.waitpid(process, 0)[1])
    print(f"type_password: prompts answered: {times_typed}")
    sys.exit(124 if not is_over else status if status >= 0 else 128 - status)


main()
