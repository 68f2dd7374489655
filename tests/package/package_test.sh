#!/usr/bin/env bash
# Builds the Debian package, puts it into a folder (and, where TERVANE_TRY_PACKAGE is set and the user may, into the
# system, from which it is removed again), and tries what a user would: package_test.sh BUILD_FOLDER SOURCE_FOLDER
set -euo pipefail
build="$1" source="$2"
fail() { echo "FAILED: $*" >&2; exit 1; }
work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT
cd "$work"

cpack --config "$build/CPackConfig.cmake" -B "$work" >cpack.log 2>&1 || { cat cpack.log; fail "no package"; }
package="$(ls ./*.deb)"
dpkg-deb --field "$package" Depends | grep -q libqt6widgets6 || fail "the package does not ask for what it needs"
dpkg-deb --field "$package" Depends | grep -q libtervane && fail "the package asks for itself"
dpkg-deb -x "$package" root
export PATH="$work/root/usr/bin:$PATH"

try() { # try ROOT: the programs as they stand below it
  local root="$1" place="$1/usr/share/doc/tervane/examples"
  [ "$(command -v tervane)" = "$root/usr/bin/tervane" ] || fail "tervane of $root is not found first"
  tervane --version | grep -q '^tervane [0-9.]* (.*Release' || fail "--version"
  # Data files and projections come with modules beside the program.
  cp -r "$place/rhone" setup
  # It has a warning, which is status 1.
  tervane check setup/rhone.tvd >checked.txt || [ $? -eq 1 ] || fail "check of an example"
  grep -q "cannot be loaded" checked.txt && fail "a module that check needs"
  tervane data info setup/dem.nds2 | grep -q Elevation || fail "data info"
  tervane run setup/rhone.tvd --pp >/dev/null || fail "the engine beside the program"
  QT_QPA_PLATFORM=offscreen quarzel setup/rhone.tvd --screenshot window.png 2>/dev/null || fail "the desktop"
  [ "$(stat -c %s window.png)" -gt 10000 ] || fail "the picture of the desktop"
  man -l "$root/usr/share/man/man1/tervane-set.1"* | grep -q "The value; see VALUES" || fail "the man page"
  bash -c "source '$root/usr/share/bash-completion/completions/tervane' && complete -p tervane" >/dev/null ||
    fail "the completion of bash"
  if command -v zsh >/dev/null; then
    zsh -n "$root/usr/share/zsh/vendor-completions/_tervane" || fail "the completion of zsh"
  fi
  if command -v desktop-file-validate >/dev/null; then
    desktop-file-validate "$root/usr/share/applications/quarzel.desktop" || fail "the desktop entry"
  fi
  rm -rf setup
}
try "$work/root"
[ -e root/usr/include/tervane.h ] || fail "the header for C"
if compgen -G "$build/python/tervane/_tervane*" >/dev/null; then
  PYTHONPATH="$PWD/root/usr/lib/python3/dist-packages" /usr/bin/python3 -c '
import sys, tervane
setup = tervane.open(sys.argv[1])
assert setup.validate() is not None' "$source/examples/default.tvd" || fail "the module for Python"
fi

if [ -n "${TERVANE_TRY_PACKAGE:-}" ] && [ "$(id -u)" -eq 0 ]; then
  dpkg -i "$package" >/dev/null || fail "dpkg -i"
  PATH="${PATH#"$work"/root/usr/bin:}" try ""
  dpkg -r tervane >/dev/null || fail "dpkg -r"
  [ ! -e /usr/bin/tervane ] && [ ! -e /usr/bin/quarzel ] || fail "what was installed is left"
fi
echo "the package works"
