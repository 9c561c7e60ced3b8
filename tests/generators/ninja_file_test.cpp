// The ninja file as a whole, and what there can be no rule for. That ninja reads it is tested end to end.

#include "generators/generate_fixture.h"

namespace qrex {

namespace {

class NinjaFileTest : public GenerateTest {
 protected:
  NinjaFileTest() {
    settings.compiler = CompilerKind::gcc;
    settings.ninja = true;
    settings.call = {"/opt/the tool/Qrex", "NAME=\"it's $1\"", "all.qrex", "ninja=true", "mode=gen"};
  }

  static std::string From(const std::string& begin, const std::string& end) {
    const std::string text = ReadText("build.ninja");
    const size_t at = text.find(begin);
    return at == std::string::npos ? "no " + begin : text.substr(at, text.find(end, at) - at);
  }
};

TEST_F(NinjaFileTest, Graph) {
  configs = "\"Debug|x64\"";
  WriteProject(
      "app", "Console Application",
      "subproj { \"lib\" }\n+cpp { -g -DNAME=\"a b\" }\n+link { \"extra.a\" \"-lm\" -Wl,-z,'$$ORIGIN' }\nqrex\n"
      "{ \"src\" { \"app.cpp\" \"c$: x.c\" \"app.h\" } }\n");
  WriteProject("lib", "Static Library", "{ \"src\" { \"lib.cpp\" } }");
  Generate("app");
  EXPECT_EQ("qrex = '/opt/the tool/Qrex' 'NAME=\"it'\\''s $$1\"' all.qrex ninja=true\n", From("qrex = ", "\npool"));
  EXPECT_EQ(R"(build build.ninja: regenerate | $
    tree/app/src/app.qrpj tree/lib/src/lib.qrpj
build tree/app/src/app.qrpj tree/lib/src/lib.qrpj: phony
)",
            From("build build.ninja", "\nbuild qrex"));
  EXPECT_EQ(R"(build qrexsource/x64/Debug/.translated: translate
  settings = mode=build translateOnly=true 'config="Debug"' 'platform="x64"'
  depfile_setting = 'depfile="qrexsource/x64/Debug/.translated.d"'
  file = qrexsource/x64/Debug/.translated.d
  config = Debug|x64

build qrexsource/x64/Debug/.complete | $
    qrexsource/x64/Debug/app/src/c$$$:$ x.c qrexsource/x64/Debug/app/src/app.h qrexsource/x64/Debug/app/src/app.cpp: complete qrexsource/x64/Debug/.translated
  settings = mode=build translateOnly=true 'config="Debug"' 'platform="x64"' 'depfile=""'
  log = qrexsource/x64/Debug/.log
  stamp = qrexsource/x64/Debug/.complete
  config = Debug|x64

# lib, Debug|x64

compiler1 = gcc -c -Itree/lib -Itree/lib/src -Itree

build x64/Debug/lib/lib.o: compile tree/lib/src/lib.cpp || qrexsource/x64/Debug/.complete
  compiler = $compiler1

build out/lib/x64/Debug/liblib.a: link $
    x64/Debug/lib/lib.o
  linker = ar rcs out/lib/x64/Debug/liblib.a
  text =  "x64/Debug/lib/lib.o"

build lib-Debug: phony out/lib/x64/Debug/liblib.a
build lib: phony out/lib/x64/Debug/liblib.a

# app, Debug|x64

compiler2 = gcc -c -g '-DNAME=a b' -Iqrexsource/x64/Debug/app -Iqrexsource/x64/Debug/app/src -Iqrexsource/x64/Debug -Itree

build x64/Debug/app/c$$$:$ x.o: compile qrexsource/x64/Debug/app/src/c$$$:$ x.c || qrexsource/x64/Debug/.complete
  compiler = $compiler2

build x64/Debug/app/app.o: compile qrexsource/x64/Debug/app/src/app.cpp || qrexsource/x64/Debug/.complete
  compiler = $compiler2

build out/lib/x64/Debug/app: link $
    x64/Debug/app/c$$$:$ x.o x64/Debug/app/app.o out/lib/x64/Debug/liblib.a | extra.a
  linker = g++
  text = -o "out/lib/x64/Debug/app" "x64/Debug/app/c$$: x.o" "x64/Debug/app/app.o" "out/lib/x64/Debug/liblib.a" -Xlinker -rpath -Xlinker '$$ORIGIN' "extra.a" "-lm" -Wl,-z,'$$ORIGIN'

build app-Debug: phony out/lib/x64/Debug/app
build app: phony out/lib/x64/Debug/app

build Debug: phony out/lib/x64/Debug/liblib.a out/lib/x64/Debug/app

build all: phony Debug
default Debug
)",
            From("build qrexsource", "no such text"));
}

// Configurations are told apart by their platform where their names do not; a project may have the name of one.
TEST_F(NinjaFileTest, Names) {
  configs = "\"Debug|x64\" \"Debug|arm\" \"Fast|arm\"";
  settings.config = "Debug";
  settings.platform = "arm";
  WriteProject("Fast", "Static Library", "{ }");
  Generate("Fast");
  std::string phony;
  const std::string text = ReadText("build.ninja");
  for (size_t at = text.find("# Fast, "); (at = text.find(": phony", at)) != std::string::npos; ++at) {
    const size_t begin = text.rfind('\n', at) + 1;
    phony += text.substr(begin, text.find('\n', at) + 1 - begin);
  }
  EXPECT_EQ(R"(build Fast-x64-Debug: phony out/lib/x64/Debug/libFast.a
build x64-Debug: phony out/lib/x64/Debug/libFast.a
build Fast-arm-Debug: phony out/lib/arm/Debug/libFast.a
build arm-Debug: phony out/lib/arm/Debug/libFast.a
build Fast-Fast: phony out/lib/arm/Fast/libFast.a
build Fast: phony out/lib/arm/Fast/libFast.a
build all: phony x64-Debug arm-Debug Fast
)",
            phony);
  EXPECT_NE(std::string::npos, text.find("\ndefault arm-Debug\n"));
  EXPECT_EQ(std::string::npos, text.find("build qrexsource"));  // nothing is translated
}

TEST_F(NinjaFileTest, NoRule) {
  WriteProject("app", "Utility Project", "{ \"one\" { \"a.cpp\" } \"two\" { \"a.cpp\" } }");
  Generate("app");
  const std::string told =
      "Error : Ninja file build.ninja has no rule for app/two/a.cpp : x64/Debug/app/a.o is the object of another "
      "source\n";
  EXPECT_NE(std::string::npos, trace.find(told)) << trace;
  EXPECT_EQ("build app-Debug: phony x64/Debug/app/a.o", From("build app-Debug:", "\n"));
#ifndef _WIN32  // where no file has such a name
  Write("tree/app/src/a\nb.cpp", "");
  std::filesystem::remove("build.ninja");
  WriteProject("app", "{ \"src\" { \"*.cpp\" } }");
  Generate("app");
  EXPECT_NE(std::string::npos, trace.find("Error : Ninja files can't have the name app/src/a\nb.cpp - not written\n"));
  EXPECT_FALSE(FileExists("build.ninja"));
#endif
}

}  // namespace

}  // namespace qrex
