"""The symbols of the reference, from Doxygen's XML: for the map of functions, for the search, and as lists."""
import html
import posixpath
import re
import xml.etree.ElementTree as xml

KINDS = {"class", "struct", "union", "namespace"}


class Symbol:
    """A public symbol, or a header; its text is all that is said of it, its brief text the first sentence."""

    def __init__(self, kind, name, page, element):
        self.kind, self.name, self.page = kind, name, page
        self.brief = " ".join("".join(element.find("briefdescription").itertext()).split())
        self.text = " ".join([self.brief, *"".join(element.find("detaileddescription").itertext()).split()])


def page_of(refid):
    """The page of a symbol, whose last part is its anchor there unless it has a page of its own."""
    page, separator, anchor = refid.rpartition("_1")
    return f"{page}.html#{anchor}" if separator and len(anchor) >= 33 and anchor[0] in "abcdefgh" else f"{refid}.html"


def symbols(folder):
    """All public symbols in the order of their names."""
    found = {}
    for path in sorted(folder.glob("*.xml")):
        root = xml.parse(path).getroot()
        for compound in root.findall("compounddef"):
            kind, scope = compound.get("kind"), compound.findtext("compoundname")
            if compound.get("prot") == "private":
                continue
            if kind in KINDS:
                found[compound.get("id")] = Symbol(kind, scope, page_of(compound.get("id")), compound)
            elif kind == "file":
                name = compound.find("location").get("file")
                found[compound.get("id")] = Symbol("header", name, page_of(compound.get("id")), compound)
                scope = ""
            else:
                continue
            for member in compound.findall(".//memberdef"):
                if member.get("prot") == "private" or member.get("kind") == "friend":
                    continue
                name = "::".join(part for part in (scope, member.findtext("name")) if part)
                page = page_of(member.get("id"))
                found.setdefault(member.get("id"), Symbol(member.get("kind"), name, page, member))
                for value in member.findall("enumvalue"):
                    title = f"{name}::{value.findtext('name')}"
                    found.setdefault(value.get("id"), Symbol("enumerator", title, page, value))
    return sorted(found.values(), key=lambda symbol: (symbol.name, symbol.page))


def operations(found):
    """{qualified name of a function: its page}; of overloads the first."""
    pages = {}
    for symbol in found:
        if symbol.kind == "function":
            pages.setdefault(symbol.name, symbol.page)
        elif symbol.kind in ("class", "struct"):
            last = symbol.name.rpartition("::")[2]
            for special in (last, f"~{last}"):
                pages.setdefault(f"{symbol.name}::{special}", symbol.page)
    return pages


def lists(found):
    """Two pages in Markdown: the classes by namespace, the headers by folder."""
    def page(title, name, groups):
        text = [f"# {title} {{#{name}}}", ""]
        for group, members in groups.items():
            anchor = re.sub(r"\W+", "-", group)
            text += [f"## {group} {{#{name}-{anchor}}}", "", "\\htmlonly", '<ul class="list">']
            text += [f'<li><a href="{page}">{html.escape(shown)}</a> <span>{html.escape(brief)}</span></li>'
                     for shown, page, brief in members]
            text += ["</ul>", "\\endhtmlonly", ""]
        return "\n".join(text)

    namespaces = [symbol.name for symbol in found if symbol.kind == "namespace"]
    classes, headers = {}, {}
    for symbol in found:
        if symbol.kind in ("class", "struct", "union"):
            scope = max((name for name in namespaces if symbol.name.startswith(f"{name}::")), key=len, default="")
            shown = symbol.name.removeprefix(f"{scope}::")
            classes.setdefault(scope, []).append((shown, symbol.page, symbol.brief))
        elif symbol.kind == "header":
            folder, shown = posixpath.split(symbol.name)
            headers.setdefault(folder, []).append((shown, symbol.page, symbol.brief))
    return {"class-list": page("Classes", "class-list", classes),
            "header-list": page("Headers", "header-list", headers)}
