#!/bin/sh
# Copyright (C) 2026 the Tervane developers
# SPDX-License-Identifier: GPL-3.0-or-later

# Writes kvf.dict: the tokens of a parameter file, and every word in the sources that can be the name of a key, a
# section or a target.
set -eu
cd "$(dirname "$0")/.."
{
  echo '# Made by make_dictionary.sh.'
  printf '"%s"\n' 'target ' 'section ' ' {\x0A' '}\x0A' ' = ' ', ' '\x0D\x0A' '#' 'file \"\"' 'true' 'false' \
    'inf' '-inf' 'nan' 'inff' 'nanf' '1e9' '-0.0' '5e-324' '1e-45f' '6f' '2147483647' '-2147483648' \
    '\\\"' '\\\\' '\\n' '\\t' '\\u{' '\\u{10ffff}' '\xEF\xBB\xBF' '\xC3\xA4' '\xF0\x9F\x8C\x8A' \
    'target TERVANE_FLOWMODEL {\x0A' 'ExtraParam_1'
  git ls-files 'core/*' 'simspec/*' 'spatial/*' 'surface/*' 'subsurface/*' 'wqpt/*' 'execution/*' 'exchange/*' \
    'document/*' | grep -E '\.(h|cpp)$' | xargs cat | grep -v '^#include' |
    grep -oE '"[A-Za-z_][A-Za-z0-9_]* ?"' | sort -u
} > fuzz/kvf.dict
