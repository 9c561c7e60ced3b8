// Conditions that the workspace of project_files_test.cpp does not meet, and what goes to the trace log.

#include "generators/generate_fixture.h"

namespace qrex {

namespace {

class ProjectDetailsTest : public GenerateTest {
 protected:
  void LoadAndGenerate(CompilerKind compiler, const std::string& entry = "app") {
    settings.compiler = compiler;
    Generate(entry);
  }
  static void AssertHolds(const std::string& path, const std::string& text) {
    const std::string content = ReadText(path);
    EXPECT_NE(content.find(text), std::string::npos) << path << " lacks:\n" << text << "\nIt is:\n" << content;
  }
  static void AssertLacks(const std::string& path, const std::string& text) {
    const std::string content = ReadText(path);
    EXPECT_EQ(content.find(text), std::string::npos) << path << " holds:\n" << text << "\nIt is:\n" << content;
  }
};

// `old` is loaded, but the project in it goes by another name.
TEST_F(ProjectDetailsTest, MissingDependency) {
  const std::string missing = "Error : Can't find dependent project old under project app\n";
  const std::string noLibrary = "Error : Can't find subproject old/src/old.qrpj under project app\n";
  WriteProject("app", "Application", "subproj { \"old\" } { }");
  Write("tree/old/src/old.qrpj", "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"new\" { }");

  LoadAndGenerate(CompilerKind::vc6);
  EXPECT_EQ(trace, "Writing app.dsp\nWriting new.dsp\n" + missing + "Writing all.dsw\n");
  AssertLacks("all.dsw", "Project Dependency");

  LoadAndGenerate(CompilerKind::vc10);
  EXPECT_EQ(trace, noLibrary + noLibrary + missing +
                       "Writing app.vcxproj\nWriting app.vcxproj.filters\nWriting new.vcxproj\n"
                       "Writing new.vcxproj.filters\nWriting all.sln\n");
  AssertHolds("app.vcxproj", "  <ItemGroup>\n  </ItemGroup>\n  <ItemGroup>\n  </ItemGroup>\n  <Import");

  LoadAndGenerate(CompilerKind::gcc);
  EXPECT_TRUE(trace.ends_with("Writing all.make\n" + missing + "Writing all.workspace\nWriting all.geany\n")) << trace;
  AssertHolds("app.cbp", "\t\t\t\t\t<Add option=\"-lold\" />\n");

  WriteProject("app", "Application", "subproj { \"old\" } qrex { }");  // a second pass, over the same names
  LoadAndGenerate(CompilerKind::gcc);
  EXPECT_TRUE(trace.ends_with("Skipping all.make\n" + missing + "Skipping all.workspace\nSkipping all.geany\n"))
      << trace;
}

TEST_F(ProjectDetailsTest, PrepackagedProjectsInSolutions) {
  WriteProject("app", "Application", "subproj { \"pre\" } { }");
  Write("tree/pre/src/pre.qrpj",
        "$TARGET_TYPE = \"Library\" $ROOT_TO_PROJDIR = \"pre\" export config { \"Debug|x64\" \"Odd|x64\" } { }");
  settings.solutionContainsPrepackagedProjects = false;
  LoadAndGenerate(CompilerKind::vc9);
  AssertHolds("all.sln",
              "\tProjectSection(ProjectDependencies) = postProject\n\tEndProjectSection\nEndProject\nGlobal\n");
  AssertHolds("all.sln", "\t\tDebug|x64 = Debug|x64\n\t\tOdd|x64 = Odd|x64\n\t\tRelease|x64 = Release|x64\n\tEnd");
  AssertLacks("all.sln", "}.Odd|x64");
}

TEST_F(ProjectDetailsTest, OptionsOfTheNewFormat) {
  WriteProject("app", "Console Application", R"qrpj(qrex
    general { CharacterSet = "3" UseOfATL = "2" UseOfMFC = "-1" ManagedExtensions = "x" WholeProgramOptimization = "4" }
    +cpp ("Debug") { /Fp "a.pch" /FI "b.h" /FI "c.h" /C /arch:AVX /Fr /fp:except - /clr:pure /wd 4100 /Fe "e" }
    +rc ("Debug") { /fo "a.res" /x }
    +link ("Debug") { /HEAP:1,2 /OPT:WIN98 /MANIFEST }
    { "src" { "a.cpp" : +cpp { /YX } "b.cpp" : +cpp ("Release") { /Yc } } })qrpj");
  settings.platform = "x64";
  settings.config = "Debug";
  LoadAndGenerate(CompilerKind::vc12);
  const std::string general =
      "CharacterSet index = 3 out of range\nUseOfMFC index = -1 out of range\n"
      "ManagedExtensions index = x out of range\n";
  const std::string messages = general + general +
                               "todo : resource switch IgnoreStandardIncludePath = true\n"
                               "todo : resource switch ResourceOutputFileName = a.res\n"
                               "todo : linker switch HeapCommitSize = 2\n"
                               "todo : linker switch HeapReserveSize = 1\n"
                               "VS2012 has no mapping for linker switch OptimizeForWindows98 = 2\n";
  EXPECT_EQ(trace, messages + "Writing app.vcxproj\nWriting app.vcxproj.filters\n" + messages +
                       "Writing build_app.vcxproj\nWriting build_app.vcxproj.filters\nWriting all.sln\n"
                       "Writing build_all.sln\n");
  AssertHolds("app.vcxproj",
              "    <PlatformToolset>v120</PlatformToolset>\n    <UseOfAtl>Dynamic</UseOfAtl>\n"
              "    <WholeProgramOptimization>PGUpdate</WholeProgramOptimization>\n  </PropertyGroup>\n");
  AssertHolds("app.vcxproj", "    <GenerateManifest>true</GenerateManifest>\n  </PropertyGroup>\n");
  AssertHolds("app.vcxproj",
              "    <ClCompile>\n"
              "      <EnableEnhancedInstructionSet>AdvancedVectorExtensions</EnableEnhancedInstructionSet>\n"
              "      <FloatingPointExceptions>false</FloatingPointExceptions>\n"
              "      <ForcedIncludeFiles>b.h;c.h;%(ForcedIncludeFiles)</ForcedIncludeFiles>\n"
              "      <PreprocessKeepComments>true</PreprocessKeepComments>\n"
              "      <PrecompiledHeaderOutputFile>a.pch</PrecompiledHeaderOutputFile>\n"
              "      <PrecompiledHeaderFile>StdAfx.h</PrecompiledHeaderFile>\n"
              "    </ClCompile>\n");
  // A value of 0 in the first record asks for nothing; the first record counts for all configurations.
  AssertHolds("build_app.vcxproj",
              "    <ClCompile Include=\"qrexsource/x64/Debug/app/src/a.cpp\">\n    </ClCompile>\n"
              "    <ClCompile Include=\"qrexsource/x64/Debug/app/src/b.cpp\">\n"
              "      <PrecompiledHeaderFile Condition=\"'$(Configuration)|$(Platform)'=='Debug|x64'\">StdAfx.h"
              "</PrecompiledHeaderFile>\n");
}

TEST_F(ProjectDetailsTest, Toolsets) {
  WriteProject("app", "Application", "general (\"Release\") { PlatformToolset = \"ClangCL\" } { }");
  settings.platformToolset = "v143";
  settings.targetXP = true;
  for (const auto& [compiler, sdk, told] :
       {std::tuple(CompilerKind::vc10, "", "10.0"), std::tuple(CompilerKind::vc14, "10.0.22621.0", "10.0.22621.0")}) {
    settings.windowsSdk = sdk;
    LoadAndGenerate(compiler);
    AssertHolds("app.vcxproj", "}</ProjectGuid>\n    <WindowsTargetPlatformVersion>" + std::string(told) +
                                   "</WindowsTargetPlatformVersion>\n  </PropertyGroup>\n");
    for (const auto& [config, toolset] : {std::pair("Debug", "v143"), std::pair("Release", "ClangCL")}) {
      AssertHolds("app.vcxproj",
                  "'=='" + std::string(config) +
                      "|x64'\" Label=\"Configuration\">\n    <ConfigurationType>Application</ConfigurationType>\n"
                      "    <PlatformToolset>" +
                      toolset + "</PlatformToolset>\n  </PropertyGroup>\n");
    }
  }
  LoadAndGenerate(CompilerKind::vc8);  // has no such attribute
  AssertLacks("app.vcproj", "Toolset");
}

TEST_F(ProjectDetailsTest, WhatKindsOfProjectsGet) {
  settings.virtualTree = {"tree", "other"};
  const char* const kUtility = "Utility Project";  // which has no tool of any sort
  const char* const kIncludes = R"qrpj(+cpp ("Debug") { /I "a" /I "$(VIRTUAL_TREE)" /I "$(VIRTUAL_TREE)/b" } { })qrpj";
  const char* const kWin64 = "config { \"Win64 Debug|x64\" } { }";
  const struct {
    CompilerKind compiler;
    const char *targetType, *statements, *file, *text;
  } kRows[] = {
      {CompilerKind::vc6, kUtility, "+link { /NOLOGO } { }", "app.dsp", "# ADD BSC32 /nologo\n\n!ELSEIF"},
      {CompilerKind::vc8, kUtility, "{ }", "app.vcproj",
       "\t\t\tManagedExtensions=\"0\"\n\t\t\t>\n\t\t</Configuration>\n"},
      {CompilerKind::vc14, kUtility, "{ }", "app.vcxproj", "'=='Release|x64'\">\n  </ItemDefinitionGroup>\n"},
      {CompilerKind::vc14, "Static Library", "+link (\"Debug\") { /NOLOGO /EXPORT:\"f\" } { }", "app.vcxproj",
       "    <Lib>\n      <SuppressStartupBanner>true</SuppressStartupBanner>\n    </Lib>\n"},
      {CompilerKind::vc8, "Application", kIncludes, "app.vcproj",
       "AdditionalIncludeDirectories=\"tree/app;tree/app/src;a;tree;other;tree/b;other/b\"\n"},
      {CompilerKind::vc14, "Application", kIncludes, "app.vcxproj",
       ">tree/app;tree/app/src;a;tree;other;tree/b;other/b;%(AdditionalIncludeDirectories)</Additional"},
      {CompilerKind::vc6, "Console Application", kWin64, "app.dsp",
       "# TARGTYPE \"Win32 (x86) Console Application\" 0x0103\n"},
      {CompilerKind::vc6, "Console Application", kWin64, "app.dsp",  // by its name
       "app - Win32 Win64 Debug\"\n\n# PROP BASE Use_MFC 0\n# PROP BASE Use_Debug_Libraries 1\n"},
  };
  for (const auto& row : kRows) {
    WriteProject("app", row.targetType, row.statements);
    LoadAndGenerate(row.compiler);
    AssertHolds(row.file, row.text);
    const bool isTold = trace.starts_with("todo : librarian switch ExportNamedFunctions = f\nWriting app.vcxproj\n");
    EXPECT_EQ(isTold, std::string(row.targetType) == "Static Library") << trace;
  }
}

TEST_F(ProjectDetailsTest, GccWorkspaces) {
  settings.compiler = CompilerKind::gcc;
  Workspace empty(settings);
  empty.name = "all";
  Generator(settings.leftovers).WriteWorkspace(empty, Form::Plain);
  EXPECT_EQ(trace, "");
  EXPECT_TRUE(std::filesystem::is_empty("."));

  // No program: no project is active. The first project has headers only.
  WriteProject("base", "Library", "{ \"base.h\" }");
  WriteProject("app", "Dynamic-Link Library", "subproj { \"base\" } { \"app.cpp\" }");
  LoadAndGenerate(CompilerKind::gcc);
  AssertHolds("all.workspace",
              "\t\t<Project filename=\"base.cbp\">\n\t\t</Project>\n"
              "\t\t<Project filename=\"app.cbp\">\n\t\t\t<Depends filename=\"base.cbp\" />\n\t\t</Project>\n");
  AssertHolds("all.geany", "[files]\ncurrent_page=0\n\n[build-menu]\n");

  // Without a configuration nothing is translated. A root may be the current folder.
  Write("bare/src/bare.qrpj", "$TARGET_TYPE = \"Application\" $ROOT_TO_PROJDIR = \"bare\" qrex { \"bare.c\" }");
  settings.virtualTree = {"tree", "."};
  LoadAndGenerate(CompilerKind::gcc, "bare/src/bare.qrpj");
  AssertHolds("bare.cbp",
              "\t\t<Build>\n\t\t</Build>\n\t\t<Compiler>\n\t\t\t<Add option=\"-Ibare\" />\n"
              "\t\t\t<Add option=\"-Ibare/src\" />\n\t\t\t<Add option=\"-Itree\" />\n\t\t\t<Add option=\"-I.\" />\n"
              "\t\t</Compiler>\n\t\t<Unit filename=\"./bare/bare.c\" />\n");

  WriteProject("tool", "Console Application", "subproj { \"app\" } { }");
  LoadAndGenerate(CompilerKind::clang, "tool");
  AssertHolds("all.workspace", "\t\t<Project filename=\"tool.cbp\" active=\"1\">\n");
  AssertHolds("tool.cbp",
              "\t\t\t\t<Option object_output=\"x64/Debug/tool/\" />\n\t\t\t\t<Option type=\"1\" />\n"
              "\t\t\t\t<Option compiler=\"gcc\" />\n\t\t\t\t<Compiler>\n\t\t\t\t</Compiler>\n");
}

}  // namespace

}  // namespace qrex
