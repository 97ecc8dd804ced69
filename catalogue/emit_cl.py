"""Emits the OpenCL function table, the extension enumeration and the device-property types."""
import re
import textwrap

import tables

FOLDER = "oru/oru_ocl"
ENTRY_POINTS = "cl_entry_points.tsv"
EXTENSIONS = "cl_extensions.tsv"
PROPERTIES = "cl_device_properties.tsv"


def emit(folder, writer):
    entries = tables.rows(folder / ENTRY_POINTS, 4)
    extensions = tables.rows(folder / EXTENSIONS, 2)
    properties = tables.rows(folder / PROPERTIES, 3)
    known = {name for _, name in extensions}
    for name, group, _, _ in entries:
        if group not in known:
            raise ValueError(f"{ENTRY_POINTS}: {name}: unknown group {group}")

    def write(name, text, table):
        writer.write(f"{FOLDER}/{name}", text, f"catalogue/{table} by emit_cl.py")

    write("functiontable.h", function_table(entries), ENTRY_POINTS)
    write("internal/functiontable_slots.inc", slots(entries), ENTRY_POINTS)
    write("extensionenum.h", extension_enum(extensions), EXTENSIONS)
    write("extensionmanagerocl_operations.inc", operations(extensions), EXTENSIONS)
    write("internal/extensions.inc", extension_rows(extensions), EXTENSIONS)
    write("devicepropertyenum.h", property_enum(properties), PROPERTIES)
    write("internal/deviceproperty_rows.inc", property_rows(properties), PROPERTIES)
    writer.write("tests/support/oclruntime/entrypoints.inc", entry_points(entries),
                 f"catalogue/{ENTRY_POINTS} by emit_cl.py")


def extension_enumerator(name):
    return "EXTENSION_" + name.upper().removeprefix("CL_")


def property_enumerator(constant):
    return "DEVICEPROPERTY_" + constant.removeprefix("CL_").removeprefix("DEVICE_")


def namespace(name, body):
    return f"namespace {name} {{\n\n{body}\n\n}} // namespace {name}\n"


def declaration(name, result, parameters):
    """The member that points to `name`, wrapped after commas at the width of the code."""
    glued = re.sub(r"(?<![,;]) ", "\u00a0", parameters).replace(";", ",")
    lines = textwrap.wrap(f"{result}(CL_API_CALL\u00a0*{name})({glued})\u00a0=\u00a0nullptr;", 96,
                          subsequent_indent="    ", break_long_words=False)
    return "\n".join("    " + line for line in lines).replace("\u00a0", " ")


def function_table(entries):
    lines = []
    group = None
    for name, entry_group, result, parameters in entries:
        if entry_group != group:
            lines += ["    /// @}", ""] if group else []
            group = entry_group
            lines += [f"    /// @name {group}", f"    /// Null where the runtime has no {group}.", "    /// @{"]
        lines.append(declaration(name, result, parameters))
    body = "\n".join([*lines, "    /// @}"])
    return """// The OpenCL entry points, one pointer each.
#pragma once

#include "oru/oru_ocl/openclheaders.h"

""" + namespace("ORU::OCL", f"""/// The entry points of the loaded runtime in slot order; null where the runtime lacks one.
/// `ExtensionManager` fills it.
struct FunctionTable {{
{body}
}};""")


def slots(entries):
    lines = "\n".join(f"ORU_CL_SLOT({extension_enumerator(group)}, {name})"
                      for name, group, _, _ in entries)
    return f"""// One line per slot, in slot order; define ORU_CL_SLOT(Extension, Name) before.
{lines}
#undef ORU_CL_SLOT
"""


def parameter_name(parameter):
    return re.search(r"\(CL_CALLBACK \*(\w+)\)|(\w+)$", parameter).group(1, 2)


def entry_points(entries):
    lines = []
    for name, _, result, parameters in entries:
        names = [callback or plain for callback, plain in
                 (parameter_name(parameter) for parameter in parameters.split("; ") if parameter)]
        lines.append(f"#ifndef ORU_TEST_WITHOUT_{name}\n"
                     f"ORU_CL_ENTRY({result}, {name},\n"
                     f"    ({parameters.replace('; ', ', ')}),\n    ({', '.join(names)}))\n"
                     "#endif")
    body = "\n".join(lines)
    return f"""// What the tests' runtime exports; define ORU_CL_ENTRY(Result, Name, Parameters, Arguments)
// before, and ORU_TEST_WITHOUT_ with a name to leave it out.
{body}
#undef ORU_CL_ENTRY
"""


def extension_enum(extensions):
    lines = "\n".join(f"    {extension_enumerator(name)} = {value}, ///< {name}"
                      for value, name in extensions)
    return """// The OpenCL versions and extensions that the layer knows.
#pragma once

""" + namespace("ORU::OCL::Enum", f"""/// An OpenCL version or extension; `ExtensionManager::ExtensionEnumToString` gives its name.
enum Extension : int {{
{lines}
    EXTENSION_UNKNOWN = 16 ///< a name that is none of these
}};""")


def operations(extensions):
    lines = "\n".join(f"bool init_{name}();\nbool zero_{name}();" for _, name in extensions)
    return f"// The per-extension operations of ExtensionManager, for its class body.\n{lines}\n"


def extension_rows(extensions):
    lines = "\n".join(f"ORU_CL_EXTENSION({extension_enumerator(name)}, {name})"
                      for _, name in extensions)
    return f"""// One line per extension; define ORU_CL_EXTENSION(Extension, Name) before. The headers define
// most of the names as macros: use Name only with # or ##.
{lines}
#undef ORU_CL_EXTENSION
"""


def property_enum(properties):
    lines = "\n".join(f"    {property_enumerator(constant)} = {value}, ///< {constant}{read_as(kind)}"
                      for value, constant, kind in properties)
    return """// The device properties of OpenCL 1.1.
#pragma once

""" + namespace("ORU::OCL::Enum", f"""/// What can be asked of a device: the CL_DEVICE_* constants, given to the runtime unchanged.
enum DeviceProperty : unsigned int {{
{lines}
}};""")


def read_as(kind):
    """The type of a property's value, which `-` leaves to the caller."""
    types = {"-": "for the runtime's own query alone", "char *": "`std::string`"}
    return f": {types.get(kind, f'`{kind}`')}"


def property_rows(properties):
    lines = "\n".join(f"ORU_CL_DEVICE_PROPERTY({property_enumerator(constant)}, {constant}, {kind})"
                      for _, constant, kind in properties if kind != "-")
    return f"""// One line per property with a type; define ORU_CL_DEVICE_PROPERTY(Property, Constant, Type) before.
{lines}
#undef ORU_CL_DEVICE_PROPERTY
"""
