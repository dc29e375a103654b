#!/usr/bin/env bash
# Sends every file of the third-party corpus through every entry point of the host, built with
# the sanitizers (asan preset: AddressSanitizer, UndefinedBehaviorSanitizer, LeakSanitizer), and
# fails on any sanitizer report or crash. Result codes are not judged: refusing a file is fine.
#
# Tickets: inspect, valid, consume (as the ticket of a job folder) and autoimpose (on a copy, with
# the settings of fuzz/autoimpose/corpus). PDFs: valid, consume (as a bare PDF), scan-xmp in both
# modes (with the die library of fuzz/versions/corpus), convert-pdf and rewrite-seps --keep and
# --drop with the PDF's spot colorants from the corpus manifest.
#
# Environment: VORLAN_SHARED_DIR (default ../shared), VORLAN_BUILD_LOCK (held while building).
set -euo pipefail
cd "$(dirname "$0")/.."

corpus="${VORLAN_SHARED_DIR:-../shared}/corpus"
if [ ! -d "$corpus" ]; then
  echo "corpus-sweep: no corpus at $corpus; nothing to do"
  exit 0
fi
locked() {
  if [ -n "${VORLAN_BUILD_LOCK:-}" ]; then flock "$VORLAN_BUILD_LOCK" "$@"; else "$@"; fi
}
locked cmake --preset asan >/dev/null
locked cmake --build --preset asan --target vorlan_cli
cli=$(realpath build/asan/tools/vorlan/vorlan)

work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export VORLAN_JOB_STORE="$work/store" VORLAN_HOME="$work/home"
export ASAN_OPTIONS="detect_leaks=1:exitcode=99" UBSAN_OPTIONS="print_stacktrace=1:exitcode=99"
mkdir -p "$VORLAN_HOME/DieLib"
cp fuzz/versions/corpus/die_library.xml "$VORLAN_HOME/DieLib/AutoDieLib.xml"
settings=$(realpath fuzz/autoimpose/corpus/full.xml)

runs=0
findings=0
declare -A statuses  # how many runs ended with each exit status
# Runs one command in a fresh scratch folder; a sanitizer report or a crash counts as a finding.
check() {
  local label="$1"
  shift
  runs=$((runs + 1))
  local status=0
  (cd "$work/run" && "$@") >"$work/out" 2>"$work/err" || status=$?
  statuses[$status]=$((${statuses[$status]:-0} + 1))
  if [ "$status" -ge 99 ] || grep -qE 'ERROR: (Address|Leak)Sanitizer|runtime error:|SUMMARY: UndefinedBehaviorSanitizer' "$work/err"; then
    findings=$((findings + 1))
    echo "corpus-sweep: FINDING in $label (exit $status)" >&2
    grep -E -A30 'ERROR: |runtime error:' "$work/err" | head -n 40 >&2 || tail -n 20 "$work/err" >&2
  fi
}
fresh() {
  rm -rf "$work/run"
  mkdir -p "$work/run/out"
}

shopt -s nullglob nocaseglob
for ticket in "$corpus"/jdf/*.jdf; do
  name=$(basename "$ticket")
  fresh
  check "inspect $name" "$cli" inspect "$ticket"
  check "valid $name" "$cli" valid "$ticket"
  mkdir -p "$work/run/job1D0001"
  cp "$ticket" "$work/run/job1D0001/ticket.jdf"
  echo "data file" >"$work/run/job1.0001"
  check "consume $name" "$cli" consume --out-dir out job1.0001 out.jdf
  cp "$ticket" "$work/run/autoimpose.jdf"
  check "autoimpose $name" "$cli" autoimpose "$settings" autoimpose.jdf
done

for pdf in "$corpus"/pdf/*.pdf; do
  name=$(basename "$pdf")
  spots=$(awk -F'\t' -v f="$name" '$1 == f { gsub(/\|/, ",", $10); print $10 }' "$corpus/pdf/MANIFEST.tsv")
  [ -n "$spots" ] || spots="Spot"
  fresh
  cp "$pdf" "$work/run/job1.pdf"
  check "valid $name" "$cli" valid job1.pdf
  check "consume $name" "$cli" consume --out-dir out job1.pdf out.jdf
  check "scan-xmp $name" "$cli" scan-xmp job1.pdf esko.impinfo
  check "scan-xmp --die-library $name" "$cli" scan-xmp --die-library job1.pdf die.impinfo
  check "convert-pdf $name" "$cli" convert-pdf --seps "$spots" --layers "Layer" job1.pdf converted.pdf
  check "rewrite-seps --keep $name" "$cli" rewrite-seps --keep "$spots" job1.pdf kept.pdf
  check "rewrite-seps --drop $name" "$cli" rewrite-seps --drop "$spots" job1.pdf dropped.pdf
done

summary=""
for status in $(printf '%s\n' "${!statuses[@]}" | sort -n); do summary+=" $status:${statuses[$status]}"; done
echo "corpus-sweep: $runs runs (exit status:count$summary), $findings with sanitizer findings"
[ "$findings" -eq 0 ]
