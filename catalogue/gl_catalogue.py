"""The OpenGL catalogue as objects: entry points in slot order, and the capability enumeration."""
import itertools
import re

import tables

CORE_GROUP = "GL_VERSION_1_1"


class Parameter:
    """One parameter: its registry type text (`const GLfloat *`) and its name."""

    def __init__(self, text):
        match = re.fullmatch(r"(.*?[ *])(\w+)", text)
        if not match:
            raise ValueError(f"parameter not understood: {text}")
        self.type = match.group(1).strip()
        self.name = match.group(2)
        self.declaration = text


class Function:
    """A function of the platform and the interceptor operation that stands for it."""

    def __init__(self, name, result, parameters):
        self.name = name
        self.short_name = re.sub("^w?gl", "", name)
        self.result = result
        self.parameters = [Parameter(text) for text in parameters.split(", ")] if parameters else []

    @property
    def declarations(self):
        """The function's own parameters as a C++ parameter list, `void`-free when there are none."""
        return ", ".join(p.declaration for p in self.parameters)

    @property
    def full_declarations(self):
        """The interceptor operation's parameter list: file, line, then the function's own."""
        return ", ".join(["char const *file", "unsigned int line"]
                         + [p.declaration for p in self.parameters])

    @property
    def arguments(self):
        return ", ".join(p.name for p in self.parameters)

    @property
    def full_arguments(self):
        return ", ".join(["file", "line"] + [p.name for p in self.parameters])

    def expansion(self, macro):
        """The operation as a line of a list that C++ expands."""
        return (f"{macro}({self.result}, {self.short_name}, ({self.full_declarations}), "
                f"({self.full_arguments}))")


class EntryPoint(Function):
    """One row of gl_entry_points.tsv."""

    def __init__(self, cells):
        name, self.group, result, parameters = cells
        super().__init__(name, result, parameters)
        self.operation = "cgm" + self.short_name

    @property
    def is_core(self):
        """Whether the platform's library exports it, so that it needs no FunctionTable entry."""
        return self.group == CORE_GROUP


class Extension:
    """One row of gl_extensions.tsv."""

    def __init__(self, cells):
        self.value = int(cells[0])
        self.string = cells[1]
        self.enumerator = self.string.upper()
        self.is_wgl = self.string.startswith("WGL_")
        self.is_version = self.string.startswith("GL_VERSION_")


class Catalogue:
    """All rows, checked for consistency."""

    def __init__(self, folder):
        self.entry_points = [EntryPoint(cells)
                             for cells in tables.rows(folder / "gl_entry_points.tsv", 4)]
        self.extensions = [Extension(cells) for cells in tables.rows(folder / "gl_extensions.tsv", 2)]
        self._check()
        self.core = [e for e in self.entry_points if e.is_core]
        self.extended = [e for e in self.entry_points if not e.is_core]

    def runs(self):
        """(group, index in the FunctionTable, entry points) of neighbours of one group. A group has several
        when rows were appended to it after others."""
        index = 0
        for group, members in itertools.groupby(self.extended, key=lambda e: e.group):
            entries = list(members)
            yield group, index, entries
            index += len(entries)

    def _check(self):
        names = [e.name for e in self.entry_points]
        if len(set(names)) != len(names):
            raise ValueError("gl_entry_points.tsv names an entry point twice")
        values = {x.string: x.value for x in self.extensions}
        if list(values.values()) != list(range(len(values))):
            raise ValueError("gl_extensions.tsv: the values are not 0, 1, 2, ... in order")
        groups = {x.string for x in self.extensions if not x.is_wgl} | {CORE_GROUP}
        for entry in self.entry_points:
            if entry.group not in groups:
                raise ValueError(f"gl_entry_points.tsv: {entry.name}: unknown group {entry.group}")
        order = [not e.is_core for e in self.entry_points]
        if order != sorted(order):
            raise ValueError(f"gl_entry_points.tsv: the group {CORE_GROUP} is not in one piece at the top")

    def chunks(self, size=160):
        """(title, entry points) pieces for parallel compilation, whole groups of one family together."""
        families = {}
        for entry in self.entry_points:
            families.setdefault(self._family(entry.group), []).append(entry)
        for family, entries in families.items():
            count = -(-len(entries) // size)
            step = -(-len(entries) // count)
            for index in range(count):
                title = family if count == 1 else f"{family}_{index + 1}"
                yield title, entries[index * step:(index + 1) * step]

    @staticmethod
    def _family(group):
        if group == CORE_GROUP:
            return "gl11"
        if group.startswith("GL_VERSION_"):
            return "gl12_on"
        return group.split("_")[1].lower()
