#!/usr/bin/env python3
"""The tool in other people's builds: docs/cmake.md is followed word for word, with the installed tool and the example."""

import functools
import os
import re
import shutil
from pathlib import Path

from workspace_fixture import ROOT, Workspace, equal, holds, indented, install, lacks, need, run_tests

PAGE = (ROOT / "docs/cmake.md").read_text()
TOLD = 'goods::Item\n    string8 name = rope\n    [unit("m")] float64 length = 12.5\n    costs 10\n'
NEW_HEADER = '@import "Vesk/vxObject/IObject.h"\nnamespace goods { $class+ Box { public: $int32 size; }; }\n'
# A compiler cache by its own means, where there is one: ccache has its name on PATH (workspace_fixture.py).
os.environ.pop("CMAKE_CXX_COMPILER_LAUNCHER", None)


def blocks(heading):
    """The indented blocks of a section."""
    section = re.search(rf"^## {heading}\n(.*?)(?=^## |\Z)", PAGE, re.S | re.M).group(1)
    return [block for _, block in indented(section)]


class Example(Workspace):
    """A copy of the example, beside an installation of the tool."""

    def __init__(self, binary, prefix):
        super().__init__(binary, {})
        self.around, self.prefix, self.built_in = self.folder, self.path(prefix), Path(binary).parent
        install(binary, self.prefix)
        self.folder, self.binary = self.path("stock"), self.prefix / "bin/Qrex"
        shutil.copytree(ROOT / "examples/cmake", self.folder, ignore=shutil.ignore_patterns("build", "out", "qrexsource", "x64"))
        os.environ["CMAKE_PREFIX_PATH"] = str(self.prefix)

    def __exit__(self, *_):
        shutil.rmtree(self.around)

    def shell(self, command, **options):
        return super().shell("set -e\n" + command, **options)


def of_example(*tools, prefix="usr local"):
    def decorate(test):
        @functools.wraps(test)
        def run(binary):
            need("cmake", "ninja", "g++", *tools)
            with Example(binary, prefix) as build:
                test(build)
        return run
    return decorate


@of_example()
def test_page(build):
    """The first steps. A second run has nothing to do; what is edited, added and removed is seen, and no more is made."""
    file, steps = blocks("CMake")[:2]
    equal(file, (build.folder / "CMakeLists.txt").read_text())
    holds(build.shell(steps), "100% tests passed")
    equal(build.shell("build/stock"), TOLD)
    holds(build.shell("ninja -C build"), "no work to do")
    build.edit("main.cpp", "12.5", "10")
    lacks(build.shell("ninja -C build"), "Translating")
    build.edit("tree/goods/src/goods.cpp", "0.8", "0.5")
    output = build.shell("ninja -C build && build/stock")
    holds(output, "Translating", "goods.cpp.o", "costs 5\n")
    lacks(output, "main.cpp.o")
    build.write("tree/goods/api/box.h", NEW_HEADER)
    build.write("tree/goods/src/box.cpp", '@import "api/box.h"\n')
    holds(build.shell("ninja -C build"), "Re-running CMake", "box.cpp.o")
    holds((build.folder / "build/qrex/stock/qrexsource/x64/Debug/goods/src/goods.cpp").read_text(), "Box")
    os.remove(build.folder / "tree/goods/src/box.cpp")
    os.remove(build.folder / "tree/goods/api/box.h")
    holds(build.shell("ninja -C build"), "Re-running CMake", "goods.cpp.o")
    equal([path.name for path in build.folder.glob("build/qrex/stock/**/box.*")], [])
    holds(build.shell("ninja -C build"), "no work to do")
    build.shell("ninja -C build clean")
    equal([str(path) for path in build.folder.glob("build/qrex/stock/**/*.h")], [])
    holds(build.shell("ninja -C build && ninja -C build"), "Translating", "no work to do")
    os.remove(next(build.folder.glob("build/qrex/stock/**/item.h")))
    holds(build.shell("ninja -C build && ninja -C build"), "main.cpp.o", "no work to do")
    equal(sorted(path.name for path in build.folder.iterdir()), sorted(["build", *os.listdir(ROOT / "examples/cmake")]))


@of_example()
def test_settings(build):
    """What sets keys is an input like any other, and another translator or line translates anew."""
    build.shell("cmake -G Ninja -B build -DCMAKE_BUILD_TYPE=Debug && ninja -C build")
    translated = "build/qrex/stock/qrexsource/**/*.h"

    def is_anew():
        holds(build.shell("ninja -C build && ninja -C build"), "Translating", "no work to do")
        before, build.known = build.known, build.times(translated)
        return all(build.known[name] != before[name] for name in build.known)
    build.known = build.times(translated)
    build.edit("CMakeLists.txt", "PROJECT goods", "PROJECT goods SETTINGS writeTokenEquivalent=true")
    assert is_anew()
    build.edit("stock.qrex", "modernCpp = true", "modernCpp = false")
    assert is_anew()
    build.edit("tree/stock.qrws", '"goods"', '"goods"  // the only one')
    assert not is_anew()
    os.utime(build.prefix / "bin/Qrex")
    assert is_anew()


@of_example()
def test_errors(build):
    build.edit("CMakeLists.txt", "PROJECT goods", "PROJECT wares")
    holds(build.shell("cmake -G Ninja -B build", status=1), "no project wares")
    build.edit("CMakeLists.txt", "PROJECT wares", "PROJECT goods")
    build.shell("cmake -G Ninja -B build")
    build.edit("tree/goods/api/item.h", "$float64 Price", "$float64 : Price")
    output = build.shell("ninja -C build", status=1)
    holds(output, f"{build.folder}/tree/goods/api/item.h(14) : error : ")
    lacks(output, "argv[")
    build.edit("tree/goods/api/item.h", "$float64 : Price", "$float64 Price")
    build.edit("tree/goods/src/goods.qrpj", "qrex\n", "qrix\n")
    holds(build.shell("ninja -C build", status=1), f"{build.folder}/tree/goods/src/goods.qrpj(6) : ")
    build.edit("tree/goods/src/goods.qrpj", "qrix\n", "qrex\n")
    build.shell("ninja -C build && build/stock")


@of_example("make")
def test_generators(build):
    """From clean with a translator that takes its time: nothing is compiled ahead of what it includes."""
    slow = build.path("slow")
    build.write("slow", f'#!/bin/sh\nsleep 0.5\nexec "{build.prefix}/bin/Qrex" "$@"\n')
    for generator, options in (("Ninja", ""), ("Unix Makefiles", "-DCMAKE_BUILD_TYPE=Release")):
        build.shell(f"cmake -G '{generator}' -B 'a build' {options} -DQrex_EXECUTABLE={slow}")
        build.shell("cmake --build 'a build' -j8")
        equal(build.shell("'a build/stock'"), TOLD)
        second = build.shell("cmake --build 'a build' -j8")
        assert not re.search("Translating|Building|Linking", second), second
        build.edit("tree/goods/src/goods.cpp", "0.8", "0.80")
        output = build.shell("cmake --build 'a build' -j8")
        holds(output, "Translating", "goods.cpp.o")
        lacks(output, "main.cpp.o")
        build.edit("tree/goods/src/goods.cpp", "0.80", "0.8")
        build.shell("cmake --build 'a build' --target clean && cmake --build 'a build' -j8")
        shutil.rmtree(build.folder / "a build")


@of_example()
def test_configurations(build):
    """The presets of the example: each configuration of a build has its own translations."""
    build.shell("cmake --preset debug && cmake --build --preset debug && build/debug/stock")
    build.shell("cmake --preset multi")
    for config, translated in (("Debug", "Debug"), ("Release", "Release"), ("RelWithDebInfo", "Release")):
        build.shell(f"cmake --build build/multi --config {config} && build/multi/{config}/stock")
        holds(build.shell(f"cmake --build build/multi --config {config}"), "no work to do")
        assert (build.folder / f"build/multi/qrex/stock/{config}/qrexsource/x64/{translated}/goods/api/item.h").exists()
    build.edit("tree/goods/src/goods.cpp", "0.8", "0.5")
    holds(build.shell("cmake --build --preset multi-release && build/multi/Release/stock"), "costs 6.25\n")


SECOND = {  # a program that uses a library of the same workspace, which a folder of its own adds
    "CMakeLists.txt": "cmake_minimum_required(VERSION 3.22)\nproject(shop LANGUAGES CXX)\nfind_package(Qrex REQUIRED)\n"
                      "{include}\nadd_executable(shop shop.cpp)\n"
                      "qrex_translate(TARGET shop WORKSPACE ${{stock_SOURCE_DIR}}/stock.qrex PROJECT prices)\n"
                      "target_link_libraries(shop PRIVATE stock_goods)\n",
    "shop.cpp": '#include "goods/api/item.h"\n#include "prices/price.h"\nvoid Register_Project_goods();\n'
                "void Register_Project_prices();\nint main()\n{\n    Register_Project_goods();\n    Register_Project_prices();\n"
                '    vesk::xout() << vesk::Find<vesk::ReflectedClass>("goods::Item")->m_name << \' \'\n'
                '                 << vesk::Find<vesk::ReflectedClass>("prices::Price")->m_name << \'\\n\';\n}\n',
}
LIBRARY = """cmake_minimum_required(VERSION 3.22)
project(stock LANGUAGES CXX)
find_package(Qrex REQUIRED)
add_library(stock_goods STATIC)
qrex_translate(TARGET stock_goods WORKSPACE stock.qrex PROJECT goods)
target_link_libraries(stock_goods PUBLIC Qrex::Runtime)
"""
WAYS = ["add_subdirectory(../stock stock)", "include(FetchContent)\nFetchContent_Declare(stock SOURCE_DIR "
        "${CMAKE_CURRENT_SOURCE_DIR}/../stock)\nFetchContent_MakeAvailable(stock)"]


@of_example("make")
def test_parts_of_one_workspace(build):
    build.write("CMakeLists.txt", LIBRARY)
    build.edit("tree/stock.qrws", '"goods"', '"goods"\n    "prices"')
    build.write("tree/prices/src/prices.qrpj", (build.folder / "tree/goods/src/goods.qrpj").read_text()
                .replace('"goods"', '"prices"').replace('"api"\n    {\n        "*.h"\n    }', '"*.h"'))
    build.write("tree/prices/price.h", '@import "goods/api/item.h"\n'
                "namespace prices { $class+ Price { public: $goods::Item item; $float64 euros; }; }\n")
    build.write("tree/prices/src/prices.cpp", '@import "price.h"\nvxDefineTarget(prices, 1)\n')
    for way, generator in zip(WAYS, ("Ninja", "Unix Makefiles")):
        for name, text in SECOND.items():
            build.write(f"../shop/{name}", text.format(include=way) if name == "CMakeLists.txt" else text)
        build.shell(f"cmake -G '{generator}' -S ../shop -B ../built && cmake --build ../built -j8 > ../log && ../built/shop")
        equal(build.path("../log").read_text().count("Translating"), 1)
        build.edit("tree/goods/api/item.h", "$string8", "$string8 ")
        output = build.shell("cmake --build ../built -j8 && ../built/shop")
        equal(output.count("Translating"), 1)
        holds(output, "goods::Item prices::Price\n")
        shutil.rmtree(build.path("../built"))


@of_example()
def test_without_the_built_runtime(build):
    """From a build folder of the tool, and from an installation without the library, the runtime is made with the project."""
    shutil.rmtree(build.prefix / "lib/qrex")
    for options in ("", f"-DQrex_DIR='{build.built_in}'"):
        build.shell(f"cmake -G Ninja -B build -DCMAKE_BUILD_TYPE=Debug {options} && ninja -C build -j2")
        equal(build.shell("build/stock"), TOLD)
        holds(build.shell("ninja -C build"), "no work to do")
        assert (build.folder / "build/libvxObject.a").exists()
        shutil.rmtree(build.folder / "build")


@of_example("meson")
def test_meson(build):
    file, script, steps = blocks("Meson")
    build.write("meson.build", file)
    build.write("translate.sh", script)
    holds(build.shell(steps), "Ok: ")
    holds(build.shell("ninja -C build"), "no work to do")
    equal(build.shell("build/stock"), TOLD)
    build.edit("tree/goods/src/goods.cpp", "0.8", "0.5")
    output = build.shell("ninja -C build && build/stock")
    holds(output, "costs 6.25\n")
    build.edit("tree/goods/api/item.h", '"m"', '"cm"')
    holds(build.shell("ninja -C build && build/stock && ninja -C build"), '[unit("cm")]', "no work to do")


@of_example("make", "awk", prefix="usr")  # make takes no name with a blank
def test_plain_make(build):
    file, steps = blocks("make")
    build.write("Makefile", file)
    holds(build.shell(steps), TOLD)
    holds(build.shell("make"), "'stock' is up to date")
    build.edit("tree/goods/src/goods.cpp", "0.8", "0.5")
    output = build.shell("make && ./stock")
    holds(output, "Completed", "costs 6.25\n")
    lacks(output, "-o main.cpp.o")
    build.edit("tree/goods/api/item.h", '"m"', '"cm"')
    holds(build.shell("make -j8 && ./stock && make"), '[unit("cm")]', "'stock' is up to date")


run_tests(globals())
