#!/bin/sh
# check_x12_files.sh PROGRAM: every X12 file in samples/ must be whole, and so must what PROGRAM writes when it processes
# them, each in a workspace of its own. Each of them has to be acknowledged.
set -eu
cd "$(dirname "$0")/.."
program=$1

fail() {
  echo "check_x12_files: $*" >&2
  exit 1
}

folder=$(mktemp -d)
trap 'rm -rf "$folder"' EXIT
count=0
for orders in samples/*/orders.x12; do
  name=$(basename "$(dirname "$orders")")
  workspace=$folder/$name
  "$program" new "$workspace" >/dev/null
  "$program" --workspace "$workspace" data load "samples/$name/records.json" >/dev/null
  document=$(sed -n 's/.*"EDIDocId": \([0-9]*\).*/\1/p' "samples/$name/records.json")
  cp "$orders" "$workspace/inbox/"
  status=0
  "$program" --workspace "$workspace" process "$document" "$workspace/inbox/orders.x12" >"$folder/told" || status=$?
  # 1: some of the orders have a fault, and tell of it.
  [ $status -le 1 ] && grep -q ' posted' "$folder/told" || fail "$name: $(cat "$folder/told")"
  set -- "$workspace"/outbox/*
  [ -e "$1" ] || fail "$name: nothing was written"
  tools/check_x12.pl "$orders" "$@" >"$folder/told" || fail "$(cat "$folder/told")"
  count=$((count + 1 + $#))
done
echo "X12: $count files are whole"
