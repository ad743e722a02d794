#!/usr/bin/env bash
# The main job: build the module and run it on an example.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --preset default >/dev/null
cmake --build --preset default
build/default/examples/nlssm_version
