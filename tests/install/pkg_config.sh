#!/usr/bin/env bash
# Builds and runs SOURCE with the flags that pkg-config gives for PACKAGE, installed in PREFIX.
# usage: pkg_config.sh PREFIX COMPILER SOURCE OUTPUT PACKAGE
set -euo pipefail

prefix=$1
export compiler=$2 source=$3 output=$4
name=$5

package=$(find "$prefix" -name "$name.pc")
PKG_CONFIG_PATH=$(dirname -- "$package")
export PKG_CONFIG_PATH
pkg-config --print-errors --exists "$name"
flags=$(pkg-config --cflags --libs "$name")

# pkg-config escapes the blanks for a shell, so a shell has to read the flags.
eval "\"\$compiler\" -std=c++17 \"\$source\" -o \"\$output\" $flags"

libraries=$(dirname -- "$PKG_CONFIG_PATH")
LD_LIBRARY_PATH=$libraries${LD_LIBRARY_PATH:+:$LD_LIBRARY_PATH} "$output"
