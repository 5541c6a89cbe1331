"""Android.bp: what it says of libsenseloom."""

import ast
import pathlib
import re
import sys


class Blueprint:
    """`properties` has those of the one module: a text, a list of texts, a bool, or such a dictionary again."""

    def __init__(self, root):
        self.root = pathlib.Path(root)
        text = re.sub(r"^\s*//.*", "", (self.root / "Android.bp").read_text(), flags=re.MULTILINE)
        module = re.fullmatch(r"\s*cc_library_shared\s*(\{.*\})\s*", text, re.DOTALL)
        # Apart from names without quotes, this is how Python writes a dictionary.
        quoted = re.sub(r"\b(\w+)(?=\s*:)", r'"\1"', module[1])
        quoted = re.sub(r"\b(true|false)\b", lambda word: word[1].capitalize(), quoted)
        self.properties = ast.literal_eval(quoted)

    def __getitem__(self, name):
        if name not in self.properties:
            sys.exit(f"Android.bp has no {name}")
        return self.properties[name]

    def sources(self):
        """The sources, relative to the root."""
        found = {file for pattern in self["srcs"] for file in self.root.glob(pattern)}
        return sorted(str(file.relative_to(self.root)) for file in found)

    def include_dirs(self):
        """The folders of the project that sources take headers from, relative to the root."""
        return self["local_include_dirs"] + self["export_include_dirs"]

    def flags(self):
        """What C++ sources are compiled with. Without RTTI, unless it is asked for: that is the platform's default."""
        rtti = [] if self.properties.get("rtti", False) else ["-fno-rtti"]
        return [f"-std={self['cpp_std']}", *rtti, *self["cflags"], *self["cppflags"]]
