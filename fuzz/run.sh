#!/usr/bin/env bash
# Fuzzes each target for a set time, one after the other, and reports what
# each run did: executions, coverage (edges and features), corpus size and
# findings (crashes, leaks, timeouts, out-of-memory inputs).
#
#   fuzz/run.sh [-t SECONDS] [TARGET...]     (default: 60 s, every target)
#
# Expects the targets built by `cmake --preset fuzz && cmake --build --preset
# fuzz` (`make fuzz` does both). Inputs found are kept in
# build/fuzz/work/corpus/<target> and start the next run; the seed corpora in
# fuzz/corpus/ are read, never written. Findings go to
# build/fuzz/work/findings/<target>/ and make the script fail; once fixed, a
# finding belongs in fuzz/corpus/<target>/ as regress-<what it shows>.
set -euo pipefail

root=$(cd "$(dirname "$0")/.." && pwd)
bin=$root/build/fuzz/bin
work=$root/build/fuzz/work
seconds=${FUZZ_SECONDS:-60}

while getopts "t:" opt; do
  case $opt in
    t) seconds=$OPTARG ;;
    *) echo "usage: $0 [-t SECONDS] [TARGET...]" >&2; exit 2 ;;
  esac
done
shift $((OPTIND - 1))

if [ $# -gt 0 ]; then
  targets=("$@")
else
  # The one list of targets, shared with the build.
  read -r -a targets <<<"$(sed -n 's/^set(CARNET_FUZZ_TARGETS \(.*\))$/\1/p' "$root/fuzz/targets.cmake")"
fi

# The last value of a field in libFuzzer's status lines ("cov: 123").
field() { grep -aoE "$1: [0-9]+" "$2" | tail -n 1 | awk '{print $2}'; }

printf '%-10s %8s %12s %9s %7s %7s %7s %9s\n' target seconds executions exec/s edges feats corpus findings
failed=0
for t in "${targets[@]}"; do
  if [ ! -x "$bin/fuzz_$t" ]; then
    echo "$t: $bin/fuzz_$t is not built" >&2
    exit 2
  fi
  mkdir -p "$work/corpus/$t" "$work/findings/$t"
  # Findings of earlier runs stay where they are, but only this run's count.
  stamp=$work/findings/$t/.started
  touch "$stamp"
  log=$work/$t.log
  status=0
  started=$(date +%s)
  # The scratch folder of the run, in memory when the machine has it; a run
  # that stops on a finding cannot remove it itself.
  scratch=$( [ -d /dev/shm ] && echo /dev/shm || echo "${TMPDIR:-/tmp}")/carnet-fuzz-run-$$
  (cd "$work/findings/$t" && CARNET_FUZZ_SCRATCH=$scratch "$bin/fuzz_$t" -max_total_time="$seconds" \
      -print_final_stats=1 -artifact_prefix="$work/findings/$t/" "$work/corpus/$t" "$root/fuzz/corpus/$t") \
      >"$log" 2>&1 || status=$?
  rm -rf "$scratch"
  runs=$(grep -aoE 'stat::number_of_executed_units: [0-9]+' "$log" | awk '{print $2}' || true)
  secs=$(( $(date +%s) - started ))
  found=$(find "$work/findings/$t" -maxdepth 1 -type f -newer "$stamp" \
    \( -name 'crash-*' -o -name 'leak-*' -o -name 'timeout-*' -o -name 'oom-*' \) | wc -l)
  rate=0
  [ -n "$runs" ] && [ "$secs" -gt 0 ] && rate=$((runs / secs))
  printf '%-10s %8s %12s %9s %7s %7s %7s %9s\n' "$t" "$secs" "${runs:-?}" "$rate" \
    "$(field cov "$log")" "$(field ft "$log")" "$(ls "$work/corpus/$t" | wc -l)" "$found"
  if [ "$status" -ne 0 ] || [ "$found" -ne 0 ]; then
    failed=1
    grep -aE 'property broken|ERROR: |SUMMARY: ' "$log" | head -n 5 | sed "s/^/  $t: /" >&2
  fi
done
[ "$failed" -eq 0 ] || { echo "findings: see $work/findings/ and the logs in $work/" >&2; exit 1; }
