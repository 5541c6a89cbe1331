#!/usr/bin/env python3
"""Builds the library by Android.bp alone, for the host: build_by_blueprint.py ROOT FOLDER -I FOLDER... FILE...

As the platform's build does, by clang with a shared libc++. The folders are those of other modules' headers, the files
the libraries in shared_libs. The result is FOLDER/libsenseloom.so."""

import pathlib
import subprocess
import sys

from blueprint import Blueprint

# What the platform's build compiles every module with.
PLATFORM_FLAGS = ["-O2", "-fPIC", "-DNDEBUG", "-fno-exceptions", "-fstack-protector-strong",
                  "-D_FORTIFY_SOURCE=2"]


def ninja_file(blueprint, includes, libraries):
    root = blueprint.root
    own_includes = [f"-I{root / folder}" for folder in blueprint.include_dirs()]
    flags = PLATFORM_FLAGS + blueprint.flags() + own_includes + includes
    linked = [libraries[name] for name in blueprint["shared_libs"]]
    lines = [
        "rule compile",
        f"  command = clang++ -stdlib=libc++ {' '.join(flags)} -MD -MF $out.d -c $in -o $out",
        "  depfile = $out.d",
        "rule link",
        f"  command = clang++ -stdlib=libc++ -shared -Wl,--no-undefined "
        f"-Wl,--version-script={root / blueprint['version_script']} $in {' '.join(linked)} -o $out",
    ]
    objects = {source: source.replace("/", "_") + ".o" for source in blueprint.sources()}
    lines += [f"build {made}: compile {root / source}" for source, made in objects.items()]
    lines += [f"build libsenseloom.so: link {' '.join(objects.values())} | {root / blueprint['version_script']}"]
    return "\n".join(lines) + "\n"


def main():
    root, folder, *rest = sys.argv[1:]
    includes = [argument for argument in rest if argument.startswith("-I")]
    libraries = {pathlib.Path(file).name.split(".")[0]: file for file in rest if not file.startswith("-I")}
    output = pathlib.Path(folder)
    output.mkdir(parents=True, exist_ok=True)
    (output / "build.ninja").write_text(ninja_file(Blueprint(root), includes, libraries))
    sys.exit(subprocess.run(["ninja", "--quiet", "-C", output], check=False).returncode)


main()
