#!/usr/bin/env python3
"""Runs two shell commands in turn and prints the medians of their times and of the ratios.

usage: compare.py ROUNDS COMMAND OTHER
"""
import resource
import statistics
import subprocess
import sys
import time


def run(command):
    """Gives wall and processor seconds."""
    before = resource.getrusage(resource.RUSAGE_CHILDREN)
    begin = time.perf_counter()
    subprocess.run(["sh", "-c", "exec " + command], check=True, stdout=subprocess.DEVNULL)
    wall = time.perf_counter() - begin
    after = resource.getrusage(resource.RUSAGE_CHILDREN)
    return wall, after.ru_utime + after.ru_stime - before.ru_utime - before.ru_stime


def main():
    rounds, first, second = int(sys.argv[1]), sys.argv[2], sys.argv[3]
    run(first)
    run(second)
    pairs = [(run(first), run(second)) for _ in range(rounds)]
    for index, name in enumerate(("wall", "cpu")):
        mine = [a[index] * 1000 for a, _ in pairs]
        other = [b[index] * 1000 for _, b in pairs]
        ratios = sorted(a / b for a, b in zip(mine, other))
        print("%-5s %6.1f ms beside %6.1f ms, ratio %.2f (%.2f to %.2f in %d rounds)" % (
            name, statistics.median(mine), statistics.median(other), statistics.median(ratios),
            ratios[0], ratios[-1], rounds))


main()
