#!/usr/bin/env bash
# Builds the fuzz preset (clang, libFuzzer, AddressSanitizer + UndefinedBehaviorSanitizer) and runs
# every fuzzer for a bounded time (FUZZ_SECONDS, default 30) from its seed corpus.
#
# Conventions: a fuzz target is an executable named *_fuzzer built from fuzz/<area>/; its seeds are
# fuzz/<area>/corpus/ (plus the shared corpus files fuzz/<area>/seeds-from-shared names) and its
# dictionary fuzz/<area>/fuzz.dict, when present. The seeds are copied
# to a scratch corpus, so new inputs never land in the repository. A crash leaves its input in
# build/fuzz/artifacts/ and fails the script.
#
# Environment: FUZZ_SECONDS (per fuzzer), FUZZ_RUNS (optional: also stop a fuzzer after this many
# executions), FUZZ_TARGETS (space-separated target names; default all),
# VORLAN_BUILD_LOCK (a lock file to hold while building, for machines where builds must not overlap).
set -euo pipefail
cd "$(dirname "$0")/.."

seconds="${FUZZ_SECONDS:-30}"
build=build/fuzz

locked() {
  if [ -n "${VORLAN_BUILD_LOCK:-}" ]; then flock "$VORLAN_BUILD_LOCK" "$@"; else "$@"; fi
}

locked cmake --preset fuzz >/dev/null
# Every target declared with vorlan_fuzzer() under fuzz/: each must be known to the build, so a
# target that the configuration lost fails the run instead of being skipped.
declared=$(sed -nE 's/^[[:space:]]*vorlan_fuzzer\(([A-Za-z0-9_]+).*/\1/p' fuzz/*/CMakeLists.txt | sort -u)
known=$(cmake --build "$build" --target help 2>/dev/null | grep -oE '[A-Za-z0-9_]+_fuzzer$' | sort -u || true)
missing=$(comm -23 <(echo "$declared") <(echo "$known"))
if [ -n "$missing" ]; then
  echo "fuzz-short: declared but unknown to the build: $missing" >&2
  exit 1
fi
targets="${FUZZ_TARGETS:-$declared}"
if [ -z "$targets" ]; then
  echo "fuzz-short: no fuzz targets" >&2
  exit 1
fi
# shellcheck disable=SC2086
locked cmake --build "$build" -j2 --target $targets

mkdir -p "$build/artifacts"
status=0
for target in $targets; do
  binary=$(find "$build/fuzz" -type f -name "$target" -perm -u+x | head -n 1)
  if [ -z "$binary" ]; then
    echo "fuzz-short: $target was not built" >&2
    status=1
    continue
  fi
  area=$(basename "$(dirname "$binary")")
  scratch=$(mktemp -d)
  if [ -d "fuzz/$area/corpus" ]; then cp -r "fuzz/$area/corpus/." "$scratch/"; fi
  # Seeds from the third-party corpus (never committed): fuzz/<area>/seeds-from-shared lists globs
  # under ../shared/corpus (or $VORLAN_SHARED_DIR/corpus).
  shared="${VORLAN_SHARED_DIR:-../shared}/corpus"
  if [ -f "fuzz/$area/seeds-from-shared" ] && [ -d "$shared" ]; then
    while read -r pattern; do
      [ -n "$pattern" ] || continue
      # shellcheck disable=SC2086
      cp $shared/$pattern "$scratch/" 2>/dev/null || true
    done <"fuzz/$area/seeds-from-shared"
  fi
  options=(-max_total_time="$seconds" -timeout=10 -rss_limit_mb=2048 -max_len=65536
           -print_final_stats=1 -artifact_prefix="$build/artifacts/$target-")
  if [ -n "${FUZZ_RUNS:-}" ]; then options+=(-runs="$FUZZ_RUNS"); fi
  if [ -f "fuzz/$area/fuzz.dict" ]; then options+=(-dict="fuzz/$area/fuzz.dict"); fi
  echo "fuzz-short: $target for ${seconds}s"
  if ! ASAN_OPTIONS="detect_leaks=1:${ASAN_OPTIONS:-}" "$binary" "${options[@]}" "$scratch" \
      >"$build/artifacts/$target.log" 2>&1; then
    echo "fuzz-short: $target FAILED; log $build/artifacts/$target.log" >&2
    tail -n 40 "$build/artifacts/$target.log" >&2
    status=1
  else
    grep -E 'stat::number_of_executed_units|stat::peak_rss_mb|Done [0-9]+ runs' "$build/artifacts/$target.log" | sed "s/^/  /"
  fi
  rm -rf "$scratch"
done
exit "$status"
