#!/usr/bin/env python3
"""Makes the Debian packages of a finished build, for its word size: make_debs.py BUILD OUTPUT

The packages are those of packaging/control; each has what the build installs as one of its components.
"""

import gzip
import hashlib
import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
import textwrap

COMPONENTS = {
    "libsenseloom1": "library",
    "libsenseloom-dev": "development",
    "senseloom-recorder": "recorder",
    "senseloom": "tool",
}
PACKAGING = pathlib.Path(__file__).resolve().parent
SOURCE = PACKAGING.parent


def run(*command, **settings):
    done = subprocess.run([str(word) for word in command], capture_output=True, text=True, **settings)
    if done.returncode != 0:
        sys.exit(f"{' '.join(map(str, command))}\n{done.stdout}{done.stderr}")
    return done.stdout.strip()


def changelog():
    """The topmost section of CHANGELOG.md in Debian's form, and the version it is about."""
    page = SOURCE / "CHANGELOG.md"
    version, date, notes = re.search(r"^## (\S+), (.*?)\n(.*?)(?=^## |\Z)", page.read_text(), re.M | re.S).groups()
    if not re.fullmatch(r"\d{4}-\d\d-\d\d", date):  # not yet released; the date has to be that of both word sizes
        date = f"@{int(page.stat().st_mtime)}"
    lines = [f"senseloom ({version}) unstable; urgency=medium", ""]
    for note in re.split(r"^- ", notes, flags=re.M)[1:]:
        lines += textwrap.wrap(note, 76, initial_indent="  * ", subsequent_indent="    ")
    maintainer = re.search(r"^Maintainer: (.*)$", (PACKAGING / "control").read_text(), re.M)[1]
    lines += ["", f" -- {maintainer}  {run('date', '-u', '-R', '-d', date)}", ""]
    return "\n".join(lines), version, run("date", "-u", "+%s", "-d", date)


def compress(file, content):
    file.parent.mkdir(parents=True, exist_ok=True)
    file.write_bytes(gzip.compress(content, 9, mtime=0))
    file.chmod(0o644)


def document(package, root, history):
    """Adds what Debian wants of every package."""
    folder = root / "usr/share/doc" / package
    compress(folder / "changelog.gz", history.encode())
    shutil.copyfile(PACKAGING / "copyright", folder / "copyright")
    for page in [page for page in root.glob("usr/share/man/*/*") if page.suffix != ".gz"]:
        compress(page.with_name(page.name + ".gz"), page.read_bytes())
        page.unlink()
    overrides = PACKAGING / f"{package}.lintian-overrides"
    if overrides.exists():
        (root / "usr/share/lintian/overrides").mkdir(parents=True)
        shutil.copyfile(overrides, root / "usr/share/lintian/overrides" / package)


def checksums(root):
    files = sorted(file for file in root.glob("usr/**/*") if file.is_file() and not file.is_symlink())
    return "".join(f"{hashlib.md5(file.read_bytes()).hexdigest()}  {file.relative_to(root)}\n" for file in files)


def programs(root):
    return [file for file in sorted(root.glob("usr/**/*"))
            if file.is_file() and not file.is_symlink() and file.read_bytes()[:4] == b"\x7fELF"]


def describe(package, root, work, version):
    """Adds what dpkg reads of the package: on which others it depends, above all."""
    (root / "DEBIAN").mkdir()
    if package == "libsenseloom1":
        (root / "DEBIAN/shlibs").write_text(f"libsenseloom 1 {package} (>= {version})\n")
        (root / "DEBIAN/triggers").write_text("activate-noawait ldconfig\n")
    variables = work / "debian" / f"{package}.substvars"
    if programs(root):
        run("dpkg-shlibdeps", f"-T{variables}", *(f"-e{program}" for program in programs(root)), cwd=work)
    (root / "DEBIAN/md5sums").write_text(checksums(root))
    run("dpkg-gencontrol", f"-p{package}", f"-P{root}", f"-T{variables}", cwd=work)


def make(package, build, work, history, version):
    """Makes one package, and returns its root."""
    root = work / "debian" / package
    run("cmake", "--install", build, "--prefix", "/usr", "--component", COMPONENTS[package], "--strip",
        env=dict(os.environ, DESTDIR=str(root)))
    document(package, root, history)
    describe(package, root, work, version)
    return root


def architecture(build):
    """Debian's name for what the build's programs run on."""
    folder = re.search(r"^CMAKE_INSTALL_LIBDIR:PATH=lib/(.*)$", (build / "CMakeCache.txt").read_text(), re.M)[1]
    return run("dpkg-architecture", "-f", "-t", folder, "-q", "DEB_HOST_ARCH")


def main():
    build, output = (pathlib.Path(argument).resolve() for argument in sys.argv[1:])
    os.umask(0o022)
    history, version, os.environ["SOURCE_DATE_EPOCH"] = changelog()
    os.environ["DEB_HOST_ARCH"] = architecture(build)
    packages = list(COMPONENTS)
    if os.environ["DEB_HOST_ARCH"] != run("dpkg", "--print-architecture"):
        packages.remove("senseloom")  # one tool is for programs of either word size
    output.mkdir(parents=True, exist_ok=True)
    with tempfile.TemporaryDirectory() as folder:
        work = pathlib.Path(folder)
        (work / "debian").mkdir()
        (work / "debian/changelog").write_text(history)
        shutil.copyfile(PACKAGING / "control", work / "debian/control")
        for package in packages:  # the library comes first: the others are told by it what they depend on
            run("dpkg-deb", "--root-owner-group", "--build", make(package, build, work, history, version), output)


main()
