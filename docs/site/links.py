"""Every link, picture and anchor of the site's pages, followed; files that no page uses go."""
import html.parser
import posixpath
import urllib.parse


class Page(html.parser.HTMLParser):
    def __init__(self, text):
        super().__init__()
        self.anchors, self.targets = set(), set()
        self.feed(text)

    def handle_starttag(self, tag, attributes):
        for name, value in attributes:
            if name == "id" or (name == "name" and tag == "a"):
                self.anchors.add(value)
            elif name in ("href", "src") and value:
                self.targets.add(value)


def check(folder, kept):
    """The faults, a line each, in the pages that a reader can come to. The others go, as do files that none of them
    uses; `kept` are files that scripts use."""
    read, faults, used, waiting = {}, [], set(kept) | {"index.html"}, ["index.html"]

    def page(name):
        if name not in read:
            read[name] = Page((folder / name).read_text(encoding="utf-8"))
        return read[name]

    while waiting:
        name = waiting.pop()
        for target in sorted(page(name).targets):
            parts = urllib.parse.urlsplit(target)
            if parts.scheme or parts.netloc:
                continue
            path = posixpath.normpath(posixpath.join(posixpath.dirname(name), urllib.parse.unquote(parts.path))) \
                if parts.path else name
            if not (folder / path).is_file():
                faults.append(f"{name}: links to {target}, which is not in the site")
                continue
            if path.endswith(".html"):
                if parts.fragment and parts.fragment not in page(path).anchors:
                    faults.append(f"{name}: links to {target}, but that page has no such anchor")
                if path not in used:
                    waiting.append(path)
            used.add(path)
    for path in sorted(folder.rglob("*")):
        if path.is_file() and path.relative_to(folder).as_posix() not in used:
            path.unlink()
    return sorted(faults)
