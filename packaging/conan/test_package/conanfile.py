"""Builds samples/hello against the package and runs it."""

import pathlib

from conan import ConanFile
from conan.tools.build import can_run
from conan.tools.cmake import CMake, cmake_layout


class QxcoreTest(ConanFile):
    settings = "os", "arch", "compiler", "build_type"
    generators = "CMakeDeps", "CMakeToolchain", "VirtualRunEnv"

    def requirements(self):
        self.requires(self.tested_reference_str)

    def layout(self):
        cmake_layout(self)

    def _samples(self):
        return pathlib.Path(self.recipe_folder).parents[2] / "samples"

    def build(self):
        cmake = CMake(self)
        cmake.configure(build_script_folder=str(self._samples()))
        cmake.build()

    def test(self):
        if can_run(self):
            text = self._samples() / "texts/files/utf8-french.txt"
            self.run(f'"{self.cpp.build.bindir}/hello" "{text}"', env="conanrun")
