#!/usr/bin/env python3
"""The same kinds of warm questions through Python.

    python_calls.py SIZE DATABASE
"""

import random
import statistics
import sys
import time

import tarvik

ROUNDS = 11
QUESTIONS = 20_000


def nanoseconds_each(ask, questions):
    start = time.thread_time_ns()
    for question in questions:
        ask(*question)
    return (time.thread_time_ns() - start) / len(questions)


def report(measure, size, ask, questions):
    nanoseconds_each(ask, questions)  # loads what is asked about
    figures = [nanoseconds_each(ask, questions) for _ in range(ROUNDS)]
    print(f"call, {measure}\t{size}\tPython\tns\t{statistics.median(figures):.6g}")


def main():
    size, database = sys.argv[1:]
    manager = tarvik.Manager(database)
    pick = random.Random(4)
    devices = pick.choices(list(manager.get_all_device_idcodes()), k=QUESTIONS)
    modes, outputs = list(tarvik.Mode)[:6], list(tarvik.Output)[:5]
    masks = [(device, pick.choice(modes), pick.choice(outputs)) for device in devices]
    report("operations", size, manager.get_device_operations, masks)
    report("property", size, manager.get_device_string_property, [(device, "PINS") for device in devices])


if __name__ == "__main__":
    main()
