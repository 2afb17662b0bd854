#!/usr/bin/env bash
# Relinking a large page, whole process (user + system time): `pelmo relink` against lxml's make_links_absolute
# (parse, relink, serialise) on the same generated pages of 4 MB and 16 MB, with a relative
# link or picture every ~200 bytes. Medians of ROUNDS interleaved runs; prints Pelmo's time as
# a share of lxml's, and how Pelmo's time grows from 4 MB to 16 MB (4.0 is linear).
# Usage: bench-relink.sh PATH-TO-PELMO [ROUNDS]
set -euo pipefail

pelmo=$(realpath "$1")
rounds=${2:-7}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export XDG_CACHE_HOME="$work/cache" XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config"

# Debian's own interpreter: lxml comes from python3-lxml, which another python3 on PATH lacks.
/usr/bin/python3 - "$pelmo" "$work" "$rounds" <<'PY'
import os, random, statistics, subprocess, sys
pelmo, work, rounds = sys.argv[1], sys.argv[2], int(sys.argv[3])
base = "http://www.example.org/news/2026/index.html"

def page(size):
    rnd = random.Random(7)
    parts, n = ["<!DOCTYPE html><html><head><title>Bench</title>"
                '<link rel="stylesheet" href="css/site.css"></head><body>\n'], 0
    while n < size:
        word = " ".join(rnd.choice(("news", "report", "Zürich", "data", "and", "the"))
                        for _ in range(rnd.randint(8, 20)))
        kind = rnd.randrange(3)
        if kind == 0:
            piece = f'<p>{word} <a href="../archive/{rnd.randint(1, 9999)}.html">more</a></p>\n'
        elif kind == 1:
            piece = f'<p><img src="img/p{rnd.randint(1, 999)}.jpg" alt="{word[:20]}"> {word}</p>\n'
        else:
            piece = f'<div><a href="/section/{rnd.randint(1, 99)}/">{word}</a></div>\n'
        parts.append(piece)
        n += len(piece)
    parts.append("</body></html>\n")
    return "".join(parts).encode()

lxml_script = f"""
import sys, lxml.html
doc = lxml.html.document_fromstring(open(sys.argv[1], 'rb').read())
doc.make_links_absolute({base!r}, resolve_base_href=True)
sys.stdout.buffer.write(lxml.html.tostring(doc))
"""
files = {}
for mb in (4, 16):
    files[mb] = f"{work}/page{mb}.html"
    with open(files[mb], "wb") as f:
        f.write(page(mb * 1000 * 1000))
    with open(f"{work}/relink_lxml.py", "w") as f:
        f.write(lxml_script)

def timed(args):
    # Process time (user + system CPU) rather than wall time: other work on a shared machine
    # stretches the wall clock of both sides unevenly.
    child = subprocess.Popen(args, stdout=subprocess.DEVNULL)
    _, status, usage = os.wait4(child.pid, 0)
    child.returncode = os.waitstatus_to_exitcode(status)
    if child.returncode != 0:
        raise SystemExit(f"{args[0]} failed with {child.returncode}")
    return (usage.ru_utime + usage.ru_stime) * 1000

runs = {k: [] for k in ("pelmo4", "lxml4", "pelmo16")}
timed([pelmo, "relink", base, files[4]])  # builds the suffix-map cache once
for _ in range(rounds):
    runs["pelmo4"].append(timed([pelmo, "relink", base, files[4]]))
    runs["lxml4"].append(timed(["/usr/bin/python3", f"{work}/relink_lxml.py", files[4]]))
    runs["pelmo16"].append(timed([pelmo, "relink", base, files[16]]))
m = {k: statistics.median(v) for k, v in runs.items()}
print(f"relink, process time: 4 MB pelmo {m['pelmo4']:.0f} ms, lxml {m['lxml4']:.0f} ms, "
      f"ratio {m['pelmo4'] / m['lxml4']:.2f}; 16 MB pelmo {m['pelmo16']:.0f} ms, "
      f"16 MB / 4 MB {m['pelmo16'] / m['pelmo4']:.2f}")
PY
