#!/usr/bin/env bash
# Builds the release preset and runs every benchmark. Each prints our figure beside its anchor's
# (qpdf for PDFs, plain pugixml for the JDF layer, the parse for the ticket reader, the smaller
# job for growth) with its goal and whether it holds; a summary of the goals comes last.
#
# Environment: BENCH_ONLY (space-separated benchmark names; default all),
# VORLAN_BUILD_LOCK (a lock file to hold while building).
# Exit status: 0 when every goal holds, 1 otherwise.
set -uo pipefail
cd "$(dirname "$0")/.."

locked() {
  if [ -n "${VORLAN_BUILD_LOCK:-}" ]; then flock "$VORLAN_BUILD_LOCK" "$@"; else "$@"; fi
}
locked cmake --preset release >/dev/null || exit 1
locked cmake --build --preset release || exit 1

bin=build/release/bench
# name | program and arguments | what it holds us to
benchmarks=(
  "layermode|$bin/layermode/layermode_bench --sizes 1000,10000|layer mode, both run-list shapes: 10x the job in <= 10.5x the time; peak memory <= 4x the output ticket"
  "reader|$bin/jdf/reader_bench|ticket reader: <= 2.5x the JDF layer's parse (fresh process); 10x the ticket in <= 10.5x the time"
  "jdflayer|$bin/jdflayer/jdflayer_bench|JDF layer parse + write: <= 1.3x the time and <= 1.5x the memory of pugixml"
  "pdfconvert|$bin/pdfconvert/pdfconvert_bench|conversion and separation rewriting against qpdf --linearize --recompress-flate"
  "threads|$bin/concurrency/thread_bench|jobs side by side: 2 threads >= 1.8x the throughput of one on a mixed batch (needs both cores free)"
  "pdfink|$bin/pdf/pdf_ink_bench|page-ink scan: <= 1.5x the time of qpdf --check"
  "description|$bin/versions/description_bench|version descriptions: throughput and peak memory (for information)"
  "autodescription|$bin/versions/auto_description_bench|automatic description: cost per surface stays flat (for information)"
)

summary=()
status=0
for entry in "${benchmarks[@]}"; do
  IFS='|' read -r name command goal <<<"$entry"
  if [ -n "${BENCH_ONLY:-}" ] && [[ " $BENCH_ONLY " != *" $name "* ]]; then continue; fi
  echo
  echo "=== $name: $goal"
  # shellcheck disable=SC2086
  if $command; then
    summary+=("held      $name")
  else
    summary+=("NOT held  $name")
    status=1
  fi
done

echo
echo "=== summary"
printf '%s\n' "${summary[@]}"
exit $status
