"""Emits the OpenGL function layer: enumeration, function table, loaders, interceptor operations, error checker."""
from gl_catalogue import Catalogue

BASE = "oru/oru_ogl"
FOLDER = f"{BASE}/extensionator"
UNDEFINITIONS = "openglextension_undef.inc"
SOURCE = "catalogue/gl_entry_points.tsv and gl_extensions.tsv by emit_gl.py"

# Written by hand in openglerrorchecker.cpp: they keep or read the begin/end state.
HAND_CHECKED = {"glBegin", "glEnd", "glGetError"}

# Functions that make a name, and what deletes it when the check after the call throws: the caller never
# gets the name then.
UNDONE_BY = {"glCreateProgram": "glDeleteProgram", "glCreateShader": "glDeleteShader",
             "glFenceSync": "glDeleteSync"}

# Names that the generated bodies use themselves; a parameter of that name would hide them.
RESERVED_NAMES = {"file", "line", "insideBeginEnd_", "function_", "value_"}


def emit(folder, writer):
    catalogue = Catalogue(folder)
    for entry in catalogue.entry_points:
        clash = RESERVED_NAMES.intersection(p.name for p in entry.parameters)
        if clash:
            raise ValueError(f"{entry.name}: the parameter name {clash.pop()} is used by the generated code")
    writer.write(f"{BASE}/{UNDEFINITIONS}", undefinitions(catalogue), SOURCE)
    outputs = {
        # The path that hosts know; the layer below the enumeration needs the text, too.
        UNDEFINITIONS: f'#include "{BASE}/{UNDEFINITIONS}"\n',
        "openglextension.h": enumeration(catalogue),
        "internal/catalogueogl.h": names(catalogue),
        "internal/catalogueogl.cpp": name_tables(catalogue),
        "functiontable.h": function_table(catalogue),
        "gloperations.inc": operations(catalogue),
        "extensionmanagerogl_loaders.inc": loader_declarations(catalogue),
        "extensionmanagerogl_loaders.cpp": loaders(catalogue),
        "internal/librarycalls.h": library_calls(catalogue),
        "prototypechecks.cpp": prototype_checks(catalogue),
    }
    for title, entries in catalogue.chunks():
        outputs[f"openglerrorchecker_{title}.cpp"] = error_checker(entries)
    for name, text in outputs.items():
        writer.write(f"{FOLDER}/{name}", text, SOURCE)


def undefinitions(catalogue):
    undefs = "\n".join(f"#undef {x.enumerator}" for x in catalogue.extensions if x.is_version)
    return f"""// glext.h defines the names of the version enumerators as macros, which are its own include guards
// and carry no information. Include this after glext.h wherever the enumerators are used.
{undefs}
"""


def enumeration(catalogue):
    rows = "\n".join(f"    {x.enumerator} = {x.value}, ///< {meaning(catalogue, x)}" for x in catalogue.extensions)
    unknown = len(catalogue.extensions)
    return f"""#pragma once

#include "oru/oru_ogl/extensionator/openglextension_undef.inc"

namespace ORU::OGL {{

/// The capabilities an OpenGL implementation can have: versions, GL extensions, WGL extensions.
enum OpenGLExtension : unsigned int {{
{rows}
    UNKNOWN_OPENGL_EXTENSION = {unknown} ///< the answer for any other name; never stored
}};

}} // namespace ORU::OGL
"""


def meaning(catalogue, extension):
    """What stands beside a capability's enumerator."""
    if extension.is_version:
        name = "OpenGL " + extension.string.removeprefix("GL_VERSION_").replace("_", ".")
    else:
        name = f"the extension {extension.string}"
    count = sum(e.group == extension.string for e in catalogue.entry_points)
    return f"{name}; {count} entry point{'' if count == 1 else 's'}" if count else name


def function_table(catalogue):
    blocks = []
    for group, _, entries in catalogue.runs():
        rows = "\n".join(f"    {e.result} (ORU_APIENTRY *{e.name})({e.declarations}) = nullptr;"
                         for e in entries)
        blocks.append(f"    /// @name {group}\n    /// Null unless the context has {group} and the driver the function.\n"
                      f"    /// @{{\n{rows}\n    /// @}}\n")
    return f"""#pragma once

#include "oru/oru_ogl/gltypes.h"

namespace ORU::OGL {{

/// The addresses of one context's OpenGL entry points beyond OpenGL 1.1, in catalogue order.
///
/// An entry is null until its group's loader found it (`ExtensionManager::init_...`); test support
/// (`ExtensionManager::isSupported`) before calling one.
struct FunctionTable {{
{chr(10).join(blocks)}
}};

}} // namespace ORU::OGL
"""


def operations(catalogue):
    rows = "\n".join(e.expansion("ORU_GL_OPERATION") for e in catalogue.entry_points)
    return f"""// One line per wrapped OpenGL entry point, in slot order. Define
//     ORU_GL_OPERATION(Result, Name, Parameters, Arguments)
// and include this file where the expansions belong (it undefines the macro at its end):
//     #define ORU_GL_OPERATION(Result, Name, Parameters, Arguments) Result cgm##Name Parameters override;
{rows}
#undef ORU_GL_OPERATION
"""


def loader_declarations(catalogue):
    return "\n".join(f"bool init_{x.string}();" for x in catalogue.extensions if not x.is_wgl) + "\n"


def names(catalogue):
    gl_count = len([x for x in catalogue.extensions if not x.is_wgl])
    return f"""// The names of the catalogue.
#pragma once

#include "oru/oru_ogl/extensionator/openglextension.h"

namespace ORU::OGL {{

/// The names of the FunctionTable's entry points, in its order.
extern char const *const kEntryPointNames[{len(catalogue.extended)}];

/// The capability that each of them belongs to.
extern OpenGLExtension const kEntryPointGroups[{len(catalogue.extended)}];

/// A capability and its exact extension string.
struct NamedExtension {{
    char const *name;
    OpenGLExtension value;
}};

/// The capabilities, those of OpenGL and those of WGL, each ascending by name as strcmp compares.
extern NamedExtension const kGLExtensions[{gl_count}];
extern NamedExtension const kWGLExtensions[{len(catalogue.extensions) - gl_count}];

}} // namespace ORU::OGL
"""


def name_tables(catalogue):
    entry_points = "\n".join(f'    "{e.name}",' for e in catalogue.extended)
    groups = "\n".join(f"    {e.group.upper()}," for e in catalogue.extended)

    def named(is_wgl):
        chosen = sorted((x.string, x.enumerator) for x in catalogue.extensions if x.is_wgl == is_wgl)
        return "\n".join(f'    {{"{string}", {enumerator}}},' for string, enumerator in chosen)

    return f"""#include "oru/oru_ogl/extensionator/internal/catalogueogl.h"

namespace ORU::OGL {{

char const *const kEntryPointNames[] = {{
{entry_points}
}};

OpenGLExtension const kEntryPointGroups[] = {{
{groups}
}};

NamedExtension const kGLExtensions[] = {{
{named(False)}
}};

NamedExtension const kWGLExtensions[] = {{
{named(True)}
}};

}} // namespace ORU::OGL
"""


def loader(runs):
    """The body of a group's loader: every entry point is asked for, also after one that is missing."""
    first, *others = [f"loadGroup({index}, {len(entries)})" for index, entries in runs] or ["true"]
    if not others:
        return f"{{ return {first}; }}"
    lines = "".join(f"    all = {call} && all;\n" for call in others)
    return f"{{\n    bool all = {first};\n{lines}    return all;\n}}"


def loaders(catalogue):
    runs = {}
    for group, index, entries in catalogue.runs():
        runs.setdefault(group, []).append((index, entries))
    bodies, dispatch = [], []
    for extension in catalogue.extensions:
        if extension.is_wgl:
            dispatch.append(f"    nullptr, // {extension.string}")
            continue
        bodies.append(f"bool ExtensionManager::init_{extension.string}() {loader(runs.get(extension.string, []))}")
        dispatch.append(f"    &ExtensionManager::init_{extension.string},")

    return f"""#include "oru/oru_ogl/extensionator/extensionmanagerogl.h"

namespace ORU::OGL {{

{chr(10).join(bodies)}

ExtensionManager::GroupLoader const ExtensionManager::sGroupLoaders_[] = {{
{chr(10).join(dispatch)}
}};

}} // namespace ORU::OGL
"""


def prototype_checks(catalogue):
    def upper_type(entry):
        return f"PFN{entry.name.upper()}PROC"

    core = "\n".join(f"static_assert(std::is_same<decltype(&::{e.name}), "
                     f"{e.result}(ORU_APIENTRY *)({e.declarations})>::value, \"{e.name}\");"
                     for e in catalogue.core)
    undeclared = "GL_APPLE_flush_render"  # declared in no platform header
    extended = "\n".join(f"static_assert(std::is_same<decltype(FunctionTable::{e.name}), "
                         f"{upper_type(e)}>::value, \"{e.name}\");"
                         for e in catalogue.extended if e.group != undeclared)
    offsets = "\n".join(f"static_assert(offsetof(FunctionTable, {e.name}) == {i} * sizeof(void *), "
                        f"\"{e.name}\");" for i, e in enumerate(catalogue.extended))
    return f"""#include "oru/oru_ogl/extensionator/functiontable.h"
#include "oru/oru_ogl/platformgl.h"

#include <cstddef>
#include <type_traits>

// The catalogue's prototypes against the platform headers' own, and the table's layout, which the
// loaders rely on: entry i lies i pointers from the start.
{core}

namespace ORU::OGL {{

{extended}

static_assert(sizeof(FunctionTable) == {len(catalogue.extended)} * sizeof(void *), "FunctionTable");
{offsets}

}} // namespace ORU::OGL
"""


def call(entry, check):
    """The lines that make the real call of an entry point, and then `check`: what follows its closing quote."""
    lines = []
    function = f"::{entry.name}"
    if not entry.is_core:
        function = "function_"
        lines = [f"auto const function_ = internal::CurrentTable().{entry.name};",
                 "if (!ORU_LIKELY(function_))",
                 f'    ThrowMissingFunction(file, line, "{entry.name}", "{entry.group}");']
    made = f"{function}({entry.arguments})"
    if entry.result == "void":
        return lines + [f"{made};", check]
    return lines + [f"{entry.result} const value_ = {made};", check, "return value_;"]


def error_checker(entries):
    bodies = []
    for entry in entries:
        if entry.name in HAND_CHECKED:
            continue
        undone = ""
        if entry.name in UNDONE_BY:
            undone = f",\n                     internal::CurrentTable().{UNDONE_BY[entry.name]}, value_"
        check = f'CheckOpenGLError(insideBeginEnd_, file, line, "{entry.name}"{undone});'
        body = "\n".join(f"    {text}" for text in call(entry, check))
        bodies.append(f"{entry.result} OpenGLErrorChecker::{entry.operation}({entry.full_declarations}) {{\n"
                      f"{body}\n}}")
    return f"""#include "oru/oru_ogl/extensionator/internal/currenttable.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"

namespace ORU::OGL {{

{chr(10).join(bodies)}

}} // namespace ORU::OGL
"""


def library_calls(catalogue):
    functions = []
    for entry in catalogue.entry_points:
        chain = f"OpenGLInterceptor::Instance()->{entry.operation}({entry.full_arguments});"
        body = [f"return {chain}"]
        if entry.name not in HAND_CHECKED and entry.name not in UNDONE_BY:
            body = ["if (!ORU_LIKELY(IsOpenGLChainPlain()))", f"    return {chain}"]
            body += call(entry, f'CheckOpenGLError(file, line, "{entry.name}");')
        text = "\n".join(f"    {line}" for line in body)
        functions.append(f"inline {entry.result} Call{entry.short_name}({entry.full_declarations}) {{\n{text}\n}}")
    return f"""#pragma once

#include "oru/oru_ogl/extensionator/internal/currenttable.h"
#include "oru/oru_ogl/extensionator/internal/openglerrorcheck.h"

// What the operations of the chain's first link do, for calls of the library itself. While the chain is its
// last link alone, the call and its check are made in place.
namespace ORU::OGL::internal {{

{chr(10).join(functions)}

}} // namespace ORU::OGL::internal
"""
