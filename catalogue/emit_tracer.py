"""Emits the operations of the OpenGL tracer."""
from gl_catalogue import Catalogue

FOLDER = "oru/oru_ogl/extensionator"
SOURCE = "catalogue/gl_entry_points.tsv by emit_tracer.py"

# The form of an argument by its type in the prototype: an operation of TraceLine. Several of these types
# are one to the C++ compiler, so it could not tell them apart. Pointers not named here are addresses: most
# point to data without an end mark.
FORMS = {
    "GLenum": "token",
    "GLboolean": "boolean",
    "GLbitfield": "integer",
    "GLuint": "integer",
    "GLhandleARB": "handle",
    "GLint": "integer",
    "GLsizei": "integer",
    "GLshort": "integer",
    "GLushort": "integer",
    "GLhalfNV": "integer",
    "GLbyte": "byte",
    "GLubyte": "byte",
    "GLfloat": "single",
    "GLdouble": "real",
    "GLintptr": "integer",
    "GLintptrARB": "integer",
    "GLsizeiptr": "integer",
    "GLsizeiptrARB": "integer",
    "GLuint64": "integer",
    "GLsync": "address",
    "const GLchar *": "text",
    "const GLcharARB *": "text",
}


def emit(folder, writer):
    for title, entries in Catalogue(folder).chunks():
        writer.write(f"{FOLDER}/opengltracer_{title}.cpp", operations(entries), SOURCE)


def form(entry, parameter):
    if parameter.type in FORMS:
        return FORMS[parameter.type]
    if parameter.type.endswith("*"):
        return "address"
    raise ValueError(f"{entry.name}: no trace form for the type {parameter.type}")


def operation(entry):
    arguments = "".join(f".{form(entry, p)}({p.name})" for p in entry.parameters)
    return f"""{entry.result} OpenGLTracer::{entry.operation}({entry.full_declarations}) {{
    internal::TraceLine(*stream_, file, line, "{entry.name}("){arguments}.write();
    return interceptor()->{entry.operation}({entry.full_arguments});
}}"""


def operations(entries):
    bodies = "\n\n".join(operation(entry) for entry in entries)
    return f"""#include "oru/oru_ogl/extensionator/internal/traceline.h"
#include "oru/oru_ogl/extensionator/opengltracer.h"

namespace ORU::OGL {{

{bodies}

}} // namespace ORU::OGL
"""
