"""Builds the checkout that this file lies in as a Conan 2 package:

    conan create packaging/conan

Not exercised by this repository's tests, which have no Conan; the versions below are those of Conan Center.
"""
import os
import re

from conan import ConanFile
from conan.errors import ConanInvalidConfiguration
from conan.tools.build import check_min_cppstd
from conan.tools.cmake import CMake, CMakeDeps, CMakeToolchain, cmake_layout
from conan.tools.files import copy, load


class OruConan(ConanFile):
    name = "oru"
    description = "Object layer over OpenGL and OpenCL"
    license = "MIT"
    package_type = "shared-library"
    settings = "os", "arch", "compiler", "build_type"

    def _root(self):
        return os.path.join(self.recipe_folder, os.pardir, os.pardir)

    def _headers(self, package):
        return self.dependencies[package].cpp_info.includedirs[0]

    def set_version(self):
        lists = load(self, os.path.join(self._root(), "CMakeLists.txt"))
        self.version = re.search(r"project\(oru VERSION ([\d.]+)", lists)[1]

    def export_sources(self):
        for pattern in ("CMakeLists.txt", "LICENSE", "catalogue/*", "cmake/*", "docs/CMakeLists.txt",
                        "docs/Doxyfile.in", "oru/*"):
            copy(self, pattern, self._root(), self.export_sources_folder)

    def requirements(self):
        self.requires("boost/1.83.0", options={"header_only": True})
        self.requires("onetbb/2021.10.0")
        self.requires("opencl-headers/2022.05.18", transitive_headers=True)
        self.requires("opengl-registry/cci.20220929")

    def validate(self):
        if self.settings.os != "Windows" or self.settings.arch != "x86_64":
            raise ConanInvalidConfiguration("ORU is for 64-bit Windows")
        check_min_cppstd(self, 17)

    def layout(self):
        cmake_layout(self)

    def generate(self):
        CMakeDeps(self).generate()
        toolchain = CMakeToolchain(self)
        for part in ("TESTS", "BENCHMARKS", "APPS"):
            toolchain.cache_variables[f"ORU_BUILD_{part}"] = False
        toolchain.cache_variables["ORU_WARNINGS_AS_ERRORS"] = False
        # The registry's headers come in two packages; the build takes them from one folder.
        khronos = os.path.join(self.generators_folder, "khronos")
        for package in ("opengl-registry", "khrplatform"):
            copy(self, "*", self._headers(package), khronos)
        for variable, folder in (("ORU_deps__boost_INCLUDE_DIR", self._headers("boost")),
                                 ("ORU_deps__opencl_INCLUDE_DIR", self._headers("opencl-headers")),
                                 ("ORU_KHRONOS_INCLUDE_DIR", khronos)):
            toolchain.cache_variables[variable] = folder.replace("\\", "/")
        toolchain.generate()

    def build(self):
        cmake = CMake(self)
        cmake.configure()
        cmake.build()

    def package(self):
        CMake(self).install()
        copy(self, "LICENSE", self.source_folder, os.path.join(self.package_folder, "licenses"))

    def package_info(self):
        # The package's own CMake files are the ones that hosts read.
        self.cpp_info.set_property("cmake_find_mode", "none")
        self.cpp_info.builddirs = [os.path.join("lib", "cmake", "oru")]
        self.cpp_info.libs = ["oru"]
