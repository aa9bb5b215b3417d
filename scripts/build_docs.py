#!/usr/bin/env python3
"""Builds the reference documentation as HTML, from the public headers, README.md and docs/*.md.

usage: build_docs.py ROOT OUTPUT

OUTPUT is a directory, which is replaced completely. Exit status: 1 if Doxygen warns, if a public
member has no comment, if a link leads nowhere, or if the result contains a path of this machine.
"""
import html.parser
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
import urllib.parse

import doc_filter


def version(root):
    text = (root / "CMakeLists.txt").read_text(encoding="utf-8")
    return re.search(r"^project\(\w+ VERSION ([\d.]+)", text, re.M)[1]


def filtered(root, path):
    """The text that Doxygen reads, and complaints about what it would silently ignore."""
    lines = path.read_text(encoding="utf-8").splitlines()
    if path.suffix == ".md":
        return "\n".join(doc_filter.filter_page(path, lines)) + "\n", []
    header = doc_filter.Header(lines)
    text = "\n".join(header.filter()) + "\n"
    return text, [f"{path.relative_to(root)}:{line}: enumerator without a comment"
                  for line in header.bare_enumerators]


def prepare(root, source):
    """Writes what Doxygen reads to 'source'."""
    complaints = []
    for path in [*sorted(root.glob("*.md")), *sorted(root.glob("docs/*.md")),
                 *sorted(root.glob("include/**/*.h"))]:
        copy = source / path.relative_to(root)
        copy.parent.mkdir(parents=True, exist_ok=True)
        text, found = filtered(root, path)
        copy.write_text(text, encoding="utf-8")
        complaints += found
    shutil.copytree(root / "docs/pictures", source / "docs/pictures")
    shutil.copy(root / "docs/site.css", source / "docs")
    print("".join(line + "\n" for line in complaints), end="")
    return not complaints


def run_doxygen(root, source, output):
    pictures = sorted(path.relative_to(source) for path in source.glob("docs/pictures/*.svg"))
    settings = (root / "docs/Doxyfile").read_text(encoding="utf-8") + f"""
PROJECT_NUMBER = {version(root)}
HTML_EXTRA_FILES = {" ".join(map(str, pictures))}
STRIP_FROM_PATH = "{source}"
STRIP_FROM_INC_PATH = "{source / "include"}"
OUTPUT_DIRECTORY = "{output}"
"""
    done = subprocess.run(["doxygen", "-"], input=settings, stdout=subprocess.PIPE, cwd=source,
                          stderr=subprocess.STDOUT, text=True, timeout=300, check=False)
    print(done.stdout.replace(f"{source}/", ""), end="")
    return done.returncode == 0 and not done.stdout


class Links(html.parser.HTMLParser):
    """The links of a page, and the places to which links may lead."""

    def __init__(self, path):
        super().__init__()
        self.targets, self.anchors = [], set()
        self.feed(path.read_text(encoding="utf-8"))

    def handle_starttag(self, tag, attributes):
        for name, value in attributes:
            if name in ("id", "name"):
                self.anchors.add(value)
            elif name in ("href", "src") and value and "://" not in value:
                self.targets.append(urllib.parse.unquote(value))


def check_links(directory):
    pages = {path.name: Links(path) for path in sorted(directory.glob("*.html"))}
    dead = set()
    for name, page in pages.items():
        for target in page.targets:
            file, _, anchor = target.partition("#")
            file = file or name
            if target.startswith("javascript:"):
                continue
            if not (directory / file).exists() or (
                    anchor and file in pages and anchor not in pages[file].anchors):
                dead.add(f"{name}: the link to {target} leads nowhere")
    print("".join(line + "\n" for line in sorted(dead)), end="")
    return not dead


def check_paths(directory, paths):
    found = [f"{name.name}: holds the path {path}\n" for name in sorted(directory.rglob("*"))
             for path in paths if name.is_file() and str(path).encode() in name.read_bytes()]
    print("".join(found), end="")
    return not found


def main():
    if len(sys.argv) != 3:
        sys.exit(__doc__)
    root, output = (pathlib.Path(argument).resolve() for argument in sys.argv[1:])
    output.parent.mkdir(parents=True, exist_ok=True)
    with tempfile.TemporaryDirectory(dir=output.parent) as name:
        work = pathlib.Path(name)
        if not prepare(root, work / "source") or not run_doxygen(root, work / "source", work):
            return 1
        results = [check_links(work / "html"), check_paths(work / "html", [root, work])]
        if not all(results):
            return 1
        shutil.rmtree(output, ignore_errors=True)
        (work / "html").rename(output)
    return 0


if __name__ == "__main__":
    sys.exit(main())
