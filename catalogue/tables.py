"""Reading of the catalogue's tab-separated tables."""


def rows(path, columns):
    """The rows of `path` as tuples of exactly `columns` texts; lines that start with # are notes."""
    result = []
    for number, line in enumerate(path.read_text(encoding="utf-8").splitlines(), 1):
        if not line or line.startswith("#"):
            continue
        cells = line.split("\t")
        if len(cells) != columns:
            raise ValueError(f"{path.name}:{number}: {len(cells)} columns instead of {columns}")
        result.append(tuple(cells))
    return result
