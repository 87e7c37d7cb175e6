#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Every include of a file of this project is an arrow that the map in HACKING.md has: includes.py SOURCE"""
import os
import pathlib
import re
import sys

# Where the compiler looks, beside the folder of the file itself.
ROOTS = ["", "include", "src", "tools/quarzel", "bindings", "tests"]


def is_in(path, room):
    return room == "all" or path.startswith(room + "/")


def read_map(root):
    text = (root / "HACKING.md").read_text(encoding="utf-8")
    block = re.search(r"## Who includes whom\n.*?\n```\n(.*?)```", text, re.DOTALL).group(1)
    return {room: rest.split() for room, rest in (line.split(":") for line in block.splitlines())}


def arrows(root, path):
    """The line of each include of a file, and the files of this project that it may mean."""
    for number, line in enumerate((root / path).read_text(encoding="utf-8").splitlines(), 1):
        if include := re.match(r'\s*#\s*include\s*["<]([^">]+)[">]', line):
            places = [os.path.dirname(path)] + ROOTS
            names = {os.path.normpath(os.path.join(place, include[1])) for place in places}
            yield from ((number, name) for name in sorted(names) if (root / name).is_file())


def main():
    root = pathlib.Path(sys.argv[1])
    rooms = read_map(root)
    problems = []
    for folder in sorted(root.iterdir()):
        if not folder.is_dir() or folder.name == "build" or folder.name.startswith("."):
            continue
        for source in sorted(p for p in folder.rglob("*") if p.suffix in {".h", ".hpp", ".c", ".cpp"}):
            path = source.relative_to(root).as_posix()
            allowed = ["include"] + [r for room in rooms if is_in(path, room) for r in [room] + rooms[room]]
            for number, target in arrows(root, path):
                if not any(is_in(target, room) for room in allowed):
                    problems.append(f"{path}:{number}: includes {target}; the map in HACKING.md has no such arrow")
    return "\n".join(problems) or 0


sys.exit(main())
