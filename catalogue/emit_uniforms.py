"""Emits the uniform setters of programs: one operation list, and the bodies that drive OpenGL."""
import itertools

import tables

FOLDER = "oru/oru_ogl/ogl"
SOURCE = "catalogue/gl_uniforms.tsv by emit_uniforms.py"
SUFFIXES = ("", "_Unsafe")


def emit(folder, writer):
    rows = [Row(cells) for cells in tables.rows(folder / "gl_uniforms.tsv", 5)]
    writer.write(f"{FOLDER}/uniformoperations.inc", operations(rows), SOURCE)
    writer.write(f"{FOLDER}/internal/programimplcore_uniforms.cpp", bodies(rows), SOURCE)


class Row:
    """A setter for one kind of value."""

    def __init__(self, cells):
        self.setter, self.form, self.element, self.upload, self.type = cells
        if self.form == "values":
            names = "xyzw"[:int(self.upload[0])] if "SAMPLER" not in self.type else ["unit"]
            self.parameters = ", ".join(f"{self.element} {name}" for name in names)
            self.arguments = ", ".join(names)
        elif self.form in PARAMETERS:
            self.parameters = PARAMETERS[self.form].format(self.element)
            self.arguments = ARGUMENTS[self.form]
        else:
            raise ValueError(f"gl_uniforms.tsv: unknown form {self.form} of {self.setter}")

    @property
    def uploaded(self):
        """The arguments as OpenGL takes them."""
        if self.form == "matrices":
            return "count, transpose, data"
        if self.element in ("bool", "unsigned char"):
            return ", ".join(f"int{{{name}}}" for name in self.arguments.split(", "))
        return self.arguments

    @property
    def count(self):
        return "static_cast<unsigned int>(count)" if self.form == "matrices" else "1"


PARAMETERS = {
    "array": "int count, {} const *values",
    "matrices": "int count, {} const *data, unsigned char transpose",
    "matrix": "{} const *data, unsigned char transpose",
}
ARGUMENTS = {
    "array": "count, values",
    "matrices": "count, data, transpose",
    "matrix": "data, transpose",
}
SUBJECTS = {"name": "char const *name", "location": "int location"}


def operations(rows):
    """The slot order: setter after setter, its names before its locations; all that again, unsafe."""
    lines = []
    for suffix in SUFFIXES:
        for setter, group in itertools.groupby(rows, lambda row: row.setter):
            group = list(group)
            for subject, parameter in SUBJECTS.items():
                lines += [f"ORU_UNIFORM_OPERATION({setter}{suffix}, ({parameter}, {row.parameters}), "
                          f"({subject}, {row.arguments}))" for row in group]
    return f"""// One line per uniform setter, in slot order. Define
//     ORU_UNIFORM_OPERATION(Name, Parameters, Arguments)
// and include this file where the expansions belong (it undefines the macro at its end).
{chr(10).join(lines)}
#undef ORU_UNIFORM_OPERATION
"""


def body(row, suffix, subject):
    """The statements of one setter; `subject` is what tells the uniform, its name or its location."""
    upload = f"ORU_GL(Uniform{row.upload}, location, {row.uploaded});"
    find = "int const location = getUniformLocation(name);"
    by_location = f"{row.setter}{suffix}({{}}, {row.arguments});"
    if row.form == "matrix":
        return [f"{row.upload}{suffix}({subject}, 1, {row.arguments});"]
    if subject == "name":
        if row.form == "array":
            return [find, upload]
        if suffix or row.form == "matrices":
            return [by_location.format("getUniformLocation(name)")]
        return ["requireEnabled();", by_location.format("getUniformLocation(name)")]
    if suffix:
        return ["if (location != -1)", f"    {upload}"]
    assertion = [f"assertActiveUniformType(location, {row.type}, {row.count});"] if row.type != "-" else []
    return ["requireEnabled();", *assertion, upload]


def bodies(rows):
    functions = []
    for suffix in SUFFIXES:
        for row in rows:
            for subject, parameter in SUBJECTS.items():
                lines = "\n".join(f"    {line}" for line in body(row, suffix, subject))
                functions.append(f"void ProgramImplCore::{row.setter}{suffix}({parameter}, {row.parameters}) {{\n"
                                 f"{lines}\n}}")
    return f"""#include "oru/oru_ogl/extensionator/internal/glcall.h"
#include "oru/oru_ogl/ogl/internal/programimplcore.h"
#include "oru/oru_ogl/platformgl.h"

namespace ORU::OGL {{

// A guarded setter tests that the program is current, lets the body assert the uniform's type, and uploads; an _Unsafe
// one uploads unless the location is -1.

{chr(10).join(functions)}

}} // namespace ORU::OGL
"""
