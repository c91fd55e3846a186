#!/bin/sh
# tidefiles check passes on the committed world set. (Each fault's line is the folder-check
# suite's; the command's exit status on a bad folder, the command-line suite's.)
set -eu
out=$("$1" check "$2")
echo "$out"
echo "$out" | grep -Eq '^ok: [0-9]+ stations$'
