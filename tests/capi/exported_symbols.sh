#!/usr/bin/env bash
# Only what the header declares is exported, and all of it: exported_symbols.sh LIBRARY
set -euo pipefail
header="$(dirname "$0")/../../capi/tervane.h"
declared="$(grep -o '\btervane_[a-z_]*(' "$header" | tr -d '(' | sort -u)"
exported="$(nm -D --defined-only "$1" | awk '$2 != "A" { print $3 }' | sort -u)"
diff <(echo "$declared") <(echo "$exported") || { echo "left: declared, right: exported"; exit 1; }
