#!/usr/bin/env bash
# The main job: build the module, its reference host and the nlsstr tool,
# then run nlsstr on an example text in a few encodings.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --preset default >/dev/null
cmake --build --preset default --target nlsstr nlssm_version
build/default/examples/nlssm_version
nlsstr=build/default/tools/nlsstr/nlsstr
text='Grüße aus Köln — 東京'
echo
echo "== the text \"$text\" in four encodings"
for encoding in 20 24 134 205; do
  echo "-- encoding $encoding"
  "$nlsstr" info "$encoding" | head -4
  "$nlsstr" count "$encoding" --text "$text"
done
echo "-- EBCDIC code page 037 (78)"
"$nlsstr" count 78 --text "Grüße aus Köln"
"$nlsstr" upper 78 --text "Grüße aus Köln"
