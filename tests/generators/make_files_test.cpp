// Make files as whole files, and what the compilers of the family and the kinds of target change in them.

#include <map>

#include "generators/generate_fixture.h"
#include "text/output_policy.h"

namespace qrex {

namespace {

class MakeFilesTest : public GenerateTest {
 protected:
  MakeFilesTest() {
    settings.compiler = CompilerKind::gcc;
    settings.virtualTree = {"tree", "more/tree"};
  }

  static void AssertFile(const std::string& path) {
    EXPECT_EQ(WithCarriageReturns(ReadText(QREX_SOURCE_DIR "/tests/generators/expected/make/" + path)), Read(path));
  }

  // The lines of the file that begin so, folded.
  static std::string LinesOf(const std::string& path, const std::string& begin) {
    const std::string text = ReadText(path);
    std::string found;
    for (size_t at = 0, end; at < text.size(); at = end + 1) {
      end = std::min(text.find('\n', at), text.size() - 1);
      if (text.compare(at, begin.size(), begin) == 0) found += text.substr(at, end + 1 - at);
    }
    return found;
  }
};

TEST_F(MakeFilesTest, TranslatedProgram) {
  WriteProject("app", "Console Application",
               "subproj { \"lib\" \"other/api.v2.qrpj\" }\n+cpp { -g -DNAME=\"a b\" }\n+link { -lm }\nqrex\n"
               "{ \"src\" { \"main.cpp\" \"app.cpp\" \"fast.c\" \"app.h\" \"x.asm\" \"old.cpp\" : exclude } }\n");
  WriteProject("lib", "Static Library", "{ }");
  Generate("app");
  AssertFile("make_app_x64_Release");
}

TEST_F(MakeFilesTest, TargetsByCompilerAndKind) {
  const auto kGcc = CompilerKind::gcc, kWine = CompilerKind::winegcc, kClang = CompilerKind::clang;
  const struct {
    CompilerKind compiler;
    const char* targetType;
    const char* target;
    const char* command;
    const char* linkFlags;
  } cases[] = {
      {kGcc, "Static Library", "libapp.a", "$(AR) -Wl,-soname,libapp.a -o", "LDFLAGS = \n"},
      {kGcc, "Dynamic-Link Library", "libapp.so", "$(CXX) -Wl,-soname,libapp.so -o", "LDFLAGS =  -l\"lib\"\n"},
      {kGcc, "Application", "app", "$(CXX) -o", "LDFLAGS =  -l\"lib\"\n"},
      {kGcc, "Utility Project", "app.???", "$(CXX) -o", "LDFLAGS =  -l\"lib\"\n"},
      {kWine, "Dynamic-Link Library", "libapp.so", "$(CXX) -o", "LDFLAGS =  -l\"lib.dll\"\n"},
      {kWine, "Static Library", "libapp.a", "$(AR) -o", "LDFLAGS = \n"},
      {kClang, "Dynamic-Link Library", "libapp.so", "$(CXX) -o", "LDFLAGS =  -l\"lib\"\n"},
      {kClang, "Static Library", "libapp.a", "$(AR) -o", "LDFLAGS = \n"},
  };
  const std::map<CompilerKind, std::string> tools = {{kGcc, "CC = gcc\nCXX = g++\nAR = ar\n"},
                                                     {kWine, "CC = winegcc\nCXX = wineg++\nRC = wrc\nAR = ar\n"},
                                                     {kClang, "CC = clang\nCXX = clang++\nAR = libtool -static\n"}};
  WriteProject("lib", "Static Library", "{ }");
  for (const auto& [compiler, targetType, target, command, linkFlags] : cases) {
    SCOPED_TRACE(std::string(CompilerOf(compiler).keyword) + " " + targetType);
    WriteProject("app", targetType, "subproj { \"lib\" }\n{ }");
    settings.compiler = compiler;
    Generate("app");
    const std::string path = "out/lib/x64/Debug/" + std::string(target);
    EXPECT_EQ("all: " + path + "\n", LinesOf("make_app_x64_Debug", "all:"));
    EXPECT_EQ(path + ": $(OBJS)\n", LinesOf("make_app_x64_Debug", path + ":"));
    EXPECT_EQ("\t" + std::string(command) + " $@ $(OBJS) $(LDFLAGS)\n", LinesOf("make_app_x64_Debug", "\t$("));
    EXPECT_EQ(linkFlags, LinesOf("make_app_x64_Debug", "LDFLAGS"));
    EXPECT_EQ(tools.at(compiler), LinesOf("make_app_x64_Debug", "CC") + LinesOf("make_app_x64_Debug", "CXX =") +
                                      LinesOf("make_app_x64_Debug", "RC") + LinesOf("make_app_x64_Debug", "AR"));
  }
  EXPECT_EQ("INCLUDE_PATH =  -I\"tree/app\" -I\"tree/app/src\" -I\"tree\" -I\"more/tree\"\n",
            LinesOf("make_app_x64_Debug", "INCLUDE_PATH"));
  EXPECT_EQ("SRCS = \nOBJS = \n", LinesOf("make_app_x64_Debug", "SRCS") + LinesOf("make_app_x64_Debug", "OBJS"));
}

TEST_F(MakeFilesTest, WorkspaceAndTop) {
  WriteProject("app", "Application", "subproj { \"lib\" \"pre\" }\n{ }");
  WriteProject("lib", "Static Library", "{ }");
  WriteProject("pre", "Static Library", "export\n{ }");
  Generate("app");
  ASSERT_FALSE(FileExists("make_pre_x64_Debug"));
  ASSERT_TRUE(FileExists("pre.cbp"));
  AssertFile("all.make");

  WriteProject("app", "Application", "subproj { \"lib\" \"pre\" }\nqrex\n{ }");
  Generate("app");
  AssertFile("make_all_x64_Debug");
  AssertFile("makefile");
}

// A project may have the name of its workspace. The other configurations of the workspace's have their files.
TEST_F(MakeFilesTest, ProjectNamedLikeItsWorkspace) {
  Write("tree/base/src/base.qrpj",
        "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"base\" config { \"Debug|x64\" \"Odd|x64\" } { }");
  WriteProject("all", "Application", "subproj { \"base\" } qrex { \"all.c\" }");
  Generate("all");
  EXPECT_EQ("# Project : all\n", LinesOf("make_all_x64_Debug", "# Project"));
  EXPECT_EQ("# Workspace : all\n", LinesOf("make_all_x64_Odd", "# Workspace"));
  const std::string refusal =
      "Error : Make file make_all_x64_Debug of the workspace has the name of a project's - not written\n";
  const size_t first = trace.find(refusal + "Writing make_all_x64_Odd\n");
  ASSERT_NE(std::string::npos, first) << trace;
  EXPECT_NE(std::string::npos, trace.find(refusal + "Skipping make_all_x64_Odd\n", first)) << trace;
}

}  // namespace

}  // namespace qrex
