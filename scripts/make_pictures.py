#!/usr/bin/env python3
"""Makes the pictures of the documentation, or checks that they are up to date.

usage: make_pictures.py [--check] ROOT BOOLEQ

Pictures that booleq prints are compared byte for byte. What Graphviz's dot draws depends on the
fonts of the machine, so only nodes, edges and texts are compared, not their positions. Exit status
of a check: 1 if a picture is not up to date, 77 if dot is missing and all other pictures are up to
date.
"""
import pathlib
import shutil
import subprocess
import sys
import xml.etree.ElementTree

SKIPPED = 77
SVG = "{http://www.w3.org/2000/svg}"

PRINTED = {  # by booleq
    "grouping.dot": ["tree", "--dot", "a | b & ~c"],
    "blank.dot": ["tree", "--dot", "P & X ~ | Y"],
    "no_blank.dot": ["tree", "--dot", "P & X ~| Y"],
    "bits.svg": ["init", "--svg", "a | b & ~c"],
    "kmap.svg": ["kmap", "--svg", "A & B | ~C & D"],
}
DRAWN = {  # by dot
    "grouping.svg": "grouping.dot",
    "blank.svg": "blank.dot",
    "no_blank.svg": "no_blank.dot",
    "road.svg": "road.dot",
}


def run(*command):
    return subprocess.run([str(part) for part in command], stdout=subprocess.PIPE, text=True,
                          timeout=60, check=True).stdout


def draw(path):
    return run("dot", "-Tsvg", path)


def what_is_drawn(svg):
    """The nodes, edges and texts of a picture that dot drew."""
    root = xml.etree.ElementTree.fromstring(svg.encode())
    return [element.text for element in root.iter() if element.tag in (SVG + "title", SVG + "text")]


def make(pictures, tool):
    for name, arguments in PRINTED.items():
        (pictures / name).write_text(run(tool, *arguments), encoding="utf-8")
    for name, source in DRAWN.items():
        (pictures / name).write_text(draw(pictures / source), encoding="utf-8")


def find_stale(pictures, tool, has_dot):
    committed = {path.name: path.read_text(encoding="utf-8")
                 for path in sorted(pictures.glob("*.*"))}
    known = set(PRINTED) | set(DRAWN) | set(DRAWN.values())
    yield from (f"{name} is missing" for name in sorted(known - set(committed)))
    yield from (f"{name} is made from nothing" for name in sorted(set(committed) - known))
    for name, arguments in PRINTED.items():
        if name in committed and committed[name] != run(tool, *arguments):
            yield f"{name} is not what booleq prints now"
    for name, source in DRAWN.items():
        if has_dot and name in committed and source in committed:
            if what_is_drawn(committed[name]) != what_is_drawn(draw(pictures / source)):
                yield f"{name} does not show what {source} says"


def check(pictures, tool):
    has_dot = shutil.which("dot") is not None
    stale = list(find_stale(pictures, tool, has_dot))
    for line in stale:
        print(f"docs/pictures/{line}: ./dev docs --pictures makes all anew")
    if stale:
        return 1
    if not has_dot:
        print("skipped: there is no dot to draw with")
        return SKIPPED
    return 0


def main():
    arguments = [argument for argument in sys.argv[1:] if argument != "--check"]
    if len(arguments) != 2:
        sys.exit(__doc__)
    pictures = pathlib.Path(arguments[0]) / "docs/pictures"
    if "--check" in sys.argv:
        return check(pictures, arguments[1])
    make(pictures, arguments[1])
    return 0


if __name__ == "__main__":
    sys.exit(main())
