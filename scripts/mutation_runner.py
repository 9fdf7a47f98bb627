"""Builds the tests once, and runs them on one change of a source at a time, in copies of the project."""
import collections
import os
import pathlib
import re
import resource
import shlex
import shutil
import signal
import subprocess
import sys
import time

ROOT = pathlib.Path(__file__).resolve().parent.parent
ABOVE = {"frame": ["graphics", "memory"], "geo": ["graphics"], "memory": ["sparse"],
         "platform": ["files", "frame", "util", "memory", "graphics", "sparse", "geo"]}
FAMILIES = ["files", "frame", "geo", "graphics", "memory", "platform", "sparse", "util"]
PARTS = ["CMakeLists.txt", "README.md", "cmake", "docs", "include", "src", "tests"]
FLAGS = "-O2 -g0 -Wno-error -w"
GIGABYTE = 1 << 30


def mirror(target):
    """Brings a copy of the sources up to date; what did not change keeps its time, so that ninja builds little."""
    wanted = {file.relative_to(ROOT) for part in PARTS for file in [ROOT / part, *(ROOT / part).rglob("*")]
              if file.is_file()}
    for file in [file for file in target.rglob("*") if file.is_file()]:
        if file.relative_to(target) not in wanted:
            file.unlink()
    for name in wanted:
        copy, content = target / name, (ROOT / name).read_bytes()
        if not copy.is_file() or copy.read_bytes() != content:
            copy.parent.mkdir(parents=True, exist_ok=True)
            copy.write_bytes(content)


def run(command, **options):
    result = subprocess.run(command, stdout=subprocess.PIPE, stderr=subprocess.STDOUT, text=True, errors="replace",
                            check=False, **options)
    if result.returncode != 0:
        sys.exit(f"{shlex.join(map(str, command))} failed:\n{result.stdout[-4000:]}")
    return result.stdout


class Build:
    """The unchanged objects and test programs, and how ninja made them."""

    def __init__(self, folder, jobs):
        self.tree, self.folder = folder / "tree", folder / "base"
        mirror(self.tree)
        linker = "-fuse-ld=lld" if shutil.which("ld.lld") else ""
        run(["cmake", "-S", self.tree, "-B", self.folder, "-G", "Ninja", "-DCMAKE_BUILD_TYPE=None",
             "-DBUILD_SHARED_LIBS=OFF", "-DBASALT_BUILD_EXAMPLES=OFF", "-DBASALT_BUILD_TOOLS=OFF",
             "-DBASALT_INSTALL=OFF",
             f"-DCMAKE_CXX_FLAGS={FLAGS}", f"-DCMAKE_EXE_LINKER_FLAGS={linker}"])
        run(["ninja", "-C", self.folder, f"-j{jobs}", *(f"{family}_tests" for family in FAMILIES)])
        self.compile, self.link = {}, {}
        for family in FAMILIES:
            for line in run(["ninja", "-C", self.folder, "-t", "commands", f"{family}_tests"]).splitlines():
                steps = [shlex.split(step) for step in line.split(" && ") if " -o " in step]
                for words in steps:
                    output = words[words.index("-o") + 1]
                    (self.compile if "-c" in words else self.link)[output] = words
        self.users = collections.defaultdict(list)  # what is made from a source or header
        target = None
        for line in run(["ninja", "-C", self.folder, "-t", "deps"]).splitlines():
            if line.startswith(" "):
                file = pathlib.Path(self.folder, line.strip()).resolve()
                if file.is_relative_to(self.tree):
                    self.users[str(file.relative_to(self.tree))].append(target)
            else:
                target = line.partition(":")[0]
        self.seconds = {}

    def time_tests(self, scratch):
        for family in FAMILIES:
            begin = time.monotonic()
            program = self.folder / "tests" / f"{family}_tests"
            noticed, output = run_tests(program, scratch, 600, [])
            if noticed:
                sys.exit(f"{program} fails without any change:\n{output[-4000:]}")
            self.seconds[family] = time.monotonic() - begin
            print(f"{family}_tests: {self.seconds[family]:.1f} s without any change", flush=True)


def family_of(mutation):
    name = mutation.file.split("/")[1]
    return name if name in FAMILIES else "platform"  # what stands above all families starts the platform's


def limits():
    resource.setrlimit(resource.RLIMIT_CORE, (0, 0))
    resource.setrlimit(resource.RLIMIT_FSIZE, (16 * GIGABYTE, 16 * GIGABYTE))
    resource.setrlimit(resource.RLIMIT_DATA, (6 * GIGABYTE, 6 * GIGABYTE))


def run_tests(program, scratch, seconds, options):
    """Whether the tests notice anything, and what they said last."""
    shutil.rmtree(scratch, ignore_errors=True)
    scratch.mkdir(parents=True)
    log = scratch.parent / f"{scratch.name}.log"
    with open(log, "w", encoding="utf-8") as output, subprocess.Popen(
            [program, *options], cwd=scratch, env={**os.environ, "TMPDIR": str(scratch)}, stdout=output,
            stderr=subprocess.STDOUT, start_new_session=True, preexec_fn=limits) as process:
        try:
            status = process.wait(seconds)
        except subprocess.TimeoutExpired:
            status = "time limit"
        try:  # the tests' own children too
            os.killpg(process.pid, signal.SIGKILL)
        except ProcessLookupError:
            pass
    with open(log, "rb") as file:
        file.seek(max(0, log.stat().st_size - 2_000_000))
        return status != 0, f"{file.read().decode('utf-8', 'replace')}\nstatus {status}"


class Worker:
    """A copy of the sources in which one file at a time is changed."""

    def __init__(self, build, folder, every_test):
        self.build, self.folder, self.every_test = build, folder, every_test
        self.tree = folder / "tree"
        shutil.rmtree(self.tree, ignore_errors=True)  # it may hold a change if it was killed
        mirror(self.tree)

    def compile(self, name, output):
        words = [word.replace(str(self.build.tree), str(self.tree)) for word in self.build.compile[name]]
        words[words.index("-o") + 1] = str(output)
        if "-MF" in words:
            words[words.index("-MF") + 1] = f"{output}.d"
        output.parent.mkdir(parents=True, exist_ok=True)
        try:
            done = subprocess.run(words, cwd=self.build.folder, capture_output=True, check=False, timeout=300)
        except subprocess.TimeoutExpired:
            return None
        return output.read_bytes() if done.returncode == 0 else None

    def attempt(self, mutation):
        """(outcome, family whose tests noticed or None, names of the tests that failed)"""
        file = self.tree / mutation.file
        source = file.read_text(encoding="utf-8")
        names = self.build.users[mutation.file]
        library = [name for name in names if name.startswith("src/")]
        try:
            file.write_text(mutation.apply(source), encoding="utf-8")
            replaced = {}
            for name in library:
                code = self.compile(name, self.folder / "changed" / name)
                if code is None:
                    return "not compiled", None, []
                if code != (self.build.folder / name).read_bytes():  # no source holds its own path
                    replaced[name] = str(self.folder / "changed" / name)
            if not replaced:
                return "equivalent", None, []
            return self.ask(mutation, replaced, [name for name in names if name.startswith("tests/")])
        finally:
            file.write_text(source, encoding="utf-8")

    def ask(self, mutation, replaced, tests):
        family = family_of(mutation)
        found = None
        failed = []
        for asked in [family, *ABOVE.get(family, [])]:
            for name in tests:
                if f"/{asked}_tests.dir/" in name:
                    if self.compile(name, self.folder / "changed" / name) is None:
                        return "not compiled", None, []
                    replaced[name] = str(self.folder / "changed" / name)
            program = self.folder / f"{asked}_tests"
            words = [replaced.get(word, word) for word in self.build.link[f"tests/{asked}_tests"]]
            words[words.index("-o") + 1] = str(program)
            if subprocess.run(words, cwd=self.build.folder, capture_output=True, check=False).returncode != 0:
                return "not compiled", None, []
            limit = 10 + 6 * self.build.seconds[asked]
            options = [] if self.every_test else ["--gtest_brief=1", "--gtest_fail_fast"]
            noticed, output = run_tests(program, self.folder / "scratch", limit, options)
            if noticed and self.every_test:
                names = set(re.findall(r"^\[  FAILED  \] (\w+\.\w+)", output, re.MULTILINE))
                running = re.findall(r"^\[ RUN      \] (\w+\.\w+)", output, re.MULTILINE)
                if "tests ran." not in output and running:
                    names.add(running[-1])
                failed += sorted(f"{asked}: {name}" for name in names)
            if noticed and found is None:
                found = asked
            if noticed and not self.every_test:
                break
        return ("noticed" if found else "survived"), found, failed
