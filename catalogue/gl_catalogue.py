"""The OpenGL catalogue as objects: entry points in slot order, and the capability enumeration."""
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


class EntryPoint:
    """One row of gl_entry_points.tsv."""

    def __init__(self, slot, cells):
        self.slot = slot
        self.name, self.group, self.result, parameters = cells
        self.operation = "cgm" + self.name[2:]
        self.parameters = [Parameter(text) for text in parameters.split(", ")] if parameters else []

    @property
    def is_core(self):
        """Whether the platform's library exports it, so that it needs no FunctionTable entry."""
        return self.group == CORE_GROUP

    @property
    def declarations(self):
        """The GL parameters as a C++ parameter list, `void`-free when there are none."""
        return ", ".join(p.declaration for p in self.parameters)

    @property
    def full_declarations(self):
        """The interceptor operation's parameter list: file, line, then the GL parameters."""
        return ", ".join(["char const *file", "unsigned int line"]
                         + [p.declaration for p in self.parameters])

    @property
    def arguments(self):
        return ", ".join(p.name for p in self.parameters)

    @property
    def full_arguments(self):
        return ", ".join(["file", "line"] + [p.name for p in self.parameters])


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
        self.entry_points = [EntryPoint(slot, cells) for slot, cells in
                             enumerate(tables.rows(folder / "gl_entry_points.tsv", 4))]
        self.extensions = [Extension(cells) for cells in tables.rows(folder / "gl_extensions.tsv", 2)]
        self._check()
        self.core = [e for e in self.entry_points if e.is_core]
        self.extended = [e for e in self.entry_points if not e.is_core]
        self.groups = {}
        for entry in self.extended:
            self.groups.setdefault(entry.group, []).append(entry)

    def _check(self):
        names = [e.name for e in self.entry_points]
        if len(set(names)) != len(names):
            raise ValueError("gl_entry_points.tsv names an entry point twice")
        values = {x.string: x.value for x in self.extensions}
        if list(values.values()) != list(range(len(values))):
            raise ValueError("gl_extensions.tsv: the values are not 0, 1, 2, ... in order")
        order = [-1 if e.is_core else values[e.group] for e in self.entry_points]
        if order != sorted(order):
            raise ValueError("gl_entry_points.tsv: the groups do not follow the capabilities' order")

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
            return "gl12_to_40"
        return group.split("_")[1].lower()
