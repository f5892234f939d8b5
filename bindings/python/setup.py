"""A wheel with the libraries and the command line in it: pip wheel --no-index --no-build-isolation .

All that is built goes to build/wheel at the top of the source tree. CMake and the packages that it needs are there already.
"""

import pathlib
import re
import shutil
import subprocess
import sys

from setuptools import Distribution, setup
from setuptools.command.build_py import build_py

HERE = pathlib.Path(__file__).resolve().parent
ROOT = HERE.parents[1]
BUILD = ROOT / "build" / "wheel"
OPTIONS = {
    "CMAKE_BUILD_TYPE": "Release",
    "CMAKE_INSTALL_LIBDIR": "lib",
    "Python_EXECUTABLE": sys.executable,
    "QORVIO_BUILD_PYTHON": "ON",
    "QORVIO_BUILD_TESTS": "OFF",
    "QORVIO_BUILD_EXAMPLES": "OFF",
}


def run(*words: object) -> None:
    subprocess.run([str(word) for word in words], check=True)


class BuildWithCMake(build_py):
    def run(self) -> None:
        super().run()
        run("cmake", "-S", ROOT, "-B", BUILD / "cmake", "-G", "Ninja", *(f"-D{key}={value}" for key, value in OPTIONS.items()))
        run("cmake", "--build", BUILD / "cmake", "--target", "_qorvio", "qorvio")
        package, stage = pathlib.Path(self.build_lib) / "qorvio", BUILD / "stage"
        shutil.rmtree(stage, ignore_errors=True)
        for component in ("libqorvio", "qorvio", "python3-qorvio"):
            run("cmake", "--install", BUILD / "cmake", "--prefix", stage, "--component", component, "--strip")
        # A wheel has no links: each library once, by the name that the others load it by.
        copy([each for each in (stage / "lib").glob("lib*.so.*") if each.is_symlink()], package / "lib")
        copy([stage / "bin" / "qorvio"], package / "bin")
        copy((stage / "lib/python3/dist-packages/qorvio").glob("_qorvio.*.so"), package)


def copy(files, folder: pathlib.Path) -> None:
    folder.mkdir(parents=True, exist_ok=True)
    for file in files:
        shutil.copy(file, folder / file.name)


class BinaryDistribution(Distribution):
    def has_ext_modules(self) -> bool:
        return True


BUILD.mkdir(parents=True, exist_ok=True)
setup(
    version=re.search(r"project\(QorVIO VERSION ([\d.]+)", (ROOT / "CMakeLists.txt").read_text())[1],
    packages=["qorvio"],
    package_data={"qorvio": ["*.pyi", "py.typed"]},
    cmdclass={"build_py": BuildWithCMake},
    distclass=BinaryDistribution,
    options={"build": {"build_base": str(BUILD / "python")}, "egg_info": {"egg_base": str(BUILD)}},
)
