#!/bin/sh
# tidefiles check on the committed world set passes; on truncated copies it fails with a
# clear line naming the file, the station and what is wrong.
set -eu
tool=$1
world=$2
tmp=$(mktemp -d)
trap 'rm -rf "$tmp"' EXIT

"$tool" check "$world" > "$tmp/out"
grep -Eq '^ok: [0-9]+ stations$' "$tmp/out" || { cat "$tmp/out"; exit 1; }
cat "$tmp/out"

expect_failure() {  # $1: regular expression of the expected line
  if "$tool" check "$tmp/copy" > "$tmp/out" 2> "$tmp/err"; then
    echo "check passed on a damaged copy"; exit 1
  fi
  grep -E "$1" "$tmp/out" | head -n 1
  grep -Eq "$1" "$tmp/out" || { echo "expected a line matching: $1"; head -n 5 "$tmp/out"; exit 1; }
}

mkdir "$tmp/copy"
cp "$world/td_num.ntx" "$world/td_crd.ntx" "$world/td_pnt.dat" "$tmp/copy/"
truncate -s -100 "$tmp/copy/td_pnt.dat"
expect_failure '^td_pnt\.dat: station [0-9]+: block of [0-9]+ bytes at offset [0-9]+ runs past the end of the file \([0-9]+ bytes\)$'

cp "$world/td_pnt.dat" "$tmp/copy/"
truncate -s -3 "$tmp/copy/td_num.ntx"
expect_failure '^td_num\.ntx: length [0-9]+ bytes is not a whole number of 10-byte records \(7 bytes left over\)$'
