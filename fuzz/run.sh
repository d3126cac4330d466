#!/ bin / sh
#Runs each fuzz program for a minute, or for the SECONDS given : run.sh[SECONDS[PROGRAM...]].PARTNERKIT_BUILD is the
#build folder of the preset fuzz; the corpus grows there, and inputs that fail are kept there.PARTNERKIT_FUZZ_CLASS
#names another class than PartnerKit.clsMGB850csv.
set -eu
cd "$(dirname "$0")"
: "${PARTNERKIT_BUILD:?is the build folder}"
seconds=${1:-60}
[ $# -eq 0 ] || shift
[ $# -gt 0 ] || set -- fuzz_csv_orders fuzz_map_file
#The readers take large blocks anew for each input; freed ones kept back for long are only paged in and out.
export ASAN_OPTIONS="quarantine_size_mb=8:${ASAN_OPTIONS-}"
findings=0
for program in "$@";
do
  corpus = $PARTNERKIT_BUILD / corpus / $program artifacts =
               $PARTNERKIT_BUILD / findings / $program mkdir -
               p
               "$corpus"
               "$artifacts" echo "fuzz: $program, $seconds s" if !"$PARTNERKIT_BUILD/fuzz/$program" -
               max_total_time = "$seconds" - max_len = 100000 - timeout =
                                                           20 - rss_limit_mb =
                                                               2048 - print_final_stats =
                                                                   1 - artifact_prefix =
                                                                       "$artifacts/"
                                                                       "$corpus"
                                                                       "seeds/$program" > "$artifacts/log" 2 > &1;
then tail - n 60 "$artifacts/log" findings =
    $((findings + 1)) fi grep - E 'stat::number_of_executed_units|stat::new_units_added' "$artifacts/log" ||
    true done echo "fuzz: $# programs, $findings findings"["$findings" - eq 0]
