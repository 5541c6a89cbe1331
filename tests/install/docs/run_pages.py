#!/usr/bin/env python3
"""Runs the commands that the pages show, in a folder like the project's: run_pages.py SOURCE BUILD FOLDER

The README comes first: what its commands install into FOLDER is what all others use. A page fails when one of its
commands does, when one prints something else than the page shows below it, or when one leaves a file in the tree.
Commands in the middle of a sentence are not run, but what they name has to be there.
"""
import itertools
import json
import os
import pathlib
import re
import shutil
import subprocess
import sys

PROGRAMS = re.compile(
    r"([A-Z_]+=\S* )*((senseloom|make|cmake|ctest|ldconfig|apt|cc|c\+\+|sed|awk|git)( |$)|(build|scripts|/tmp)/)")
PAGES = ["README.md", "CONTRIBUTING.md", "SECURITY.md", "docs/*.md", "examples/*.md", "platform/*.md", "data/*.md",
         "bench/*.md", "docs/man/*"]
PAGES_NOT_RUN = {
    "docs/choosing-options.md": "tests/tool/sweep/check_page.py does",
    "docs/recording-on-a-device.md": "takes a device",
}
NOT_RUN = {
    "make test": "it runs this",
    "make check-packages": "takes minutes; CONTRIBUTING.md says when",
    "make release": "Release.* run it on a project of their own",
    "ldconfig": "changes the system; the programs get LD_LIBRARY_PATH instead",
    "apt install ./build/packages/*.deb": "packaging/check_in_chroot.sh does",
    "ANDROID_NDK=... cmake --preset android-x86 -DJANSSON_INCLUDE_DIR=... -DJANSSON_LIBRARY=...": "takes an NDK",
    "cmake --build --preset android-x86": "takes an NDK",
    "scripts/learn_digits.py >platform/libgesture/templates.inc": "takes minutes",
}
# What the manual's examples take for granted: a program that uses the library, and a recording with the truth.
GRANTED = [
    "cc -o program examples/embed.c $(pkg-config --cflags --libs senseloom)",
    """echo '{"call":"open","session":"nav","sensor":"PHYAC"}' >walk.jsonl""",
    "senseloom convert --from csv --columns time=t_s,class=decision,truth=truth <(head -n 400 data/activity/decisions.csv) >>walk.jsonl",
]
# Built already: cmake has nothing to do but to install.
CMAKE = '#!/bin/sh\ncase " $* " in *" --install "*) exec {cmake} "$@" ;; esac\n'


class Project:
    def __init__(self, source, build, folder):
        self.source, self.build, self.folder = source, build, folder
        shutil.rmtree(folder, ignore_errors=True)
        (folder / "tmp").mkdir(parents=True)
        for name in ("data", "docs", "examples"):
            shutil.copytree(source / name, folder / name)
        for name in ("CHANGELOG.md", "CMakeLists.txt", "Makefile", "bench", "include", "packaging", "platform", "tests"):
            (folder / name).symlink_to(source / name)
        self.program("scripts/install-deps.sh", "#!/bin/sh\n")
        self.program("scripts/host-presets.sh", "#!/bin/sh\necho x86\n")
        self.program("scripts/demo.sh", (source / "scripts/demo.sh").read_text())
        self.program("stand_in/cmake", CMAKE.format(cmake=shutil.which("cmake")))
        (folder / "build").mkdir()
        (folder / "build/x86").symlink_to(build)
        installed = folder / "root/usr/local"
        libraries = installed / re.search("^CMAKE_INSTALL_LIBDIR:PATH=(.*)$", (build / "CMakeCache.txt").read_text(), re.M)[1]
        self.environment = dict(
            os.environ, DESTDIR=str(folder / "root"), MAKEFLAGS=f"BUILD={build}", LD_LIBRARY_PATH=str(libraries),
            PATH=f"{folder}/stand_in:{installed}/bin:{os.environ['PATH']}", PKG_CONFIG_PATH=f"{libraries}/pkgconfig")

    def program(self, name, text):
        file = self.folder / name
        file.parent.mkdir(exist_ok=True)
        file.write_text(text)
        file.chmod(0o755)

    def files(self):
        """What commands must not add to."""
        return {str(path.relative_to(self.folder)) for path in self.folder.rglob("*")
                if path.relative_to(self.folder).parts[0] not in ("build", "root", "tmp")}

    def run(self, command):
        done = subprocess.run(["bash", "-c", command.replace("/tmp/", f"{self.folder}/tmp/")], cwd=self.folder,
                              env=self.environment, stdin=subprocess.DEVNULL, capture_output=True, text=True)
        if done.returncode != 0:
            sys.exit(f"{command}\nends with status {done.returncode}:\n{done.stdout}{done.stderr}")
        return done.stdout + done.stderr


def lines_of(page):
    """The lines of a page; those of a manual page as if it were one of the others."""
    text = page.read_text()
    if page.parent.name != "man":
        return re.sub(r"^```.*?^```$", "", text, flags=re.M | re.S).splitlines()
    text = text.replace(r"\-", "-").replace(r"\(aq", "'")
    examples = text.partition(".SH EXAMPLES")[2]
    return [line for block in re.findall(r"^\.EX\n(.*?)^\.EE", examples, re.M | re.S)
            for line in [*("    " + line for line in block.splitlines()), ""]]


def shown(lines):
    """The commands that stand on lines of their own, each with what is shown of its output."""
    command, output = None, []
    for line in [*lines, ""]:
        if line.startswith("    ") and PROGRAMS.match(line.strip()):
            if command:
                yield command, output
            command, output = re.sub("  +# .*", "", line.strip()), []
        elif line.startswith("    ") and command:
            output.append(line[4:])
        elif command:
            yield command, output
            command = None


def run_page(project, page):
    """Returns how many commands were run."""
    before = project.files()
    ran = 0
    for file in (project.folder / "tmp").iterdir():
        file.unlink()
    for command, output in shown(lines_of(project.source / page)):
        if command in NOT_RUN:
            continue
        print(f"{page}: {command}", flush=True)
        printed = project.run(command)
        if output and output != printed.splitlines():
            sys.exit(f"shown is\n{chr(10).join(output)}\nand printed is\n{printed}")
        ran += 1
    left = project.files() - before
    if left:
        sys.exit(f"{page}: its commands leave {', '.join(sorted(left))} in the tree")
    return ran


def missing(project, command):
    """What a command in a sentence names that is not there."""
    words = command.split()
    if words[0] == "senseloom":
        subcommand = itertools.takewhile(re.compile("[a-z]+$").match, words)
        help_text = project.run(" ".join([*subcommand, "--help"]))
        return [word for word in words if word.startswith("--") and word not in help_text]
    if words[0] == "make":
        targets = re.findall("^([a-z-]+):", (project.source / "Makefile").read_text(), re.M)
        return [word for word in words[1:2] if word not in targets]
    if "--preset" in words:
        presets = json.loads((project.source / "CMakePresets.json").read_text())["configurePresets"]
        named = [word for before, word in zip(words, words[1:]) if before == "--preset"]
        return [word for word in named if word not in [preset["name"] for preset in presets]]
    file = project.build / words[0].split("/", 2)[2] if words[0].startswith("build/") else project.source / words[0]
    return [words[0]] if "/" in words[0] and not file.exists() else []


def check_sentences(project, page):
    text = re.sub(r"^```.*?^```$", "", (project.source / page).read_text(), flags=re.M | re.S)
    text = re.sub(r"^    .*$", "", text, flags=re.M)
    for command in re.findall(r"`((?:senseloom|make|cmake|build/|tests/|scripts/)[^`]* [^`]*)`", text):
        absent = missing(project, command)
        if absent:
            sys.exit(f"{page}: {command} names {', '.join(absent)}, which is not there")


def main():
    project = Project(*(pathlib.Path(argument).resolve() for argument in sys.argv[1:]))
    pages = [str(page.relative_to(project.source)) for pattern in PAGES for page in sorted(project.source.glob(pattern))]
    ran = 0
    for page in pages:
        if page not in PAGES_NOT_RUN:
            ran += run_page(project, page)
        check_sentences(project, page)
        if page == "README.md":
            for command in GRANTED:
                project.run(command)
    print(f"{ran} commands")
    if ran < 25:
        sys.exit("too few commands were found")


main()
