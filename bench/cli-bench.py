#!/usr/bin/env python3
"""Runs the Release `quillon` on generated projects and prints wall time and peak memory.

Usage: bench/cli-bench.py [--quillon PATH] [--work DIR] [--only NAME...]

The projects (written once into the work folder, default /tmp/quillon-cli-bench):
  diamond-N      packages pkg_k using pkg_(k-1) and pkg_(k-2), one file each
  vhdl-N         N files (~5 KB each): a package using two later packages, an entity and an
                 architecture with processes, one instance of a child entity per four files
                 (a tree of instances) and library-cell instances
  verilog-N      N files (~7 KB each): modules with parameters, assigns, always blocks and a
                 generate loop in a tree of instances, a shared `include header and a `define
                 in every tenth file that later files use
  mixed-N        half of vhdl-N and half of verilog-N
  vchain-N       a VHDL chain of N entities, each architecture instantiating the next
  mchain-N       a Verilog chain of N modules, each instantiating the next
  pchain-N       a VHDL chain of N packages, each using the next
"""
import argparse
import os
import random
import subprocess
import sys
import time

HERE = os.path.dirname(os.path.abspath(__file__))
ROOT = os.path.dirname(HERE)


def write(path, text):
    os.makedirs(os.path.dirname(path), exist_ok=True)
    with open(path, "w") as out:
        out.write(text)


def diamond(folder, count):
    paths = []
    for k in range(count):
        uses = "".join(f"use work.pkg_{j}.all;\n" for j in (k - 1, k - 2) if j >= 0)
        path = os.path.join(folder, f"pkg_{k}.vhd")
        write(path, f"{uses}package pkg_{k} is\n  constant c_{k} : integer := {k};\nend package;\n")
        paths.append(path)
    return paths


PROCESS = """  p_{n} : process (clk)
    variable acc : integer := 0;
  begin
    if rising_edge(clk) then
      -- accumulate and compare, a typical clocked block of generated RTL
      acc := acc + {n};
      if acc > 1000 then
        r_{n} <= not r_{n};
      else
        r_{n} <= d({m});
      end if;
    end if;
  end process;
"""


def vhdl_file(index, rng, cells):
    uses = "library ieee;\nuse ieee.std_logic_1164.all;\n"
    # Packages of later files only, as the instances point to later files: no file cycles.
    later = cells - index - 1
    for j in sorted({index + 1 + rng.randrange(later) for _ in range(2)} if later > 0 else set()):
        uses += f"use work.pkg_{j}.all;\n"
    text = uses + f"package pkg_{index} is\n"
    for c in range(8):
        text += f"  constant k_{index}_{c} : integer := {rng.randrange(1000)};\n"
    text += f"  type state_{index} is (idle, busy, done);\nend package;\n\n"
    text += uses + f"use work.pkg_{index}.all;\n"
    text += f"entity ent_{index} is\n  port (clk : in std_logic; d : in std_logic_vector(7 downto 0); q : out std_logic);\nend entity;\n\n"
    text += f"architecture rtl of ent_{index} is\n"
    processes = 12
    for n in range(processes):
        text += f"  signal r_{n} : std_logic;\n"
    children = [c for c in range(4 * index + 1, 4 * index + 5)]
    text += "begin\n"
    for c in children:
        if c < cells:
            text += f"  u_{c} : entity work.ent_{c} port map (clk => clk, d => d, q => open);\n"
    for n in range(3):
        text += f"  cell_{n} : QL_INV port map (A => r_{n}, Y => open);\n"
    for n in range(processes):
        text += PROCESS.format(n=n, m=n % 8)
    text += "  q <= r_0;\nend architecture;\n"
    return text


def vhdl_project(folder, count, seed=7):
    rng = random.Random(seed)
    paths = []
    for i in range(count):
        path = os.path.join(folder, f"f{i}.vhd")
        write(path, vhdl_file(i, rng, count))
        paths.append(path)
    return paths


HEADER = "`ifndef BENCH_DEFS_VH\n`define BENCH_DEFS_VH\n`define BUS_WIDTH 32\n`define PICK(s, a, b) ((s) ? (a) : (b))\n`endif\n"


VERILOG_BLOCK = """  // stage {n}: registered datapath with a saturating counter and a small state machine
  reg [{width}-1:0] r_{n};
  reg [7:0] cnt_{n};
  reg [1:0] st_{n};
  wire [{width}-1:0] w_{n} = r_{n} ^ {{ {{({width}-8){{1'b0}}}}, cnt_{n} }};
  assign sum_{n} = `PICK(en_{n}, r_{n} + w_{n}, r_{n} - LIMIT);
  always @(posedge clk or negedge rst_n) begin
    if (!rst_n) begin
      r_{n} <= {{{width}{{1'b0}}}};
      cnt_{n} <= 8'd0;
      st_{n} <= 2'd0;
    end else begin
      /* the counter saturates at LIMIT and the state follows it */
      if (cnt_{n} != LIMIT[7:0])
        cnt_{n} <= cnt_{n} + 8'd1;
      case (st_{n})
        2'd0: if (d[{bit}]) st_{n} <= 2'd1;
        2'd1: st_{n} <= cnt_{n}[0] ? 2'd2 : 2'd1;
        2'd2: begin r_{n} <= `PICK(d[0], d + {n}, r_{n} ^ {mask}); st_{n} <= 2'd3; end
        default: st_{n} <= 2'd0;
      endcase
    end
  end
"""


def verilog_file(index, count, rng):
    """About 7 KB of RTL: parameters, wires and assigns, always blocks, a generate loop, comments."""
    text = f'// generated module {index}: a stage of the benchmark tree\n`include "bench_defs.vh"\n'
    if index % 10 == 0:
        text += f"`define W_{index} {8 + index % 24}\n"
    width = f"`W_{(index // 10) * 10}"
    text += (f"module mod_{index} #(parameter LIMIT = {rng.randrange(16, 200)}, parameter DEPTH = 4)\n"
             f"  (input clk, input rst_n, input [{width}-1:0] d, output reg [`BUS_WIDTH-1:0] q);\n")
    blocks = 8
    text += "".join(f"  wire en_{n} = d[{n % 8}] & rst_n;\n  wire [{width}-1:0] sum_{n};\n" for n in range(blocks))
    for n in range(blocks):
        text += VERILOG_BLOCK.format(n=n, width=width, bit=n % 8, mask=rng.randrange(255))
    text += (f"  // a delay line built by a generate loop\n  reg [{width}-1:0] dl [0:DEPTH-1];\n"
             "  genvar g;\n  generate\n    for (g = 1; g < DEPTH; g = g + 1) begin : delay\n"
             "      always @(posedge clk) dl[g] <= dl[g-1];\n    end\n  endgenerate\n"
             "  always @(posedge clk) dl[0] <= sum_0;\n")
    for c in range(4 * index + 1, 4 * index + 5):
        if c < count:
            text += f"  mod_{c} #(.LIMIT({c % 7 + 16})) u_{c} (.clk(clk), .rst_n(rst_n), .d(d), .q());\n"
    text += "  always @(posedge clk) q <= sum_1 ^ dl[DEPTH-1];\nendmodule\n"
    return text


def verilog_project(folder, count, seed=11):
    rng = random.Random(seed)
    write(os.path.join(folder, "bench_defs.vh"), HEADER)
    paths = []
    for i in range(count):
        path = os.path.join(folder, f"f{i}.v")
        write(path, verilog_file(i, count, rng))
        paths.append(path)
    return paths


def mixed_project(folder, count):
    return vhdl_project(os.path.join(folder, "vhdl"), count // 2) + verilog_project(
        os.path.join(folder, "verilog"), count - count // 2)


def chain(folder, count, kind, per_file=1000):
    paths = []
    for start in range(0, count, per_file):
        parts = []
        for i in range(start, min(count, start + per_file)):
            nxt = i + 1 if i + 1 < count else None
            if kind == "mchain":
                body = f"  m{nxt} u ();\n" if nxt is not None else ""
                parts.append(f"module m{i};\n{body}endmodule\n")
            elif kind == "pchain":
                use = f"use work.p{nxt}.all;\n" if nxt is not None else ""
                parts.append(f"{use}package p{i} is\nend package;\n")
            else:
                inst = f"  u : entity work.e{nxt};\n" if nxt is not None else ""
                parts.append(f"entity e{i} is\nend entity;\narchitecture rtl of e{i} is\nbegin\n{inst}end architecture;\n")
        ext = ".v" if kind == "mchain" else ".vhd"
        path = os.path.join(folder, f"c{start // per_file}{ext}")
        write(path, "".join(parts))
        paths.append(path)
    return paths


GENERATORS = {
    "diamond": diamond,
    "vhdl": vhdl_project,
    "verilog": verilog_project,
    "mixed": mixed_project,
    "vchain": lambda folder, n: chain(folder, n, "vchain"),
    "mchain": lambda folder, n: chain(folder, n, "mchain"),
    "pchain": lambda folder, n: chain(folder, n, "pchain"),
}

DEFAULT_RUNS = [
    ("diamond", 20, ["order"]), ("diamond", 40, ["order"]), ("diamond", 400, ["order"]),
    ("vhdl", 1000, ["units", "order"]), ("vhdl", 2000, ["order"]), ("vhdl", 2500, ["order"]),
    ("vhdl", 5000, ["order"]), ("vhdl", 10000, ["units", "order", "tree"]),
    ("verilog", 1000, ["order"]), ("verilog", 2000, ["order"]), ("verilog", 2500, ["order"]),
    ("verilog", 5000, ["order"]), ("verilog", 10000, ["units", "order"]),
    ("mixed", 2500, ["order"]), ("mixed", 5000, ["order"]), ("mixed", 10000, ["order"]),
    ("vchain", 50000, ["order", "tree"]), ("vchain", 100000, ["order", "tree"]), ("vchain", 200000, ["order", "tree"]),
    ("mchain", 50000, ["order", "tree"]), ("mchain", 100000, ["order", "tree"]), ("mchain", 200000, ["order", "tree"]),
    ("pchain", 50000, ["order", "tree"]), ("pchain", 100000, ["order", "tree"]), ("pchain", 200000, ["order", "tree"]),
]


def project(work, kind, count):
    folder = os.path.join(work, f"{kind}-{count}")
    listing = os.path.join(folder, "files.f")
    if not os.path.exists(listing):
        paths = GENERATORS[kind](folder, count)
        write(listing, "\n".join(paths) + "\n")
    size = 0
    with open(listing) as names:
        for name in names:
            size += os.path.getsize(name.strip())
    return listing, size


def run(quillon, listing, command):
    start = time.monotonic()
    proc = subprocess.run(["/usr/bin/time", "-f", "%M", quillon, "-q", command, "-f", listing],
                          stdout=subprocess.DEVNULL, stderr=subprocess.PIPE, text=True)
    wall = time.monotonic() - start
    peak_kb = int(proc.stderr.strip().splitlines()[-1]) if proc.stderr.strip() else 0
    return proc.returncode, wall, peak_kb / 1024.0


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--quillon", default=os.path.join(ROOT, "build/release/apps/quillon/quillon"))
    parser.add_argument("--work", default="/tmp/quillon-cli-bench")
    parser.add_argument("--only", nargs="*", help="kinds or kind-count names to run")
    args = parser.parse_args()
    if not os.access(args.quillon, os.X_OK):
        sys.exit(f"no quillon at {args.quillon}; build the Release tree first")
    print(f"{'project':<16}{'command':<8}{'MB':>8}{'exit':>6}{'wall s':>9}{'peak MB':>9}{'MB/s':>8}")
    for kind, count, commands in DEFAULT_RUNS:
        name = f"{kind}-{count}"
        if args.only and kind not in args.only and name not in args.only:
            continue
        listing, size = project(args.work, kind, count)
        for command in commands:
            status, wall, peak = run(args.quillon, listing, command)
            megabytes = size / 1e6
            print(f"{name:<16}{command:<8}{megabytes:>8.1f}{status:>6}{wall:>9.2f}{peak:>9.0f}{megabytes / wall:>8.1f}",
                  flush=True)


if __name__ == "__main__":
    main()
