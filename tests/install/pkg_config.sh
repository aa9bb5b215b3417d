#!/usr/bin/env bash
# Builds and runs SOURCE with what pkg-config says about the library installed in PREFIX.
# usage: pkg_config.sh PREFIX COMPILER SOURCE OUTPUT
set -euo pipefail

prefix=$1
export compiler=$2 source=$3 output=$4

package=$(find "$prefix" -name kq_boolequation.pc)
PKG_CONFIG_PATH=$(dirname -- "$package")
export PKG_CONFIG_PATH
pkg-config --print-errors --exists kq_boolequation
flags=$(pkg-config --cflags --libs kq_boolequation)

# pkg-config escapes the blanks for a shell, so a shell has to read the flags.
eval "\"\$compiler\" -std=c++17 \"\$source\" -o \"\$output\" $flags"

libraries=$(dirname -- "$PKG_CONFIG_PATH")
LD_LIBRARY_PATH=$libraries${LD_LIBRARY_PATH:+:$LD_LIBRARY_PATH} "$output"
