#!/usr/bin/env bash
# Sets up, builds and runs every test: the development build, then the sanitizer build
# (AddressSanitizer + UndefinedBehaviorSanitizer), then the concurrency test under ThreadSanitizer
# (its preset builds that test alone), then a short bounded fuzz run.
# Fails when any step or test fails.
set -euo pipefail
cd "$(dirname "$0")/.."

scripts/setup.sh

cmake --preset dev
cmake --build --preset dev
ctest --preset dev

cmake --preset asan
cmake --build --preset asan
ctest --preset asan

cmake --preset tsan
cmake --build --preset tsan
ctest --preset tsan

if [ -x scripts/fuzz-short.sh ]; then
  scripts/fuzz-short.sh
fi
echo "test: all passed"
