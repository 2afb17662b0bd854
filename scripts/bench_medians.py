"""The medians the send benchmarks print: a file of "KIND SECONDS" lines, one per whole run of
COPIES copies, read into milliseconds a copy for each kind."""

import statistics


def per_copy(times_path, copies):
    """({kind: median ms a copy}, rounds), rounds being how many runs each kind had."""
    times = {}
    for line in open(times_path):
        kind, seconds = line.split()
        times.setdefault(kind, []).append(float(seconds))
    medians = {kind: statistics.median(values) / copies * 1000 for kind, values in times.items()}
    return medians, min(len(values) for values in times.values())
