"""The code blocks of docs/adding-a-sensor.md, and what each of them does to a tree of sources."""

import pathlib
import re

# The text before a block ends by saying where the block belongs.
PLACES = [
    ("new", re.compile(r"New file `(?P<file>[^`]+)`:$")),
    ("end", re.compile(r"At the end of `(?P<file>[^`]+)`:$")),
    ("after", re.compile(r"In `(?P<file>[^`]+)`, after `(?P<line>[^`]+)`:$")),
]


class PageError(Exception):
    pass


def blocks(page):
    """(kind of place, file, line to come after, code) of each block of the page."""
    page = re.sub(r"<!--.*?-->", "", page, flags=re.DOTALL)
    parts = re.split(r"^```[^\n]*\n(.*?)^```$", page, flags=re.MULTILINE | re.DOTALL)
    for text, code in zip(parts[0::2], parts[1::2]):
        # The sentence may be wrapped.
        sentence = re.sub(r"\n(?=[^\n])", " ", text.rstrip())
        found = [(kind, pattern.search(sentence)) for kind, pattern in PLACES]
        found = [(kind, match) for kind, match in found if match]
        if not found:
            raise PageError(f"no place for the block that begins with {code.splitlines()[0]!r}")
        kind, match = found[0]
        yield kind, match["file"], match.groupdict().get("line"), code


def apply(page, tree):
    """Applies all blocks to the tree. Returns the files that they changed or made."""
    changed = []
    for kind, name, line, code in blocks(page):
        file = pathlib.Path(tree, name)
        if kind == "new":
            if file.exists():
                raise PageError(f"{name} is there already")
            file.parent.mkdir(parents=True, exist_ok=True)
            content = code
        else:
            lines = file.read_text().splitlines(keepends=True)
            places = [number for number, there in enumerate(lines) if there.strip() == line]
            if kind == "after" and len(places) != 1:
                raise PageError(f"{name} has no single line {line!r}")
            lines.insert(places[0] + 1 if kind == "after" else len(lines), code)
            content = "".join(lines)
        file.write_text(content)
        changed.append(file)
    return changed
