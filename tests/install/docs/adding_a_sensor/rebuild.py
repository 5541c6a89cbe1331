"""Builds targets from changed sources, out of the objects of a build with Ninja wherever the change leaves them alone."""

import concurrent.futures
import os
import pathlib
import re
import shlex
import subprocess


class CompileError(Exception):
    pass


class Rebuild:
    """`build`: the folder of a finished build of `root`. `tree`: a copy of root, in which `changed` files differ."""

    def __init__(self, build, root, tree, changed, output):
        self.build, self.root, self.tree, self.output = build, root, tree, pathlib.Path(output)
        self.changed = {os.path.join(root, os.path.relpath(file, tree)) for file in changed}
        self.dependencies = self._dependencies()
        self.remade = {}  # the name of a file of the build: what takes its place

    def _ninja(self, *arguments):
        return subprocess.run(["ninja", "-C", self.build, *arguments], check=True, capture_output=True, text=True).stdout

    def _dependencies(self):
        """The sources that each object was compiled from."""
        dependencies = {}
        for entry in self._ninja("-t", "deps").split("\n\n"):
            lines = entry.splitlines()
            if lines:
                dependencies[lines[0].split(":")[0]] = {line.strip() for line in lines[1:]}
        return dependencies

    def target(self, name):
        """Makes a target and whatever it consists of. Returns its file."""
        archives = {}
        compiling = {}
        links = []
        made = None
        for command in self._ninja("-t", "commands", name).splitlines():
            compiled = re.search(r" -o (\S+\.o) -c ", command)
            archived = re.search(r" qc (\S+\.a) +(.*\.o)( |$)", command)
            linked = re.search(r" -o (\S+) ", command)
            if compiled:
                compiling[compiled[1]] = command
            elif archived:
                archives[archived[1]] = archived[2].split()
            elif linked:
                links.append((command, linked[1]))
        with concurrent.futures.ThreadPoolExecutor(os.cpu_count()) as pool:
            list(pool.map(self._compile, compiling.values(), compiling.keys()))
        for command, file in links:
            made = self._link(command, file, archives) or made
        return made

    def _compile(self, command, name):
        if name in self.remade or not self.dependencies.get(name, set()) & self.changed:
            return
        made = self.output / name
        made.parent.mkdir(parents=True, exist_ok=True)
        # What was generated into the build's folder stays where it is.
        moved = re.sub(rf"{re.escape(self.root)}(?=[/ ])(?!/{re.escape(os.path.relpath(self.build, self.root))}/)",
                       self.tree, command)
        moved = re.sub(r" -MD -MT \S+ -MF \S+", "", moved)
        # Precompiled for other sources; clang takes it in other words than gcc.
        moved = re.sub(r" -Winvalid-pch|( -Xclang)? -include(-pch)?( -Xclang)? \S+/cmake_pch\.hxx(\.pch)?", "", moved)
        arguments = [str(made) if argument == name else argument for argument in shlex.split(moved)]
        if "/Unity/" in arguments[-1]:  # several sources in one, each by its full path
            together = made.with_suffix(".cxx")
            together.write_text(pathlib.Path(arguments[-1]).read_text().replace(f"{self.root}/", f"{self.tree}/"))
            arguments[-1] = str(together)
        plain = ["-O0"] + (["-U_FORTIFY_SOURCE"] if "_FORTIFY_SOURCE" in command else [])  # which takes optimisation
        self._run([*arguments, *plain])
        self.remade[name] = str(made)

    def _link(self, command, name, archives):
        arguments = shlex.split(command.removeprefix(": && ").split(" && ")[0])
        # An object in front of an archive takes the place of the archive's own.
        inside = [self.remade[part] for archive in arguments for part in archives.get(archive, []) if part in self.remade]
        replaced = [self.remade.get(argument, argument) for argument in arguments]
        if not inside and replaced == arguments:
            return None
        made = self.output / name
        made.parent.mkdir(parents=True, exist_ok=True)
        replaced[replaced.index("-o") + 1] = str(made)
        self._run([replaced[0], *inside, *replaced[1:]])
        for soname in re.findall(r"-soname,(\S+)", command):
            made.with_name(soname).unlink(missing_ok=True)
            made.with_name(soname).symlink_to(made.name)
        self.remade[name] = str(made)
        return str(made)

    def _run(self, arguments):
        done = subprocess.run(arguments, cwd=self.build, capture_output=True, text=True)
        if done.returncode != 0:
            raise CompileError(f"{shlex.join(arguments)}\n{done.stderr}")
