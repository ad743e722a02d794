#!/usr/bin/env bash
# Configures, builds and runs the whole test suite (optimised build).
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --workflow --preset default
