"""Builds the module in C++ with CMake, with the layers of the library in it."""

import os
import subprocess
import sys
from pathlib import Path

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

SOURCE = Path(__file__).resolve().parent.parent
OTHERS = ["INSTALL", "POSTGRESQL", "TOOLS", "TESTS", "BENCHMARKS"]  # parts that the module does not need

# Those of the preset `release`. At -O3, GCC 12 warns of copies that overlap where none do.
SETTINGS = ["-DCMAKE_BUILD_TYPE=RelWithDebInfo", "-DCMAKE_CXX_FLAGS_RELWITHDEBINFO=-O2 -DNDEBUG",
            "-DCMAKE_MODULE_LINKER_FLAGS=-s", "-DCMAKE_UNITY_BUILD=ON", "-DPROJECT_MANAGEMENT_WARNINGS_AS_ERRORS=OFF"]


class BuildWithCMake(build_ext):
    """Configures and builds the target of the module, and puts it beside the package.

    The variable PROJECT_MANAGEMENT_BUILD names a folder that is configured already.
    """

    def build_extension(self, extension: Extension) -> None:
        module = Path(self.get_ext_fullpath(extension.name)).resolve()
        build = Path(os.environ.get("PROJECT_MANAGEMENT_BUILD", self.build_temp)).resolve()
        module.parent.mkdir(parents=True, exist_ok=True)
        if "PROJECT_MANAGEMENT_BUILD" not in os.environ:
            options = [f"-DPROJECT_MANAGEMENT_{other}=OFF" for other in OTHERS]
            subprocess.run(["cmake", "-S", SOURCE, "-B", build, "-G", "Ninja", *SETTINGS,
                            f"-DPython3_EXECUTABLE={sys.executable}", *options], check=True)
        subprocess.run(["cmake", "--build", build, "--target", "project_python"], check=True)
        self.copy_file(build / "python" / "project_management" / module.name, module)


setup(ext_modules=[Extension("project_management._core", [])], cmdclass={"build_ext": BuildWithCMake})
