#!/usr/bin/env bash
# scripts/fuzz.sh SECONDS [TARGET...]: fuzzes every entry, or those named, for so long each, under address and
# undefined-behaviour sanitizers.
. "$(dirname "${BASH_SOURCE[0]}")/setup.sh"
seconds=${1:?seconds for each target}
shift
configure fuzz
build fuzz
bin=build/fuzz/bin
"$bin/fuzz_make_seeds" build/fuzz/seeds resources/recordings/*.jsonl
mkdir -p build/fuzz/seeds/Scenario && cp resources/scenarios/*.scenario build/fuzz/seeds/Scenario
if [ $# -eq 0 ]; then
  set -- fuzz/*Fuzz.cpp
  set -- "${@#fuzz/}"
  set -- "${@%Fuzz.cpp}"
fi
for target in "$@"; do
  mkdir -p "build/fuzz/found/$target" "fuzz/corpus/$target"
  echo "$target:"
  "$bin/fuzz_$target" -max_total_time="$seconds" -max_len=65536 -print_final_stats=1 \
    -artifact_prefix="build/fuzz/$target-" "build/fuzz/found/$target" "build/fuzz/seeds/$target" "fuzz/corpus/$target" \
    >"build/fuzz/$target.log" 2>&1 || { tail -40 "build/fuzz/$target.log"; exit 1; }
  grep -E 'stat::(number_of_executed_units|average_exec_per_sec|peak_rss_mb)|DONE' "build/fuzz/$target.log"
done
