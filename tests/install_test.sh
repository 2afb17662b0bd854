#!/bin/sh
# Catches a desktop entry the desktop tools reject, and install rules that leave out the program,
# the desktop entry or the icon, or that ignore DESTDIR.
# usage: install_test.sh SOURCE-DIR BUILD-DIR
set -eu
complaints=$(desktop-file-validate "$1/packaging/pelmo.desktop" 2>&1)
[ -z "$complaints" ] || { echo "$complaints"; exit 1; }
stage=$(mktemp -d)
trap 'rm -rf "$stage"' EXIT
DESTDIR="$stage/dest" cmake --install "$2" --prefix /opt/pelmo >/dev/null
cmake --install "$2" --prefix "$stage/prefix" >/dev/null
for tree in "$stage/dest/opt/pelmo" "$stage/prefix"; do
  [ -x "$tree/bin/pelmo" ] || { echo "no program in $tree/bin"; exit 1; }
  cmp "$1/packaging/pelmo.desktop" "$tree/share/applications/pelmo.desktop"
  cmp "$1/packaging/pelmo.svg" "$tree/share/icons/hicolor/scalable/apps/pelmo.svg"
done
