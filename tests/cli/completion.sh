#!/usr/bin/env bash
# The completion script offers commands, options and places of a setup.
set -euo pipefail
PATH="$(dirname "$1"):$PATH"
folder="$(mktemp -d)"
trap 'rm -rf "$folder"' EXIT
cd "$folder"
tervane new a.tvd
# shellcheck disable=SC1090
source <(tervane completion)

offers() { # offers "what is typed so far, the last word may be empty" EXPECTED
  read -ra COMP_WORDS <<<"$1"
  [[ "$1" == *" " ]] && COMP_WORDS+=("")
  COMP_CWORD=$((${#COMP_WORDS[@]} - 1))
  _tervane
  for reply in "${COMPREPLY[@]}"; do [ "$reply" = "$2" ] && return; done
  echo "'$1' should offer $2, but offers: ${COMPREPLY[*]:-nothing}"
  exit 1
}
offers "tervane ch" check
offers "tervane tree --a" --all
offers "tervane check a" a.tvd
offers "tervane get a.tvd SimSpec/Sim" SimSpec/SimTitle
offers "tervane get a.tvd SimSpec/SimTitle:Ti" SimSpec/SimTitle:Title
offers "tervane get a.tvd SimSpec/SimTitle : Ti" Title
offers "tervane set a.tvd SimSpec :" ModelType
offers "tervane data stats --j" --json
offers "tervane import grid --l" --like
if (offers "tervane import series --l" --like) >/dev/null; then
  echo "import series offers an option of import grid"
  exit 1
fi
