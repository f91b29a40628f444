#!/usr/bin/env python3
"""clang-tidy over every source of ours that the release build compiles; headers are looked at
through the sources that include them.

A source that was found clean is looked at again only when its text, a header of it, its compiler
flags or a .clang-tidy has changed. The memory of that is build/tidy/.
"""

import concurrent.futures
import hashlib
import json
import os
import pathlib
import re
import shlex
import subprocess
import sys
import time

ROOT = pathlib.Path(__file__).resolve().parent.parent
BUILD = ROOT / "build" / "release"
MEMORY = ROOT / "build" / "tidy"
TOOL = "clang-tidy-14"
PRECOMPILED = re.compile(r' -Winvalid-pch| -include ("[^"]*cmake_pch\.hxx"|\S*cmake_pch\.hxx)')


def compile_commands():
    """As the release build has them, but for the compiler's own precompiled headers; a copy is left
    where the tool finds it."""
    commands = json.loads((BUILD / "compile_commands.json").read_text())
    for command in commands:
        command["command"] = PRECOMPILED.sub("", command["command"])
    (MEMORY / "compile_commands.json").write_text(json.dumps(commands))
    return commands


def own_sources(only):
    """Compile commands of our sources, the largest first: long ones must not start last."""
    commands = compile_commands()
    own = {}
    for command in commands:
        path = pathlib.Path(command["file"])
        inside = path.is_relative_to(ROOT) and not path.is_relative_to(ROOT / "build")
        if inside and (not only or any(word in str(path) for word in only)):
            own.setdefault(path, command)
    return sorted(own.values(), key=lambda c: -os.path.getsize(c["file"]))


def settings_digest():
    digest = hashlib.sha256(subprocess.check_output([TOOL, "--version"]))
    folders = [ROOT] + [path for path in sorted(ROOT.iterdir()) if path.name not in ("build", ".git")]
    for folder in folders:
        pattern = ".clang-tidy" if folder == ROOT else "**/.clang-tidy"
        for path in sorted(folder.glob(pattern)) if folder.is_dir() else []:
            digest.update(str(path).encode() + path.read_bytes())
    return digest


def digest_of(command, settings):
    """Of all that can change the verdict; comments stay in, because they can hold waivers."""
    arguments = shlex.split(command["command"])
    del arguments[arguments.index("-o"):arguments.index("-o") + 2]
    result = subprocess.run(arguments + ["-E", "-C"], cwd=command["directory"],
                            stdout=subprocess.PIPE, stderr=subprocess.DEVNULL, check=False)
    digest = settings.copy()
    digest.update(command["command"].encode() + result.stdout)
    return digest.hexdigest()


def look_at(command, settings):
    """Returns (file, findings, seconds); no findings means clean."""
    start = time.monotonic()
    file = command["file"]
    mark = MEMORY / digest_of(command, settings)
    if mark.exists():
        return file, "", 0.0
    result = subprocess.run([TOOL, "-p", str(MEMORY), "--quiet", "--extra-arg=-Wno-unknown-warning-option", file],
                            stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True, check=False)
    seconds = time.monotonic() - start
    if result.returncode == 0:
        mark.touch()
        return file, "", seconds
    return file, result.stdout or result.stderr, seconds


def main():
    MEMORY.mkdir(parents=True, exist_ok=True)
    commands = own_sources(sys.argv[1:])
    if not commands:
        sys.exit("The release build compiles nothing of ours that fits")
    settings = settings_digest()
    dirty = 0
    with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
        for file, findings, seconds in pool.map(lambda c: look_at(c, settings), commands):
            print(f"{seconds:6.1f} s  {os.path.relpath(file, ROOT)}", flush=True)
            if findings:
                dirty += 1
                print(findings, flush=True)
    if dirty:
        sys.exit(f"clang-tidy found something in {dirty} of {len(commands)} sources")
    print(f"clang-tidy found nothing in {len(commands)} sources")


if __name__ == "__main__":
    main()
