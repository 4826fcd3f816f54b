"""The Python module on the sample project and our fixtures; run by CTest with PYTHONPATH set."""

import gc
import os
import tempfile
import threading
import unittest

import quillon

SOURCE = os.environ.get("QUILLON_SOURCE_DIR", os.path.join(os.path.dirname(__file__), "..", ".."))
EXAMPLE = os.path.join(SOURCE, "examples", "project.json")


def data(*parts):
    return os.path.normpath(os.path.join(SOURCE, "tests", "data", *parts))


def written(folder, name, text):
    with open(os.path.join(folder, name), "w") as out:
        out.write(text)
    return os.path.join(folder, name)


class ExampleProjectTest(unittest.TestCase):
    @classmethod
    def setUpClass(cls):
        cls.project = quillon.Project(project=EXAMPLE)

    @classmethod
    def tearDownClass(cls):
        del cls.project

    def test_units_carry_file_library_and_line(self):
        units = {unit.key: unit for unit in self.project.units()}
        timing, crossing = units["PackageDecl|timing_pkg"], units["Architecture|crossing|structural"]
        self.assertEqual(timing.library, "common")
        self.assertTrue(timing.file.endswith("examples/common/timing_pkg.vhd"))
        self.assertEqual((crossing.type, crossing.library, crossing.line), ("Architecture", "work", 16))
        self.assertEqual(units["Module|chime"].line, 4)
        uses = [unit for unit in self.project.units() if unit.type == "Use" and unit.file == crossing.file]
        self.assertIn("work", {use.named_library for use in uses})
        self.assertIn("Unit(type='Module', name='chime'", repr(units["Module|chime"]))

    def test_tree_has_instances_files_and_shared_nodes(self):
        self.assertIn("crossing", [node.unit for node in self.project.tree().children])
        crossing = self.project.tree("crossing")
        self.assertEqual((crossing.unit, crossing.architecture, crossing.library, crossing.line),
                         ("crossing", "structural", "work", 16))
        labels = {child.instance: child for child in crossing.children if child.instance}
        self.assertEqual(set(labels), {"input", "control", "cars", "people", "bell"})
        self.assertTrue(labels["bell"].file.endswith("chime.v"))
        self.assertEqual(labels["cars"].kind, "work:Architecture")
        self.assertEqual([node.unit for node in labels["control"].walk() if node.instance == "timer"],
                         ["phase_timer"])
        light = [node for node in crossing.walk() if node.unit == "light_pkg"]
        self.assertEqual(len(light), 1, "a shared package node is one object, walked once")
        self.assertIn("instance='bell'", repr(labels["bell"]))

    def test_order_and_export_whole_and_for_one_unit(self):
        order = self.project.order()
        names = [os.path.basename(entry.path) for entry in order]
        self.assertEqual((names[0], names[-1]), ("timing_pkg.vhd", "crossing.vhd"))
        self.assertLess(names.index("light_pkg.vhd"), names.index("lamp_driver.vhd"))
        self.assertEqual({entry.language for entry in order}, {"VHDL", "Verilog"})
        controller = [("common", "timing_pkg.vhd"), ("work", "phase_timer.vhd"), ("work", "light_pkg.vhd"),
                      ("work", "controller.vhd")]
        self.assertEqual([(f.library, os.path.basename(f.path)) for f in self.project.order("controller")],
                         controller)
        alone = self.project.order("Architecture|controller|rtl", alone=True)
        self.assertLess(len(alone), len(controller) + 1)
        self.assertTrue(alone[-1].path.endswith("controller.vhd"))

        tcl = self.project.export("tcl", "controller")
        listed = [os.path.basename(line.split()[1]) for line in tcl.splitlines() if line.startswith("  {")]
        self.assertEqual(listed, [name for _, name in controller])
        self.assertIn("set quillon_top {work controller", tcl)
        self.assertIn("crossing.vhd", self.project.export("make"))
        with self.assertRaises(quillon.Error):
            self.project.export("spreadsheet")

    def test_ports_of_vhdl_and_verilog_units(self):
        ports = self.project.ports("crossing")
        self.assertEqual([(port.position, port.name, port.direction) for port in ports][:2],
                         [(1, "clk", "in"), (2, "button", "in")])
        self.assertEqual([port.name for port in self.project.ports("chime")], ["clk", "walk", "tone"])

    def test_the_example_is_sound_and_errors_are_exceptions_with_their_messages(self):
        self.assertEqual([d for d in self.project.diagnostics() if d.severity == "error"], [])
        with self.assertRaises(quillon.Error) as caught:
            self.project.ports("nowhere")
        self.assertIn("unknown design unit 'nowhere'", str(caught.exception))
        self.assertEqual(caught.exception.messages, ["unknown design unit 'nowhere'"])
        with self.assertRaisesRegex(quillon.Error, "only entities, architectures and modules have ports"):
            self.project.ports("light_pkg")
        for request in (self.project.tree, self.project.order):
            with self.assertRaises(quillon.Error):
                request("nowhere")


class FixtureTest(unittest.TestCase):
    def test_files_tuples_libraries_and_port_ranges(self):
        project = quillon.Project([data("ports", "mixer.vhd"), (data("ports", "gauge.vhd"), "meters")],
                                  libraries={"sizes": [data("ports", "sizes_pkg.vhd")]})
        libraries = {os.path.basename(unit.file): unit.library for unit in project.units()}
        self.assertEqual(libraries, {"mixer.vhd": "work", "gauge.vhd": "meters", "sizes_pkg.vhd": "sizes"})

        project = quillon.Project([data("ports", name) for name in ("sizes_pkg.vhd", "gauge.vhd", "mixer.vhd",
                                                                    "pair.v")])
        ports = {port.name: port for port in project.ports("mixer")}
        self.assertEqual([(ports[name].high, ports[name].low) for name in ("samples", "level", "clk")],
                         [(7, 0), (7, 0), (None, None)])
        self.assertEqual(ports["probe"].direction, "inout")
        self.assertEqual([(port.high, port.low) for port in project.ports("stage") if port.name == "d"], [(3, 0)])
        with self.assertRaisesRegex(quillon.Error, "gauge"):
            project.ports("gauge")

    def test_diagnostics_and_messages_of_broken_designs(self):
        with tempfile.TemporaryDirectory() as folder:
            cycle = quillon.Project([written(folder, "a.vhd", "use work.pkg_b.all;\npackage pkg_a is end;\n"),
                                     written(folder, "b.vhd", "use work.pkg_a.all;\npackage pkg_b is end;\n")])
            self.assertEqual([(d.severity, d.code) for d in cycle.diagnostics()], [("error", "no-valid-order")])
            self.assertEqual(len(cycle.order()), 2, "a cut order still lists every file")
            warnings = [m.text for m in cycle.messages() if m.severity == "warning"]
            self.assertTrue(any("circular dependency" in text for text in warnings))
        duplicate = quillon.Project([data("elab", "duplicate", name) for name in ("dup_a.vhd", "dup_b.vhd")])
        found = {d.code: d for d in duplicate.diagnostics()}
        self.assertEqual(set(found), {"duplicate-unit", "ambiguous-architecture"})
        self.assertEqual((found["duplicate-unit"].file, found["duplicate-unit"].line),
                         (data("elab", "duplicate", "dup_b.vhd"), 3))

    def test_strict_and_external_libraries_shape_the_findings(self):
        with tempfile.TemporaryDirectory() as folder:
            top = written(folder, "top.vhd", "library vendor;\nuse vendor.parts.all;\nentity top is end;\n"
                          "architecture rtl of top is\n  component mystery port (a : in bit); end component;\n"
                          "  signal s : bit;\nbegin\n  u : mystery port map (a => s);\nend;\n")
            found = lambda **options: [(d.severity, d.code, d.line) for d in
                                       quillon.Project(top, **options).diagnostics()]
            self.assertEqual(found(), [("warning", "black-box", 8), ("error", "unknown-library", 1)])
            self.assertEqual(found(strict=True), [("error", "black-box", 8), ("error", "unknown-library", 1)])
            self.assertEqual(found(external_libraries="vendor"), [("warning", "black-box", 8)])

    def test_file_list_defines_and_include_dirs(self):
        with tempfile.TemporaryDirectory() as folder:
            written(folder, "width.vh", "`define WIDE\n")
            source = written(folder, "switch.v", "`include \"width.vh\"\n`ifdef WIDE\nmodule wide; endmodule\n"
                             "`else\nmodule narrow; endmodule\n`endif\n`ifdef EXTRA\nmodule extra; endmodule\n`endif\n")
            keys = lambda **options: {u.key for u in quillon.Project(**options).units() if u.type == "Module"}
            self.assertEqual(keys(files=[source], include_dirs=folder), {"Module|wide"})
            both = {"Module|wide", "Module|extra"}
            self.assertEqual(keys(files=source, include_dirs=[folder], defines={"EXTRA": None}), both)
            listed = written(folder, "sources.f", f"+incdir+{folder}\n+define+EXTRA=1\n// the design\n{source}\n")
            self.assertEqual(keys(file_list=listed), both)
            with self.assertRaises(ValueError):
                quillon.Project([source], defines=["A;B"])

    def test_unreadable_sources_raise(self):
        missing = data("nowhere.vhd")
        with self.assertRaises(quillon.Error) as caught:
            quillon.Project([missing])
        self.assertIn("no such source file", str(caught.exception))
        self.assertIn(missing, caught.exception.messages[0])
        with self.assertRaisesRegex(quillon.Error, "not a valid project file"):
            quillon.Project(project=data("cli", "broken.json"))
        with self.assertRaises(TypeError):
            quillon.Project([(missing,)])

    def test_projects_in_threads_and_no_objects_left(self):
        gc.collect()
        before = quillon._core._live_objects()
        results = []
        threads = [threading.Thread(target=lambda: results.append(len(quillon.Project(project=EXAMPLE).order())))
                   for _ in range(3)]
        for thread in threads:
            thread.start()
        for thread in threads:
            thread.join()
        self.assertEqual(results, [8, 8, 8])
        gc.collect()
        self.assertEqual(quillon._core._live_objects(), before)


if __name__ == "__main__":
    unittest.main()
