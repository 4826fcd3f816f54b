#!/usr/bin/env python3
"""Times the Release `quillon` with and without its parse cache on the generated 10,000-file
VHDL project of cli-bench.py, and how long `quillon watch` takes to answer a changed file.

Usage: bench/cache-bench.py [--quillon PATH] [--work DIR] [--count N] [--command order]

Rows: cold without cache (--no-cache), cold with an empty cache (parses and writes every entry),
nothing changed, one file changed; then watch: the time from writing one file to the new answer
(median of several edits). Each row gives the best wall time and the best processor time (user
and system) of its runs: on a shared machine the processor time is the steadier measure.
"""
import argparse
import importlib.util
import os
import resource
import select
import shutil
import statistics
import subprocess
import time

HERE = os.path.dirname(os.path.abspath(__file__))
module_file = importlib.util.spec_from_file_location("cli_bench", os.path.join(HERE, "cli-bench.py"))
cli_bench = importlib.util.module_from_spec(module_file)
module_file.loader.exec_module(cli_bench)


def processor_time():
    used = resource.getrusage(resource.RUSAGE_CHILDREN)
    return used.ru_utime + used.ru_stime


def timed(args):
    start, cpu = time.monotonic(), processor_time()
    proc = subprocess.run(args, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL)
    return time.monotonic() - start, processor_time() - cpu, proc.returncode


# The best wall time and the best processor time of the runs.
def best(args, runs, before=None):
    walls, cpus = [], []
    for _ in range(runs):
        if before:
            before()
        wall, cpu, _ = timed(args)
        walls.append(wall)
        cpus.append(cpu)
    return min(walls), min(cpus)


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

    rows = [("cold, no cache", best([args.quillon, "-q", "--no-cache", args.command, "-f", listing], args.runs)),
            ("cold, empty cache", best(base, args.runs, before=lambda: shutil.rmtree(cache, ignore_errors=True))),
            ("nothing changed", best(base, args.runs)),
            ("one file changed", best(base, args.runs, before=lambda: edit(changed)))]
    cold_wall, cold_cpu = rows[0][1]
    print(f"vhdl-{args.count} {args.command}")
    for name, (wall, cpu) in rows:
        print(f"  {name:20s} {wall:8.3f} s wall {100 * wall / cold_wall:6.1f} %   "
              f"{cpu:8.3f} s cpu {100 * cpu / cold_cpu:6.1f} %")
    reactions, status = watch_reaction(args.quillon, listing, changed, 5)
    if reactions:
        print(f"  watch, one file       {statistics.median(reactions) * 1000:8.1f} ms (median of {len(reactions)}), "
              f"exit {status}")
    else:
        print(f"  watch gave no answer, exit {status}")


if __name__ == "__main__":
    main()
