"""Recipe for Conan 2, to be used from a checkout of this repository; see ../README.md."""

import os

from conan import ConanFile
from conan.errors import ConanInvalidConfiguration
from conan.tools.build import check_min_cppstd
from conan.tools.cmake import CMake, CMakeDeps, CMakeToolchain, cmake_layout
from conan.tools.files import copy
from conan.tools.gnu import PkgConfigDeps


class ZORLyraConan(ConanFile):
    name = "zorlyra"
    version = "0.1.0"
    description = "Reads, merges, writes and publishes the XML results of clash analyses"
    topics = ("cad", "clash", "xml", "bcf")
    package_type = "shared-library"
    settings = "os", "arch", "compiler", "build_type"
    options = {
        "with_models": [True, False],
        "with_pictures": [True, False],
        "with_pages": [True, False],
        "with_exchange": [True, False],
    }
    default_options = {option: True for option in options}

    @property
    def _root(self):
        return os.path.normpath(os.path.join(self.recipe_folder, os.pardir, os.pardir))

    def export_sources(self):
        for part in ("cmake", "include", "packaging", "python", "resources", "src", "tools"):
            copy(self, f"{part}/*", src=self._root, dst=self.export_sources_folder)
        for file in ("CMakeLists.txt", "CHANGELOG.md"):
            copy(self, file, src=self._root, dst=self.export_sources_folder)

    def validate(self):
        check_min_cppstd(self, 20)
        if self.settings.os != "Linux":
            raise ConanInvalidConfiguration("the default platform and the command are for Linux")

    def layout(self):
        cmake_layout(self)

    def requirements(self):
        for package in ("cli11/2.4.2", "icu/74.2", "nlohmann_json/3.11.3", "tomlplusplus/3.4.0", "xerces-c/3.2.5",
                        "xxhash/0.8.2", "udunits2/2.2.28"):
            self.requires(package)
        if self.options.with_models:
            self.requires("opencascade/7.6.2")
        if self.options.with_pictures:
            for package in ("embree3/3.13.5", "libjpeg-turbo/3.0.2", "libpng/1.6.43"):
                self.requires(package)
        if self.options.with_pages:
            for package in ("libwebp/1.3.2", "libxml2/2.12.6", "libxslt/1.1.39", "meshoptimizer/0.20", "nettle/3.9.1"):
                self.requires(package)
        if self.options.with_exchange:
            for package in ("libuuid/1.0.3", "libxlsxwriter/1.1.7", "libzip/1.10.1", "zlib/1.3.1"):
                self.requires(package)

    def generate(self):
        CMakeDeps(self).generate()
        PkgConfigDeps(self).generate()
        toolchain = CMakeToolchain(self)
        for part in ("models", "pictures", "pages", "exchange"):
            toolchain.cache_variables[f"ZOR_WITH_{part.upper()}"] = bool(self.options.get_safe(f"with_{part}"))
        for part in ("ZOR_BUILD_TESTS", "ZOR_BUILD_BENCH", "ZOR_WITH_PYTHON"):
            toolchain.cache_variables[part] = False
        toolchain.generate()

    def build(self):
        cmake = CMake(self)
        cmake.configure()
        cmake.build()

    def package(self):
        CMake(self).install()
        copy(self, "copyright", src=os.path.join(self.source_folder, "packaging/debian"),
             dst=os.path.join(self.package_folder, "licenses"))

    def package_info(self):
        # The package brings its own ZORLyraConfig.cmake with its targets.
        self.cpp_info.set_property("cmake_find_mode", "none")
        self.cpp_info.builddirs = [os.path.join("lib", "cmake", "ZORLyra")]
        self.cpp_info.set_property("pkg_config_name", "zorlyra")
        self.cpp_info.libs = ["ZORClashToolkit", "ZORLyra", "ZORDefaultPlatform", "ZORFoundation"]
        self.cpp_info.includedirs = [os.path.join("include", "ZORLyra")]
