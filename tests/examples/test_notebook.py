#!/usr/bin/env python3
"""Runs the notebook's cells with nbclient; its assertions decide. Then runs it again with a wrong
init value, which must fail.

usage: test_notebook.py NOTEBOOK
Exit status 77, which counts as skipped: nbclient, ipykernel, NumPy or pandas is missing.
"""
import json
import os
import pathlib
import sys
import tempfile

SKIPPED = 77

try:
    import ipykernel  # noqa: F401
    import nbclient
    import nbformat
    import numpy  # noqa: F401
    import pandas  # noqa: F401
except ImportError as error:
    print(f"skipped: {error} (Debian: python3-nbclient python3-ipykernel python3-numpy python3-pandas)")
    sys.exit(SKIPPED)


def run(text):
    """Runs all cells; returns the notebook with its outputs."""
    notebook = nbformat.reads(text, as_version=4)
    nbformat.validate(notebook)
    return nbclient.NotebookClient(notebook, timeout=120, kernel_name="tested").execute()


def use_this_interpreter(directory):
    """A kernel that is this interpreter, whatever kernels the machine has."""
    kernel = pathlib.Path(directory, "kernels/tested/kernel.json")
    kernel.parent.mkdir(parents=True)
    kernel.write_text(json.dumps({
        "argv": [sys.executable, "-m", "ipykernel_launcher", "-f", "{connection_file}"],
        "display_name": "tested", "language": "python"}), encoding="utf-8")
    os.environ.update(JUPYTER_PATH=directory, JUPYTER_RUNTIME_DIR=directory, IPYTHONDIR=directory,
                      JUPYTER_CONFIG_DIR=directory)


def main():
    text = pathlib.Path(sys.argv[1]).read_text(encoding="utf-8")
    for cell in nbformat.reads(text, as_version=4).cells:
        if cell.get("outputs") or cell.get("execution_count"):
            sys.exit(f"FAILED: a cell of {sys.argv[1]} has outputs; clear them before it is stored")
    with tempfile.TemporaryDirectory() as directory:
        use_this_interpreter(directory)
        cells = run(text).cells
        code = [cell for cell in cells if cell.cell_type == "code"]
        print(f"{len(code)} cells run, {sum(bool(cell.outputs) for cell in code)} with outputs")
        wrong = text.replace('from_init(\\"0xca\\"', 'from_init(\\"0xcb\\"')
        if wrong == text:
            sys.exit("FAILED: the init value that is to be spoiled is not in the notebook")
        try:
            run(wrong)
        except nbclient.exceptions.CellExecutionError:
            return 0
    sys.exit("FAILED: the notebook accepts another init value")


if __name__ == "__main__":
    sys.exit(main())
