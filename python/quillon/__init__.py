"""Quillon for scripts: the design units, instance hierarchy, compile order and ports of an HDL
project, read by the same module and host code as the quillon command line.

    project = quillon.Project(["top.vhd", ("cells.vhd", "cells")], defines={"SIM": None})
    for entry in project.order():
        print(entry.library, entry.path)

Every result is a plain value; a failed request raises quillon.Error, whose .messages hold the
reason and the error messages that came with it.
"""

from __future__ import annotations

import os
from dataclasses import dataclass, field
from typing import Iterable, Iterator, Mapping, Optional, Tuple, Union

from . import _core
from ._core import Error

__all__ = ["Project", "Unit", "Node", "SourceFile", "Port", "Diagnostic", "Message", "Error"]

PathLike = Union[str, "os.PathLike[str]"]


@dataclass(frozen=True)
class Unit:
    """A record of a file's design-unit set: a unit (entity, module, ...) or what a unit holds
    (library and use clauses, instances). `library` is the library of the file; `named_library`
    the library that a library or use clause names."""

    type: str
    name: str
    key: str
    file: str
    library: str
    line: int
    store_key: str
    parent: Optional[str]
    in_generate: bool
    unit_flag: bool
    partition: str
    entity: Optional[str]
    architecture: Optional[str]
    component: Optional[str]
    named_library: Optional[str]
    package: Optional[str]
    item: Optional[str]
    uses: Optional[Tuple[str, ...]]


_NODE_FIELDS_SHOWN = ("name", "kind", "instance", "library", "file", "line")


@dataclass(eq=False, repr=False)
class Node:
    """A node of the instance hierarchy. A subtree that several parents share is one Node object
    listed under each of them."""

    name: str
    kind: str
    unit: str
    architecture: str
    instance: str
    library: Optional[str]
    file: Optional[str]
    line: Optional[int]
    key: Optional[str]
    element_type: Optional[str]
    path: str
    type: str
    library_cell: bool
    partition: str
    children: list = field(default_factory=list)

    def walk(self) -> Iterator["Node"]:
        """This node and every node below it, each once, parents before their children."""
        seen = set()
        pending = [self]
        while pending:
            node = pending.pop()
            if id(node) in seen:
                continue
            seen.add(id(node))
            yield node
            pending.extend(reversed(node.children))

    def __repr__(self) -> str:
        shown = ", ".join(f"{name}={getattr(self, name)!r}" for name in _NODE_FIELDS_SHOWN)
        return f"Node({shown}, children={len(self.children)})"


@dataclass(frozen=True)
class SourceFile:
    """A file of a compile order; `language` is the file type of its plug-in ("VHDL", ...)."""

    path: str
    library: str
    language: str
    plugin: str


@dataclass(frozen=True)
class Port:
    """A port of a unit; the bounds are None when the port has no range."""

    name: str
    position: int
    type: str
    direction: str
    low: Optional[int]
    high: Optional[int]
    span: Optional[int]


@dataclass(frozen=True)
class Diagnostic:
    """A finding about the design with a stable code ("unresolved-instance", ...)."""

    severity: str
    code: str
    text: str
    file: Optional[str]
    line: Optional[int]


@dataclass(frozen=True)
class Message:
    """A message of the module or the host."""

    severity: str
    text: str
    source: Optional[str]
    line: Optional[int]


def _paths(value) -> list:
    if value is None:
        return []
    if isinstance(value, (str, os.PathLike)):
        return [os.fspath(value)]
    return [os.fspath(path) for path in value]


def _file_source(entry) -> tuple:
    if isinstance(entry, (str, os.PathLike)):
        return ("file", os.fspath(entry), "", "")
    if isinstance(entry, tuple) and len(entry) in (2, 3):
        path, library, *plugin = entry
        return ("file", os.fspath(path), library, plugin[0] if plugin else "")
    raise TypeError(f"a file is a path or a (path, library[, plugin]) tuple, not {entry!r}")


def _defines(defines) -> list:
    if defines is None:
        return []
    if isinstance(defines, str):
        return [defines]
    if isinstance(defines, Mapping):
        return [name if value is None else f"{name}={value}" for name, value in defines.items()]
    return list(defines)


class Project:
    """An HDL project, read and parsed when it is made.

    files: paths, or (path, library) and (path, library, plugin) tuples; the library is "work"
        and the plug-in follows from the extension unless given.
    libraries: {library: [paths]}, files of other libraries.
    file_list: one or more file lists (a path a line, +incdir+, +define+, comments).
    project: a JSON project file ({"properties": {...}, "files": [{"path", "library", "plugin"}]}).
    defines: {NAME: VALUE or None} or ["NAME=VALUE", ...]; include_dirs: directories for `include.
    properties: further project properties; target and family: the parse target and device family.
    external_libraries: libraries outside the project whose units are black boxes; strict: black
        boxes are errors.

    Sources come in this order: project, file_list, files, libraries; Verilog files are compiled
    in that order. Raises Error when a source cannot be read or the project cannot be built.
    """

    def __init__(
        self,
        files: Iterable = (),
        *,
        libraries: Optional[Mapping[str, Iterable[PathLike]]] = None,
        file_list: Union[PathLike, Iterable[PathLike], None] = None,
        project: Optional[PathLike] = None,
        defines=None,
        include_dirs: Union[PathLike, Iterable[PathLike]] = (),
        properties: Optional[Mapping[str, str]] = None,
        target: Optional[str] = None,
        family: Optional[str] = None,
        external_libraries: Iterable[str] = (),
        strict: bool = False,
    ):
        if isinstance(files, (str, os.PathLike)):
            files = [files]
        sources = [("project", path, "", "") for path in _paths(project)]
        sources += [("list", path, "", "") for path in _paths(file_list)]
        sources += [_file_source(entry) for entry in files]
        for library, paths in (libraries or {}).items():
            sources += [("file", path, library, "") for path in _paths(paths)]
        if isinstance(external_libraries, str):
            external_libraries = [external_libraries]
        self._project = _core.Project(
            sources,
            _defines(defines),
            _paths(include_dirs),
            list((properties or {}).items()),
            target,
            family,
            list(external_libraries),
            strict,
        )

    def units(self) -> list:
        """Every record of every file's design-unit set, file by file."""
        return [Unit(**unit) for unit in self._project.units()]

    def tree(self, top: Optional[str] = None) -> Node:
        """The instance hierarchy: its unnamed root, whose children are the top units; with `top`
        (a unit name or key; an entity stands for its architecture) the node of that unit."""
        entries, top_index = self._project.tree(top or "")
        nodes = []
        for entry in entries:
            fields = {name: value for name, value in entry.items() if name not in ("children", "shared_with")}
            nodes.append(Node(**fields))
        # A later occurrence of a shared subtree stands for its first occurrence.
        first = [index if entry["shared_with"] is None else entry["shared_with"]
                 for index, entry in enumerate(entries)]
        for node, entry in zip(nodes, entries):
            node.children = [nodes[first[child]] for child in entry["children"]]
        return nodes[first[top_index]]

    def order(self, top: Optional[str] = None, *, alone: bool = False) -> list:
        """The compile order of the whole project, or of `top` and what it needs (`alone`: the
        unit alone), as SourceFile values."""
        if alone and not top:
            raise ValueError("alone=True needs a top unit")
        return [SourceFile(**entry) for entry in self._project.order(top or "", alone)]

    def ports(self, unit: str) -> list:
        """The ports of an entity (an architecture stands for its entity) or a Verilog module."""
        return [Port(**port) for port in self._project.ports(unit)]

    def diagnostics(self) -> list:
        """What makes the design broken or incomplete, as the command line's `check` finds it."""
        return [Diagnostic(**diagnostic) for diagnostic in self._project.diagnostics()]

    def messages(self) -> list:
        """Every message of the module and the host since the project was made, in order."""
        return [Message(**message) for message in self._project.messages()]

    def export(self, to: str, top: Optional[str] = None, *, alone: bool = False) -> str:
        """The compile order (of the whole project, or of `top` and what it needs) as `quillon export
        --to` writes it: make, ninja, depfile, ghdl, iverilog, edam or tcl."""
        if alone and not top:
            raise ValueError("alone=True needs a top unit")
        return self._project.export(to, top or "", alone)
