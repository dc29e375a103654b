#!/usr/bin/env bash
# Installs the Debian packages vorlan builds and tests with, when they are missing.
# Idempotent and non-interactive; uses sudo when not run as root.
set -euo pipefail

packages=(
  # build
  cmake g++ make pkg-config libexpat1-dev libminizip-dev zlib1g-dev libqpdf-dev libpugixml-dev
  libgtest-dev libgmock-dev libbenchmark-dev
  # verification tools used by the tests and the example
  qpdf ghostscript poppler-utils libxml2-utils python3
  # fuzzing (libFuzzer comes with clang)
  clang libclang-rt-14-dev
)

missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done

if [ ${#missing[@]} -eq 0 ]; then
  echo "setup: all packages present"
  exit 0
fi

echo "setup: installing ${missing[*]}"
sudo_cmd=()
[ "$(id -u)" -eq 0 ] || sudo_cmd=(sudo)
export DEBIAN_FRONTEND=noninteractive
"${sudo_cmd[@]}" apt-get update -q
"${sudo_cmd[@]}" apt-get install -y -q --no-install-recommends "${missing[@]}"
