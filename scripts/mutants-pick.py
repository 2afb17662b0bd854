#!/usr/bin/env python3
"""Chooses and applies the small faults that `make mutants` plants in src/.

  mutants-pick.py pick [--out scripts/mutants.list]   scan src/ and write the list
  mutants-pick.py list [SELECTION]                    id, file, test area, description per line
  mutants-pick.py apply ID ROOT                       plant mutant ID in the tree under ROOT
  mutants-pick.py order TESTS_JSON DIR                write ctest -I files: DIR/<folder>.first
                                                      and .rest, DIR/all, and DIR/count

The list is chosen once and checked in, so that every run and every developer measures the
same faults; re-running `pick` on an unchanged tree writes the same list (the seed is fixed).
Each mutant names its file, a snippet that occurs exactly once in it and the snippet's
replacement, so edits elsewhere in the file do not move it. The list is JSON Lines: one
mutant per line, exact whatever characters the code holds.

SELECTION is a comma-separated list of ids (7), ranges (3-12) and folder names (smtp).
"""

import argparse
import json
import random
import re
import sys
from pathlib import Path

ROOT = Path(__file__).resolve().parent.parent
LIST = ROOT / "scripts" / "mutants.list"
FOLDERS = ["util", "text", "relink", "addressbook", "attachments", "smtp", "browser",
           "controller", "gui", "app"]
TOTAL = 70
SEED = 20260611

# The test executables that exercise each folder: they run first, so that a killed mutant
# costs little.
FOLDER_TESTS = {
    "util": ["util_tests"], "text": ["text_tests"], "relink": ["relink_tests"],
    "addressbook": ["addressbook_tests"], "attachments": ["attachments_tests"],
    "smtp": ["smtp_tests", "mime_tests"], "browser": ["controller_tests"],
    "controller": ["controller_tests"], "gui": ["gui_tests"], "app": ["app_tests", "e2e_tests"],
}

KIND_LABELS = {
    "flip": "flipped comparison",
    "off-by-one": "off by one",
    "bool": "true/false swapped",
    "drop": "dropped call",
    "negate": "negated condition",
}
FLIPS = {"<": "<=", "<=": "<", ">": ">=", ">=": ">", "==": "!=", "!=": "=="}

# Lines that only report (logging, assertions) or only declare are no place for a fault that a
# test should see.
SKIP_LINE = re.compile(r"\b(assert|Q_ASSERT\w*|static_assert|qDebug|qInfo|qWarning|qCritical|"
                       r"qFatal|gLogger|StartLogging|StopLogging|Q_UNUSED|Q_PROPERTY|"
                       r"Q_DECLARE\w*|Q_ENUM)\b")
STATEMENT_START_KEYWORDS = {
    "return", "delete", "throw", "goto", "case", "using", "typedef", "else", "if", "for",
    "while", "do", "switch", "new", "auto", "const", "constexpr", "static", "co_return",
    "co_await", "template", "class", "struct", "enum", "namespace", "friend", "virtual",
}
COMPARISON = re.compile(r"(?<= )(<=|>=|==|!=|<|>)(?= )")
PLUS_MINUS_ONE = re.compile(r"(?<=[\w)\]]) [+-] 1(?![\w.'])")
BOOLEAN = re.compile(r"\b(true|false)\b")
CONDITION = re.compile(r"\b(if|while) \(")
CALL_STATEMENT = re.compile(r"^(Q_EMIT )?(this->)?[A-Za-z_][\w:]*"
                            r"((\.|->)[A-Za-z_]\w*|\(\)|\[[^\]]*\])*\(.*\);$")
AFTER_STATEMENT = re.compile(r"([;{}]|^(case .*|default|public|private|protected)"
                             r"( slots| Q_SLOTS)?:)$")


def mask(text):
    """The text with comments blanked and literal contents replaced by '_', same offsets."""
    out = list(text)
    i, n = 0, len(text)
    while i < n:
        c = text[i]
        if text.startswith("//", i):
            j = text.find("\n", i)
            j = n if j < 0 else j
            out[i:j] = " " * (j - i)
            i = j
        elif text.startswith("/*", i):
            j = text.find("*/", i + 2)
            j = n if j < 0 else j + 2
            out[i:j] = [ch if ch == "\n" else " " for ch in text[i:j]]
            i = j
        elif c == "R" and text.startswith('R"', i) and (i == 0 or not text[i - 1].isalnum()):
            open_paren = text.index("(", i)
            delimiter = ")" + text[i + 2:open_paren] + '"'
            j = text.index(delimiter, open_paren) + len(delimiter)
            out[i + 1:j] = [ch if ch == "\n" else "_" for ch in text[i + 1:j]]
            out[i + 1] = out[j - 1] = '"'
            i = j
        elif c in "\"'":
            if c == "'" and i > 0 and text[i - 1].isalnum():  # digit separator 1'000
                i += 1
                continue
            j = i + 1
            while j < n and text[j] != c and text[j] != "\n":
                j += 2 if text[j] == "\\" else 1
            out[i + 1:j] = "_" * (j - i - 1)
            i = j + 1
        else:
            i += 1
    return "".join(out)


def matching_paren(line, open_index):
    depth = 0
    for k in range(open_index, len(line)):
        if line[k] == "(":
            depth += 1
        elif line[k] == ")":
            depth -= 1
            if depth == 0:
                return k
    return -1


def enclosing_functions(masked_lines):
    """For each line, the name of the function whose body holds it (or '')."""
    names, depth, pending, current = [], 0, "", ""
    namespace_braces = []
    for line in masked_lines:
        names.append(current if depth > 0 else "")
        # Definitions start in the first column; indented lines are their continuations.
        if depth == 0:
            m = re.search(r"([~\w:]+(?:operator\S+)?)\s*\(", line)
            if re.match(r"\s*(class|struct|enum|union)\b", line):
                pending = ""
            elif m and line[:1].isalpha() and not line.startswith("namespace"):
                pending = m.group(1)
        for ch in line:
            if ch == "{":
                if depth == 0 and re.match(r"\s*(namespace|extern)\b", line):
                    namespace_braces.append(True)
                    continue
                if depth == 0:
                    current = pending
                depth += 1
            elif ch == "}":
                if depth == 0 and namespace_braces:
                    namespace_braces.pop()
                    continue
                depth = max(0, depth - 1)
    return names


def candidates_in(path, rel):
    text = path.read_text(encoding="utf-8")
    masked = mask(text)
    lines, masked_lines = text.split("\n"), masked.split("\n")
    functions = enclosing_functions(masked_lines)
    starts = [0]
    for line in lines:
        starts.append(starts[-1] + len(line) + 1)
    found = []

    def add(kind, index, column, old, new, what):
        found.append({"file": rel, "line": index, "start": starts[index] + column,
                      "old": old, "new": new, "kind": kind, "function": functions[index],
                      "what": what})

    previous_code = ""
    for index, (line, code) in enumerate(zip(lines, masked_lines)):
        stripped = code.strip()
        if not stripped:
            continue
        prior, previous_code = previous_code, stripped
        if stripped.startswith("#") or SKIP_LINE.search(code):
            continue
        if not re.search(r"[A-Za-z0-9]", re.sub(r"\"_*\"|'_*'", "", stripped)):
            continue  # only literals: the middle of a long string
        for m in COMPARISON.finditer(code):
            op = m.group(1)
            add("flip", index, m.start(), op, FLIPS[op], f"`{op}` becomes `{FLIPS[op]}`")
        for m in PLUS_MINUS_ONE.finditer(code):
            add("off-by-one", index, m.start(), m.group(0), "",
                f"`{m.group(0).strip()}` dropped")
        for m in BOOLEAN.finditer(code):
            new = "false" if m.group(1) == "true" else "true"
            add("bool", index, m.start(), m.group(1), new, f"`{m.group(1)}` becomes `{new}`")
        for m in CONDITION.finditer(code):
            open_index = m.end() - 1
            close = matching_paren(code, open_index)
            if close < 0:
                continue
            condition = line[open_index:close + 1]
            if re.search(r"[^=!<>]=[^=]|;", code[open_index:close + 1]):
                continue  # declares or assigns: no longer a condition once negated
            add("negate", index, open_index, condition, f"(!{condition})",
                f"`{m.group(1)} {shorten(condition)}` negated")
        if (CALL_STATEMENT.match(stripped) and AFTER_STATEMENT.search(prior)
                and stripped.count("(") == stripped.count(")")
                and not re.match(r"[A-Z_]+\(", stripped)
                and stripped.split("(")[0].split(" ")[-1] not in STATEMENT_START_KEYWORDS
                and not re.search(r"[^=!<>]=[^=]", stripped)):
            column = len(code) - len(code.lstrip())
            statement = line[column:len(code.rstrip())]
            add("drop", index, column, statement, "", f"`{shorten(statement)}` dropped")
    return text, found


def shorten(snippet, limit=48):
    snippet = " ".join(snippet.split())
    return snippet if len(snippet) <= limit else snippet[:limit - 3] + "..."


def unique_snippet(text, candidate):
    """The changed line, widened to its neighbours until it occurs once in the file."""
    start, end = candidate["start"], candidate["start"] + len(candidate["old"])
    line_start = text.rfind("\n", 0, start) + 1
    while line_start < start and text[line_start] in " \t":
        line_start += 1
    line_end = text.find("\n", end)
    line_end = len(text) if line_end < 0 else line_end
    spans = [(line_start, line_end)]
    lo, hi = line_start, line_end
    while lo > 0 or hi < len(text):
        if lo > 0:
            lo = text.rfind("\n", 0, lo - 1) + 1
        spans.append((lo, hi))
        if hi < len(text):
            hi = text.find("\n", hi + 1)
            hi = len(text) if hi < 0 else hi
        spans.append((lo, hi))
    for lo, hi in spans:
        snippet = text[lo:hi]
        if snippet.strip() and text.count(snippet) == 1:
            offset = start - lo
            replacement = snippet[:offset] + candidate["new"] + snippet[offset + end - start:]
            return snippet, replacement
    raise ValueError(f"no unique snippet for {candidate}")


def folder_sizes():
    sizes = {}
    for folder in FOLDERS:
        sizes[folder] = sum(
            sum(1 for line in p.read_text(encoding="utf-8").splitlines() if line.strip())
            for p in sorted((ROOT / "src" / folder).iterdir()) if p.suffix in (".cpp", ".h"))
    return sizes


def quotas(sizes, total):
    """Largest remainder, at least one per folder."""
    whole = sum(sizes.values())
    exact = {f: total * s / whole for f, s in sizes.items()}
    shares = {f: max(1, int(x)) for f, x in exact.items()}
    for f in sorted(exact, key=lambda f: exact[f] - shares[f], reverse=True):
        if sum(shares.values()) >= total:
            break
        shares[f] += 1
    return shares


def pick(out):
    rng = random.Random(SEED)
    sizes = folder_sizes()
    shares = quotas(sizes, TOTAL)
    mutants = []
    for folder in FOLDERS:
        texts, by_kind = {}, {}
        for path in sorted((ROOT / "src" / folder).iterdir()):
            if path.suffix not in (".cpp", ".h"):
                continue
            rel = path.relative_to(ROOT).as_posix()
            texts[rel], found = candidates_in(path, rel)
            for c in found:
                by_kind.setdefault(c["kind"], []).append(c)
        kinds = sorted(by_kind)
        rng.shuffle(kinds)
        chosen, used_lines = [], set()
        turn = 0
        while len(chosen) < shares[folder] and any(by_kind.values()):
            kind = kinds[turn % len(kinds)]
            turn += 1
            pool = by_kind[kind]
            if not pool:
                continue
            c = pool.pop(rng.randrange(len(pool)))
            if (c["file"], c["line"]) in used_lines:
                continue
            used_lines.add((c["file"], c["line"]))
            chosen.append(c)
        chosen.sort(key=lambda c: (c["file"], c["start"]))
        for c in chosen:
            find, into = unique_snippet(texts[c["file"]], c)
            assert find != into and texts[c["file"]].count(find) == 1, c
            where = f" in {c['function']}()" if c["function"] else ""
            mutants.append({
                "id": len(mutants) + 1, "area": folder, "file": c["file"], "kind": c["kind"],
                "what": f"{KIND_LABELS[c['kind']]}{where}: {c['what']}",
                "find": find, "into": into})
        print(f"{folder:12} {sizes[folder]:5} lines  {len(chosen):3} mutants", file=sys.stderr)
    with open(out, "w", encoding="utf-8") as f:
        for m in mutants:
            f.write(json.dumps(m, ensure_ascii=False) + "\n")
    print(f"{len(mutants)} mutants written to {out}", file=sys.stderr)


def load():
    with open(LIST, encoding="utf-8") as f:
        return [json.loads(line) for line in f if line.strip()]


def select(mutants, selection):
    if not selection:
        return mutants
    wanted = set()
    for term in selection.split(","):
        term = term.strip()
        if term in FOLDERS:
            wanted |= {m["id"] for m in mutants if m["area"] == term}
        elif re.fullmatch(r"\d+", term):
            wanted.add(int(term))
        elif re.fullmatch(r"\d+-\d+", term):
            first, last = map(int, term.split("-"))
            wanted |= set(range(first, last + 1))
        elif term:
            sys.exit(f"mutants: '{term}' is neither an id, a range (3-12) nor a folder name")
    known = {m["id"] for m in mutants}
    if wanted - known:
        sys.exit(f"mutants: no mutant {', '.join(map(str, sorted(wanted - known)))} "
                 f"(the list has 1 to {len(mutants)})")
    return [m for m in mutants if m["id"] in wanted]


def apply(mutant_id, root):
    m = next((m for m in load() if m["id"] == mutant_id), None)
    if m is None:
        sys.exit(f"mutants: no mutant {mutant_id}")
    path = Path(root) / m["file"]
    text = path.read_text(encoding="utf-8")
    count = text.count(m["find"])
    if count != 1:
        print(f"mutants: #{mutant_id}: its snippet occurs {count} times in {m['file']}; "
              "the list needs picking again", file=sys.stderr)
        sys.exit(3)
    path.write_text(text.replace(m["find"], m["into"]), encoding="utf-8")


def order(tests_json, out):
    """Splits the test numbers of `ctest --show-only=json-v1` between each folder's own tests
    and the others, as files for ctest -I."""
    with open(tests_json, encoding="utf-8") as f:
        tests = json.load(f)["tests"]
    numbers = {}
    for number, test in enumerate(tests, start=1):
        numbers.setdefault(Path(test["command"][0]).name, []).append(number)
    everything = set(range(1, len(tests) + 1))

    def write(name, chosen):
        # ctest drops the last character of a file that has no line end.
        text = "0,0,0," + ",".join(map(str, sorted(chosen))) + "\n" if chosen else ""
        (Path(out) / name).write_text(text, encoding="utf-8")

    for folder, executables in FOLDER_TESTS.items():
        first = {n for e in executables for n in numbers.get(e, [])}
        write(f"{folder}.first", first)
        write(f"{folder}.rest", everything - first)
    write("all", everything)
    (Path(out) / "count").write_text(f"{len(tests)}\n", encoding="utf-8")


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    sub = parser.add_subparsers(dest="command", required=True)
    p = sub.add_parser("pick")
    p.add_argument("--out", default=str(LIST))
    p = sub.add_parser("list")
    p.add_argument("selection", nargs="?", default="")
    p = sub.add_parser("apply")
    p.add_argument("id", type=int)
    p.add_argument("root")
    p = sub.add_parser("order")
    p.add_argument("tests_json")
    p.add_argument("dir")
    args = parser.parse_args()
    if args.command == "pick":
        pick(args.out)
    elif args.command == "list":
        for m in select(load(), args.selection):
            print(f"{m['id']}\t{m['file']}\t{m['area']}\t{m['what']}")
    elif args.command == "apply":
        apply(args.id, args.root)
    else:
        order(args.tests_json, args.dir)


if __name__ == "__main__":
    main()
