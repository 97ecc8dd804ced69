"""The page that tells, for each function of OpenGL, WGL and OpenCL, which operations of the library call it."""
import html
import posixpath
import re

import callgraph
from gl_catalogue import Catalogue, Function

MOST_SHOWN = 8
PREFIX = re.compile("^(w?gl|cl)")
KINDS = {"gl": "OpenGL", "cl": "OpenCL"}  # by how a name begins; WGL has one of another prefix
SWAP = "SwapBuffers"

TEXT = """# From function to operation {#map}

Which operation of the library calls a function of OpenGL, WGL or OpenCL. It is read from the sources each time this site
is built: the operations of classes that make the call themselves or through a helper of the library's own. Where **no
class** stands, call the function yourself, in the form of the last column: with the same checks, the same exceptions and
in the same trace as the library's own calls. `ORU_GL` comes from `oru/oru_ogl/extensionator/glcall.h`, `ORU_CL` from
`oru/oru_ocl/clcall.h`. Results of WGL are yours to look at: `ORU_WGL`, from `oru/oru_ogl/extensionator/wgl/wglcall.h`,
only goes through the chain, and what begins with `_wcgm` is a pointer of
`oru/oru_ogl/extensionator/wgl/extensionswgl.h`, null where the driver has no such function.

| | functions | called by a class | only inside the library | no class calls it |
|---|---|---|---|---|
"""

TABLE = """
\\htmlonly
<p class="filter">
<label>Only rows with
<input id="map-filter" type="search" placeholder="glBindTexture, Texture2, GL_VERSION_3_0 …"></label>
<label><input id="map-holes" type="checkbox"> only what no class calls</label> <output id="map-count"></output></p>
<div class="wide"><table id="map-table" class="map">
<thead><tr><th>Function</th><th>Called by</th><th>Your own call</th></tr></thead>
<tbody>
"""

END = "</tbody></table></div>\n\\endhtmlonly\n"


class Row:
    """A function, where it comes from, how a host calls it, and who does in the library."""

    def __init__(self, name, origin, call):
        self.name, self.origin, self.call = name, origin, call
        self.kind = KINDS.get(name[:2], "WGL")
        self.operations, self.files = [], []

    @property
    def state(self):
        return "class" if self.operations else "file" if self.files else "hole"


def own_call(macro, name, parameters):
    """How a host calls a function by a macro: `ORU_GL(BindTexture, GLenum target, GLuint texture)`."""
    if not parameters:
        macro += "0"
    return f"{macro}({', '.join([PREFIX.sub('', name), *parameters])})"


def rows_of(catalogue, tables):
    """A row for each row of the tables."""
    for entry in Catalogue(catalogue).entry_points:
        yield Row(entry.name, entry.group, own_call("ORU_GL", entry.name, [p.declaration for p in entry.parameters]))
    for name, place, result, parameters in tables.rows(catalogue / "wgl_operations.tsv", 4):
        function = Function(name, result, parameters)
        chain = own_call("ORU_WGL", name, [p.declaration for p in function.parameters])
        yield Row(name, "WGL", chain if place == "chain" else f"WGLErrorChecker::wcgm{function.short_name}")
    for name, extension, _, _, parameters in tables.rows(catalogue / "wgl_entry_points.tsv", 5):
        yield Row(name, extension, f"_wcgm{PREFIX.sub('', name)}({parameters})")
    for name, group, _, parameters in tables.rows(catalogue / "cl_entry_points.tsv", 4):
        yield Row(name, group, own_call("ORU_CL", name, parameters.split("; ") if parameters else []))


class Map:
    """All functions of the catalogue. `pages` are those of the public operations: {qualified name: page}."""

    def __init__(self, root, generated, pages, catalogue, tables):
        self.pages = pages
        self.rows = {row.name: row for row in rows_of(catalogue, tables)}  # some come with two extensions
        callers = callgraph.callers(root, generated, pages)
        for row in self.rows.values():
            row.operations, row.files = callers.get(f"wgl{SWAP}" if row.name == SWAP else row.name, ([], []))

    def counts(self):
        """{kind: [functions, called by a class, only inside the library]}."""
        counts = {}
        for row in self.rows.values():
            count = counts.setdefault(row.kind, [0, 0, 0])
            count[0] += 1
            if row.state != "hole":
                count[1 if row.state == "class" else 2] += 1
        return counts

    def summary(self):
        return "; ".join(f"{kind}: classes call {by_class} of {total} functions, {inside} more serve the library alone"
                         for kind, (total, by_class, inside) in self.counts().items())

    def page(self):
        """Markdown, with the table in HTML."""
        lines = [f"| {kind} | {total:,} | {by_class:,} | {inside:,} | {total - by_class - inside:,} |\n"
                 for kind, (total, by_class, inside) in self.counts().items()]
        rows = [f'<tr id="map-{row.name}" class="{row.state}"><td><code>{row.name}</code><br>'
                f"<small>{row.origin}</small></td><td>{self.callers_of(row)}</td>"
                f"<td><code>{html.escape(row.call)}</code></td></tr>\n" for row in self.rows.values()]
        return "".join([TEXT, *lines, TABLE, *rows, END])

    def callers_of(self, row):
        if row.operations:
            links = [f'<a href="{self.pages[name]}">{html.escape(name.removeprefix("ORU::"))}</a>'
                     for name in row.operations[:MOST_SHOWN]]
            more = len(row.operations) - MOST_SHOWN
            return ", ".join(links) + (f" and {more} more" if more > 0 else "")
        if row.files:
            names = (f"<code>{html.escape(posixpath.basename(path))}</code>" for path in row.files)
            return f"inside the library: {', '.join(names)}"
        return '<span class="hole">no class</span>'

    def entries(self):
        """For the search: (name, place, text)."""
        return [(row.name, f"map.html#map-{row.name}", " ".join([row.origin, *row.operations]))
                for row in self.rows.values()]
