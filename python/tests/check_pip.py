#!/usr/bin/env python3
"""Installs the package as pip does, without a network, and uses it from there.

usage: check_pip.py ROOT VERSION

Two ways: 'pip install ROOT', and a wheel, which must have the same bytes each time. The
installation must not depend on the tree in which it was built. A source distribution must hold all
that building takes.
"""
import hashlib
import os
import re
import subprocess
import sys
import tarfile
import tempfile
import venv
import zipfile
from pathlib import Path
from typing import List

PROGRAM = """
import importlib.metadata, pickle, sys
import numpy, booleq
from booleq import Equation, ParseError
assert booleq.__file__.startswith(sys.prefix), booleq.__file__
assert booleq.__version__ == importlib.metadata.version("booleq") == sys.argv[1]
assert any(word.startswith("numpy") for word in importlib.metadata.requires("booleq"))
equation = pickle.loads(pickle.dumps(Equation("A & ~B")))
assert equation.hex_init() == "0x4" and equation.eval_many([[1, 0]]).tolist() == [1]
try:
    Equation("A &")
    sys.exit("nothing was refused")
except ParseError:
    pass
libraries = [line.rstrip().split(maxsplit=5)[-1] for line in open("/proc/self/maps") if "libkq_" in line]
assert libraries and all(path.startswith(sys.prefix) for path in libraries), libraries
print("fine")
"""


def without_network() -> List[str]:
    """The start of a command that runs without the network, if this user may do that."""
    for command in (["unshare", "-n"], ["unshare", "-r", "-n"]):
        if subprocess.run([*command, "true"], stderr=subprocess.DEVNULL,
                          check=False).returncode == 0:
            return command
    print("the network could not be cut off: 'unshare -n' is not allowed here")
    return []


def run(*command: object) -> str:
    environment = {name: value for name, value in os.environ.items()
                   if not name.startswith(("PYTHON", "PIP_"))}
    environment["PIP_CONFIG_FILE"] = os.devnull
    done = subprocess.run([str(word) for word in command], stdout=subprocess.PIPE,
                          stderr=subprocess.STDOUT, text=True, env=environment, check=False)
    if done.returncode != 0:
        sys.exit(f"{' '.join(map(str, command))}\n{done.stdout}")
    return done.stdout


def new_python(folder: Path) -> Path:
    venv.EnvBuilder(system_site_packages=True, with_pip=True, symlinks=True).create(folder)
    return folder / "bin" / "python"


def check_wheel(path: Path, root: Path) -> None:
    with zipfile.ZipFile(path) as wheel:
        names = wheel.namelist()
        assert wheel.testzip() is None and len(set(names)) == len(names)
        for name in ("booleq/py.typed", "booleq/_booleq.pyi", "booleq/libkq_boolequation.so.1",
                     "booleq/libkq_port.so.1"):
            assert name in names, names
        info = next(name for name in names if name.endswith("/METADATA")).split("/", 1)[0]
        metadata = wheel.read(f"{info}/METADATA").decode()
        assert "\nRequires-Dist: numpy" in metadata and "\nLicense: MIT\n" in metadata
        own = wheel.read(f"{info}/LICENSE").decode()
        solver = wheel.read(f"{info}/LICENSE.cadical").decode() # its code is linked statically
        assert "\nLicense-File: LICENSE\nLicense-File: LICENSE.cadical\n" in metadata
        assert "\nCopyright 2016-2021 Armin Biere, Johannes Kepler University Linz" in solver
        assert solver.count("\nCopyright ") == 4 and "(c)" not in solver
        assert solver.endswith(own[own.index("Permission is hereby granted"):])
        records = wheel.read(f"{info}/RECORD").decode().splitlines()
        assert sorted(line.split(",")[0] for line in records) == sorted(names)
        for name in names:
            assert str(root).encode() not in wheel.read(name), f"{name} names the build tree"


def check_sdist(path: Path, version: str) -> None:
    with tarfile.open(path) as sdist:
        names = sdist.getnames()
    assert all(name.startswith(f"booleq-{version}/") for name in names)
    assert not [name for name in names if re.search(r"__pycache__|[.]so\b|/build/", name)]
    for name in ("PKG-INFO", "pyproject.toml", "LICENSE", "python/build_backend.py"):
        assert f"booleq-{version}/{name}" in names


def main() -> None:
    root, version = Path(sys.argv[1]).resolve(), sys.argv[2]
    cut_off = without_network()
    with tempfile.TemporaryDirectory() as name:
        folder = Path(name)
        python = new_python(folder / "from the tree")
        run(*cut_off, python, "-m", "pip", "install", root)
        run(python, "-P", "-c", PROGRAM, version)

        backend = (f"import sys; sys.path.insert(0, {str(root / 'python')!r}); import build_backend; "
                   f"build_backend.build_sdist({name!r}); build_backend.build_wheel({name!r})")
        run(*cut_off, python, "-c", backend)
        (wheel,), (sdist,) = folder.glob("*.whl"), folder.glob("*.tar.gz")
        check_wheel(wheel, root)
        check_sdist(sdist, version)
        first = hashlib.sha256(wheel.read_bytes()).digest()
        run(*cut_off, python, "-c", backend)
        assert hashlib.sha256(wheel.read_bytes()).digest() == first, "another wheel, other bytes"

        python = new_python(folder / "editable")
        run(*cut_off, python, "-m", "pip", "install", "--no-build-isolation", "-e", root)
        run(python, "-P", "-c", "import booleq; assert booleq.Equation('A & ~B').hex_init() == '0x4'; "
            f"assert booleq.__file__.startswith({str(root)!r})")
        old = "import sys; sys.version_info = (3, 10, 12); import build_backend"
        refused = subprocess.run([python, "-c", old], cwd=root / "python", text=True, check=False,
                                 stderr=subprocess.PIPE)
        assert refused.stderr == "booleq needs Python 3.11 or newer; this is Python 3.10.12\n"

        python = new_python(folder / "from the wheel")
        run(*cut_off, python, "-m", "pip", "install", wheel)
        run(python, "-P", "-c", PROGRAM, version)
        with zipfile.ZipFile(wheel) as packed:
            has_tool = "booleq/_tool" in packed.namelist()
        if has_tool:
            assert "0x4" in run(python, "-P", "-m", "booleq", "A & ~B")
        run(python, "-m", "pip", "uninstall", "--yes", "booleq")
        assert not list((folder / "from the wheel").rglob("booleq*"))
        print("installed from the tree and from a wheel")


if __name__ == "__main__":
    main()
