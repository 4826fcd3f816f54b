#!/usr/bin/env python3
"""Writes a generated system on chip of 60 source files in three libraries, for looking at the
hierarchy and order drawings of a design of realistic size.

Usage: bench/gen-soc-project.py FOLDER

FOLDER gets project.json and the sources: packages in `common` that nearly every unit uses, a
processor in `core`, peripherals in `periph` (two of them Verilog modules) and the top in `work`.
Then, for example:
  quillon -P FOLDER/project.json --format dot tree | dot -Tpng -o tree.png
"""
import json
import os
import sys

PACKAGES = {  # name: packages it uses
    "types_pkg": [],
    "bus_pkg": ["types_pkg"],
    "util_pkg": ["types_pkg"],
    "regs_pkg": ["types_pkg", "bus_pkg"],
    "isa_pkg": ["types_pkg"],
    "irq_pkg": ["types_pkg"],
}

# name: (library, packages used, children as (instance, unit) pairs)
UNITS = {
    "soc_top": ("work", ["bus_pkg"], [("u_cpu", "cpu_top"), ("u_bus", "bus_matrix"), ("u_uart0", "uart"),
                                     ("u_uart1", "uart"), ("u_spi", "spi_master"), ("u_timer", "timer_block"),
                                     ("u_gpio", "gpio"), ("u_i2c", "i2c_master"), ("u_irq", "irq_ctrl"),
                                     ("u_sram", "sram_ctrl"), ("u_rst", "reset_sync")]),
    "bus_matrix": ("work", ["bus_pkg", "regs_pkg"], [("u_arb", "bus_arbiter"), ("u_dec", "addr_decoder")]),
    "bus_arbiter": ("work", ["bus_pkg"], []),
    "addr_decoder": ("work", ["bus_pkg", "regs_pkg"], []),
    "cpu_top": ("core", ["isa_pkg", "bus_pkg"], [("u_fetch", "fetch"), ("u_decode", "decode"), ("u_exec", "execute"),
                                                 ("u_lsu", "lsu"), ("u_wb", "writeback"), ("u_csr", "csr_file"),
                                                 ("u_hazard", "hazard_unit"), ("u_icache", "icache"),
                                                 ("u_dcache", "dcache"), ("u_dbg", "debug_unit")]),
    "fetch": ("core", ["isa_pkg"], [("u_pc", "pc_reg"), ("u_bp", "branch_predictor"), ("u_ibuf", "instr_buffer")]),
    "pc_reg": ("core", ["types_pkg"], []),
    "branch_predictor": ("core", ["isa_pkg", "util_pkg"], [("u_btb", "btb")]),
    "btb": ("core", ["util_pkg"], []),
    "instr_buffer": ("core", ["isa_pkg"], []),
    "decode": ("core", ["isa_pkg"], [("u_regs", "regfile"), ("u_imm", "imm_gen")]),
    "regfile": ("core", ["types_pkg"], []),
    "imm_gen": ("core", ["isa_pkg"], []),
    "execute": ("core", ["isa_pkg", "util_pkg"], [("u_alu", "alu"), ("u_shift", "shifter"), ("u_mul", "multiplier"),
                                                  ("u_div", "divider"), ("u_br", "branch_unit"),
                                                  ("u_fwd", "forwarding")]),
    "alu": ("core", ["isa_pkg"], [("u_add", "adder"), ("u_logic", "logic_unit"), ("u_cmp", "comparator")]),
    "adder": ("core", ["types_pkg"], []),
    "logic_unit": ("core", ["types_pkg"], []),
    "comparator": ("core", ["types_pkg"], [("u_sub", "adder")]),
    "shifter": ("core", ["types_pkg"], []),
    "multiplier": ("core", ["util_pkg"], [("u_add0", "adder"), ("u_add1", "adder")]),
    "divider": ("core", ["util_pkg"], [("u_sub", "adder")]),
    "branch_unit": ("core", ["isa_pkg"], [("u_cmp", "comparator")]),
    "forwarding": ("core", ["isa_pkg"], []),
    "lsu": ("core", ["bus_pkg", "isa_pkg"], [("u_align", "load_align"), ("u_sbuf", "store_buffer")]),
    "load_align": ("core", ["types_pkg"], []),
    "store_buffer": ("core", ["bus_pkg"], [("u_fifo", "sync_fifo")]),
    "writeback": ("core", ["isa_pkg"], []),
    "csr_file": ("core", ["isa_pkg", "irq_pkg", "regs_pkg"], [("u_cnt", "perf_counter")]),
    "perf_counter": ("core", ["util_pkg"], []),
    "hazard_unit": ("core", ["isa_pkg"], []),
    "icache": ("core", ["bus_pkg", "util_pkg"], [("u_tags", "tag_ram"), ("u_data", "data_ram")]),
    "dcache": ("core", ["bus_pkg", "util_pkg"], [("u_tags", "tag_ram"), ("u_data", "data_ram"),
                                                 ("u_wbuf", "sync_fifo")]),
    "tag_ram": ("core", ["types_pkg"], []),
    "data_ram": ("core", ["types_pkg"], []),
    "debug_unit": ("core", ["regs_pkg"], [("u_jtag", "jtag_tap")]),
    "jtag_tap": ("core", ["types_pkg"], []),
    "uart": ("periph", ["bus_pkg", "regs_pkg"], [("u_tx", "uart_tx"), ("u_rx", "uart_rx"), ("u_txq", "sync_fifo"),
                                                ("u_rxq", "sync_fifo"), ("u_baud", "baud_gen")]),
    "uart_tx": ("periph", ["types_pkg"], []),
    "uart_rx": ("periph", ["types_pkg"], [("u_sync", "sync_cell")]),
    "baud_gen": ("periph", ["util_pkg"], []),
    "sync_fifo": ("periph", ["util_pkg"], [("u_mem", "fifo_mem")]),
    "spi_master": ("periph", ["bus_pkg", "regs_pkg"], [("u_shift", "spi_shift"), ("u_q", "sync_fifo")]),
    "spi_shift": ("periph", ["types_pkg"], []),
    "timer_block": ("periph", ["bus_pkg", "irq_pkg"], [("u_t0", "timer_channel"), ("u_t1", "timer_channel"),
                                                       ("u_pre", "prescaler")]),
    "timer_channel": ("periph", ["util_pkg"], []),
    "prescaler": ("periph", ["util_pkg"], []),
    "gpio": ("periph", ["bus_pkg", "regs_pkg", "irq_pkg"], [("u_sync", "sync_cell")]),
    "i2c_master": ("periph", ["bus_pkg", "regs_pkg"], [("u_bit", "i2c_bit_ctrl"), ("u_sync", "sync_cell")]),
    "i2c_bit_ctrl": ("periph", ["types_pkg"], []),
    "irq_ctrl": ("periph", ["irq_pkg", "bus_pkg"], [("u_prio", "irq_priority")]),
    "irq_priority": ("periph", ["irq_pkg"], []),
    "sram_ctrl": ("periph", ["bus_pkg"], [("u_sync", "sync_cell")]),
    "reset_sync": ("periph", ["types_pkg"], [("u_sync", "sync_cell")]),
}

VERILOG = {"fifo_mem": "periph", "sync_cell": "periph"}

PORTS = "clk : in std_logic; rst : in std_logic"


def package_text(name, uses):
    lines = ["library ieee;", "use ieee.std_logic_1164.all;"]
    lines += [f"use common.{used}.all;" for used in uses]
    lines += [f"package {name} is", f"  constant {name.upper()}_WIDTH : natural := 32;", f"end package {name};", ""]
    return "\n".join(lines)


def unit_text(name, library, packages, children):
    libraries = sorted({"common"} | {UNITS[unit][0] for _, unit in children if unit in UNITS} - {library})
    lines = ["library ieee;", "use ieee.std_logic_1164.all;"]
    lines += [f"library {used};" for used in libraries if used != "work"]
    lines += [f"use common.{package}.all;" for package in packages]
    lines += [f"entity {name} is", f"  port ({PORTS});", f"end entity {name};", "",
              f"architecture rtl of {name} is"]
    for module in sorted({unit for _, unit in children if unit in VERILOG}):
        lines += [f"  component {module} is", f"    port ({PORTS});", "  end component;"]
    lines.append("begin")
    for label, unit in children:
        if unit in VERILOG:
            lines.append(f"  {label} : {unit} port map (clk => clk, rst => rst);")
        else:
            target = "work" if UNITS[unit][0] == library else UNITS[unit][0]
            lines.append(f"  {label} : entity {target}.{unit} port map (clk => clk, rst => rst);")
    lines += ["end architecture rtl;", ""]
    return "\n".join(lines)


def verilog_text(name):
    return f"module {name} (input wire clk, input wire rst);\n  reg state;\n" \
           f"  always @(posedge clk) state <= rst ? 1'b0 : ~state;\nendmodule\n"


def main():
    if len(sys.argv) != 2:
        sys.exit(__doc__)
    folder = sys.argv[1]
    files = []

    def write(library, name, text):
        path = os.path.join(library, name)
        os.makedirs(os.path.join(folder, library), exist_ok=True)
        with open(os.path.join(folder, path), "w") as out:
            out.write(text)
        files.append({"path": path, "library": library})

    for name, uses in PACKAGES.items():
        write("common", f"{name}.vhd", package_text(name, uses))
    for name, library in VERILOG.items():
        write(library, f"{name}.v", verilog_text(name))
    for name, (library, packages, children) in UNITS.items():
        write(library, f"{name}.vhd", unit_text(name, library, packages, children))
    with open(os.path.join(folder, "project.json"), "w") as out:
        json.dump({"files": files}, out, indent=1)
    print(f"{len(files)} files in {folder}")


if __name__ == "__main__":
    main()
