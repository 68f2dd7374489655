#!/usr/bin/env bash
# Who reads only the beginning is not told of an error; who cannot store the output is.
set -uo pipefail
tervane="$1"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1

"$tervane" keys --json >all || exit 1
# More than a pipe holds, so that the end cannot be written any more.
[ "$(wc -c <all)" -gt 70000 ] || { echo "the output is too short for this test"; exit 1; }
"$tervane" keys --json 2>errors | head -n 1 >first
[ "${PIPESTATUS[0]}" -eq 0 ] && [ ! -s errors ] && [ -s first ] || { cat errors; exit 1; }
if [ -w /dev/full ]; then
  "$tervane" keys --json 2>errors >/dev/full
  [ "$?" -eq 2 ] && grep -q 'could not be written' errors || { cat errors; exit 1; }
fi
