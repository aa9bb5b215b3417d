#!/bin/sh
# Runs a Windows program under Wine, with its own Wine folder and the compiler's libraries.
# usage: wine.sh FOLDER PROGRAM [ARGUMENT...], or FOLDER --start or --stop: makes the folder, and keeps
# Wine's services running from one program to the next, so that no test has to start them
set -eu
export WINEPREFIX="$1" WINEDEBUG=-all WINEDLLOVERRIDES='mscoree,mshtml='
shift
libraries=$(dirname "$(x86_64-w64-mingw32-g++-posix -print-file-name=libstdc++-6.dll)")
export WINEPATH="$libraries;/usr/x86_64-w64-mingw32/lib"
case $1 in
--start)
    mkdir -p -- "$WINEPREFIX"
    # What stays running must not hold the caller's output open: ctest waits for its end.
    wineserver --persistent=300 > /dev/null 2>&1 || true # seconds; it may run already
    exec wine wineboot --init > /dev/null 2>&1
    ;;
--stop) exec wineserver --kill --wait ;;
esac
exec wine "$@"
