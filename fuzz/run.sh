#!/bin/sh
# Runs each fuzz program over each class that it reads for a minute, or for the SECONDS given:
# run.sh [SECONDS [PROGRAM...]].
# PARTNERKIT_BUILD is the build folder of the preset fuzz; the corpus grows there, and inputs that fail are kept there.
# PARTNERKIT_FUZZ_CLASS names one class, as PartnerKit.clsMGB850csv, instead of all.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_BUILD:?is the build folder}"
seconds=${1:-60}
[ $# -eq 0 ] || shift
[ $# -gt 0 ] || set -- fuzz_segments fuzz_bar_pattern fuzz_label_packets fuzz_csv_orders fuzz_map_file fuzz_x12_orders
export PYTHONDONTWRITEBYTECODE=1 PYTHONPATH=../tools
all='from order_samples import order_classes; from x12_samples import x12_classes
print(*(each.prog_id for each in order_classes() + x12_classes()))'
classes=${PARTNERKIT_FUZZ_CLASS:-$(python3 -c "$all")}
# The readers take large blocks anew for each input; freed ones kept back for long are only paged in and out.
export ASAN_OPTIONS="quarantine_size_mb=8:${ASAN_OPTIONS-}"
runs=0
findings=0

# fuzz PROGRAM PLACE: PLACE is the class, or what stands for it where none is read.
fuzz() {
  corpus=$PARTNERKIT_BUILD/corpus/$2/$1
  artifacts=$PARTNERKIT_BUILD/findings/$2/$1
  mkdir -p "$corpus" "$artifacts"
  echo "fuzz: $1, $2, $seconds s"
  if ! "$PARTNERKIT_BUILD/fuzz/$1" -max_total_time="$seconds" -max_len=100000 -timeout=20 -rss_limit_mb=2048 \
      -print_final_stats=1 -artifact_prefix="$artifacts/" "$corpus" "$PARTNERKIT_BUILD/seeds/$2/$1" \
      >"$artifacts/log" 2>&1; then
    tail -n 60 "$artifacts/log"
    findings=$((findings + 1))
  fi
  runs=$((runs + 1))
  grep -E 'stat::number_of_executed_units|stat::new_units_added' "$artifacts/log" || true
}

for program in "$@"; do
  case $program in
  fuzz_segments) place=segments ;;
  fuzz_bar_pattern) place=barcodes ;;
  fuzz_label_packets) place=labels ;;
  *) continue ;;
  esac
  python3 seeds.py "$PARTNERKIT_BUILD/seeds/$place"
  fuzz "$program" "$place"
done
for class in $classes; do
  export PARTNERKIT_FUZZ_CLASS="$class"
  python3 seeds.py "$PARTNERKIT_BUILD/seeds/$class" "$class"
  for program in "$@"; do
    # Only the programs that have seeds for the class can read it.
    [ ! -d "$PARTNERKIT_BUILD/seeds/$class/$program" ] || fuzz "$program" "$class"
  done
done
echo "fuzz: $runs runs, $findings findings"
[ "$findings" -eq 0 ]
