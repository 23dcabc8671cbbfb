"""Conan 2 recipe that builds the tree it lies in: conan create packaging/conan --build=missing"""

import pathlib

from conan import ConanFile
from conan.tools.cmake import CMake, CMakeDeps, CMakeToolchain, cmake_layout
from conan.tools.files import copy


class Qxcore(ConanFile):
    name = "qxcore11e"
    version = "11.0.0"
    description = "Core class library: strings, containers, streams, text encodings, files, settings"
    package_type = "shared-library"
    settings = "os", "arch", "compiler", "build_type"

    def export_sources(self):
        tree = pathlib.Path(self.recipe_folder).parents[1]
        for pattern in ("CMakeLists.txt", "README.md", "CHANGELOG.md", "cmake/*", "qxcore/*", "tools/debug/*"):
            copy(self, pattern, str(tree), self.export_sources_folder)

    def requirements(self):
        self.requires("zlib/[>=1.2.11 <2]")
        if self.settings.os != "Windows":
            for library in ("icu/[>=72]", "sqlite3/[>=3.40]", "pixman/[>=0.42]", "freetype/[>=2.12]", "libpng/[>=1.6]"):
                self.requires(library)

    def layout(self):
        cmake_layout(self)

    def generate(self):
        CMakeDeps(self).generate()
        toolchain = CMakeToolchain(self)
        toolchain.variables.update({"QXCORE_TESTS": False, "QXCORE_TOOLS": False, "QXCORE_WERROR": False})
        toolchain.generate()

    def build(self):
        cmake = CMake(self)
        cmake.configure()
        cmake.build()

    def package(self):
        CMake(self).install()

    def package_info(self):
        # The package's own CMake files are used, not generated ones.
        self.cpp_info.set_property("cmake_find_mode", "none")
        self.cpp_info.builddirs.append("lib/cmake/qxcore11e")
        self.cpp_info.libs = ["qxcore11e"]
        self.cpp_info.cxxflags = ["-fno-delete-null-pointer-checks"]
