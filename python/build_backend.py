"""The build backend for pip (PEP 517): CMake builds and installs, this file packs.

It uses only the standard library, so that nothing has to be fetched. The wheel holds the module,
the libraries that it uses, and metadata; the source distribution holds what building a wheel takes.
Called as a program, it writes the directory *.dist-info of an installation that CMake makes:
build_backend.py dist-info DIRECTORY.
"""
import sys

if sys.version_info < (3, 11):  # before the imports below fail
    raise SystemExit("booleq needs Python 3.11 or newer; this is Python " +
                     ".".join(str(number) for number in sys.version_info[:3]))

import base64
import hashlib
import io
import os
import re
import shutil
import subprocess
import sysconfig
import tarfile
import tempfile
import tomllib
import zipfile
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
PROJECT = tomllib.loads((ROOT / "pyproject.toml").read_text(encoding="utf-8"))["project"]
NAME = PROJECT["name"]
SOURCES = ["CMakeLists.txt", "LICENSE", "README.md", "pyproject.toml", "cmake", "docs/python.md",
           "include", "logic", "port", "python", "s", "tools"]
SOLVER_NOTICE = "LICENSE.cadical"
DATE = (1980, 1, 1, 0, 0, 0)  # the earliest of a zip file; fixed, so that bytes are reproducible


def _version():
    text = (ROOT / "CMakeLists.txt").read_text(encoding="utf-8")
    return re.search(r"^project\(KqBoolEquation VERSION ([0-9.]+) ", text, re.MULTILINE)[1]


def _tag():
    if sys.implementation.name != "cpython":
        raise SystemExit(f"{NAME} is built for CPython only, this is {sys.implementation.name}")
    interpreter = f"cp{sys.version_info.major}{sys.version_info.minor}"
    abi = "cp" + sysconfig.get_config_var("SOABI").split("-")[1]
    platform = re.sub(r"[-.]", "_", sysconfig.get_platform())
    return f"{interpreter}-{abi}-{platform}"


def _metadata(has_solver_notice=True):
    lines = ["Metadata-Version: 2.1", f"Name: {NAME}", f"Version: {_version()}",
             f"Summary: {PROJECT['description']}", "License: MIT",
             f"License-File: {PROJECT['license']['file']}"]
    lines += [f"License-File: {SOLVER_NOTICE}"] if has_solver_notice else []
    lines += [f"Classifier: {name}" for name in PROJECT["classifiers"]]
    lines.append(f"Requires-Python: {PROJECT['requires-python']}")
    lines += [f"Requires-Dist: {name}" for name in PROJECT["dependencies"]]
    lines.append("Description-Content-Type: text/markdown")
    return "\n".join(lines) + "\n\n" + (ROOT / PROJECT["readme"]).read_text(encoding="utf-8")


def _solver_notice():
    """The solver's authors and terms (the same as ours), which must go along with its code."""
    packed = (ROOT / "cmake/packages/solver.copyright").read_text(encoding="utf-8")
    holders = re.search(r"^Copyright: (.*?)^Comment:", packed, re.MULTILINE | re.DOTALL)[1]
    terms = (ROOT / PROJECT["license"]["file"]).read_text(encoding="utf-8")
    lines = ["Built where the solver CaDiCaL is found, the module and the tool hold its code. Its licence:",
             "", *(f"Copyright {line.strip()}" for line in holders.splitlines()), "",
             terms[terms.index("Permission is hereby granted"):]]
    return "\n".join(lines)


def _wheel_information():
    return f"""Wheel-Version: 1.0
Generator: {NAME} build_backend
Root-Is-Purelib: false
Tag: {_tag()}
"""


def _run(*command):
    done = subprocess.run([str(word) for word in command], stdin=subprocess.DEVNULL, check=False)
    if done.returncode != 0:
        raise SystemExit(f"{NAME}: {command[0]} failed, see above; on Debian 12 building takes: "
                         "apt-get install cmake g++ make pybind11-dev python3-dev")


def _has_tool_headers():
    """Whether the command-line tool can be built, which needs two header-only libraries."""
    return all(any((Path(root) / header).exists() for root in ("/usr/include", "/usr/local/include"))
               for header in ("CLI/CLI.hpp", "nlohmann/json.hpp"))


def _build():
    """Builds the package and returns the build directory, which stays for the next time."""
    if shutil.which("cmake") is None:
        raise SystemExit(f"{NAME} is built by CMake, and there is none; on Debian 12: "
                         "apt-get install cmake g++ make pybind11-dev python3-dev")
    build = ROOT / "build" / f"wheel-{_tag()}"
    if (build / "CMakeCache.txt").exists():
        cache = (build / "CMakeCache.txt").read_text(encoding="utf-8")
        if f"CMAKE_HOME_DIRECTORY:INTERNAL={ROOT}\n" not in cache:
            shutil.rmtree(build)  # the tree was moved
    generator = ["-G", "Ninja"] if shutil.which("ninja") else []
    _run("cmake", "-S", ROOT, "-B", build, *generator, "-DCMAKE_BUILD_TYPE=Release",
         "-DBUILD_TESTING=OFF", "-DKQ_BUILD_LOGIC=OFF",
         f"-DKQ_BUILD_TOOLS={'ON' if _has_tool_headers() else 'OFF'}", "-DKQ_BUILD_PYTHON=ON",
         "-DKQ_PYTHON_BUNDLE=ON", "-DKQ_PYTHON_DIR=.", f"-DPython_EXECUTABLE={sys.executable}")
    targets = ["_booleq", *(["booleq"] if _has_tool_headers() else [])]
    _run("cmake", "--build", build, "--target", *targets, "--parallel", os.cpu_count() or 1)
    return build


class _Wheel:
    """A zip file with the list of its files and their hashes."""

    def __init__(self, path, information):
        self._file = zipfile.ZipFile(path, "w", zipfile.ZIP_DEFLATED)
        self._information = information
        self._records = []

    def add(self, name, content, mode=0o644):
        entry = zipfile.ZipInfo(name, DATE)
        entry.external_attr = (0o100000 | mode) << 16
        entry.compress_type = zipfile.ZIP_DEFLATED
        self._file.writestr(entry, content)
        digest = base64.urlsafe_b64encode(hashlib.sha256(content).digest()).rstrip(b"=")
        self._records.append(f"{name},sha256={digest.decode()},{len(content)}\n")

    def close(self):
        name = f"{self._information}/RECORD"
        self._file.writestr(zipfile.ZipInfo(name, DATE), "".join(self._records) + f"{name},,\n")
        self._file.close()


def _write_information(write, is_wheel=True):
    """Calls write(name, bytes) for the files of *.dist-info except RECORD.

    A package that another program makes has its own place for the solver's notice.
    """
    write("METADATA", _metadata(is_wheel).encode())
    write("WHEEL", _wheel_information().encode())
    write("LICENSE", (ROOT / PROJECT["license"]["file"]).read_bytes())
    if is_wheel:
        write(SOLVER_NOTICE, _solver_notice().encode())


# --- the hooks --------------------------------------------------------------------------------

def get_requires_for_build_wheel(config_settings=None):
    return []


def get_requires_for_build_sdist(config_settings=None):
    return []


def prepare_metadata_for_build_wheel(metadata_directory, config_settings=None):
    directory = Path(metadata_directory) / f"{NAME}-{_version()}.dist-info"
    directory.mkdir()
    _write_information(lambda name, content: (directory / name).write_bytes(content))
    return directory.name


def build_wheel(wheel_directory, config_settings=None, metadata_directory=None):
    information = f"{NAME}-{_version()}.dist-info"
    file_name = f"{NAME}-{_version()}-{_tag()}.whl"
    with tempfile.TemporaryDirectory() as prefix:
        _run("cmake", "--install", _build(), "--component", "python", "--prefix", prefix, "--strip")
        wheel = _Wheel(Path(wheel_directory) / file_name, information)
        for path in sorted(Path(prefix).rglob("*")):
            if path.is_file():
                name = path.relative_to(prefix).as_posix()
                wheel.add(name, path.read_bytes(), 0o755 if ".so" in path.name or path.name == "_tool" else 0o644)
        _write_information(lambda name, content: wheel.add(f"{information}/{name}", content))
        wheel.close()
    return file_name


def get_requires_for_build_editable(config_settings=None):
    return []


prepare_metadata_for_build_editable = prepare_metadata_for_build_wheel


def build_editable(wheel_directory, config_settings=None, metadata_directory=None):
    """A wheel that points at the build directory, where the package is links to the sources."""
    information = f"{NAME}-{_version()}.dist-info"
    file_name = f"{NAME}-{_version()}-{_tag()}.whl"
    wheel = _Wheel(Path(wheel_directory) / file_name, information)
    wheel.add(f"__editable__.{NAME}.pth", f"{_build() / 'python'}\n".encode())
    _write_information(lambda name, content: wheel.add(f"{information}/{name}", content))
    wheel.close()
    return file_name


def _source_files():
    for source in SOURCES:
        path = ROOT / source
        for file in [path] if path.is_file() else sorted(path.rglob("*")):
            if file.is_file() and "__pycache__" not in file.parts:
                yield file


def build_sdist(sdist_directory, config_settings=None):
    folder = f"{NAME}-{_version()}"
    file_name = f"{folder}.tar.gz"

    def plain(entry):
        entry.uid = entry.gid = 0
        entry.uname = entry.gname = ""
        return entry

    with tarfile.open(Path(sdist_directory) / file_name, "w:gz", format=tarfile.PAX_FORMAT) as sdist:
        for file in _source_files():
            sdist.add(file, f"{folder}/{file.relative_to(ROOT).as_posix()}", filter=plain)
        content = _metadata().encode()
        entry = tarfile.TarInfo(f"{folder}/PKG-INFO")
        entry.size = len(content)
        sdist.addfile(entry, io.BytesIO(content))
    return file_name


def _write_installed(directory):
    """Writes what pip and importlib.metadata read about a package that pip did not install."""
    information = Path(directory) / f"{NAME}-{_version()}.dist-info"
    information.mkdir(parents=True, exist_ok=True)
    _write_information(lambda name, content: (information / name).write_bytes(content),
                       is_wheel=False)
    (information / "INSTALLER").write_text("cmake\n", encoding="utf-8")


if __name__ == "__main__":
    if len(sys.argv) != 3 or sys.argv[1] != "dist-info":
        raise SystemExit("usage: build_backend.py dist-info DIRECTORY")
    _write_installed(sys.argv[2])
