#!/usr/bin/env python3
"""Fails unless Android.bp builds a library as CMake does for Android: check_blueprint.py ROOT BUILD MODULE TARGET LIBRARY

BUILD is a build for Android, from whose commands CMake's way is read; TARGET makes LIBRARY in it."""

import os
import pathlib
import re
import shlex
import subprocess
import sys

from blueprint import Blueprint

# What CMake's build gets by itself, and a platform's build from the platform.
OF_THE_PLATFORM = {"-O3", "-DNDEBUG", "-fPIC", "-g", "-U_FORTIFY_SOURCE", "-D_FORTIFY_SOURCE=2",
                   "-fstack-protector-strong", "-fvisibility-inlines-hidden"}
# What CMake leaves at the compiler's default, and a platform switches off.
DEFAULTS = {"-fexceptions"}
# Libraries that a platform's build links without being told.
RUNTIME = {"libc", "libm", "libdl"}


def output_of(*command):
    return subprocess.run(command, check=True, capture_output=True, text=True).stdout


def commands(build, target):
    """The command lines of a target, those that compile C++ and the one that links it."""
    lines = [shlex.split(line) for line in output_of("ninja", "-C", build, "-t", "commands", target).splitlines()]
    compiling = [line for line in lines if "-c" in line and line[-1].endswith(".cpp")]
    return compiling, lines[-1]


def code_flags(command):
    """The options that decide what code a source becomes, not where anything is or what is warned of."""
    skipped = re.compile(r"-(I|W|M|isystem|o$|c$|D_LIBCPP|-target|-sysroot|mssse3)")
    return {argument for argument in command[1:] if argument.startswith("-") and not skipped.match(argument)}


def includes(command, root, build):
    """The folders of the project that headers are taken from. Those of <hardware/hardware.h> are another module's."""
    folders = {argument[2:] for argument in command if argument.startswith("-I")}
    own = {os.path.relpath(folder, root) for folder in folders if not folder.startswith(str(build))}
    others = {folder for folder in own if os.path.exists(os.path.join(root, folder, "hardware/hardware.h"))}
    return own - others, others


def needed(library):
    dynamic = output_of("readelf", "--wide", "--dynamic", library)
    return {name for name in re.findall(r"\(NEEDED\).*\[([\w-]+)\.so\]", dynamic) if name not in RUNTIME}


def soname(library):
    return re.findall(r"\(SONAME\).*\[(.+)\]", output_of("readelf", "--wide", "--dynamic", library))


def exported_headers(root, target):
    text = pathlib.Path(root, "src/CMakeLists.txt").read_text()
    return set(re.findall(rf"target_include_directories\({target} PUBLIC \$\{{PROJECT_SOURCE_DIR\}}/([^)]*)\)", text))


def main():
    root, build = (os.path.abspath(argument) for argument in sys.argv[1:3])
    module, target, library = sys.argv[3:]
    library = os.path.join(build, library)
    blueprint = Blueprint(root, module)
    compiling, linking = commands(build, target)
    own_folders, other_folders = includes(compiling[0], root, build)
    version_scripts = re.findall(r"--version-script=(\S+)", " ".join(linking))
    headers = {"libhardware_headers"} if other_folders else set()

    failed = False

    def compare(what, by_blueprint, by_cmake):
        nonlocal failed
        for where, names in ("Android.bp", by_blueprint - by_cmake), ("CMake", by_cmake - by_blueprint):
            for name in sorted(names):
                failed = True
                print(f"{what}: {name} in {where} alone")

    compare("sources", set(blueprint.sources()), {os.path.relpath(line[-1], root) for line in compiling})
    flags = {flag for flag in blueprint.flags() if not flag.startswith("-W")}
    for by_cmake in {frozenset(code_flags(line)) for line in compiling}:
        compare("flags", flags - DEFAULTS, by_cmake - OF_THE_PLATFORM)
    compare("folders of headers", set(blueprint.include_dirs()), own_folders)
    compare("modules of headers", set(blueprint.properties.get("header_libs", [])), headers)
    compare("exported headers", set(blueprint.properties.get("export_include_dirs", [])), exported_headers(root, target))
    compare("version scripts", {blueprint["version_script"]}, {os.path.relpath(file, root) for file in version_scripts})
    compare("libraries", set(blueprint["shared_libs"]), needed(library))
    compare("sonames", {blueprint.properties.get("stem", module) + ".so"}, set(soname(library)))
    # Without -Wno-error a platform's build adds -Werror itself.
    compare("warnings", {flag for flag in blueprint.flags() if flag.endswith("error")}, {"-Wno-error"})
    sys.exit(failed)


main()
