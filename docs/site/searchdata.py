"""What the site's search looks through."""
import html
import json
import re

SECTION = re.compile(r'<h[2-5]><a class="anchor" id="([^"]+)"></a>\n?(.*?)</h[2-5]>', re.DOTALL)
MOST_KEPT = 300  # characters of a symbol's text; pages are kept whole


def plain(markup):
    return " ".join(html.unescape(re.sub(r"<[^>]+>", " ", markup)).split())


def script(symbols, site, folder, platform):
    """A script with the rows [name, page, kind, text]: of symbols, of the platform's functions, of pages and their parts."""
    rows = [[symbol.name.removeprefix("ORU::"), symbol.page, symbol.kind, symbol.text[:MOST_KEPT]] for symbol in symbols]
    rows += [[name, page, "function of the platform", text] for name, page, text in platform]
    for path, name in sorted(site.names.items(), key=lambda item: item[1]):
        text = (folder / f"{name}.html").read_text(encoding="utf-8")
        body = text[text.index('<div class="contents">'):text.index("</div><!-- contents -->")]
        first, *parts = SECTION.split(body)
        title = site.titles[path]
        rows.append([title, f"{name}.html", "page", plain(first)])
        for anchor, heading, part in zip(parts[::3], parts[1::3], parts[2::3]):
            rows.append([plain(heading), f"{name}.html#{anchor}", f"page, {title.split(':')[0]}", plain(part)])
    return "searchRows = " + json.dumps(rows, ensure_ascii=False, separators=(",", ":")) + ";\n"
