#!/usr/bin/env python3
"""Draws docs/images/run.svg: the screen of a terminal in which velkhost has run the example request.

usage: scripts/render_run.py [--check] [VELKHOST]

VELKHOST is build/release/bin/velkhost unless given. The clock of the run is virtual, so the same
program draws the same picture. --check draws nothing and fails when the picture is out of date.
"""
import fcntl
import os
import pathlib
import pty
import re
import shutil
import struct
import subprocess
import sys
import tempfile
import termios
from xml.sax.saxutils import escape

ROOT = pathlib.Path(__file__).resolve().parent.parent
PICTURE = ROOT / "docs/images/run.svg"
COLUMNS, ROWS = 113, 70
DEMO = pathlib.Path("/tmp/velkhost-demo")  # what the picture shows as run folder
COMMAND = "velkhost install --scenario scenarios/default.toml …"

# Drawing, in pixels.
CELL, LINE, SIZE = 8.4, 19, 14
MARGIN, BAR = 22, 38

INKS = {None: "#d6dde8", 31: "#ff7b72", 32: "#56d364", 33: "#e3b341", 36: "#76c7f0", "dim": "#7d8799"}
TOKEN = re.compile(r"\x1b\[(\??)([0-9;]*)([A-Za-z])|([\r\n])|([^\x1b\r\n])")


class Screen:
    """A terminal that knows the few sequences that velkhost writes, and no others."""

    def __init__(self):
        self.lines, self.row, self.column, self.style = [[]], 0, 0, (None, False)

    def feed(self, text):
        end = 0
        for match in TOKEN.finditer(text):
            if match.start() != end:
                raise ValueError(f"unknown sequence: {text[end:match.start()]!r}")
            end = match.end()
            private, numbers, letter, control, character = match.groups()
            if letter:
                self.obey(private + numbers + letter, numbers, letter)
            elif control:
                self.move(control)
            else:
                self.put(character)

    def obey(self, sequence, numbers, letter):
        if letter == "A":
            self.row -= int(numbers)
        elif letter == "J" and not numbers:
            self.lines[self.row] = self.lines[self.row][: self.column]
            del self.lines[self.row + 1 :]
        elif letter == "m":
            self.ink(int(numbers or 0))
        elif sequence not in ("?25l", "?25h"):
            raise ValueError(f"unknown sequence: {sequence}")

    def ink(self, number):
        colour, bold = self.style
        if number == 0:
            self.style = (None, False)
        elif number == 1:
            self.style = (colour, True)
        else:
            self.style = ("dim" if number == 2 else number, bold)

    def move(self, control):
        self.column = 0
        if control == "\n":
            self.row += 1
            if self.row == len(self.lines):
                self.lines.append([])

    def put(self, character):
        line = self.lines[self.row]
        line.extend([(" ", (None, False))] * (self.column - len(line)))
        line[self.column : self.column + 1] = [(character, self.style)]
        self.column += 1


def run_on_terminal(command, environment):
    """What the command writes to a terminal of COLUMNS x ROWS."""
    pid, terminal = pty.fork()
    if pid == 0:
        fcntl.ioctl(0, termios.TIOCSWINSZ, struct.pack("HHHH", ROWS, COLUMNS, 0, 0))
        os.execve(command[0], command, environment)
    output = b""
    while True:
        try:
            piece = os.read(terminal, 65536)
        except OSError:  # how Linux says that the other end is closed
            break
        if not piece:
            break
        output += piece
    status = os.waitstatus_to_exitcode(os.waitpid(pid, 0)[1])
    return output.decode(), status


def example_run(velkhost):
    """The lines of the screen after the example request."""
    with tempfile.TemporaryDirectory() as packages:
        subprocess.run(["bash", ROOT / "examples/make_packages.sh", packages], check=True,
                       stdout=subprocess.DEVNULL)
        names = (ROOT / "examples/default.list").read_text().splitlines()
        uris = [f"file://{packages}/{name}" for name in names if name and not name.startswith("#")]
        command = [str(velkhost), "install", "--scenario", "scenarios/default.toml",
                   "--root", str(DEMO), *uris]
        environment = {"PATH": os.environ["PATH"], "TERM": "xterm-256color", "LC_ALL": "C.UTF-8"}
        try:
            output, status = run_on_terminal(command, environment)
        finally:
            shutil.rmtree(DEMO, ignore_errors=True)
    if status != 1:  # one package of the example fails
        sys.exit(f"velkhost ended with {status}:\n{output}")
    screen = Screen()
    screen.feed(f"\x1b[2m$\x1b[0m \x1b[1m{COMMAND}\x1b[0m\r\n" + output)
    while screen.lines and not screen.lines[-1]:
        screen.lines.pop()
    return screen.lines


def runs_of(line):
    """The line as (column, text, style), a piece for each style, without blanks at the ends."""
    start = 0
    while start < len(line):
        end = start
        while end < len(line) and line[end][1] == line[start][1]:
            end += 1
        text = "".join(character for character, _ in line[start:end])
        lead = len(text) - len(text.lstrip())
        if text.strip():
            yield start + lead, text.strip(), line[start][1]
        start = end


def drawn_line(number, line):
    y = BAR + MARGIN + number * LINE + SIZE
    for column, text, (colour, bold) in runs_of(line):
        weight = ' font-weight="bold"' if bold else ""
        # The length makes columns stand under each other whatever font there is.
        yield (f'<text x="{MARGIN + column * CELL:.1f}" y="{y}" fill="{INKS[colour]}"{weight} '
               f'textLength="{len(text) * CELL:.1f}" lengthAdjust="spacingAndGlyphs">'
               f"{escape(text)}</text>")


def drawn(lines):
    width = 2 * MARGIN + COLUMNS * CELL
    height = BAR + 2 * MARGIN + len(lines) * LINE
    yield (f'<svg xmlns="http://www.w3.org/2000/svg" width="{width:.0f}" height="{height}" '
           f'viewBox="0 0 {width:.0f} {height}" font-size="{SIZE}" xml:space="preserve" '
           "font-family=\"'DejaVu Sans Mono','Cascadia Mono','SF Mono',Menlo,Consolas,monospace\">")
    yield "<title>velkhost installs the example packages</title>"
    yield f'<rect width="{width:.0f}" height="{height}" rx="10" fill="#161b24"/>'
    yield f'<path d="M0 {BAR}V10a10 10 0 0 1 10-10h{width - 20:.0f}a10 10 0 0 1 10 10v{BAR - 10}z" fill="#232a36"/>'
    for number, colour in enumerate(("#ff5f57", "#febc2e", "#28c840")):
        yield f'<circle cx="{MARGIN + number * 20}" cy="{BAR / 2:.0f}" r="6" fill="{colour}"/>'
    yield (f'<text x="{width / 2:.0f}" y="{BAR / 2 + 5:.0f}" fill="#8b95a7" text-anchor="middle">'
           "velkprovider</text>")
    for number, line in enumerate(lines):
        yield from drawn_line(number, line)
    yield "</svg>\n"


def main(arguments):
    check = "--check" in arguments
    rest = [argument for argument in arguments if argument != "--check"]
    if len(rest) > 1 or any(argument.startswith("-") for argument in rest):
        sys.exit(__doc__)
    velkhost = pathlib.Path(rest[0] if rest else ROOT / "build/release/bin/velkhost").resolve()
    os.chdir(ROOT)
    picture = "\n".join(drawn(example_run(velkhost)))
    if check:
        sys.exit(0 if PICTURE.is_file() and PICTURE.read_text() == picture else
                 f"{PICTURE} is out of date; scripts/render_run.py draws it anew")
    PICTURE.parent.mkdir(parents=True, exist_ok=True)
    PICTURE.write_text(picture)
    print(PICTURE)


if __name__ == "__main__":
    main(sys.argv[1:])
