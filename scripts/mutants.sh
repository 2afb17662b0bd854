#!/usr/bin/env bash
# Mutation testing: plants each small fault of scripts/mutants.list, one at a time, in a private
# copy of the source tree, builds it and runs the tests. A fault some test notices is "killed";
# one every test passes with "survived"; one that does not compile is "not built" and left out
# of the figure. The working tree is only read, so an interrupted run leaves it as it was.
#
#   MUTANTS=3,7,12-20,smtp scripts/mutants.sh    only these ids, ranges or folders
#   JOBS=2                                       build and test jobs
#   MUTANT_TEST_TIMEOUT=60                       seconds a test may take before it counts as hung
set -euo pipefail

root=$(cd "$(dirname "$0")/.." && pwd)
work=$root/build/mutants
mirror=$work/src
build=$work/build
logs=$work/logs
report=$work/report.txt
jobs=${JOBS:-2}
test_timeout=${MUTANT_TEST_TIMEOUT:-60}
picker=(python3 "$root/scripts/mutants-pick.py")

mkdir -p "$work" "$logs"
"${picker[@]}" list "${MUTANTS:-}" > "$work/selected"

# Copies the tree's files (tracked, or new and not ignored) into the mirror, touching only those
# whose content differs so that the build there stays incremental.
sync_mirror() {
    local f
    git -C "$root" ls-files -z --cached --others --exclude-standard > "$work/files"
    mkdir -p "$mirror"
    while IFS= read -r -d '' f; do
        [ -f "$root/$f" ] || continue
        if ! cmp -s "$root/$f" "$mirror/$f"; then
            mkdir -p "$(dirname "$mirror/$f")"
            cp "$root/$f" "$mirror/$f"
        fi
    done < "$work/files"
    # Files the tree no longer has leave the mirror too.
    (cd "$mirror" && find . -type f -printf '%P\n' | sort) \
        | comm -23 - <(tr '\0' '\n' < "$work/files" | sort) \
        | while IFS= read -r f; do rm -f "$mirror/$f"; done
}

# While a mutant is planted, its file's clean copy waits in $work/original.
planted=""
restore() {
    if [ -n "$planted" ]; then
        cp "$work/original" "$mirror/$planted"  # a fresh mtime, so the next build recompiles it
        planted=""
    fi
}
trap restore EXIT
trap 'restore; echo; echo "mutants: interrupted; the source tree was not touched" >&2; exit 130' INT TERM

# Runs the ctest selection in spec file $2 (see ctest -I), appending to log $1. Answers
# whether every test passed, and adds the number of tests run to $ran.
run_tests() {
    local log=$1 spec=$2 status=0
    (cd "$build" && ctest -I "$spec" --stop-on-failure --timeout "$test_timeout" -j "$jobs" \
        --output-on-failure) < /dev/null >> "$log" 2>&1 || status=$?
    local count
    count=$(grep -oE 'tests failed out of [0-9]+' "$log" | tail -n1 | grep -oE '[0-9]+$' || true)
    ran=$((ran + ${count:-0}))
    return "$status"
}

echo "mutants: building the unchanged tree in $build"
sync_mirror
if ! { cmake -S "$mirror" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Debug -DPELMO_SANITIZE=OFF \
        -DPELMO_BUILD_TESTS=ON && cmake --build "$build" -j "$jobs"; } > "$logs/baseline.log" 2>&1
then
    echo "mutants: the unchanged tree does not build; see $logs/baseline.log" >&2
    exit 1
fi

# Which tests to run, in which order, for a mutant in each folder.
(cd "$build" && ctest --show-only=json-v1) 2> /dev/null > "$work/tests.json"
mkdir -p "$work/order"
"${picker[@]}" order "$work/tests.json" "$work/order"
total_tests=$(< "$work/order/count")
ran=0
if ! run_tests "$logs/baseline.log" "$work/order/all" || [ "$ran" -ne "$total_tests" ]; then
    echo "mutants: the tests fail on the unchanged tree; see $logs/baseline.log" >&2
    exit 1
fi
echo "mutants: $total_tests tests pass on the unchanged tree"

echo "# make mutants, $(date '+%Y-%m-%d %H:%M'), $(git -C "$root" describe --always --dirty)" \
    > "$report"
killed=0 built=0 not_built=0 stale=0
# The list comes in on descriptor 3, out of reach of the builds and tests.
while IFS=$'\t' read -r -u 3 id file area what; do
    log=$logs/$id.log
    cp "$mirror/$file" "$work/original"
    planted=$file
    status=0 by=""
    "${picker[@]}" apply "$id" "$mirror" > "$log" 2>&1 || status=$?
    if [ "$status" -ne 0 ]; then
        verdict="stale"
        stale=$((stale + 1))
    elif ! cmake --build "$build" -j "$jobs" >> "$log" 2>&1; then
        verdict="not built"
        not_built=$((not_built + 1))
    else
        built=$((built + 1))
        ran=0
        if [ -s "$work/order/$area.first" ] && ! run_tests "$log" "$work/order/$area.first"; then
            verdict="killed"
        elif ! run_tests "$log" "$work/order/$area.rest"; then
            verdict="killed"
        elif [ "$ran" -ne "$total_tests" ]; then
            verdict="killed"  # some tests did not even start: their executable is broken
        else
            verdict="survived"
        fi
        if [ "$verdict" = killed ]; then
            killed=$((killed + 1))
            by=$(grep -A1 'The following tests FAILED' "$log" | sed -nE 's/^[[:space:]]*[0-9]+ - //p' \
                | head -n1)
        fi
    fi
    restore
    line=$(printf '%3s  %-9s  %s: %s' "$id" "$verdict" "$file" "$what")
    echo "$line${by:+  [$by]}" | tee -a "$report"
done 3< "$work/selected"

{
    echo "killed $killed of $built"
    echo "not built: $not_built"
    [ "$stale" -eq 0 ] || echo "stale: $stale (snippet no longer found once; pick the list again)"
} | tee -a "$report"
echo "mutants: report in $report, logs in $logs"
