#!/usr/bin/env bash
# The main job: build the module, its reference host and the nlsstr tool,
# then let nlsstr work on a small data set of fixed-length EBCDIC records
# (code page 037, 80 bytes a record, made from examples/records.txt):
# shown as bytes and UTF-8, upper-cased, searched, compared and counted.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
cmake --preset default >/dev/null
cmake --build --preset default --target nlsstr nlssm_version
build/default/examples/nlssm_version
nlsstr=build/default/tools/nlsstr/nlsstr
data=build/default/customers.ebc
scripts/make_records.sh >"$data"
# Columns: the first bytes of each record in hex, then the record in UTF-8.
side_by_side() {
  paste -d ' ' <("$nlsstr" substr 78 --records 80 --count 12 --room 12 --out hex --file "$1" 2>/dev/null) \
    <("$nlsstr" substr 78 --records 80 --out utf8 --file "$1" 2>/dev/null)
}

echo
echo "== $data: $(wc -c <"$data") bytes of code page 037, 80-byte records"
side_by_side "$data"

echo
echo "== upper-cased record by record (nlsstr upper 78 --records 80)"
"$nlsstr" upper 78 --records 80 --out raw --file "$data" >"$data.upper"
side_by_side "$data.upper"

echo
echo "== searched: where \"straße\" and \"Köln\" start, record by record (in characters)"
"$nlsstr" index 78 'straße' --records 80 --file "$data" | paste - <("$nlsstr" index 78 'Köln' --records 80 --file "$data") | cat -n
echo "-- records that end in a euro amount of four digits or more (like '%EUR%_.___,__%')"
"$nlsstr" like 78 '%EUR%_.___,__%' --records 80 --file "$data" | cat -n || true

echo
echo "== compared in code page 037"
"$nlsstr" compare 78 'Müller' 'MÜLLER'
"$nlsstr" compare 78 'Müller' 'MÜLLER' --options 4
"$nlsstr" equals 78 'Ødegård' 'ØDEGÅRD'

echo
echo "== counted"
"$nlsstr" count 78 --records 80 --file "$data" | head -3
"$nlsstr" count 78 --file "$data"
"$nlsstr" substr 78 --records 80 --out raw --file "$data" 2>/dev/null |
  "$nlsstr" count 78 --records 80 | tail -1
echo "-- the same names in UTF-8, UTF-16 and EBCDIC double-byte (930)"
for encoding in 20 25 ibm-930; do
  printf '%-8s ' "$encoding"
  "$nlsstr" count "$encoding" --text 'Müller, 東京 🙂' | paste -s -d ' '
done
