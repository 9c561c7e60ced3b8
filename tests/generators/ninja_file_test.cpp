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
  // Between the parts stand the rules, which are the same for all.
  EXPECT_EQ(
      ReadText(QREX_SOURCE_DIR "/tests/generators/expected/ninja/build.ninja"),
      From("qrex = ", "pool") + From("build build.ninja", "build qrex") + From("build qrexsource", "no such text"));
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
