#!/usr/bin/env bash
# Checks types: the tests, which use every member, against the stubs; the stubs against the module.
# usage: check_types.sh PYTHON CONFIGURATION CACHE TESTS, PYTHONPATH being where the package is
set -euo pipefail

python=$1
configuration=$2
cache=$3
tests=$4
mkdir -p -- "$cache"
cd -- "$cache" # stubtest keeps its cache in the current directory
MYPYPATH=$PYTHONPATH "$python" -m mypy --config-file "$configuration" --cache-dir "$cache" \
    "$tests" "$tests/../bench"
# pybind11 gives the class its own metaclass, which has no name to write into a stub.
"$python" -m mypy.stubtest booleq._booleq --mypy-config-file "$configuration" \
    --allowlist <(echo booleq._booleq.NetlistCore)
