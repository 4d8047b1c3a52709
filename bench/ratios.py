#!/usr/bin/env python3
"""Prints the ratios of the benchmark suite from Google Benchmark's JSON output.

Usage: ratios.py RESULTS.json [--markdown]

Each time is the median of the repetitions when the run had several (else
the single run). Ratios are given on wall-clock time and on CPU time: on a
machine shared with other work the CPU time is the steadier of the two, while
the wall-clock time also counts waiting for the disk.
"""

import json
import sys

SIZES = (10000, 100000, 1000000)
GROWTH_FROM, GROWTH_TO = 100000, 1000000

# (label, numerator benchmark, denominator benchmark, goal or None)
RATIOS = (
    ("load / minimal-parse loop", "BM_Load", "BM_LoadMinimalParse", 2.0),
    ("load / getline loop", "BM_Load", "BM_LoadGetline", None),
    ("save / fprintf loop", "BM_Save", "BM_SaveFprintf", 1.5),
    ("write to a stream / fprintf loop", "BM_Write", "BM_SaveFprintf", 1.5),
    ("forward Find / fetching every measure", "BM_FindForward", "BM_TouchMeasures", None),
    ("compute / load", "BM_Compute", "BM_Load", 3.0),
)
GROWTH = ("BM_Load", "BM_LoadMinimalParse", "BM_Save", "BM_Write", "BM_SaveFprintf", "BM_FindForward", "BM_TouchMeasures",
          "BM_FindBackward", "BM_HasPnt", "BM_LastMatPoints", "BM_LastMatAny")
GROWTH_GOAL = 1.15
PER_ELEMENT = ("BM_FindForward", "BM_TouchMeasures", "BM_FindBackward", "BM_HasPnt", "BM_LastMatPoints",
               "BM_LastMatAny")
FIND_GOAL_NS = 3.0
MEMORY_GOAL = 3.0
PER_CALL = ("BM_IsPointInSel", "BM_FormMatNormalise", "BM_FormMatBuild", "BM_InitCode", "BM_Interprete",
            "BM_FindRepAtEveryStation")

# carnet check against the plain C loop, whole processes (median of 5 runs).
TOOL_GOAL = 1.3
TOOL_MEMORY_GOAL = 2.0

# The selection matcher: its cost must grow with the logarithm of the number
# of groups, not with the number (cpu time, from 10 groups to each count).
SELECT_GROUPS = (10, 100, 1000)
SELECT_GROWTH_GOAL = 2.0

TO_NS = {"ns": 1.0, "us": 1e3, "ms": 1e6, "s": 1e9}


def load(path):
    with open(path, encoding="utf-8") as f:
        data = json.load(f)
    runs = {}
    medians = {}
    for b in data.get("benchmarks", []):
        name = b.get("run_name", b["name"])
        # A name like BM_LoadMemory/10000/iterations:1 is keyed without its options.
        key = "/".join(p for p in name.split("/") if ":" not in p and p not in ("manual_time", "real_time"))
        if b.get("run_type") == "aggregate":
            if b.get("aggregate_name") == "median":
                medians[key] = b
        elif b.get("error_occurred"):
            continue
        else:
            runs.setdefault(key, b)
    runs.update(medians)
    return data.get("context", {}), runs


def ns(run, clock):
    return run[clock + "_time"] * TO_NS[run.get("time_unit", "ns")]


def status(value, goal):
    if goal is None or value is None:
        return ""
    return "ok" if value <= goal else "SHORT"


def fmt(v, digits=2):
    return "-" if v is None else f"{v:.{digits}f}"


class Table:
    def __init__(self, markdown):
        self.markdown = markdown
        self.rows = []

    def add(self, *cells):
        self.rows.append([str(c) for c in cells])

    def show(self, header):
        rows = [list(header)] + self.rows
        if self.markdown:
            print("| " + " | ".join(rows[0]) + " |")
            print("|" + "|".join("---" for _ in rows[0]) + "|")
            for r in rows[1:]:
                print("| " + " | ".join(r) + " |")
        else:
            widths = [max(len(r[i]) for r in rows) for i in range(len(header))]
            for k, r in enumerate(rows):
                print("  ".join(c.ljust(w) for c, w in zip(r, widths)).rstrip())
                if k == 0:
                    print("  ".join("-" * w for w in widths))
        print()
        self.rows = []


def ratio(runs, num, den, size, clock):
    a, b = runs.get(f"{num}/{size}"), runs.get(f"{den}/{size}")
    if not a or not b:
        return None
    return ns(a, clock) / ns(b, clock)


def growth(runs, name, clock):
    a, b = runs.get(f"{name}/{GROWTH_FROM}"), runs.get(f"{name}/{GROWTH_TO}")
    if not a or not b:
        return None
    # Per element visited where the benchmark says how many it visits.
    na = a.get("visited", a.get("elements", GROWTH_FROM))
    nb = b.get("visited", b.get("elements", GROWTH_TO))
    return (ns(b, clock) / ns(a, clock)) / (nb / na)


def main(argv):
    if len(argv) < 2:
        print(__doc__.strip())
        return 2
    context, runs = load(argv[1])
    table = Table("--markdown" in argv[2:])

    print(f"machine: {context.get('num_cpus', '?')} CPUs at {context.get('mhz_per_cpu', '?')} MHz, "
          f"load average {', '.join(f'{x:.2f}' for x in context.get('load_avg', []))}")
    print()

    print("Ratios (medians; 'ok' / 'SHORT' against the goal, on wall-clock and on CPU time)")
    for label, num, den, goal in RATIOS:
        for size in SIZES:
            r, c = ratio(runs, num, den, size, "real"), ratio(runs, num, den, size, "cpu")
            if r is None:
                continue
            table.add(label, size, fmt(r), status(r, goal), fmt(c), status(c, goal),
                      "-" if goal is None else f"<= {goal}")
    table.show(("ratio", "elements", "wall", "", "cpu", "", "goal"))

    print(f"Growth from {GROWTH_FROM} to {GROWTH_TO} elements (1.00 is linear)")
    for name in GROWTH:
        r, c = growth(runs, name, "real"), growth(runs, name, "cpu")
        if r is None:
            continue
        goal = GROWTH_GOAL if name in ("BM_Load", "BM_Save") else None
        table.add(name, fmt(r), status(r, goal), fmt(c), status(c, goal), f"<= {goal}" if goal else "-")
    table.show(("benchmark", "wall", "", "cpu", "", "goal"))

    print("Cost per element visited (ns)")
    for name in PER_ELEMENT:
        for size in SIZES:
            run = runs.get(f"{name}/{size}")
            if not run:
                continue
            visited = run.get("visited", size)
            r, c = ns(run, "real") / visited, ns(run, "cpu") / visited
            goal = FIND_GOAL_NS if name == "BM_FindForward" else None
            table.add(name, size, fmt(r), status(r, goal), fmt(c), status(c, goal), f"<= {goal}" if goal else "-")
    table.show(("benchmark", "elements", "wall", "", "cpu", "", "goal"))

    print("Memory after a load (fresh process, resident size from the kernel)")
    for size in SIZES:
        run = runs.get(f"BM_LoadMemory/{size}")
        if not run:
            continue
        peak = run.get("peak_over_file")
        table.add(size, f"{run.get('file_bytes', 0) / 1e6:.1f}", fmt(run.get("peak_bytes_per_element"), 0),
                  fmt(peak), status(peak, MEMORY_GOAL), f"<= {MEMORY_GOAL}")
    table.show(("elements", "file MB", "peak bytes/element", "peak / file", "", "goal"))

    print("carnet check of the 1-million-element book against the C getline + split + strtod loop (whole processes)")
    tool, loop = runs.get("BM_ToolCheck"), runs.get("BM_CLoopCheck")
    if tool and loop:
        wall = ns(tool, "real") / ns(loop, "real")
        cpu = tool.get("child_cpu_s", 0) / loop["child_cpu_s"] if loop.get("child_cpu_s") else None
        peak = tool.get("peak_over_file")
        table.add("carnet check / C loop", fmt(ns(tool, "real") / 1e6, 0), fmt(ns(loop, "real") / 1e6, 0), fmt(wall),
                  status(wall, TOOL_GOAL), fmt(cpu), status(cpu, TOOL_GOAL), f"<= {TOOL_GOAL}")
        table.add("peak memory of carnet check / file", "", "", fmt(peak), status(peak, TOOL_MEMORY_GOAL), "", "",
                  f"<= {TOOL_MEMORY_GOAL}")
    table.show(("measure", "tool ms", "loop ms", "wall", "", "cpu", "", "goal"))

    print("Selection matched against every element of the 100 000-element book (ms)")
    few = runs.get(f"BM_SelectMatcher/{SELECT_GROUPS[0]}")
    for groups in SELECT_GROUPS:
        m, p = runs.get(f"BM_SelectMatcher/{groups}"), runs.get(f"BM_SelectIsPointInSel/{groups}")
        if not m:
            continue
        g = ns(m, "cpu") / ns(few, "cpu") if few else None
        table.add(groups, fmt(ns(m, "cpu") / 1e6), fmt(ns(p, "cpu") / 1e6) if p else "-", fmt(g),
                  status(g, SELECT_GROWTH_GOAL), f"<= {SELECT_GROWTH_GOAL}")
    table.show(("groups", "matcher", "IsPointInSel per element", f"matcher / {SELECT_GROUPS[0]} groups", "", "goal"))

    print("Time per call (ns)")
    for name in PER_CALL:
        for key in sorted(k for k in runs if k == name or k.startswith(name + "/")):
            run = runs[key]
            items = run.get("items_per_second")
            if not items:
                continue
            # items_per_second is counted on CPU time.
            per_item_cpu = 1e9 / items
            per_item_real = per_item_cpu * ns(run, "real") / ns(run, "cpu")
            table.add(key, fmt(per_item_real, 0), fmt(per_item_cpu, 0))
    table.show(("benchmark", "wall", "cpu"))
    return 0


if __name__ == "__main__":
    sys.exit(main(sys.argv))
