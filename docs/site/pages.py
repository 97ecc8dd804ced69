"""The repository's Markdown as pages for Doxygen: names, anchors, links and pictures that hold in the site."""
import html
import os
import posixpath
import re

GUIDE = "docs/guide"
# Pages beside the guides: path and name. The first that is there is the start page.
OTHERS = [
    ("docs/start.md", "index"),
    ("README.md", "overview"),
    ("docs/architecture.md", "architecture"),
    ("examples/README.md", "examples"),
    ("docs/performance/README.md", "performance"),
    ("CONTRIBUTING.md", "contributing"),
    ("CHANGELOG.md", "changelog"),
    ("SECURITY.md", "security"),
]
PICTURES = {".png", ".svg", ".jpg"}
TOKEN = re.compile(r"(?P<code>^```.*?^```|`[^`]+`)|"
                   r"(?P<picture>!)?\[(?P<text>(?:[^\][]|\[[^\]]*\])*)\]\((?P<target>[^)\s]+)\)", re.DOTALL | re.MULTILINE)
ORDER = re.compile(r"^\|\s*\[[^\]]*\]\((\w[\w-]*\.md)\)", re.MULTILINE)


class Fault(Exception):
    """Something in a page that would not hold in the site."""


def slug(heading):
    """The anchor that a heading has where Markdown is shown with the code."""
    kept = re.sub(r"[^\w\- ]", "", re.sub(r"\[([^\]]*)\]\([^)]*\)", r"\1", heading).replace("`", "").lower())
    return kept.strip().replace(" ", "-")


class Site:
    """All pages, each by its path in the repository, and what they take along."""

    def __init__(self, root):
        self.root = root
        self.names = {}
        for path, name in OTHERS:
            if (root / path).is_file():
                self.names[path] = name
        if "index" not in self.names.values():
            self.names["README.md"] = "index"
        self.guides = self.guides_in_order()
        self.names.update({path: "guides" if path.endswith("/README.md") else posixpath.basename(path)[:-3]
                           for path in self.guides})
        self.titles, self.pictures, self.sources = {}, set(), set()

    def guides_in_order(self):
        """As the table of the guides' first page has them, which has to name all."""
        there = sorted(path.relative_to(self.root).as_posix() for path in (self.root / GUIDE).glob("*.md"))
        first = f"{GUIDE}/README.md"
        if first not in there:
            return there
        named = ORDER.findall((self.root / first).read_text(encoding="utf-8"))
        order = [first, *(f"{GUIDE}/{name}" for name in named)]
        if missing := set(there) - set(order):
            raise Fault(f"{first}: its table does not name {', '.join(sorted(missing))}")
        return order

    def page(self, path):
        """The Markdown that Doxygen reads."""
        text = (self.root / path).read_text(encoding="utf-8")
        text = re.sub(r"^<!-- .*? -->\n", "", text, flags=re.MULTILINE)
        text = TOKEN.sub(lambda match: self.token(path, match), text)
        name, parts, fenced, headings = self.names[path], [], False, 0
        for line in text.split("\n"):
            if line.startswith("```"):
                fenced = not fenced
            heading = None if fenced else re.fullmatch(r"(#+) (.*)", line)
            if not heading:
                parts.append(line)
            elif path not in self.titles:
                self.titles[path] = heading[2]
                label = "mainpage" if name == "index" else name
                parts += [f"# {heading[2]} {{#{label}}}", "", "@@TOC@@"]
            else:
                headings += heading[1] == "##"
                parts.append(f"{heading[1]} {heading[2]} {{#{name}-{slug(heading[2])}}}")
        if path not in self.titles:
            raise Fault(f"{path}: has no title")
        return "\n".join(parts).replace("@@TOC@@", "[TOC]\n" if headings > 2 else "")

    def token(self, page, match):
        """A piece of code as it is; a link or a picture with its target in the site."""
        if match["code"]:
            return match[0]
        target, _, anchor = match["target"].partition("#")
        if re.match(r"[a-z]+:", target):
            return match[0]
        path = posixpath.normpath(posixpath.join(posixpath.dirname(page), target)) if target else page
        if match["picture"]:
            self.pictures.add(self.existing(page, path))
            return f'<img src="{posixpath.basename(path)}" alt="{html.escape(" ".join(match["text"].split()))}"/>'
        return f"[{match['text']}]({self.place(page, path, anchor)})"

    def place(self, page, path, anchor):
        if f"{path}/README.md" in self.names:
            path = f"{path}/README.md"
        elif path == GUIDE:
            path = self.guides[0]
        if path in self.names:
            name = self.names[path]
            return f"{name}.html" + (f"#{name}-{anchor}" if anchor else "")
        self.existing(page, path)
        if os.path.splitext(path)[1] in PICTURES:
            self.pictures.add(path)
            return posixpath.basename(path)
        self.sources.add(path)
        return f"source/{path}/index.html" if (self.root / path).is_dir() else f"source/{path}.txt"

    def existing(self, page, path):
        if not (self.root / path).exists():
            raise Fault(f"{page}: links to {path}, which is not there")
        return path
