#!/usr/bin/env python3
"""Metadata as annotations of C++26. No compiler here reads them: what they hold is checked as constants, and where they stand
as the attributes that they are."""

import re

from runtime_fixture import translated_shop
from workspace_fixture import data, equal, holds, need, run_tests

KEY = "annotations = true "
OUT = "qrexsource/x64/Debug"
HEADER = data("annotations/shop.h")
MAIN = """@import "shop.h"
int main() { return sizeof(shop::Size) > sizeof(shop::Shop) ? 0 : 1; }
"""
EXPECTED = [
    '=unit("mm"), =5, =(-2147483647 - 1), =2.5, =3.0, =true',
    '=bare, =times(unit("m ", 2, 1.0000000000000000525e+300), -1)',
    r'=vesk::AnnotationText("a \"text\" \\ of\011tab")',
    '=vesk::AnnotationList(1, vesk::AnnotationText("list"), vesk::AnnotationList()), =false',
    '=unit("eu")', '=unit("eu")', '=vesk::AnnotationText("where")', '=unit("nr")', '=unit("pc"), =1', '=unit("eu")']
ANNOTATION = re.compile(r"\[\[(=.*?)\]\]")
FORMS = {  # clang 14 takes no floats as arguments of templates
    "g++": "using Constants{} = Constants<{}>; [[maybe_unused]]",
    "clang++": "static constexpr auto kConstants{} = vesk::AnnotationList({}); [[maybe_unused]]"}


def checked(text, compiler):
    """For each annotation a declaration that takes its values as constants, and an attribute of the member."""
    count = iter(range(99))
    values = lambda found: re.sub(r"(^|, )=", r"\1", found[1])  # noqa: E731
    return "template <auto...> struct Constants {};\n" + ANNOTATION.sub(
        lambda found: FORMS[compiler].format(next(count), values(found)), text)


def test_members(binary):
    for keys in (KEY, KEY + "lineDirectives = true "):
        with translated_shop(binary, keys, MAIN, HEADER) as workspace:
            text = workspace.path(f"{OUT}/app/src/shop.h").read_text()
            equal(ANNOTATION.findall(text), EXPECTED)
            include = f"-I{OUT} -I{OUT}/app/src"
            for compiler in ("g++", "clang++"):
                need(compiler)
                text = workspace.shell(f"{compiler} -std=c++20 -E -D__cpp_impl_reflection=202506L {include} {OUT}/app/src/app.cpp")
                equal(len(ANNOTATION.findall(text)), len(EXPECTED))
                workspace.write("seen.cpp", checked(text, compiler))
                workspace.shell(f"{compiler} -std=c++20 -Wall -Werror -fsyntax-only seen.cpp")
                workspace.write("wrong.cpp", checked(text.replace('[[=unit("pc")', '[[=unit("piece")'), compiler))
                holds(workspace.shell(f"{compiler} -std=c++20 -fsyntax-only wrong.cpp 2>&1 || true"), " error: ")


def test_same_text_without_reflection(binary):
    """A compiler without it gets what it gets without the key."""
    need("g++")
    texts = []
    for keys in ("", KEY):
        with translated_shop(binary, keys, MAIN, HEADER) as workspace:
            texts.append(workspace.shell(f"g++ -std=c++17 -E -P -I{OUT} -I{OUT}/app/src {OUT}/app/src/app.cpp").split())
    equal(texts[1], texts[0])


run_tests(globals())
