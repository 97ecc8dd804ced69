"""Emits the WGL extension pointers and the rows of their loader."""
import tables

FOLDER = "oru/oru_ogl/extensionator/wgl"
SOURCE = "catalogue/wgl_entry_points.tsv by emit_wgl.py"


def emit(folder, writer):
    entries = tables.rows(folder / "wgl_entry_points.tsv", 5)
    extensions = dict(reversed(cells) for cells in tables.rows(folder / "gl_extensions.tsv", 2))
    for cells in entries:
        if cells[1] not in extensions:
            raise ValueError(f"wgl_entry_points.tsv: unknown extension {cells[1]}")
    writer.write(f"{FOLDER}/extensionswgl_pointers.inc", pointers(entries), SOURCE)
    writer.write(f"{FOLDER}/extensionswgl_rows.inc", rows(entries), SOURCE)
    writer.write(f"{FOLDER}/extensionswgl_types.inc", types(entries), SOURCE)


def pointer(name):
    return "_wcgm" + name[3:]


def pointers(entries):
    lines = "\n".join(f"ORU_WGL_POINTER({result}, {pointer(name)}, ({parameters}))"
                      for name, _, _, result, parameters in entries)
    return f"""// One line per exported WGL pointer; define ORU_WGL_POINTER(Result, Pointer, Parameters) before.
{lines}
#undef ORU_WGL_POINTER
"""


def rows(entries):
    lines = "\n".join(f"ORU_WGL_ROW({extension.upper()}, {name}, {pointer(name)}, {line})"
                      for name, extension, line, _, _ in entries)
    return f"""// One line per look-up, in loading order; define ORU_WGL_ROW(Extension, Name, Pointer, Line) before.
{lines}
#undef ORU_WGL_ROW
"""


def types(entries):
    lines = "\n".join(f"ORU_WGL_TYPE({pointer(name)}, PFN{name.upper()}PROC)"
                      for name, _, _, _, _ in entries)
    return f"""// One line per exported WGL pointer; define ORU_WGL_TYPE(Pointer, Type) before.
{lines}
#undef ORU_WGL_TYPE
"""
