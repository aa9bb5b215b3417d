#!/usr/bin/env python3
# Runs what README.md or another page shows, and compares the outputs byte for byte:
#   commands  every "$ command" of a console block, with the tool on the PATH
#   program   the C++ example, built as the CMake block and as the pkg-config block say, against
#             an installed tree in a path with a blank, or against what the system has installed
import argparse
import os
import re
import shutil
import subprocess
import sys
import tempfile

SKIPPED = 77


def blocks(text, kind):
    return re.findall(rf"^```{re.escape(kind)}\n(.*?)^```$", text, re.M | re.S)


def one_block(text, kind):
    found = blocks(text, kind)
    if len(found) != 1:
        sys.exit(f"README has {len(found)} blocks of kind {kind}, not one")
    return found[0]


def run(command, **options):
    done = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True,
                          timeout=300, check=False, **options)
    return done.returncode, done.stdout


def must_run(command, **options):
    status, output = run(command, **options)
    if status != 0:
        sys.exit(f"{command} ended with {status}:\n{output}")
    return output


def compare(what, expected, got):
    if expected == got:
        return 0
    print(f"{what}\n--- the page says\n{expected}--- it is\n{got}")
    return 1


def check_commands(readme, tool):
    environment = dict(os.environ, LC_ALL="C")
    environment.pop("MAV_KQ_BOOL_EQUATION_DEBUG", None)
    environment["PATH"] = os.path.dirname(tool) + os.pathsep + environment["PATH"]
    failures = count = 0
    # One directory for all commands of a page, because some read what earlier ones write.
    with tempfile.TemporaryDirectory() as directory:
        for block in blocks(readme, "console"):
            for example in re.split(r"^\$ ", block, flags=re.M)[1:]:
                command, expected = example.split("\n", 1)
                count += 1
                failures += compare(command, expected,
                                    run(["sh", "-c", command], env=environment,
                                        cwd=directory)[1])
    print(f"{count} commands run, {failures} differ")
    return 1 if failures or not count else 0


def find_directory(root, file):
    for directory, _, files in os.walk(root):
        if file in files:
            return directory
    sys.exit(f"no {file} below {root}")


# Runs the lines that README gives, in a folder with example.cpp. 'prefix' replaces their prefix
# $HOME/kq; without 'prefix' the system has the library, and the prefix is removed from the lines.
def run_lines(readme, kind, directory, prefix, compiler, flags):
    home = os.path.join(directory, "home")
    os.mkdir(home)
    lines = one_block(readme, kind)
    environment = dict(os.environ, HOME=home, CXX=compiler, CXXFLAGS=flags)
    if prefix:
        os.symlink(prefix, os.path.join(home, "kq"))
        libraries = os.path.relpath(find_directory(prefix, "libkq_boolequation.so"), prefix)
        lines = lines.replace("$HOME/kq/lib", f"$HOME/kq/{libraries}")
    else:
        lines = lines.replace(" -DCMAKE_PREFIX_PATH=$HOME/kq", "")
    lines = lines.replace("c++ ", f"'{compiler}' {flags} ")
    output = must_run(["bash", "-euc", lines], cwd=directory, env=environment)
    return "".join(output.splitlines(True)[-2:])  # CMake prints other lines before


def build_with_cmake(readme, directory, *where):
    with open(os.path.join(directory, "CMakeLists.txt"), "w", encoding="utf-8") as file:
        file.write(one_block(readme, "cmake"))
    return run_lines(readme, "sh cmake", directory, *where)


def build_with_pkg_config(readme, directory, *where):
    return run_lines(readme, "sh pkg-config", directory, *where)


def check_program(readme, build, compiler, flags):
    if not shutil.which("pkg-config"):
        print("skipped: there is no pkg-config")
        return SKIPPED
    expected = "".join(line + "\n" for line in re.findall(r"// prints (.*)$", one_block(readme, "cpp"),
                                                          re.M))
    failures = 0
    with tempfile.TemporaryDirectory() as top:
        prefix = None # the library is the system's
        if build:
            prefix = os.path.join(top, "installed here")
            must_run(["cmake", "--install", build, "--prefix", prefix])
        for how in (build_with_cmake, build_with_pkg_config):
            directory = os.path.join(top, how.__name__)
            os.mkdir(directory)
            with open(os.path.join(directory, "example.cpp"), "w", encoding="utf-8") as file:
                file.write(one_block(readme, "cpp"))
            failures += compare(how.__name__, expected,
                                how(readme, directory, prefix, compiler, flags))
    print(f"C++ example of README built in 2 ways, {failures} differ")
    return 1 if failures else 0


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--readme", required=True)
    parser.add_argument("--tool")
    parser.add_argument("--build", help="build tree to install; none: use what is installed")
    parser.add_argument("--compiler")
    parser.add_argument("--flags", default="")
    arguments = parser.parse_args()
    with open(arguments.readme, encoding="utf-8") as file:
        readme = file.read()
    if arguments.tool:
        return check_commands(readme, os.path.abspath(arguments.tool))
    return check_program(readme, arguments.build, arguments.compiler, arguments.flags)


if __name__ == "__main__":
    sys.exit(main())
