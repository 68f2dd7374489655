#!/usr/bin/env bash
# The stubs agree with the module, and the package with its hints: types.sh PYTHON SOURCES
set -euo pipefail
"$1" -c 'import mypy' 2>/dev/null || { echo "mypy is not installed for $1: types are not checked"; exit 77; }
cd "$(mktemp -d)"
trap 'rm -rf "$PWD"' EXIT
"$1" -m mypy.stubtest tervane._tervane --allowlist "$2/tests/python/stubtest_allowed.txt"
"$1" -m mypy --config-file "$2/tests/python/mypy.ini" --cache-dir=/dev/null -p tervane
