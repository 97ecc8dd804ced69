"""Emits the operations of the WGL interceptors, the WGL extension pointers and the rows of their loader."""
import tables
from gl_catalogue import Function

FOLDER = "oru/oru_ogl/extensionator/wgl"
POINTERS = "wgl_entry_points.tsv"
OPERATIONS = "wgl_operations.tsv"


def emit(folder, writer):
    entries = tables.rows(folder / POINTERS, 5)
    extensions = {string for _, string in tables.rows(folder / "gl_extensions.tsv", 2)}
    for name, extension, _, _, _ in entries:
        if extension not in extensions:
            raise ValueError(f"{POINTERS}: {name}: unknown extension {extension}")
    functions = {"chain": [], "checker": []}
    for name, place, result, parameters in tables.rows(folder / OPERATIONS, 4):
        if place not in functions:
            raise ValueError(f"{OPERATIONS}: {name} is of {place}, not of chain or checker")
        functions[place].append(Function(name, result, parameters))

    def write(name, text, table):
        writer.write(f"{FOLDER}/{name}", text, f"catalogue/{table} by emit_wgl.py")

    write("wgloperations.inc", operations(functions["chain"], "of the WGL chain"), OPERATIONS)
    write("wglcheckeroperations.inc", operations(functions["checker"], "of the last link alone"), OPERATIONS)
    write("wglerrorchecker.cpp", error_checker(sum(functions.values(), [])), OPERATIONS)
    write("extensionswgl_pointers.inc", pointers(entries), POINTERS)
    write("internal/extensionswgl_rows.inc", rows(entries), POINTERS)
    write("internal/extensionswgl_types.inc", types(entries), POINTERS)


def operations(functions, place):
    lines = "\n".join(f.expansion("ORU_WGL_OPERATION") for f in functions)
    return f"""// One line per operation {place}, in slot order. Define
//     ORU_WGL_OPERATION(Result, Name, Parameters, Arguments)
// and include this file where the expansions belong (it undefines the macro at its end).
{lines}
#undef ORU_WGL_OPERATION
"""


def error_checker(functions):
    bodies = "\n\n".join(
        f"{f.result} WGLErrorChecker::wcgm{f.short_name}("
        f"{', '.join(['char const *', 'unsigned int', *(p.declaration for p in f.parameters)])}) {{\n"
        f"    return ::{f.name}({f.arguments});\n}}" for f in functions)
    return f"""#include "oru/oru_ogl/extensionator/wgl/wglinterceptor.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {{

{bodies}

}} // namespace ORU::OGL
"""


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
