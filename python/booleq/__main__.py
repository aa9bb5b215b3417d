"""python -m booleq: the command-line tool of the same version."""
import os
import shutil
import sys
from pathlib import Path
from typing import Optional

STATUS_NO_TOOL = 125


def find_tool() -> Optional[str]:
    """The tool that came with the package, or the one on the PATH."""
    bundled = Path(__file__).with_name("_tool")
    return str(bundled) if os.access(bundled, os.X_OK) else shutil.which("booleq")


def main() -> None:
    tool = find_tool()
    if tool is None:
        sys.stderr.write("booleq: the command-line tool is not installed: neither with the module "
                         "nor on the PATH; on Debian: apt-get install booleq\n")
        sys.exit(STATUS_NO_TOOL)
    sys.stdout.flush()
    os.execv(tool, ["booleq", *sys.argv[1:]])


if __name__ == "__main__":
    main()
