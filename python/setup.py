"""Builds the extension module with CMake, from the checkout that this folder lies in."""

import pathlib
import re
import subprocess
import sys

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

ROOT = pathlib.Path(__file__).resolve().parent.parent


def version():
    header = (ROOT / "include/tevpf.h").read_text()
    return ".".join(re.search(rf"TEVPF_VERSION_{part} (\d+)", header)[1]
                    for part in ("MAJOR", "MINOR", "PATCH"))


class CMakeBuild(build_ext):
    def build_extension(self, ext):
        build = pathlib.Path(self.build_temp).resolve()
        build.mkdir(parents=True, exist_ok=True)
        subprocess.run(["cmake", "-S", ROOT, "-B", build, "-G", "Ninja", "-DCMAKE_BUILD_TYPE=Release",
                        "-DTEVPF_BUILD_PYTHON=ON", "-DTEVPF_BUILD_TOOL=OFF", "-DTEVPF_BUILD_SQL=OFF",
                        "-DTEVPF_BUILD_EXAMPLES=OFF",
                        f"-DPython_EXECUTABLE={sys.executable}"], check=True)
        subprocess.run(["cmake", "--build", build, "--target", "tevpf_python"], check=True)
        target = pathlib.Path(self.get_ext_fullpath(ext.name)).resolve()
        target.parent.mkdir(parents=True, exist_ok=True)
        built, = (build / "python/tevpf").glob("_core.*.so")
        self.copy_file(built, target)


setup(version=version(), ext_modules=[Extension("tevpf._core", [])],
      cmdclass={"build_ext": CMakeBuild})
