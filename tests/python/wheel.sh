#!/usr/bin/env bash
# The project builds as a wheel, where its backend is installed: wheel.sh PYTHON SOURCES
set -euo pipefail
"$1" -c 'import scikit_build_core' 2>/dev/null ||
  { echo "scikit-build-core is not installed for $1: no wheel is built"; exit 77; }
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT
env -u PYTHONPATH "$1" -m pip wheel --no-build-isolation --no-deps -w "$work" "$2"
"$1" -m zipfile -e "$work"/*.whl "$work/site"
PYTHONPATH="$work/site" "$1" -c 'import tervane; tervane.new().validate()'
