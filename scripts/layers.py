#!/usr/bin/env python3
"""Prints the include graph between the folders of src/ and fails (status 1)
on an include that goes up or sideways in the layer order, which also rules
out cycles.

Each folder may include itself and the folders listed for it below; a folder
missing from the list fails too, so that a new one gets its place on purpose.
"""
import os
import re
import sys
from collections import defaultdict

# Bottom to top; a folder may include the folders of lower rank. Folders of
# one rank (the summarizers and the domains) stay apart.
RANKS = ["base", "Records", "store", "time", "accum", "framework", ("summarizers", "domains"), "model", "reports",
         "service", "cli", "."]  # "." is main.cc
LAYERS = {}
for rank, entry in enumerate(RANKS):
    for folder in entry if isinstance(entry, tuple) else (entry,):
        LAYERS[folder] = [f for r, e in enumerate(RANKS[:rank]) for f in (e if isinstance(e, tuple) else (e,))]
# The recorder is a program of its own over the records and the store.
LAYERS["recorder"] = ["base", "Records", "store"]

INCLUDE = re.compile(r'^\s*#\s*include\s+"([^"/]+)/[^"]+"', re.MULTILINE)


def main():
    src = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "src")
    src = os.path.normpath(sys.argv[1] if len(sys.argv) > 1 else src)
    edges = defaultdict(lambda: defaultdict(list))  # from -> to -> files
    for root, _, names in os.walk(src):
        for name in sorted(names):
            if not name.endswith((".h", ".cc")):
                continue
            path = os.path.join(root, name)
            folder = os.path.relpath(root, src).split(os.sep)[0]
            with open(path, encoding="utf-8") as f:
                for target in INCLUDE.findall(f.read()):
                    if target != folder:
                        edges[folder][target].append(os.path.relpath(path, src))

    problems = []
    for folder in sorted(set(edges) | {d for d in os.listdir(src) if os.path.isdir(os.path.join(src, d))}):
        if folder not in LAYERS:
            problems.append(f"{folder}: not in the layer list of scripts/layers.py")
    for folder in sorted(set(edges) | set(LAYERS) & set(os.listdir(src))):
        allowed = LAYERS.get(folder, [])
        targets = edges[folder]
        print(f"{folder} -> {', '.join(sorted(targets)) or '(nothing)'}")
        for target in sorted(targets):
            if target not in allowed:
                files = ", ".join(sorted(set(targets[target])))
                problems.append(f"{folder} -> {target} goes up or sideways (in {files})")
    for p in problems:
        print("layers: " + p, file=sys.stderr)
    return 1 if problems else 0


if __name__ == "__main__":
    sys.exit(main())
