"""Android.bp: what it says of a module."""

import ast
import pathlib
import re
import sys


def parsed(text):
    """The modules by name, each a dictionary of texts, lists of texts, bools, or such dictionaries again."""
    text = re.sub(r"^\s*//.*", "", text, flags=re.MULTILINE)
    modules = {}
    for body in re.findall(r"^cc_\w+ (\{.*?^\})", text, re.MULTILINE | re.DOTALL):
        # Apart from names without quotes, this is how Python writes a dictionary.
        quoted = re.sub(r"\b(\w+)(?=: )", r'"\1"', body)
        quoted = re.sub(r"\b(true|false)\b", lambda word: word[1].capitalize(), quoted)
        module = ast.literal_eval(quoted)
        modules[module["name"]] = module
    return modules


def merged(modules, name):
    """A module with what its defaults say: their lists come first, and what else it says itself counts."""
    properties = {}
    for source in [merged(modules, default) for default in modules[name].get("defaults", [])] + [modules[name]]:
        for key, value in source.items():
            properties[key] = properties.get(key, []) + value if isinstance(value, list) else value
    return properties


class Blueprint:
    def __init__(self, root, module="libsenseloom"):
        self.root = pathlib.Path(root)
        self.properties = merged(parsed((self.root / "Android.bp").read_text()), module)

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
        return self["local_include_dirs"] + self.properties.get("export_include_dirs", [])

    def flags(self):
        """What C++ sources are compiled with. Without RTTI, unless it is asked for: that is the platform's default."""
        rtti = [] if self.properties.get("rtti", False) else ["-fno-rtti"]
        return [f"-std={self['cpp_std']}", *rtti, *self["cflags"], *self["cppflags"]]
