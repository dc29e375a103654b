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

status=0
build/dev/tools/vorlan/vorlan consume \
  --impinfo "$example/job1.impinfo" --job-folder "$example" --out-dir "$example/out" \
  "$example/job1.0001" "$example/versioned.jdf" || status=$?

if [ -f "$example/versioned.jdf" ]; then
  echo "---- $example/versioned.jdf"
  cat "$example/versioned.jdf"
fi
exit $status
