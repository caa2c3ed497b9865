#!/usr/bin/env bash
# bench_smoke.sh FOLDER: runs each bench of a folder for a moment. It must start, run every case once and end well; no
# figure is judged.
set -euo pipefail
bin=$1
scratch=$(mktemp -d)
trap 'rm -rf "$scratch"' EXIT
export QUORL_BENCH_DIR=$scratch QUORL_BENCH_ROWS=2000 QUORL_BENCH_SECONDS=1 QUORL_BENCH_STEPS=300
for bench in "$bin"/bench_*; do
  [ -x "$bench" ] || continue
  if ! "$bench" --benchmark_min_time=0.001 >"$scratch/output" 2>&1; then
    cat "$scratch/output" >&2
    echo "$(basename "$bench") failed" >&2
    exit 1
  fi
  echo "bench smoke: $(basename "$bench") runs"
done
