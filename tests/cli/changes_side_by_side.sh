#!/usr/bin/env bash
# Two loops change keys of one setup at the same time: no change is lost.
set -uo pipefail
tervane="$1"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder" || exit 1

"$tervane" new setup.tvd || exit 1
change() { # KEY
  local round
  for round in {1..20}; do
    "$tervane" set setup.tvd "SimSpec/SimTitle:$1" "$1 $round" || return 1
    [ "$("$tervane" get setup.tvd "SimSpec/SimTitle:$1")" = "$1 $round" ] || {
      echo "$1 $round was lost"
      return 1
    }
  done
}
change Title &
change Description &
convert() {
  for _ in {1..10}; do "$tervane" convert setup.tvd setup.tvd || return 1; done
}
convert &
status=0
for job in $(jobs -p); do wait "$job" || status=1; done
[ -z "$(find . -name '.setup.tvd*')" ] || { ls -la; status=1; }
exit "$status"
