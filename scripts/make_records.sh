#!/usr/bin/env bash
# Writes fixed-length EBCDIC records to standard output: the lines of
# examples/records.txt (UTF-8, 80 characters each) in code page 037 without
# newlines, 80 bytes a record, repeated until SIZE bytes (default: one pass).
#   scripts/make_records.sh            # 8 records, 640 bytes
#   scripts/make_records.sh 1G > /tmp/records.ebc
set -euo pipefail
here="$(cd "$(dirname "$0")/.." && pwd)"
one_pass() { iconv -f UTF-8 -t IBM037 "$here/examples/records.txt" | tr -d '\045'; }
if (($# == 0)); then
  one_pass
  exit 0
fi
block=$(mktemp)
trap 'rm -f "$block"' EXIT
one_pass >"$block"
# Double the block to 640 KiB (1024 passes), then repeat it.
for _ in $(seq 10); do cat "$block" "$block" >"$block.2" && mv "$block.2" "$block"; done
while :; do cat "$block"; done 2>/dev/null | head -c "$1"
