#!/bin/sh
# Runs each fuzz program over each class for a minute, or for the SECONDS given: run.sh [SECONDS [PROGRAM...]].
# PARTNERKIT_BUILD is the build folder of the preset fuzz; the corpus grows there, and inputs that fail are kept there.
# PARTNERKIT_FUZZ_CLASS names one class, as PartnerKit.clsMGB850csv, instead of all.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_BUILD:?is the build folder}"
seconds=${1:-60}
[ $# -eq 0 ] || shift
[ $# -gt 0 ] || set -- fuzz_csv_orders fuzz_map_file
export PYTHONDONTWRITEBYTECODE=1 PYTHONPATH=../tools
all='from order_samples import order_classes; print(*(each.prog_id for each in order_classes()))'
classes=${PARTNERKIT_FUZZ_CLASS:-$(python3 -c "$all")}
# The readers take large blocks anew for each input; freed ones kept back for long are only paged in and out.
export ASAN_OPTIONS="quarantine_size_mb=8:${ASAN_OPTIONS-}"
runs=0
findings=0
for class in $classes; do
  export PARTNERKIT_FUZZ_CLASS="$class"
  seeds=$PARTNERKIT_BUILD/seeds/$class
  python3 seeds.py "$class" "$seeds"
  for program in "$@"; do
    corpus=$PARTNERKIT_BUILD/corpus/$class/$program
    artifacts=$PARTNERKIT_BUILD/findings/$class/$program
    mkdir -p "$corpus" "$artifacts"
    echo "fuzz: $program, $class, $seconds s"
    if ! "$PARTNERKIT_BUILD/fuzz/$program" -max_total_time="$seconds" -max_len=100000 -timeout=20 -rss_limit_mb=2048 \
        -print_final_stats=1 -artifact_prefix="$artifacts/" "$corpus" "$seeds/$program" >"$artifacts/log" 2>&1; then
      tail -n 60 "$artifacts/log"
      findings=$((findings + 1))
    fi
    runs=$((runs + 1))
    grep -E 'stat::number_of_executed_units|stat::new_units_added' "$artifacts/log" || true
  done
done
echo "fuzz: $runs runs, $findings findings"
[ "$findings" -eq 0 ]
