#!/usr/bin/env python3
# Packages are made by component, so each installed file must belong to exactly one component.
# usage: components.py CMAKE BUILD SCRATCH
import collections
import os
import shutil
import subprocess
import sys

COMPONENTS = ("library", "development", "logic", "logic_development", "tool", "python",
              "documentation")


def files_below(top):
    found = set()
    for directory, subdirectories, files in os.walk(top):
        links = [name for name in subdirectories if os.path.islink(os.path.join(directory, name))]
        for name in files + links:
            found.add(os.path.relpath(os.path.join(directory, name), top))
    return found


def main():
    cmake, build, scratch = sys.argv[1:]

    def installed(directory, *options):
        tree = os.path.join(scratch, directory)
        subprocess.run([cmake, "--install", build, "--prefix", tree, *options],
                       stdout=subprocess.DEVNULL, timeout=300, check=True)
        return files_below(tree)

    shutil.rmtree(scratch, ignore_errors=True)
    everything = installed("everything")
    owners = collections.defaultdict(list)
    for component in COMPONENTS:
        for file in installed(component, "--component", component):
            owners[file].append(component)

    failures = 0
    for file in sorted(everything | set(owners)):
        if file not in everything:
            print(f"{file}: in component {owners[file][0]}, but not installed without components")
        elif not owners[file]:
            print(f"{file}: its install() names no component of {', '.join(COMPONENTS)}")
        elif len(owners[file]) > 1:
            print(f"{file}: in more than one component: {', '.join(owners[file])}")
        else:
            continue
        failures += 1
    counts = collections.Counter(owner for file in owners for owner in owners[file])
    print(f"{len(everything)} files;", ", ".join(f"{name} {counts[name]}" for name in COMPONENTS))
    for component in ("library", "development", "documentation"): # always present
        if not counts[component]:
            print(f"component {component} has no file")
            failures += 1
    return 1 if failures else 0


if __name__ == "__main__":
    sys.exit(main())
