#!/bin/sh
# run.sh prefix|cmake|pkg-config|readme BUILD - installs the build BUILD under a prefix of its own; or builds the programs
# in the folders here against what stands there, found by its CMake package or through pkg-config, and runs them; or
# holds the program and the output that the README shows against those here.
set -eu
step=$1 build=$2
here=$(cd "$(dirname "$0")" && pwd)
project=$here/../..
work=$build/install-test
prefix=$work/prefix
: "${CMAKE:=cmake}" "${CXX:=c++}"

fail() {
  echo "run.sh: $*" >&2
  exit 1
}

# check NAME EXPECTED ACTUAL
check() {
  [ "$2" != "$3" ] || return 0
  mkdir -p "$work"
  printf '%s\n' "$2" >"$work/expected"
  printf '%s\n' "$3" >"$work/actual"
  diff -u "$work/expected" "$work/actual" >&2 || fail "$1 is not as expected"
}

# An empty folder with the sample's order file and map, and the current one from here on.
begin() {
  rm -rf "$work/$1"
  mkdir -p "$work/$1"
  cd "$work/$1"
  cp "$project/samples/mgb850/orders.csv" "$project/samples/mgb850/mgb850.map" .
}

# answers PROGRAM: what it writes and, in the last line, its exit status.
answers() {
  status=0
  "$1" 2>&1 || status=$?
  echo "status $status"
}

# The numbers of the orders in a file of order lines, each once.
orders_in() {
  cut -d, -f8 "$1" | uniq | xargs
}

turned_away='4500012346 2006-03-06 000000481/481/0002  NOT DONE
   ...Cannot process PO 4500012346, buying location 0130 does not exist.
   ...Cannot process PO 4500012346, buying location 0130 does not exist.
   PO 4500012346 import incomplete.'
turned_away_too='4500012352 2006-03-07 000000481/481/0004  NOT DONE
   ...Cannot process PO 4500012352, ship to location 0130 does not exist.
   ...Cannot process PO 4500012352, ship to location 0130 does not exist.
   PO 4500012352 import incomplete.'

first_run="4500012345 2006-03-06 000000481/481/0001  posted, id 1
   PO 4500012345 import completed.
$turned_away
4500012351 2006-03-07 000000481/481/0003  posted, id 2
   PO 4500012351 import completed.
$turned_away_too"

# The program with the database: a run, a second one over what is left, and two that cannot be.
database() {
  begin database
  check 'the first run' "$first_run
status 1" "$(answers "$1")"
  check 'the rest of the file' '4500012346 4500012352' "$(orders_in orders.csv)"
  check 'the backup' '4500012345 4500012351' "$(orders_in posted.csv)"
  check 'the second run' "$turned_away
$turned_away_too
status 1" "$(answers "$1")"
  rm mgb850.map
  check 'a run without a map' '   PO map file mgb850.map does not exist.
status 1' "$(answers "$1")"
  begin no-database
  mkdir orders.db
  check 'a run without a database' 'orders.db: is a folder, not a database
status 2' "$(answers "$1")"
}

memory() {
  begin memory
  check 'the list' 'wanted 9312345678907: 24
wanted 9312345679010: 42
wanted 9312345679126: 24
wanted 9312345679454: 108
wanted 9312345679676: 20
kim: ...Cannot process PO 4500012346, buying location 0130 does not exist.
kim: ...Cannot process PO 4500012346, buying location 0130 does not exist.
kim: ...Cannot process PO 4500012352, ship to location 0130 does not exist.
kim: ...Cannot process PO 4500012352, ship to location 0130 does not exist.
status 1' "$(answers "$1")"
  check 'the rest of the file' '4500012346 4500012352' "$(orders_in orders.csv)"
}

# block LINE: what the README has between that line and the end of the block.
block() {
  awk -v from="$1" '$0 == from { inside = 1; next } $0 == "```" { inside = 0 } inside' "$project/README.md"
}

case $step in
prefix)
  rm -rf "$work"
  "$CMAKE" --install "$build" --prefix "$prefix"
  "$prefix/bin/partnerkit" --version
  ;;
cmake)
  for each in database memory; do
    "$CMAKE" -S "$here/$each" -B "$work/cmake/$each" -G Ninja -DCMAKE_CXX_COMPILER="$CXX" -DCMAKE_PREFIX_PATH="$prefix"
    "$CMAKE" --build "$work/cmake/$each"
  done
  database "$work/cmake/database/import_orders"
  memory "$work/cmake/memory/list_orders"
  ;;
pkg-config)
  pc=$(find "$prefix" -name partnerkit.pc)
  export PKG_CONFIG_PATH="${pc%/*}"
  LD_LIBRARY_PATH=$(pkg-config --variable=libdir partnerkit)
  export LD_LIBRARY_PATH
  # Unquoted: several flags.
  "$CXX" -std=c++20 "$here/database/main.cpp" -o "$work/import_orders" $(pkg-config --cflags --libs partnerkit-host)
  "$CXX" -std=c++20 "$here/memory/main.cpp" -o "$work/list_orders" $(pkg-config --cflags --libs partnerkit)
  database "$work/import_orders"
  memory "$work/list_orders"
  ;;
readme)
  check "the README's program" "$(cat "$here/database/main.cpp")" "$(block '```cpp')"
  check "the README's CMakeLists.txt" "$(cat "$here/database/CMakeLists.txt")" "$(block '```cmake')"
  check "the README's output" "$first_run" "$(block '$ build/import_orders')"
  ;;
*)
  echo "usage: run.sh prefix|cmake|pkg-config|readme BUILD" >&2
  exit 2
  ;;
esac
