#!/usr/bin/env bash
# Runs every command of the README's "Using it" section and compares what each prints
# with the output the README shows under it, so the README cannot drift from the tools.
#
#   readme_commands.sh ROOT BUILD
#
# In the section's ```console blocks a line "$ command" is a command (run by bash, one
# session for the whole section, so exports and functions carry on) and the lines after
# it, up to the next command or the block's end, are its output. In an output line "…"
# stands for any text (paths of this machine). Commands run in a scratch folder where
# build/, data/ and examples/ lead to the build and the source tree.
set -euo pipefail
ROOT=$1
BUILD=$2
readme=$ROOT/README.md
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
ln -s "$BUILD" "$work/build"
ln -s "$ROOT/data" "$work/data"
ln -s "$ROOT/examples" "$work/examples"

# The section's blocks as commands and expected outputs, numbered.
awk -v dir="$work" '
  /^## / { inside = ($0 == "## Using it") }
  inside && /^```console$/ { block = 1; next }
  inside && block && /^```$/ { block = 0; next }
  inside && block && /^\$ / {
    n++
    print substr($0, 3) > (dir "/command." n)
    printf "" > (dir "/expected." n)
    next
  }
  inside && block && n > 0 { print > (dir "/expected." n) }
  END { print n > (dir "/count") }
' "$readme"
count=$(cat "$work/count")
if [ "$count" -lt 1 ]; then
  echo "readme: no commands found in the Using it section" >&2
  exit 1
fi

# One bash session runs them all; a marker line separates their outputs.
script=$work/session.sh
for i in $(seq 1 "$count"); do
  printf 'echo "@@readme-output %d"\n{ %s\n} 2>&1 || true\n' "$i" "$(cat "$work/command.$i")" >> "$script"
done
(cd "$work" && bash "$script") > "$work/session.out" 2>&1 || true
tr -d '\r' < "$work/session.out" | awk -v dir="$work" '
  /^@@readme-output / { n = $2; printf "" > (dir "/actual." n); next }
  n > 0 { print > (dir "/actual." n) }
'

failures=0
for i in $(seq 1 "$count"); do
  mapfile -t expected < "$work/expected.$i"
  mapfile -t actual < "$work/actual.$i" 2>/dev/null || actual=()
  same=1
  if [ "${#expected[@]}" -ne "${#actual[@]}" ]; then same=0; fi
  for ((k = 0; same && k < ${#expected[@]}; k++)); do
    want=${expected[$k]}
    if [[ "$want" == *"…"* ]]; then
      # "…" matches any text; everything else literally.
      pattern=""
      rest=$want
      while [[ "$rest" == *"…"* ]]; do
        pattern+=$(printf '%q' "${rest%%…*}")"*"
        rest=${rest#*…}
      done
      pattern+=$(printf '%q' "$rest")
      eval "[[ \"\${actual[$k]}\" == $pattern ]]" || same=0
    else
      [ "$want" == "${actual[$k]}" ] || same=0
    fi
  done
  if [ "$same" -eq 0 ]; then
    failures=$((failures + 1))
    echo "README command $i differs: \$ $(cat "$work/command.$i")"
    diff <(printf '%s\n' "${expected[@]}") <(printf '%s\n' "${actual[@]}") | head -20 || true
  fi
done
echo "$count README commands run, $failures differ"
[ "$failures" -eq 0 ]
