#!/usr/bin/env python3
"""Brings translations/pelmo_*.ts up to date with the sources, through lupdate.

Pelmo looks its texts up by their English key in the one context "LocalizedStrings", through
the free functions LocalizedString(), LocalizedStringNS() and LocalizedFormat(), and keys that
travel through tables or parameters are marked LocalizedKey() where they are written. lupdate
knows no context for a free function, so it reads these keys twice: first as ids (aliases of
qtTrId), which are then written into a scratch source as QT_TRANSLATE_NOOP("LocalizedStrings",
key); a second run reads that scratch source along with the sources, where it also finds the
tr() of Pelmo's Qt classes, and merges everything into the .ts files, keeping their
translations.

  update.py TS...           updates the given .ts files
  update.py --check TS...   updates copies and fails if a text is new, unfinished or vanished
"""

import argparse
import html
import os
import re
import shutil
import subprocess
import sys
import tempfile
import xml.etree.ElementTree as ElementTree

HERE = os.path.dirname(os.path.abspath(__file__))
SOURCES = os.path.join(os.path.dirname(HERE), "src")
KEY_FUNCTIONS = ("LocalizedString", "LocalizedStringNS", "LocalizedFormat", "LocalizedKey")


def run_lupdate(lupdate, arguments):
    done = subprocess.run([lupdate] + arguments, capture_output=True, text=True)
    if done.returncode != 0:
        sys.exit("lupdate failed:\n" + done.stdout + done.stderr)
    return done.stdout


def keys_in_sources(lupdate, scratch):
    """The keys of the LocalizedStrings lookups, in the order the sources name them."""
    ids_ts = os.path.join(scratch, "ids.ts")
    # lupdate would merge into an earlier run's file, which it cannot read back (see below).
    if os.path.exists(ids_ts):
        os.remove(ids_ts)
    aliases = ",".join("qtTrId+=" + name for name in KEY_FUNCTIONS)
    run_lupdate(lupdate, ["-silent", "-locations", "none", "-tr-function-alias", aliases,
                          "-extensions", "cpp,h", SOURCES, "-ts", ids_ts])
    # lupdate writes a quote inside an id attribute as it stands, so the file is read by line.
    with open(ids_ts, encoding="utf-8") as ts:
        found = re.findall(r'^\s*<message id="(.*?)"(?: numerus="yes")?>$', ts.read(), re.MULTILINE)
    keys = []
    for key in map(html.unescape, found):
        if key not in keys:
            keys.append(key)
    return keys


def c_literal(text):
    escaped = (text.replace("\\", "\\\\").replace("\"", "\\\"").replace("\n", "\\n")
               .replace("\t", "\\t").replace("\r", "\\r"))
    return "\"" + escaped + "\""


def update(lupdate, ts_files, scratch, drop_vanished=True):
    """Runs lupdate over the sources and the keys; answers its report."""
    keys_cpp = os.path.join(scratch, "LocalizedStringsKeys.cpp")
    with open(keys_cpp, "w", encoding="utf-8") as out:
        for key in keys_in_sources(lupdate, scratch):
            out.write("QT_TRANSLATE_NOOP(\"LocalizedStrings\", %s);\n" % c_literal(key))
    # Locations would point into the scratch file and change with every edit of a source.
    options = ["-locations", "none", "-extensions", "cpp,h"]
    if drop_vanished:
        options.append("-no-obsolete")
    return run_lupdate(lupdate, options + [SOURCES, keys_cpp, "-ts"] + ts_files)


def problems(ts_file, report):
    """What keeps ts_file from covering the sources: new, unfinished or vanished texts."""
    found = []
    for new in re.findall(r"\((\d+) new and", report):
        if int(new) > 0:
            found.append("%s new source text(s) not in the file before" % new)
    for message in ElementTree.parse(ts_file).iter("message"):
        kind = message.find("translation").get("type")
        if kind is not None:
            found.append("%s: %s" % (kind, message.findtext("source")))
    return found


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--check", action="store_true")
    # Debian keeps Qt 6's lupdate out of PATH, where a Qt 5 one may stand.
    qt6 = "/usr/lib/qt6/bin/lupdate"
    parser.add_argument("--lupdate", default=qt6 if os.path.exists(qt6) else shutil.which("lupdate"))
    parser.add_argument("ts", nargs="+")
    arguments = parser.parse_args()
    with tempfile.TemporaryDirectory() as scratch:
        if not arguments.check:
            print(update(arguments.lupdate, arguments.ts, scratch), end="")
            return 0
        failed = False
        for ts in arguments.ts:
            copy = os.path.join(scratch, os.path.basename(ts))
            shutil.copyfile(ts, copy)
            report = update(arguments.lupdate, [copy], scratch, drop_vanished=False)
            for problem in problems(copy, report):
                print("%s: %s" % (ts, problem))
                failed = True
        return 1 if failed else 0


if __name__ == "__main__":
    sys.exit(main())
