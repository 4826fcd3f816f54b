#!/usr/bin/env python3
"""Times the Release `quillon` with and without its parse cache on the generated 10,000-file
VHDL project of cli-bench.py, and how long `quillon watch` takes to answer a changed file.

Usage: bench/cache-bench.py [--quillon PATH] [--work DIR] [--count N] [--command order]

Rows: cold without cache (--no-cache), cold with an empty cache (parses and writes every entry),
nothing changed, one file changed; then watch: the time from writing one file to the new answer
(median of several edits).
"""
import argparse
import importlib.util
import os
import select
import shutil
import statistics
import subprocess
import time

HERE = os.path.dirname(os.path.abspath(__file__))
module_file = importlib.util.spec_from_file_location("cli_bench", os.path.join(HERE, "cli-bench.py"))
cli_bench = importlib.util.module_from_spec(module_file)
module_file.loader.exec_module(cli_bench)


def timed(args):
    start = time.monotonic()
    proc = subprocess.run(args, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
    return time.monotonic() - start, proc.returncode


def best(args, runs, before=None):
    times = []
    for _ in range(runs):
        if before:
            before()
        wall, status = timed(args)
        times.append(wall)
    return min(times), status


def edit(path, counter=[0]):
    counter[0] += 1
    with open(path, "a") as out:
        out.write(f"-- edit {counter[0]}\nentity bench_edit_{counter[0]} is\nend entity;\n")


def watch_reaction(quillon, listing, path, edits):
    proc = subprocess.Popen([quillon, "-q", "watch", "--show", "check", "--format", "json", "-f", listing],
                            stdout=subprocess.PIPE, stderr=subprocess.DEVNULL)
    proc.stdout.readline()  # the first answer
    reactions = []
    for _ in range(edits):
        start = time.monotonic()
        edit(path)
        ready, _, _ = select.select([proc.stdout], [], [], 60)
        if not ready:
            break
        proc.stdout.readline()
        reactions.append(time.monotonic() - start)
    proc.send_signal(2)
    status = proc.wait(timeout=60)
    return reactions, status


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--quillon", default=os.path.join(cli_bench.ROOT, "build/release/apps/quillon/quillon"))
    parser.add_argument("--work", default="/tmp/quillon-cli-bench")
    parser.add_argument("--count", type=int, default=10000)
    parser.add_argument("--command", default="order")
    parser.add_argument("--runs", type=int, default=3)
    args = parser.parse_args()
    listing, _ = cli_bench.project(args.work, "vhdl", args.count)
    with open(listing) as names:
        changed = names.readline().strip()
    cache = os.path.join(args.work, f"cache-vhdl-{args.count}")
    base = [args.quillon, "-q", "--cache", cache, args.command, "-f", listing]

    cold_plain, _ = best([args.quillon, "-q", "--no-cache", args.command, "-f", listing], args.runs)
    cold, _ = best(base, args.runs, before=lambda: shutil.rmtree(cache, ignore_errors=True))
    unchanged, _ = best(base, args.runs)
    one, _ = best(base, args.runs, before=lambda: edit(changed))
    print(f"vhdl-{args.count} {args.command}")
    print(f"  cold, no cache        {cold_plain:8.3f} s")
    print(f"  cold, empty cache     {cold:8.3f} s")
    print(f"  nothing changed       {unchanged:8.3f} s  {100 * unchanged / cold_plain:5.1f} % of cold")
    print(f"  one file changed      {one:8.3f} s  {100 * one / cold_plain:5.1f} % of cold")
    reactions, status = watch_reaction(args.quillon, listing, changed, 5)
    if reactions:
        print(f"  watch, one file       {statistics.median(reactions) * 1000:8.1f} ms (median of {len(reactions)}), "
              f"exit {status}")
    else:
        print(f"  watch gave no answer, exit {status}")


if __name__ == "__main__":
    main()
