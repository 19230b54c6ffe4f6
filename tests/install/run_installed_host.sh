#!/usr/bin/env bash
# Installs the build into a scratch DESTDIR under /usr, builds installed_host.cpp with nothing
# but the compile and link flags pkg-config gives for the installed quintarachat, and runs it
# against the installed library on the offscreen Qt platform.
# Usage: run_installed_host.sh BUILD_DIR WORK_DIR CXX [EXTRA_FLAGS...]
set -euo pipefail
here=$(cd "$(dirname "$0")" && pwd)
build=$1 work=$2 cxx=$3
shift 3
root=$work/root
rm -rf "$root"
mkdir -p "$root"
DESTDIR=$root cmake --install "$build" --prefix /usr >/dev/null
pc=$(find "$root" -name quintarachat.pc)
[ -n "$pc" ] || { echo "no quintarachat.pc installed" >&2; exit 1; }
lib=$(dirname "$(find "$root" -name 'libquintarachat.so')")
export PKG_CONFIG_PATH=$(dirname "$pc")
# shellcheck disable=SC2046 # the flags are words
"$cxx" "$@" -o "$work/installed_host" "$here/installed_host.cpp" \
    $(pkg-config --cflags --libs quintarachat)
LD_LIBRARY_PATH=$lib QT_QPA_PLATFORM=offscreen "$work/installed_host"
