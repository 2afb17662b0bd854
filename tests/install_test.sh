#!/bin/sh
# Catches a desktop entry the desktop tools reject, and install rules that leave out a file the
# desktop, man, Help or the translations look for, or that ignore DESTDIR; with --deb, the same
# of the Debian package that cpack makes of the build, and a package of some other version.
# usage: install_test.sh SOURCE-DIR BUILD-DIR VERSION [--deb]
set -eu
source=$1 build=$2 version=$3
stage=$(mktemp -d)
trap 'rm -rf "$stage"' EXIT

fail() { echo "$*"; exit 1; }

# The width and height a PNG's header gives, as "WxH".
png_size() {
  set -- $(od -An -tu1 -j16 -N8 "$1")
  echo "$(( ($1 << 24) + ($2 << 16) + ($3 << 8) + $4 ))x$(( ($5 << 24) + ($6 << 16) + ($7 << 8) + $8 ))"
}

check_tree() {
  tree=$1
  [ -x "$tree/bin/pelmo" ] || fail "no program in $tree/bin"
  cmp "$source/packaging/pelmo.desktop" "$tree/share/applications/pelmo.desktop"
  cmp "$source/packaging/io.github.pelmo.Pelmo.metainfo.xml" \
    "$tree/share/metainfo/io.github.pelmo.Pelmo.metainfo.xml"
  icons=$tree/share/icons/hicolor
  cmp "$source/packaging/pelmo.svg" "$icons/scalable/apps/pelmo.svg"
  for size in 48 256; do
    [ "$(png_size "$icons/${size}x$size/apps/pelmo.png")" = "${size}x$size" ] ||
      fail "no ${size}x$size icon in $icons"
  done
  gzip -dc "$tree/share/man/man1/pelmo.1.gz" | grep -q "^\.TH PELMO 1 .*\"Pelmo $version\"" ||
    fail "no manual page of Pelmo $version in $tree/share/man/man1"
  # The translations, where the program finds them by their path from its own folder.
  for language in de fr; do
    cmp "$build/src/translations/pelmo_$language.qm" "$tree/share/pelmo/translations/pelmo_$language.qm"
  done
  home=$(mktemp -d -p "$stage")
  said=$(HOME=$home XDG_DATA_HOME=$home/data XDG_CONFIG_HOME=$home/config LC_ALL= LANGUAGE= \
    LANG=de_DE.UTF-8 "$tree/bin/pelmo" contacts list --group Keine 2>&1 || true)
  case $said in
    *"hat keine Gruppe"*) ;;
    *) fail "$tree/bin/pelmo does not speak German: $said" ;;
  esac
  cmp "$source/README.md" "$tree/share/doc/pelmo/README.md"
  cmp "$source/packaging/copyright" "$tree/share/doc/pelmo/copyright"
  gzip -dc "$tree/share/doc/pelmo/changelog.gz" | head -n 1 | grep -q "^pelmo ($version) " ||
    fail "the changelog in $tree/share/doc/pelmo does not start at $version"
}

if [ "${4:-}" != --deb ]; then
  complaints=$(desktop-file-validate "$source/packaging/pelmo.desktop" 2>&1)
  [ -z "$complaints" ] || fail "$complaints"
  DESTDIR="$stage/dest" cmake --install "$build" --prefix /opt/pelmo >/dev/null
  cmake --install "$build" --prefix "$stage/prefix" >/dev/null
  check_tree "$stage/dest/opt/pelmo"
  check_tree "$stage/prefix"
  exit 0
fi

(cd "$build" && cpack -G DEB -B "$stage/package" >"$stage/cpack.log" 2>&1) ||
  fail "cpack failed: $(cat "$stage/cpack.log")"
deb=$stage/package/pelmo_${version}_amd64.deb
[ -f "$deb" ] || fail "no $deb; cpack made: $(ls "$stage/package")"
for field in Package=pelmo Version=$version Architecture=amd64 Section=mail Priority=optional; do
  [ "$(dpkg-deb -f "$deb" "${field%%=*}")" = "${field#*=}" ] || fail "the package's $field is not so"
done
# dpkg-shlibdeps' share: the libraries the program links.
dpkg-deb -f "$deb" Depends | grep -q "libqt6widgets6" || fail "no libqt6widgets6 in Depends"
dpkg -x "$deb" "$stage/root"
[ -z "$(find "$stage/root" -path "$stage/root/usr" -prune -o ! -type d -print)" ] ||
  fail "the package puts files outside /usr"
check_tree "$stage/root/usr"
[ "$("$stage/root/usr/bin/pelmo" --version)" = "Pelmo $version" ] ||
  fail "the packaged program does not tell version $version"
