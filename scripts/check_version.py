#!/usr/bin/env python3
"""Checks that the version is stated in one place, and that everything made from it agrees.

usage: check_version.py VERSION SOURCES [PREFIX]

VERSION is the one in project() of CMakeLists.txt. No other file under SOURCES may state it, except
CHANGELOG.md, whose newest release must be VERSION, with a date; a pyproject.toml that describes its
project takes it from the build (dynamic). PREFIX is an installed tree: its packages for CMake and
pkg-config, its libraries, its tool and its Python module must give VERSION, each if it is
installed. Prints one line for each violation.  Exit status: 1 if there is one.
"""
import os
import pathlib
import re
import subprocess
import sys

HEADING = re.compile(r"^## \[([^\]]+)\](.*)$", re.M)
RELEASE = re.compile(r"\d+\.\d+\.\d+")
DATE = re.compile(r" - \d{4}-\d{2}-\d{2}")
SKIPPED = re.compile(r"\.git|build.*|__pycache__|corpus|\..*_cache")


def text_files(sources):
    for directory, folders, files in os.walk(sources):
        folders[:] = sorted(name for name in folders if not SKIPPED.fullmatch(name))
        for name in sorted(files):
            path = pathlib.Path(directory, name)
            try:
                yield path.relative_to(sources).as_posix(), path.read_text(encoding="utf-8")
            except UnicodeDecodeError:
                pass


def check_changelog(version, text):
    found = HEADING.findall(text)
    releases = [(name, rest) for name, rest in found if name != "Unreleased"]
    if "Unreleased" in [name for name, _ in found[1:]]:
        yield "CHANGELOG.md: the heading [Unreleased] is not the first one"
    if not releases:
        yield f"CHANGELOG.md: no heading of a release; write '## [{version}] - YYYY-MM-DD'"
        return
    if releases[0][0] != version:
        yield (f"CHANGELOG.md: the newest release is {releases[0][0]}, CMakeLists.txt says {version};"
               f" write '## [{version}] - YYYY-MM-DD' above it, or fix project(VERSION)")
    for name, rest in releases:
        if not RELEASE.fullmatch(name) or not DATE.fullmatch(rest):
            yield f"CHANGELOG.md: '## [{name}]{rest}' is not of the form '## [1.2.3] - YYYY-MM-DD'"


def check_pyproject(path, text):
    project = re.search(r"^\[project\]\n(.*?)(?=^\[|\Z)", text, re.M | re.S)
    lines = project[1] if project else ""
    if re.search(r"^version\s*=", lines, re.M):
        yield f"{path}: states a version; write dynamic = [\"version\"] instead"
    elif project and not re.search(r"^dynamic\s*=\s*\[[^\]]*\"version\"", lines, re.M):
        yield f"{path}: does not say dynamic = [\"version\"] in [project]"


def check_sources(version, sources):
    stated = re.compile(rf"(?<![\w.]){re.escape(version)}(?![\w]|\.\d)")
    project = re.compile(rf"^project\(\w+ VERSION {re.escape(version)}\b", re.M)
    is_stated = False
    for path, text in text_files(sources):
        if path == "CMakeLists.txt":
            is_stated = bool(project.search(text))
            text = project.sub("", text)
        elif path == "CHANGELOG.md":
            yield from check_changelog(version, text)
            continue
        elif path.endswith("pyproject.toml"):
            yield from check_pyproject(path, text)
        for match in stated.finditer(text):
            line = text.count("\n", 0, match.start()) + 1
            yield (f"{path}:{line}: states the version {version}; take it from CMake's"
                   " PROJECT_VERSION")
    if not is_stated:
        yield f"CMakeLists.txt: does not say project(... VERSION {version} ...)"


def output_of(*command, **environment):
    return subprocess.run([str(part) for part in command], stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, text=True, timeout=60, check=False,
                          env={**os.environ, **environment}).stdout.strip()


def stated_versions(prefix, major):
    """Pairs (what, the version that it states) for everything installed."""
    for package in prefix.rglob("kq_boolequation.pc"):
        yield "pkg-config", output_of("pkg-config", "--modversion", "kq_boolequation",
                                      PKG_CONFIG_PATH=str(package.parent))
    for package in prefix.rglob("KqBoolEquationConfigVersion.cmake"):
        yield "the CMake package", re.search(r'set\(PACKAGE_VERSION "(.*?)"\)',
                                             package.read_text(encoding="utf-8"))[1]
    for library in ("libkq_boolequation.so", "libkq_port.so"):
        for path in prefix.rglob(f"{library}.{major}"):
            yield library, path.resolve().name[len(library) + 1:]
    for tool in prefix.glob("bin/booleq"):
        yield "booleq --version", output_of(tool, "--version").removeprefix("booleq ")
    for module in prefix.rglob("booleq/__init__.py"):
        yield "the Python module", output_of("/usr/bin/python3", "-c",
                                             "import booleq; print(booleq.__version__)",
                                             PYTHONPATH=str(module.parent.parent))
    for metadata in prefix.rglob("booleq-*.dist-info/METADATA"):
        yield "the Python package", re.search(r"^Version: (.*)$",
                                              metadata.read_text(encoding="utf-8"), re.M)[1]


def check_installed(version, prefix):
    stated = list(stated_versions(prefix, version.partition(".")[0]))
    for needed in ("pkg-config", "the CMake package", "libkq_boolequation.so"):
        if needed not in [what for what, _ in stated]:
            yield f"{prefix}: {needed} is not there, or its name has another major version"
    for what, says in stated:
        if says != version:
            yield f"{what} says '{says}', CMakeLists.txt {version}"


def main():
    if len(sys.argv) not in (3, 4):
        sys.exit(__doc__)
    version, sources, *rest = sys.argv[1:]
    found = list(check_sources(version, pathlib.Path(sources)))
    for prefix in rest:
        found += check_installed(version, pathlib.Path(prefix))
    print("\n".join(found), end="\n" if found else "")
    return 1 if found else 0


if __name__ == "__main__":
    sys.exit(main())
