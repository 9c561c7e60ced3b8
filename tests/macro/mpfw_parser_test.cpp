// Loading of source files, imports, and the statements that the file languages share.

#include "macro/mpfw_parser.h"

#include "message_of.h"
#include "world_fixture.h"

namespace qrex {

class MpfwParserTest : public WorldTest {
 protected:
  struct Parser : MpfwParser {
    using MpfwParser::MpfwParser;
    bool ResolveImport(const std::string& path, std::string& found) override {
      found = path;
      return FileExists(path);
    }
    void OnImportedFile(MpfwSourceFile& file) override {
      imported += file.path + (file.expansion.empty() ? "" : " " + file.expansion) + ";";
    }
    std::string imported;
  };

  std::string Load(const std::string& name, const std::string& extraText = {}) {
    const MpfwSourceFile* file = parser.LoadSourceFile(name, extraText);
    return file ? file->expansion : "none";
  }
  // What `act` answers with the text as input, or the error's message.
  template <typename Act>
  std::string With(const std::string& text, Act act) {
    return MessageOf([&] {
      parser.SetInput(TextRange(std::string_view(text)));
      return act();
    });
  }

  SourceFileList& sources = settings.sourceFiles;
  MpfwContext& context = settings.context;
  Parser parser{context};
};

TEST_F(MpfwParserTest, LoadsAndImports) {
  Write("a", "@import \"b\"\r\n@importpath \"$(p)\\\\q/\"\r@$p = \"1\"@importpath (\"$\" + \"(p)\")\nf");
  Write("b", "@def f = imported\n@$p = \"0\"\n");
  EXPECT_EQ("@import \"b\"\n\n\nimported\n g", Load("a", " g"));
  EXPECT_EQ((std::vector<std::string>{"0/q", "1"}), context.importPaths);
  EXPECT_EQ(2u, sources.size());
  EXPECT_EQ("", trace);
}

TEST_F(MpfwParserTest, ReportsErrors) {
  Write("a", "x\n@import \"b\"\n");
  Write("b", "\n\n@fail(\"no\")");
  EXPECT_EQ("none", Load("a"));
  EXPECT_EQ("\nb(3) : no\n\na(2) : Can't import file: b\n", trace);
  trace.clear();
  Write("a", "\n@import \"c$(v)\"");
  EXPECT_EQ("none", Load("a"));
  EXPECT_EQ("\na(2) : Couldn't open file c$(v)\n", trace);
  EXPECT_EQ("Couldn't open file none", With("", [&] { return Load("none"); }));
  trace.clear();
  Write("self", "@import \"self\"");
  EXPECT_EQ("none", Load("self"));
  EXPECT_EQ("\nself(1) : Imports nested too deeply : self imports self\n", trace);
  trace.clear();
  Write("e", "@import \"f\"");
  Write("f", "\n@import \"e\"");
  EXPECT_EQ("none", Load("e"));
  EXPECT_EQ("\ne(1) : Imports nested too deeply : f imports e imports f\n", trace);
}

TEST_F(MpfwParserTest, Statements) {
  const auto import = [&](const std::string& text) {
    return With(text, [&] {
      const bool parsed = parser.ParseImportStatement();
      return std::string(parsed ? "yes|" : "no|") + Printed(parser.current);
    });
  };
  Write("a", "");
  EXPECT_EQ("no|x", import("x"));
  EXPECT_EQ("yes|x", import("@import \"a\" x"));
  EXPECT_EQ("", parser.imported);  // it was never loaded
  Load("a");
  EXPECT_EQ("yes|x", import("@import \"a\" x"));
  EXPECT_EQ("a;", parser.imported);
  EXPECT_EQ("Syntax error: @x", import("@x"));
  EXPECT_EQ("Expected quoted string when read x", import("@import x"));
  EXPECT_EQ("Couldn't open file none", import("@import \"none\""));

  // In a loaded file, the one behind it goes ahead of one that was loaded earlier.
  Write("b", "@quote(@import \"A\")");
  Load("b");
  const MpfwSourceFile& importer = *sources.back();
  const auto importedBy = [&] {
    parser.imported.clear();
    parser.SetInput(TextRange(std::string_view(importer.expansion)));
    return parser.ParseImportStatement() ? parser.imported : "no";
  };
  Write("A", "");
  EXPECT_EQ("a;", importedBy());
  Write("a", "again");
  Load("a");
  EXPECT_EQ("a again;", importedBy());

  const auto define = [&](const std::string& text) {
    return With(text, [&] {
      const bool defined = parser.ParseVariableStatement();
      const std::string* value = context.rootFrame.FindSubstitution("x");
      return (defined ? "" : "no ") + (value ? *value : "none");
    });
  };
  EXPECT_EQ("no none", define("x"));
  EXPECT_EQ("a/b", define("$x = path \"a\\\\b/\""));
  EXPECT_EQ("a\\b/", define("$x = \"a\\\\b/\""));
  EXPECT_EQ("ab", define("$x = (\"a\" + \"b\")"));
  EXPECT_EQ("Expected identifier after $ when read 1", define("$1"));
  EXPECT_EQ("Expected = after x when read ;", define("$x ;"));
}

}  // namespace qrex
