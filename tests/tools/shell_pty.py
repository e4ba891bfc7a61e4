#!/usr/bin/env python3
"""The interactive shell through a pseudo-terminal: help, completion, Ctrl-C, history
across two sessions, show with its options and the selection, quitting. Usage: shell_pty.py QUORREL. Exit 77 (skipped) when
the system has no pseudo-terminals or the shell was built without line editing."""
import fcntl
import os
import signal
import select
import struct
import sys
import tempfile
import termios
import time

try:
    import pty
except ImportError:
    print("skipped: no pty module on this system")
    sys.exit(77)

QUORREL = sys.argv[1]
failures = []


def fail(message):
    """A step that did not happen ends the test: the steps after it depend on it."""
    print(message)
    sys.exit(1)


class Shell:
    def __init__(self, home):
        env = dict(os.environ, HOME=home, TERM="xterm")
        try:
            self.pid, self.fd = pty.fork()
        except OSError as error:
            print(f"skipped: no pseudo-terminal ({error})")
            sys.exit(77)
        if self.pid == 0:
            # As from a login terminal, whatever the test runner blocked or ignored.
            signal.pthread_sigmask(signal.SIG_SETMASK, [])
            signal.signal(signal.SIGINT, signal.SIG_DFL)
            os.execve(QUORREL, [QUORREL, "shell"], env)
        # A terminal of a real size: a runner's pseudo-terminal starts at 0 x 0.
        fcntl.ioctl(self.fd, termios.TIOCSWINSZ, struct.pack("HHHH", 24, 80, 0, 0))
        self.seen = b""

    def expect(self, text, what, timeout=5.0):
        """Reads until `text` appears in the output since the last expect."""
        deadline = time.time() + timeout
        while text.encode() not in self.seen:
            left = deadline - time.time()
            if left <= 0 or not select.select([self.fd], [], [], left)[0]:
                fail(f"{what}: never saw {text!r} in {self.seen!r}")
            try:
                chunk = os.read(self.fd, 4096)
            except OSError:
                chunk = b""
            if not chunk:
                fail(f"{what}: output ended before {text!r} in {self.seen!r}")
            self.seen += chunk
        self.seen = self.seen[self.seen.index(text.encode()) + len(text):]

    def send(self, keys):
        os.write(self.fd, keys.encode())

    def send_control(self, key, what):
        """Sends Ctrl-C or Ctrl-D once the line editor holds the terminal. Between two
        lines the terminal is in canonical mode, where its line discipline takes such
        keys itself; the editor's own mode shows on the master side too."""
        deadline = time.time() + 5
        while termios.tcgetattr(self.fd)[3] & termios.ICANON:
            if time.time() > deadline:
                fail(f"{what}: the line editor never took the terminal")
            time.sleep(0.01)
        self.send(key)

    def finish(self, what):
        """Waits for the shell to end and checks its exit status is 0."""
        deadline = time.time() + 20  # a sanitizer build checks for leaks at exit
        while time.time() < deadline:
            pid, status = os.waitpid(self.pid, os.WNOHANG)
            if pid:
                if not os.WIFEXITED(status) or os.WEXITSTATUS(status) != 0:
                    failures.append(f"{what}: shell ended with wait status {status}")
                return
            # Drain what the shell still prints, without blocking on a silent one.
            if select.select([self.fd], [], [], 0.05)[0]:
                try:
                    os.read(self.fd, 4096)
                except OSError:  # the terminal closed: the shell is ending
                    time.sleep(0.05)
        os.kill(self.pid, 9)
        failures.append(f"{what}: shell did not end")


def steps(shell, *pairs):
    """Sends each (keys, text to expect, what it shows); no keys: only waits for the text."""
    for keys, text, what in pairs:
        if keys:
            shell.send(keys)
        shell.expect(text, what)


with tempfile.TemporaryDirectory() as home:
    shell = Shell(home)
    steps(shell, (None, "quorrel> ", "first prompt"),
          ("help\r", "Ctrl-C clears the line", "help"),
          ("help appendString\r", "Adds a string element at the end of the array.", "help NAME"),
          # Tab completes an action name after A, and an expression name after E.
          ('A appendStr\t"x"\r', "quorrel> ", "completed action"),
          ("E siz\t\r", "1\r\n", "completed expression"),
          # Ctrl-C abandons the half-typed line; the shell goes on.
          ("A appendString", "appendString", "echo before Ctrl-C"))
    shell.send_control("\x03", "Ctrl-C")
    # On a new line: the editor may redraw the half-typed line, prompt and all.
    steps(shell, (None, "\r\nquorrel> ", "prompt after Ctrl-C"), ("E size(\r", "1\r\n", "line after Ctrl-C"),
          ("show\r", "elements    1", "show"))
    shell.send("quit\r")
    shell.finish("quit")
    if not os.path.exists(os.path.join(home, ".quorrel_history")):
        failures.append("no history file in HOME")

    # The second session recalls the first one's lines: Up three times passes quit
    # and show.
    shell = Shell(home)
    steps(shell, (None, "quorrel> ", "second prompt"), ("\x1b[A\x1b[A\x1b[A\r", "E size(", "recalled line"),
          (None, "0\r\n", "recalled line's result in a fresh instance"),
          (None, "quorrel> ", "prompt before show"))
    # show marks the selected rows, shows all ten columns of a default-width table
    # and takes inspect's view options.
    rows = [f'A appendRowFromList "r{row},b,c,d,e,f,g,h,i,j{row}"' for row in range(3)]
    steps(shell, *[(line + "\r", "quorrel> ", line) for line in
                   ["new autoselect=1", *rows, "A invertSelection", 'A selectWhereContainingByColumn 0 "r1"']])
    steps(shell, ("show\r", "selected    1 of 3 rows (marked *)", "show's selection"),
          (None, "#8 #9\r\n", "show's tenth column"), (None, "  0   r0", "show's unselected row"),
          (None, "  *1  r1", "show's selected row"),
          ("show --ke\t--rows 1\r", '0     string "r0"', "show --keys, completed"),
          (None, "29 more elements not shown", "show --rows"),
          ("show --bogus\r", "not --bogus", "show's unknown option"),
          (None, "quorrel> ", "prompt before Ctrl-D"))
    shell.send_control("\x04", "Ctrl-D")
    shell.finish("Ctrl-D")

if failures:
    print("\n".join(failures))
    sys.exit(1)
print("shell: help, completion, Ctrl-C, show and its options, history and quitting work")
