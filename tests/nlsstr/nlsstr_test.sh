#!/usr/bin/env bash
# nlsstr_test.sh NLSSTR: runs the built tool on small inputs.
set -uo pipefail
nlsstr=$1
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
failures=0
fail() { echo "FAIL: $*"; failures=$((failures + 1)); }
# expect CODE COMMAND...: the command exits with CODE.
expect() {
  local code=$1
  shift
  "$@" >"$work/out" 2>"$work/err"
  local got=$?
  ((got == code)) || fail "exit $got, not $code: $* ($(head -c 300 "$work/err"))"
}
# same WHAT EXPECTED ACTUAL
same() { [[ "$2" == "$3" ]] || fail "$1: expected [$2], got [$3]"; }
# The text as raw bytes of an encoding.
bytes() { "$nlsstr" substr "$1" --text "$2" --out raw 2>/dev/null; }
# twice K: standard input repeated 2^K times.
twice() {
  local k
  cat >"$work/twice"
  for ((k = 0; k < $1; ++k)); do cat "$work/twice" "$work/twice" >"$work/twice.2" && mv "$work/twice.2" "$work/twice"; done
  cat "$work/twice"
}

# Help for the tool and for every verb, and exit codes of the command line.
expect 0 "$nlsstr" --help
verbs=$(sed -n '/^Subcommands:/,/^$/p' "$work/out" | awk 'NF && !/Subcommands/ {print $1}')
(($(wc -w <<<"$verbs") >= 20)) || fail "too few verbs listed: $verbs"
for verb in $verbs; do
  expect 0 "$nlsstr" "$verb" --help
  grep -q "^usage: nlsstr $verb" "$work/out" || fail "$verb --help has no usage line"
done
expect 2 "$nlsstr"
expect 2 "$nlsstr" no-such-verb
expect 2 "$nlsstr" count
expect 2 "$nlsstr" count 20 --no-such-option 1
expect 2 "$nlsstr" count no-such-encoding --text a
expect 2 "$nlsstr" count 20 --records 0 --file /dev/null
expect 3 "$nlsstr" count 20 --file "$work/missing"
expect 1 "$nlsstr" count 20 --hex "61 E6 97"
grep -q "NLSSM_E_" "$work/err" || fail "a failing status is not named: $(cat "$work/err")"
expect 1 "$nlsstr" like 20 "a%" --text "ba"
expect 0 "$nlsstr" like 20 "a%" --text "ab"
expect 0 "$nlsstr" encodings

# UTF-8 in records of 5 bytes: no record ends inside a character, every
# record is whole text, and the records put together are the input.
text='aé漢😀bc€dé漢😀😀x'
printf '%s' "$text" >"$work/utf8"
expect 0 "$nlsstr" substr 20 --records 5 --file "$work/utf8" --out raw
cmp -s "$work/out" "$work/utf8" || fail "UTF-8 records do not put back together"
expect 0 "$nlsstr" count 20 --records 5 --file "$work/utf8"
same "UTF-8 records" "record 1: 2 characters, 3 bytes
record 2: 1 characters, 3 bytes
record 3: 2 characters, 5 bytes
record 4: 3 characters, 5 bytes
record 5: 2 characters, 5 bytes
record 6: 1 characters, 4 bytes
record 7: 2 characters, 5 bytes" "$(cat "$work/out")"

# Every other multi-byte form, records of 3 to 7 bytes: each record converts
# whole, and the records put together are the input.
for encoding in 24 25 26 27 134 135 161 205; do
  wide='aé漢😀b𠀋ｶ€z'
  ((encoding == 134 || encoding == 135)) && wide='aｶ漢字b表ｶz' # 表: trail byte 0x5C
  bytes "$encoding" "$wide" >"$work/wide"
  for n in 3 4 5 7; do
    expect 0 "$nlsstr" substr "$encoding" --records "$n" --file "$work/wide" --out utf8
    same "encoding $encoding, records of $n" "$wide" "$(tr -d '\n' <"$work/out")"
    expect 0 "$nlsstr" substr "$encoding" --records "$n" --file "$work/wide" --out raw
    cmp -s "$work/out" "$work/wide" || fail "encoding $encoding: records of $n do not put back together"
  done
done

# Modal EBCDIC (code page 930) in records of 4 and 5 bytes: a record cut
# inside a double-byte run is closed with shift-in and the next opened with
# shift-out, so every record converts whole and they read as the input.
modal='ab漢字cdｶﾅ漢e'
bytes ibm-930 "$modal" >"$work/modal"
for n in 4 5; do
  expect 0 "$nlsstr" substr ibm-930 --records "$n" --file "$work/modal" --out utf8
  same "modal records of $n" "$modal" "$(tr -d '\n' <"$work/out")"
  expect 0 "$nlsstr" substr ibm-930 --records "$n" --file "$work/modal" --out hex
  while read -r line; do
    [[ $line == *0E* && ${line##*0E} != *0F* ]] && fail "record of $n left shifted out: $line"
  done <"$work/out"
done
# Raw records of a mapping verb come in batches: the same bytes as record by
# record, across many batches.
twice 15 <"$work/modal" >"$work/many"
expect 0 "$nlsstr" upper ibm-930 --records 5 --file "$work/many" --out raw
od -An -v -tx1 "$work/out" | tr -d ' \n' >"$work/batched"
expect 0 "$nlsstr" upper ibm-930 --records 5 --file "$work/many" --out hex
tr -d ' \n' <"$work/out" | tr 'A-F' 'a-f' | cmp -s - "$work/batched" ||
  fail "batched records differ from single records"
# A shift-out at the end of a record moves to the next one.
expect 0 "$nlsstr" substr ibm-930 --records 4 --file "$work/modal" --out hex
same "modal records of 4" "62 63
0E 4F 58 0F
0E 48 F2 0F 64" "$(head -3 "$work/out")"

# Lines in the encoding's newline: EBCDIC NL (0x15) and LF (0x25), UTF-16.
printf 'ab\x15cde\x25\x15f' >"$work/ebcdic"
expect 0 "$nlsstr" count ibm-037 --lines --file "$work/ebcdic"
same "EBCDIC lines" "record 1: 2 characters, 2 bytes
record 2: 3 characters, 3 bytes
record 3: 0 characters, 0 bytes
record 4: 1 characters, 1 bytes" "$(cat "$work/out")"
expect 0 "$nlsstr" substr ibm-037 --lines --file "$work/ebcdic" --out raw
cmp -s "$work/out" "$work/ebcdic" || fail "raw lines do not keep their newlines"
printf 'a\x00\x0a\x01\n\x00b\x00' >"$work/utf16"  # a, U+010A (not a newline), LF, b
expect 0 "$nlsstr" substr 25 --lines --file "$work/utf16" --out raw
cmp -s "$work/out" "$work/utf16" || fail "raw UTF-16 lines do not keep their newlines"
expect 0 "$nlsstr" count 25 --lines --file "$work/utf16"
same "UTF-16LE lines" "record 1: 2 characters, 4 bytes
record 2: 1 characters, 2 bytes" "$(cat "$work/out")"

# A whole input longer than a piece: counted across pieces cut between
# characters, and transliterated piece by piece into the same bytes.
printf '%s' "$text" | twice 16 >"$work/long"
expect 0 "$nlsstr" count 20 --file "$work/long"
same "long UTF-8 count" "characters $((65536 * 13))
bytes      $((65536 * 30))" "$(cat "$work/out")"
expect 0 "$nlsstr" translit 20 --from 'é' --to 'e' --file "$work/long" --out raw
cmp -s "$work/out" <(sed 's/é/e/g' "$work/long") || fail "pieces do not transliterate as the whole"
# Printed as UTF-8, the pieces of one text make one line.
"$nlsstr" upper 20 --text "$text" --out raw | twice 16 >"$work/expected"
echo >>"$work/expected"
expect 0 "$nlsstr" upper 20 --file "$work/long"
cmp -s "$work/out" "$work/expected" || fail "upper-cased pieces are not the upper-cased text"
# Modal pieces are cut where no double-byte run is open, so their bytes are
# the input's.
twice 17 <"$work/modal" >"$work/long-modal"
expect 0 "$nlsstr" count ibm-930 --file "$work/long-modal"
same "long modal count" "characters $((131072 * 10))
bytes      $(wc -c <"$work/long-modal")" "$(cat "$work/out")"
expect 0 "$nlsstr" translit ibm-930 --from 'e' --to 'E' --file "$work/long-modal" --out raw
bytes ibm-930 "${modal/e/E}" | twice 17 | cmp -s - "$work/out" || fail "modal pieces are not the input's bytes"

((failures == 0)) && echo "all passed"
exit $((failures != 0))
