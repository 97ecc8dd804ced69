"""Which public operation calls which function of the platform, read from sources laid out by clang-format.

A reading by patterns, not a compiler's: a helper counts as called where its name stands and could mean it.
"""
import collections
import re

# The library's ways to call the platform; a pattern's groups are alternatives.
WAYS = [
    (re.compile(r"\bORU_GL0?\(\s*(\w+)|\bORU_BINDER\((\w+)|->cgm(\w+)\("), "gl"),
    (re.compile(r"\bORU_WGL0?\(\s*(\w+)|->wcgm(\w+)\(|\b_wcgm(\w+)|\"wgl([A-Z]\w+)\""), "wgl"),
    (re.compile(r"\bORU_CL\(\s*(\w+)|[.>]cl([A-Z]\w+)\b"), "cl"),
    (re.compile(r"::gl([A-Z]\w+)\(|[.>]gl([A-Z]\w+)\b"), "gl"),
]
COUNTED = re.compile(r"^ORU_CL_COUNTED\(\w+, (\w+)\)$", re.MULTILINE)  # a kind of handle, retained and released
COMMENT = re.compile(r"//[^\n]*|/\*.*?\*/", re.DOTALL)
STRING = re.compile(r'"(?:\\.|[^"\\])*"')
WORD = re.compile(r"\b[A-Za-z_]\w*")
# The bodies of an implementation behind a pointer belong to the class in front of it.
BEHIND_POINTER = re.compile(r"Impl(Core)?$")
# The last links call every function and are no answer to "who calls it".
LEFT_OUT = ("openglerrorchecker", "wglerrorchecker", "opengltracer", "forwarder.h", "wglcall.h", "glcall.h",
            "librarycalls.h", "clcall.h")
# What nearly every operation asks by the way, or draws to find something out: the library's own business.
OWN_BUSINESS = ("objects/supported.h", "objects/release.h", "contexts/filteringprobe.cpp", "extensionmanagerogl_records.cpp",
                "internal/contextprofile.cpp", "internal/contextbootstrap_win.cpp", "contexts/temporarycontext_win.cpp")


class Function:
    """A function body in the sources: where, whose, what it calls."""

    def __init__(self, owner, name, text, path):
        self.owner, self.name, self.text, self.path = owner, name, text, path
        self.calls = set(called(text))
        self.spaces = []  # the named namespaces of its file

    @property
    def last_owner(self):
        return self.owner.rpartition("::")[2]

    @property
    def is_special(self):
        """A constructor or the destructor."""
        return bool(self.owner) and self.name.lstrip("~") == self.last_owner


def called(text):
    """The platform's functions that a text calls by one of the library's ways."""
    for way, prefix in WAYS:
        for groups in way.findall(text):
            yield prefix + ("".join(groups) if isinstance(groups, tuple) else groups)


def blocks(text, indent):
    """(head, whole) of each braced block, of a function or a class, that begins at an indentation."""
    margin, head, body, depth = " " * indent, [], [], 0
    for line in text.split("\n"):
        plain = STRING.sub("", line).rstrip()
        if depth == 0:
            at_margin = line.startswith(margin) and line[indent:indent + 1] not in ("", " ", "#", "}")
            if at_margin and not (head and head[-1].startswith(f"{margin}template")):
                head = []  # what stood there was no beginning
            if not at_margin and not head:
                continue
            head.append(line)
            if head[0][indent:].startswith(("namespace", 'extern "C"')) or plain.endswith((";", "public:", "private:")):
                head = []
                continue
            body = []
        body.append(line)
        depth += plain.count("{") - plain.count("}")
        if depth == 0 and "{" in "".join(body):
            yield "\n".join(head).split("{")[0], "\n".join(head + body)
            head, body = [], []


def functions(path, text, indent=0, owner=""):
    """Every function body of a file, those in classes too."""
    for head, body in blocks(text, indent):
        kind = re.match(r"\s*(?:template<.*?>\s*)?(?:class|struct)\s+(?:ORU_API\s+)?([\w:]+)", head)
        if kind and "(" not in head.split(kind[1])[0]:
            yield from functions(path, body, indent + 4, f"{owner}::{kind[1]}" if owner else kind[1])
            continue
        name = re.search(r"([\w:~]+(?:operator\W+)?)\s*\(", head) or re.search(r"(\w+)\W*$", head.split("=")[0])
        if name:
            scope, _, last = name[1].rpartition("::")
            yield Function("::".join(part for part in (owner, scope) if part), last, body, path)


def read(root, generated):
    """All function bodies of the library."""
    found = []
    for top in (root, generated):
        for path in sorted(path for suffix in ("*.cpp", "*.h") for path in (top / "oru").rglob(suffix)):
            if any(part in path.name for part in LEFT_OUT):
                continue
            text, name = COMMENT.sub("", path.read_text(encoding="utf-8")), path.relative_to(top).as_posix()
            of_file = list(functions(name, text))
            of_file += [Function("", f"{does}Handle", f"ORU_CL({does}{kind}, handle)", name)
                        for kind in COUNTED.findall(text) for does in ("Retain", "Release")]
            for function in of_file:
                function.spaces = re.findall(r"^namespace (\w+) \{", text, re.MULTILINE)
            found += of_file
    return found


class Operations:
    """Knows the public operations, {qualified name: page}, and finds those that lead to a function body."""

    def __init__(self, found, pages):
        self.pages = pages
        self.by_word = collections.defaultdict(list)
        for function in found:
            for word in set(WORD.findall(function.text)):
                self.by_word[word].append(function)

    def public(self, function):
        """The qualified name of a public operation, None of another function."""
        name = BEHIND_POINTER.sub("", function.name) if function.is_special else function.name
        parts = [*(BEHIND_POINTER.sub("", part) for part in function.owner.split("::") if part), name]
        layer = "ORU::OCL" if function.path.startswith("oru/oru_ocl") else "ORU::OGL"
        spaces = [*(f"{layer}::{space}" for space in function.spaces), layer, "ORU"]
        names = ("::".join([space, *parts]) for space in spaces)
        return next((name for name in names if name in self.pages), None)

    def leading_to(self, function, seen=None):
        """The names of the public operations behind which a function body stands."""
        seen = set() if seen is None else seen
        if id(function) in seen or function.path.endswith(OWN_BUSINESS):
            return set()
        seen.add(id(function))
        if name := self.public(function):
            return {name}
        by_class = function.is_special or function.name.startswith("operator")
        callers = self.by_word.get(function.last_owner if by_class else function.name, ())
        return set().union(*(self.leading_to(caller, seen) for caller in callers
                             if caller is not function and self.may_call(caller, function)))

    def may_call(self, caller, function):
        """A function of a source is called there alone, what a public class hides by that class alone, an operation of
        another class by who has such an object."""
        if caller.path.split("/")[1] != function.path.split("/")[1]:
            return False
        if not function.owner:
            return caller.path == function.path or "internal" in function.path
        own, callers = (BEHIND_POINTER.sub("", name) for name in (function.last_owner, caller.last_owner))
        is_public = any(f"{layer}::{own}::{own}" in self.pages for layer in ("ORU", "ORU::OGL", "ORU::OCL"))
        return own == callers or not is_public and function.last_owner in WORD.findall(caller.text)


def callers(root, generated, pages):
    """{function of the platform: (public operations that call it, files of other callers)}."""
    found = read(root, generated)
    operations = Operations(found, pages)
    names, files = collections.defaultdict(set), collections.defaultdict(set)
    for function in found:
        leading = operations.leading_to(function) if function.calls else set()
        for name in function.calls:
            names[name] |= leading
            if not leading:
                files[name].add(function.path)
    return {name: (sorted(names[name]), sorted(files[name])) for name in names.keys() | files.keys()}
