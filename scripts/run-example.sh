#!/usr/bin/env bash
# Sets up, builds the host and runs the bundled example job (examples/generate_example.py).
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh
cmake --preset dev
cmake --build --preset dev --target vorlan_cli

example=build/example
rm -rf "$example"
python3 examples/generate_example.py "$example"
export VORLAN_JOB_STORE="$PWD/$example/jobstore"

vorlan=build/dev/tools/vorlan/vorlan
# Job 1 prints its die line: the job attribute the print server would set.
"$vorlan" job-attr 1 KVPrintDieLine True

status=0
echo "== job 1: a ticket with two sheets, an English and a German version, a die cut"
"$vorlan" consume \
  --impinfo "$example/job1.impinfo" --job-folder "$example" --out-dir "$example/out" \
  "$example/job1.0001" "$example/versioned.jdf" || status=$?
echo "== job 2: a bare PDF with the same two versions"
"$vorlan" consume \
  --impinfo "$example/job2.impinfo" --job-folder "$example" --out-dir "$example/out" \
  "$example/job2.pdf" "$example/bare.jdf" || status=$?

echo "== proofs: one PDF per version of each ticket"
"$vorlan" proof "$example/versioned.jdf" "$example/proofs" || status=$?
"$vorlan" proof "$example/bare.jdf" "$example/proofs-bare" || status=$?

if [ -f "$example/versioned.jdf" ]; then
  echo "---- $example/versioned.jdf (README: 'The example jobs and what their tickets say')"
  cat "$example/versioned.jdf"
fi
exit $status
