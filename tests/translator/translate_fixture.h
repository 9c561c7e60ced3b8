// Translates given texts, as files of a project.
#pragma once

#include <algorithm>
#include <sstream>
#include <string>
#include <vector>

#include "text/numbers.h"
#include "text/paths.h"
#include "translator/file/translate_file.h"
#include "translator/reader/qrex_parser.h"
#include "workspace/project_parser.h"
#include "world_fixture.h"

namespace qrex {

// The world of a test is a workspace of the project `app` and the companion runtime `vxObject` with
// Vesk/vxObject/IObject.h. A file of `app` stands under app/src/ unless its name holds a slash (then under app/: of a
// library, these are the public headers). Paths in messages are printed relative to app/src/, or else to the tree.
class TranslateTest : public WorldTest {
 protected:
  TranslateTest() {
    configs = "";  // the first text of `app` has one, what extends it has none
    MakeWorld(TargetType::Application);
  }

  // A new world in which `app` is of that kind and has no files.
  void MakeWorld(TargetType target) {
    Load({});
    AddProject("app", TargetTypeName(target), "config { \"Debug|x64\" } qrex { }");
    AddFileTo(AddProject("Vesk/vxObject", "Utility Project", "qrex { }"), "Vesk/vxObject/IObject.h",
              "namespace vesk\n{\n$interface+ IObject\n{\n};\n$interface+ IPersistable : IObject\n{\n};\n}\n");
    StartBuild();
    trace.clear();
  }

  static std::string PathOf(const std::string& name) {
    return (name.find('/') == std::string::npos ? "app/src/" : "app/") + name;
  }
  void AddFile(const std::string& name, const std::string& text) { AddFileTo(App(), PathOf(name), text); }
  ScannedFile& Scanned(const std::string& name) { return World::Scanned(PathOf(name)); }

  // The generated text. Throws what the translation throws. A header and its .cpp must both be there before the first
  // of them is translated.
  std::string Translate(const std::string& name) {
    App().CollectFiles();
    ScannedFile& file = Scanned(name);
    file.TakeBack();
    file.needsWriting = true;
    BringUpToDate(file);
    return ReadText(builder->TranslatedPath(file));
  }
  std::string Translate(const std::string& name, const std::string& text) {
    AddFile(name, text);
    return Translate(name);
  }

  // What comes of a header `t.h` that imports IObject.h, then holds `text`, and of its empty `t.cpp`: the text proper
  // of the one (between head and foot, without the import), and the reflection tail in the other. Makes a new world of
  // the kind that `app` has.
  struct Generated {
    std::string header, tail;
  };
  Generated TranslateHeader(const std::string& text) {
    MakeWorld(App().targetType);
    AddFile("t.h", "@import \"Vesk/vxObject/IObject.h\"\n" + text);
    AddFile("t.cpp", "@import \"t.h\"\n");
    Generated generated{WithoutGuard(Translate("t.h")), Translate("t.cpp")};
    Cut(generated.tail, "#include \"t.h\"\n", "");
    return generated;
  }
  // Of a header, what stands between its head and foot.
  static std::string WithoutGuard(std::string text) {
    if (text.starts_with("#pragma once")) {
      Cut(text, "#pragma once\n#ifndef _app_src_t_h\n#define _app_src_t_h\n\n#include \"Vesk/vxObject/IObject.h\"\n",
          "\n#endif // include guard\n");
    }
    return text;
  }
  // What comes of the body of a class.
  std::string Body(const std::string& body, const std::string& head = "$struct S") {
    const std::string header = TranslateHeader(head + "\n{//\n" + body + "int end;\n};\n").header;
    return Section(header, "//\n", "int end;\n");
  }

  // What stands behind the first `begin`, up to the first `end` behind it; all the rest when `end` is empty.
  static std::string Section(const std::string& text, const std::string& begin, const std::string& end) {
    const size_t found = text.find(begin);
    if (found == std::string::npos) return "'" + begin + "' is not in:\n" + text;
    const size_t start = found + begin.size();
    return text.substr(start, end.empty() ? end.npos : text.find(end, start) - start);
  }

  // With each table of a record on one line, "static T N[] = { row, row, };", and so its operations, by their names:
  // "{ sizeof(T), 0, VariableLess, ... }".
  static std::string Folded(const std::string& text) {
    std::istringstream lines(text);
    std::string result;
    bool folding = false;
    for (std::string line; std::getline(lines, line);) {
      const size_t indent = std::min(line.find_first_not_of(' '), line.size());
      if (result.ends_with("[] =\n") || result.ends_with("[] = \n") ||
          (result.ends_with("{\n") && line.compare(indent, 7, "sizeof(") == 0)) {
        result.back() = ' ';
        folding = true;
      }
      if (folding) line.erase(0, indent);
      if (size_t name = line.find(")) vesk::"); folding && name != line.npos && line.find("Fn) (") != line.npos) {
        name += 9;
        line = line.substr(name, line.find('<', name) - name) + (line.back() == ',' ? "," : "");
      }
      folding = folding && !line.starts_with("}");
      result += line + (folding ? ' ' : '\n');
    }
    return result;
  }

  // The printed form of the error that the translation of `text` raises.
  std::string ErrorOf(const std::string& name, const std::string& text) {
    try {
      std::string generated = Translate(name, text);
      return "no error, but:\n" + generated;
    } catch (const IException& exception) {
      return WithShortPaths(ExceptionText(exception));
    }
  }

  // The error that a header raises, or the messages that its translation prints, in a new world of the kind that `app`
  // has. The import of IObject.h stands on the first line of the text.
  void AssertError(const std::string& text, int line, const std::string& error) {
    EXPECT_EQ("t.h(" + ToString(line) + ") : error : " + error, ErrorInNewWorld("t.h", text)) << text;
  }
  void AssertMessages(const std::string& text, const std::string& messages, const std::string& name = "t.h") {
    const std::string error = ErrorInNewWorld(name, text);
    EXPECT_EQ("no error", error.substr(0, 8)) << error;
    EXPECT_EQ(messages, Messages()) << text;
  }

  // What is told of a header in a new world: its error, or else its messages.
  std::string Told(const std::string& text) {
    const std::string error = ErrorInNewWorld("t.h", text);
    return !error.starts_with("no error") ? error : trace.empty() ? "" : Messages().substr(0, Messages().size() - 1);
  }

  std::string Messages() const { return WithShortPaths(trace); }  // all that was printed

  // The project's text now lists this file; the files that it listed before stay as they are.
  void AddFileTo(Project& project, const std::string& path, const std::string& text) {
    ASSERT_FALSE(project.filesByPath.count(path)) << path << " is there already: use a new world";
    Write("tree/" + path, text);
    const std::string entry = path.substr(project.rootToProjDir.size() + 1);
    WriteProject(project.rootToProjDir, TargetTypeName(project.targetType),
                 "{ \"" + entry + "\" as \"" + std::string(FileNameOf(entry)) + "\" }");
    ASSERT_TRUE(LoadProjectFile(project, ProjectPathOf(project.rootToProjDir))) << trace;
    project.filesCollected = false;
    project.folders.clear();
    ProjectFile& file = *project.filesByPath.at(path);
    workspace->fileMap[file.path] = &file;
  }

 private:
  std::string ErrorInNewWorld(const std::string& name, const std::string& text) {
    MakeWorld(App().targetType);
    return ErrorOf(name, "@import \"Vesk/vxObject/IObject.h\" " + text);
  }
  std::string WithShortPaths(std::string text) const {
    ReplaceAllInPlace(text, "tree/", "");
    ReplaceAllInPlace(text, "app/src/", "");
    return text;
  }

  static void Cut(std::string& text, const std::string& head, const std::string& foot) {
    ASSERT_EQ(head, text.substr(0, head.size()));
    text.erase(0, head.size());
    ASSERT_TRUE(text.size() >= foot.size() && text.compare(text.size() - foot.size(), foot.size(), foot) == 0) << text;
    text.erase(text.size() - foot.size());
  }
};

}  // namespace qrex
