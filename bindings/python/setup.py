"""Builds the library of this repository as a static archive and the extension module on top of it.

With BASALT_LIBRARY set to a build folder of the library, static and released, that one serves. A source distribution
has the library in its folder library.
"""
import os
import pathlib
import shutil
import subprocess
import sysconfig

import numpy
import pybind11
from pybind11.setup_helpers import ParallelCompile
from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext
from setuptools.command.sdist import sdist

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE / "library" if (HERE / "library").exists() else HERE.parent.parent
LIBRARY = pathlib.Path(os.environ.get("BASALT_LIBRARY", ROOT / "build" / "python" / "library"))

# One compiler for both: with GCC the library's functions are inlined into the loops over arrays.
CXX = (os.environ.get("CXX") or sysconfig.get_config_var("CXX") or "c++").split()[0]
INLINED = [] if "clang" in CXX else ["-flto=auto"]

WORK = LIBRARY / "python"  # build folder of setuptools
WORK.mkdir(parents=True, exist_ok=True)


class BuildWithLibrary(build_ext):
    def run(self):
        if "BASALT_LIBRARY" not in os.environ:
            subprocess.run(["cmake", "-S", ROOT, "-B", LIBRARY, "-DCMAKE_BUILD_TYPE=Release", "-DBUILD_SHARED_LIBS=OFF",
                            "-DBASALT_BUILD_TESTS=OFF", "-DBASALT_BUILD_EXAMPLES=OFF", "-DBASALT_BUILD_TOOLS=OFF",
                            "-DBASALT_INSTALL=OFF", f"-DCMAKE_CXX_COMPILER={CXX}",
                            f"-DCMAKE_INTERPROCEDURAL_OPTIMIZATION={'ON' if INLINED else 'OFF'}"], check=True)
            subprocess.run(["cmake", "--build", LIBRARY, "--target", "basalt", "--parallel", str(os.cpu_count())],
                           check=True)
        super().run()


class SourcesWithLibrary(sdist):
    def make_release_tree(self, base_dir, files):
        # setuptools lists its own egg_base below WORK, and some versions what the extension depends on.
        super().make_release_tree(base_dir, [name for name in files if not os.path.isabs(name) and ".." not in name])
        library = pathlib.Path(base_dir) / "library"
        library.mkdir()
        shutil.copy(ROOT / "CMakeLists.txt", library)
        for folder in ("cmake", "include", "src"):
            shutil.copytree(ROOT / folder, library / folder)


ParallelCompile(default=os.cpu_count()).install()
setup(
    ext_modules=[Extension(
        "basalt._basalt",
        sources=[str(file.relative_to(HERE)) for file in sorted((HERE / "src").glob("*.cpp"))],
        depends=[__file__, str(HERE / "src" / "universal.h"), str(HERE / "src" / "exported.map"),
                 str(LIBRARY / "src" / "libbasalt.a")],
        include_dirs=[str(HERE / "src"), str(ROOT / "include"), str(LIBRARY / "include"), pybind11.get_include(),
                      numpy.get_include()],
        extra_compile_args=["-std=c++20", "-O3", *INLINED, "-g0", "-ffp-contract=off", "-fvisibility=hidden",
                            "-Wall", "-Wextra"],
        # The library's own symbols stay inside: a host that has loaded another basalt would otherwise lend its own.
        extra_link_args=["-O3", *INLINED, "-Wl,--strip-all",
                         f"-Wl,--version-script={HERE / 'src' / 'exported.map'}",
                         str(LIBRARY / "src" / "libbasalt.a")],
    )],
    cmdclass={"build_ext": BuildWithLibrary, "sdist": SourcesWithLibrary},
    options={"build": {"build_base": str(WORK)}, "egg_info": {"egg_base": str(WORK)}},
)
