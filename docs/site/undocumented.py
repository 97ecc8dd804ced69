"""What the reference lacks: every public symbol of Doxygen's XML that has no text, of its own or of its group."""
import re
import xml.etree.ElementTree as xml

COMPOUNDS = {"class", "struct", "union", "namespace", "concept"}


def has_text(element):
    """Whether a brief or a detailed description says anything."""
    return any("".join(part.itertext()).strip()
               for name in ("briefdescription", "detaileddescription")
               for part in element.findall(name))


def place(element):
    location = element.find("location")
    return (location.get("file"), int(location.get("line") or 0)) if location is not None else ("", 0)


def local_macros(*folders):
    """Macros that do not outlive the header, or the rows that it includes."""
    return {name for folder in folders for path in folder.rglob("*") if path.suffix in (".h", ".inc")
            for name in re.findall(r"^#\s*undef (\w+)", path.read_text(encoding="utf-8"), re.MULTILINE)}


def explained_elsewhere(member, owner):
    """By what it overrides, or because the language says what it does: copies, moves, destructors, friends."""
    name, arguments = member.findtext("name"), (member.findtext("argsstring") or "").replace(" ", "")
    parameters = ["".join(parameter.find("type").itertext()) for parameter in member.findall("param")
                  if parameter.find("type") is not None]
    return (member.find("reimplements") is not None or member.get("kind") == "friend" or arguments.endswith("=delete")
            or name.startswith("~") or name == "operator="
            or (name == owner and len(parameters) == 1 and owner in re.findall(r"\w+", parameters[0])))


def symbols(folder, macros):
    """(file, line, symbol) of each public symbol without a text, but for those macros."""
    seen = set()
    for path in sorted(folder.glob("*.xml")):
        if path.name in ("index.xml", "Doxyfile.xml"):
            continue
        for compound in xml.parse(path).getroot().findall("compounddef"):
            yield from of_compound(compound, seen, macros)


def of_compound(compound, seen, macros):
    if compound.get("prot") == "private":
        return
    if compound.get("kind") in COMPOUNDS and not has_text(compound):
        yield *place(compound), f"{compound.get('kind')} {compound.findtext('compoundname')}"
    for section in compound.findall("sectiondef"):
        description = section.find("description")
        group_has_text = description is not None and bool("".join(description.itertext()).strip())
        for member in section.findall("memberdef"):
            if member.get("prot") == "private" or member.get("id") in seen:
                continue
            if member.get("kind") == "define" and member.findtext("name") in macros:
                continue
            seen.add(member.get("id"))
            yield from of_member(member, compound, group_has_text)


def of_member(member, compound, group_has_text):
    kind, scope = member.get("kind"), compound.findtext("compoundname")
    prefix = "" if compound.get("kind") == "file" else f"{scope}::"
    name = member.findtext("name")
    owner = scope.split("::")[-1].split("<")[0].strip()
    if not (has_text(member) or group_has_text or explained_elsewhere(member, owner)):
        yield *place(member), f"{kind} {prefix}{name}{member.findtext('argsstring') or ''}"
    if kind == "enum":
        for value in member.findall("enumvalue"):
            if not has_text(value):
                yield *place(member), f"enumerator {prefix}{name}::{value.findtext('name')}"
