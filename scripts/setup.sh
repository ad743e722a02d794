#!/usr/bin/env bash
# Installs the Debian packages the project builds with, when they are missing.
set -euo pipefail

packages=(g++ cmake ninja-build pkg-config libicu-dev icu-devtools libgtest-dev libgmock-dev
          libbenchmark-dev clang libclang-rt-dev binutils doxygen unicode-data)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if ((${#missing[@]})); then
  echo "installing: ${missing[*]}"
  sudo_cmd=()
  [ "$(id -u)" -eq 0 ] || sudo_cmd=(sudo)
  export DEBIAN_FRONTEND=noninteractive
  "${sudo_cmd[@]}" apt-get update -qq
  "${sudo_cmd[@]}" apt-get install -y -qq --no-install-recommends "${missing[@]}"
fi
