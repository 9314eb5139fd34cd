#!/usr/bin/env python3
"""Prints a table of results, and which figures are reached."""

import statistics
import sys

KINDS = ("operations", "options", "check", "property")
MAP, HASH_MAP, LMDB, SQLITE = "std::map", "std::unordered_map", "LMDB", "SQLite"


def read(path):
    """The results by (measure, size) and contender; of repeated ones the median."""
    found = {}
    with open(path, encoding="ascii") as lines:
        for line in lines:
            measure, size, contender, _, value = line.rstrip("\n").split("\t")
            found.setdefault((measure, size), {}).setdefault(contender, []).append(float(value))
    return {key: {name: statistics.median(values) for name, values in row.items()} for key, row in found.items()}


def shown(value):
    return f"{value:,.0f}" if value >= 100 else f"{value:.3g}"


def is_of_its_own(measure, row):
    """Is it measured with contenders of its own, or with none?"""
    return len(row) == 1 or measure == "batch" or measure.startswith("call, ")


def table(results):
    contenders = []
    for row in results.values():
        contenders += [name for name in row if name not in contenders]
    side_by_side = [name for name in contenders if any(
        name in row and not is_of_its_own(measure, row) for (measure, _), row in results.items())]
    print("| measure | size | " + " | ".join(side_by_side) + " |")
    print("|---" * (2 + len(side_by_side)) + "|")
    for (measure, size), row in results.items():
        if not is_of_its_own(measure, row):
            cells = [shown(row[name]) if name in row else "" for name in side_by_side]
            print(f"| {measure} | {size} | " + " | ".join(cells) + " |")
    print("\n| measure | size | |\n|---|---|---|")
    for (measure, size), row in results.items():
        if is_of_its_own(measure, row):
            print(f"| {measure} | {size} | " + ", ".join(f"{name} {shown(value)}" for name, value in row.items()) + " |")


def figures(results):
    """Each figure as (what, where, value, limit); a value up to the limit reaches it."""
    # The smallest size is there for the growth.
    sizes = [size for measure, size in results if measure == "loading" and size != "XS"]
    for size in sizes:
        for kind in ("operations", "options", "check"):
            for wait in ("independent", "dependent"):
                row = results[f"{kind}, {wait}", size]
                mine = row["manager"]
                yield f"{kind}, {wait}: part of a std::map", size, mine / row[MAP], 2
                yield f"{kind}, {wait}: part of LMDB", size, mine / row[LMDB], 1 / 3
                yield f"{kind}, {wait}: part of SQLite", size, mine / row[SQLITE], 1 / 5
        for wait in ("independent", "dependent"):
            row = results[f"property, {wait}", size]
            mine = row["manager"]
            yield f"property, {wait}: part of a flat unordered_map", size, mine / row[HASH_MAP], 1.5
            yield f"property, {wait}: part of the faster of LMDB and SQLite", size, mine / min(row[LMDB], row[SQLITE]), 1
        for kind in KINDS:
            yield f"{kind}: allocations", size, results[f"{kind}, allocations", size]["manager"], 0
        nothing = results["nothing", size]["process"]
        if size in ("S", "L"):
            first = results["first question", size]["process"] - nothing
            yield "first question, ms", size, first, 1.1 if size == "S" else 18
            indexed = results["first question, with an index", size]["process"] - nothing
            yield "first question with an index, ms", size, indexed, 1.1 if size == "S" else 8
            start = results["start-up", size]["process"] - nothing
            yield "start-up, ms", size, start, 1.1 if size == "S" else 5
        for kind in ("operations", "property"):
            row = results[f"call, {kind}", size]
            yield f"{kind} through C: ns above 1.3 times C++", size, row["C"] - 1.3 * row["C++"], 20
        yield "operations through Python, us", size, results["call, operations", size]["Python"] / 1000, 3
        if size in ("M", "L"):
            keystroke = results["keystroke, 99th percentile", size]["lsp"]
            yield "findings after a keystroke, 99th percentile, ms", size, keystroke, 50 if size == "M" else 300
        batch = results["batch", size]["requests a second"]
        yield "batch: 200,000 requests a second, part of what it does", size, 200_000 / batch, 1
        for command in ("which, property", "diff", "report"):
            clock = [results[f"{command}{fault}, by the clock", size]["process"] for fault in ("", ", with a fault")]
            yield f"{command}: growth by a fault", size, clock[1] / clock[0], 3
        if size == "L":
            loading = results["loading", size]
            memory = results["loading, peak memory", size]
            yield "loading: part of a flat unordered_map", size, loading["manager"] / loading[HASH_MAP], 1.5
            yield "memory: part of a flat unordered_map", size, memory["manager"] / memory[HASH_MAP], 2
            yield "dump operations, ms", size, results["dump operations", size]["process"], 1000
            for command, limit in (("which, property", 1000), ("lint", 1500), ("diff", 3000), ("report", 3000)):
                yield f"{command}, ms", size, results[f"{command}, by the clock", size]["process"], limit
            for command, limit in (("lint", 400), ("diff", 500e6 / 2**20)):
                yield f"{command}, MiB", size, results[f"{command}, peak memory", size]["process"], limit
    if "S" in sizes and "L" in sizes:
        measure = "operations, independent"
        yield "operations: growth", "S to L", results[measure, "L"]["manager"] / results[measure, "S"]["manager"], 4
    compile_time = results["compile time", "header"]
    yield "compile time: part of <map>", "header", compile_time["ConstraintsManager.h"] / compile_time["<map>"], 2.8
    items = {size: row["manager"] for (measure, size), row in results.items() if measure == "item of a list"}
    yield "item of a list: growth", "100 to 32767", items["32767"] / items["100"], 1.5


def main():
    results = read(sys.argv[1])
    table(results)
    print("\n| figure | size | measured | at most | |\n|---|---|---|---|---|")
    for what, size, value, limit in figures(results):
        verdict = "reached" if value <= limit else "not reached"
        print(f"| {what} | {size} | {value:.2f} | {limit:.2f} | {verdict} |")


if __name__ == "__main__":
    main()
