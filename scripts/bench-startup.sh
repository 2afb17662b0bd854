#!/usr/bin/env bash
# Start-up: `pelmo relink` of a one-line page, whole process, against `pelmo --help`, which
# loads the same program and does nothing. The first relink of a fresh cache builds the suffix
# map from the MIME database; the later ones read it back. Medians of ROUNDS interleaved runs.
# Usage: bench-startup.sh PATH-TO-PELMO [ROUNDS]
set -euo pipefail

pelmo=$(realpath "$1")
rounds=${2:-15}
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
export XDG_CACHE_HOME="$work/cache" XDG_DATA_HOME="$work/data" XDG_CONFIG_HOME="$work/config"
echo '<a href="page.html">a page</a>' > "$work/page.html"

python3 - "$pelmo" "$work/page.html" "$rounds" <<'PY'
import statistics, subprocess, sys, time
pelmo, page, rounds = sys.argv[1], sys.argv[2], int(sys.argv[3])
def timed(*args):
    start = time.perf_counter()
    subprocess.run([pelmo, *args], check=True, stdout=subprocess.DEVNULL)
    return (time.perf_counter() - start) * 1000
first = timed("relink", "http://example.org/dir/", page)
relink, help_ = [], []
for _ in range(rounds):
    relink.append(timed("relink", "http://example.org/dir/", page))
    help_.append(timed("--help"))
r, h = statistics.median(relink), statistics.median(help_)
print(f"start-up: pelmo relink of a one-line page {r:.1f} ms (first run, building the cache: "
      f"{first:.1f} ms), pelmo --help {h:.1f} ms, relink's own work {r - h:.1f} ms")
PY
