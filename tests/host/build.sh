#!/usr/bin/env bash
# Configures, builds and installs a CMake project.
# usage: build.sh CMAKE GENERATOR SOURCE BUILD PREFIX [CMAKE OPTION...]
set -euo pipefail

cmake=$1 generator=$2 source=$3 build=$4 prefix=$5
shift 5

rm -rf -- "$prefix"
"$cmake" -S "$source" -B "$build" -G "$generator" "$@"
"$cmake" --build "$build"
"$cmake" --install "$build" --prefix "$prefix"
