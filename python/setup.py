"""Builds the module in C++ with CMake, with the layers of the library in it."""

import os
import subprocess
import sys
from pathlib import Path

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

SOURCE = Path(__file__).resolve().parent.parent
LAYERS = ["POSTGRESQL", "TOOLS", "TESTS", "BENCHMARKS"]


class BuildWithCMake(build_ext):
    """Configures and builds the target of the module, and puts it beside the package."""

    def build_extension(self, extension: Extension) -> None:
        module = Path(self.get_ext_fullpath(extension.name)).resolve()
        build = Path(os.environ.get("PROJECT_MANAGEMENT_BUILD", self.build_temp)).resolve()
        module.parent.mkdir(parents=True, exist_ok=True)
        if "PROJECT_MANAGEMENT_BUILD" not in os.environ:
            options = [f"-DPROJECT_MANAGEMENT_{layer}=OFF" for layer in LAYERS]
            subprocess.run(["cmake", "-S", SOURCE, "-B", build, "-G", "Ninja", "-DCMAKE_BUILD_TYPE=Release",
                            "-DCMAKE_UNITY_BUILD=ON", f"-DPython3_EXECUTABLE={sys.executable}", *options], check=True)
        subprocess.run(["cmake", "--build", build, "--target", "project_python"], check=True)
        self.copy_file(build / "python" / "project_management" / module.name, module)


setup(ext_modules=[Extension("project_management._core", [])], cmdclass={"build_ext": BuildWithCMake})
