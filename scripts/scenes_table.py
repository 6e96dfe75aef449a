#!/usr/bin/env python3
"""Writes the table of bench/scenes/RESULTS.md from the outputs of the scene programs.

Each output file is <library>.<repeat>.txt with one line per measurement:
    <library> <scene> median_us=... min_us=... ... allocs=... samples=...
    <library> <scene> value=...
The table holds, per scene, the median over the repeats of each library's median (or value), and
qorui's ratio to each peer; then the targets, met or missed. Everything below the line
"<!-- kept -->" of the file named by --keep is carried over unchanged (the profiles written by
hand).
"""
import argparse
import glob
import os
import statistics

LIBRARIES = ["qorui", "cegui", "imgui"]
TITLES = {"qorui": "qorui", "cegui": "CEGUI", "imgui": "Dear ImGui"}
ROWS = [
    ("S1_frame", "S1 frame of 1,000 buttons (µs)"),
    ("S1_frame_cached", "S1 frame, geometry cached (µs)"),
    ("S2_move", "S2 pointer move (µs)"),
    ("S2_move+frame", "S2 pointer move and frame (µs)"),
    ("S3_load+free", "S3 layout loaded, attached, destroyed (µs)"),
    ("S4_frame", "S4 frame of 200 lines (µs)"),
    ("S4_frame_cached", "S4 frame, geometry cached (µs)"),
    ("MEM_bytes/btn", "bytes per button"),
    ("MEM_allocs/btn", "heap allocations per button"),
    ("MEM_allocs/frm", "heap allocations per steady frame"),
    ("S1_quads", "quads of an S1 frame"),
    ("S4_quads", "quads of an S4 frame"),
]
# (description, qorui's scene, peer, peer's scene, largest ratio)
TARGETS = [
    ("S1 at most 0.5 times Dear ImGui's frame", "S1_frame", "imgui", "S1_frame", 0.5),
    ("S1 at most 2 times CEGUI's cached frame", "S1_frame", "cegui", "S1_frame_cached", 2.0),
    ("S2 at most CEGUI's move", "S2_move", "cegui", "S2_move", 1.0),
    ("S3 at most 0.1 times CEGUI's", "S3_load+free", "cegui", "S3_load+free", 0.1),
    ("S4 at most 0.5 times Dear ImGui's frame", "S4_frame", "imgui", "S4_frame", 0.5),
    ("bytes per button at most 0.1 times CEGUI's", "MEM_bytes/btn", "cegui", "MEM_bytes/btn", 0.1),
]


def read(folder):
    figures = {}  # (library, scene) -> [figure of each repeat]
    for path in sorted(glob.glob(os.path.join(folder, "*.txt"))):
        for line in open(path):
            parts = line.split()
            if len(parts) < 3:
                continue
            fields = dict(p.split("=", 1) for p in parts[2:] if "=" in p)
            figure = fields.get("median_us", fields.get("value"))
            if figure is not None:
                figures.setdefault((parts[0], parts[1]), []).append(float(figure))
    return {key: statistics.median(values) for key, values in figures.items()}


def number(value):
    if value is None:
        return "n/a"
    if abs(value) >= 100:
        return f"{value:,.0f}"
    return f"{value:.2f}" if abs(value) >= 1 or value == 0 else f"{value:.3f}"


def ratio(a, b):
    if a is None or b is None or b == 0:
        return "n/a"
    return f"{a / b:.2f}"


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("folder")
    parser.add_argument("--machine", default="")
    parser.add_argument("--versions", default="")
    parser.add_argument("--keep", default="")
    args = parser.parse_args()
    figures = read(args.folder)
    out = ["# Scene benchmarks: qorui, CEGUI and Dear ImGui side by side", ""]
    out += ["Written by scripts/bench_scenes.sh; the scenes are those of bench/scenes/scenes.h.", ""]
    out += [f"- Machine: {args.machine}", f"- Versions: {args.versions}"]
    out += ["- Figures: the median over three interleaved runs of each program's median; times in "
            "microseconds per iteration.", ""]
    out += ["| Measurement | " + " | ".join(TITLES[l] for l in LIBRARIES) + " | qorui / CEGUI | qorui / Dear ImGui |"]
    out += ["|---|" + "---:|" * (len(LIBRARIES) + 2)]
    for key, title in ROWS:
        row = [figures.get((l, key)) for l in LIBRARIES]
        if all(v is None for v in row):
            continue
        out.append(f"| {title} | " + " | ".join(number(v) for v in row) +
                   f" | {ratio(row[0], row[1])} | {ratio(row[0], row[2])} |")
    out += ["", "## Targets", "", "| Target | qorui | peer | ratio | |", "|---|---:|---:|---:|---|"]
    for title, scene, peer, peer_scene, limit in TARGETS:
        mine, theirs = figures.get(("qorui", scene)), figures.get((peer, peer_scene))
        met = "n/a" if mine is None or theirs is None or theirs == 0 else \
            ("met" if mine / theirs <= limit else "missed")
        out.append(f"| {title} | {number(mine)} | {number(theirs)} | {ratio(mine, theirs)} | {met} |")
    steady = figures.get(("qorui", "MEM_allocs/frm"))
    out.append(f"| no heap allocation in a steady frame | {number(steady)} | | | "
               f"{'n/a' if steady is None else ('met' if steady == 0 else 'missed')} |")
    kept = []
    if args.keep and os.path.exists(args.keep):
        lines = open(args.keep).read().splitlines()
        if "<!-- kept -->" in lines:
            kept = lines[lines.index("<!-- kept -->"):]
    out += [""] + (kept or ["<!-- kept -->"])
    print("\n".join(out))


if __name__ == "__main__":
    main()
