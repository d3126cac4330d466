#!/bin/sh
# run.sh prefix|cmake|pkg-config BUILD - installs the build BUILD under a prefix of its own, or builds and runs the program
# in this folder against what stands there, found by its CMake package or through pkg-config.
set -eu
step=$1 build=$2
here=$(cd "$(dirname "$0")" && pwd)
work=$build/install-test
prefix=$work/prefix
: "${CMAKE:=cmake}" "${CXX:=c++}"

expect() {
  answer=$("$@")
  [ "$answer" = PartnerKit.clsMGB850csv ] || { echo "unexpected answer: $answer" >&2; exit 1; }
}

case $step in
prefix)
  rm -rf "$work"
  "$CMAKE" --install "$build" --prefix "$prefix"
  "$prefix/bin/partnerkit" --version
  ;;
cmake)
  "$CMAKE" -S "$here" -B "$work/cmake" -G Ninja -DCMAKE_CXX_COMPILER="$CXX" -DCMAKE_PREFIX_PATH="$prefix"
  "$CMAKE" --build "$work/cmake"
  expect "$work/cmake/stranger"
  ;;
pkg-config)
  pc=$(find "$prefix" -name partnerkit.pc)
  export PKG_CONFIG_PATH="${pc%/*}"
  # Unquoted: several flags.
  "$CXX" -std=c++20 "$here/main.cpp" -o "$work/stranger" $(pkg-config --cflags --libs partnerkit)
  lib=$(pkg-config --variable=libdir partnerkit)
  expect env LD_LIBRARY_PATH="$lib" "$work/stranger"
  ;;
*)
  echo "usage: run.sh prefix|cmake|pkg-config BUILD" >&2
  exit 2
  ;;
esac
