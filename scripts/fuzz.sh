#!/usr/bin/env bash
# Builds the fuzz preset (clang-16, libFuzzer, ASan + UBSan) and fuzzes the remote entry
# for a while, on a copy of the seed corpus fuzz/corpus so that the repository is left as
# it is. Exits non-zero when the fuzzer stops on a finding (a sanitizer report, a broken
# promise of the target, a call slower than 10 s); the input is kept in
# build/fuzz/run/artifacts/.
#
#   bash scripts/fuzz.sh [SECONDS [WORKERS]]   # default 120 s, one worker
#   bash scripts/fuzz.sh --new-corpus [SECONDS] # refill fuzz/corpus: fuzz from nothing for
#                                               # SECONDS (default 300), then keep one input
#                                               # per method (see below)
#
# One input again, with the call it makes printed:
#   CORVANE_FUZZ_TRACE=1 build/fuzz/fuzz/corvane_remote_fuzz build/fuzz/run/artifacts/crash-...
set -euo pipefail
cd "$(dirname "$0")/.."

fuzzer=build/fuzz/fuzz/corvane_remote_fuzz
run=build/fuzz/run
# Calls are cheap; one slower than this is a finding. LeakSanitizer runs at exit.
common=(-timeout=10 -rss_limit_mb=2048 -print_final_stats=1)

cmake --preset fuzz
cmake --build --preset fuzz

if [ "${1:-}" = "--new-corpus" ]; then
  seconds=${2:-300}
  rm -rf "$run" && mkdir -p "$run/found" "$run/artifacts"
  # Findings are skipped here: the corpus is what the target reaches, not what breaks it.
  "$fuzzer" "${common[@]}" -fork=1 -ignore_crashes=1 -ignore_timeouts=1 -ignore_ooms=1 \
    -max_total_time="$seconds" -artifact_prefix="$run/artifacts/" "$run/found" > "$run/fuzz.log" 2>&1 || true
  # A set that covers every edge reached still holds thousands of inputs (each box filter
  # member is a function of its own), so the seeds are one input per method: the largest
  # under 1 KiB of that set. The fuzzer finds the rest again in seconds.
  mkdir -p "$run/merged"
  "$fuzzer" "${common[@]}" -use_counters=0 -set_cover_merge=1 "$run/merged" "$run/found" > "$run/merge.log" 2>&1
  declare -A seed seed_size
  for f in "$run"/merged/*; do
    size=$(stat -c %s "$f")
    method=$(CORVANE_FUZZ_TRACE=1 "$fuzzer" -runs=1 "$f" 2>&1 | grep -m1 '^method ' | cut -d' ' -f2 || true)
    if [ -n "$method" ] && [ "$size" -le 1024 ] && [ "$size" -gt "${seed_size[$method]:-0}" ]; then
      seed[$method]=$f
      seed_size[$method]=$size
    fi
  done
  rm -rf fuzz/corpus && mkdir -p fuzz/corpus
  cp "${seed[@]}" fuzz/corpus/
  echo "fuzz/corpus: $(ls fuzz/corpus | wc -l) inputs, $(cat fuzz/corpus/* | wc -c) bytes"
  exit 0
fi

seconds=${1:-120}
workers=${2:-1}
rm -rf "$run" && mkdir -p "$run/corpus" "$run/artifacts"
if [ -d fuzz/corpus ]; then cp fuzz/corpus/* "$run/corpus/"; fi  # the seed corpus, when there is one
options=("${common[@]}" -max_total_time="$seconds" -artifact_prefix="$run/artifacts/")
if [ "$workers" -gt 1 ]; then options+=(-fork="$workers"); fi

status=0
"$fuzzer" "${options[@]}" "$run/corpus" > "$run/fuzz.log" 2>&1 || status=$?
if [ "$status" -ne 0 ]; then
  # The report: from the first sanitizer or libFuzzer error line on.
  grep -n -m1 -E '^==[0-9]+==ERROR|runtime error|^(input|output) .*(written|refused)|ERROR: libFuzzer' "$run/fuzz.log" |
    cut -d: -f1 | { read -r line && tail -n +"$line" "$run/fuzz.log" | head -60; } || tail -60 "$run/fuzz.log"
  echo "fuzz: finding after $(grep -o -E '^#[0-9]+' "$run/fuzz.log" | tail -1 | tr -d '#') executions;" \
    "inputs in $run/artifacts/: $(ls "$run/artifacts" | tr '\n' ' ')"
  exit "$status"
fi
executions=$(grep -o -E 'stat::number_of_executed_units: [0-9]+' "$run/fuzz.log" | awk '{print $2}' || true)
if [ -z "$executions" ]; then executions=$(grep -o -E '^#[0-9]+' "$run/fuzz.log" | tail -1 | tr -d '#' || true); fi
echo "fuzz: clean, ${executions:-?} executions in ${seconds} s ($(ls "$run/corpus" | wc -l) corpus inputs)"
