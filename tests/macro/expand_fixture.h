// Expands texts without a disk: the text stands in the file "t"; what it imports is given by name.
#pragma once

#include <gtest/gtest.h>

#include <map>
#include <string>

#include "macro/expand.h"
#include "macro/mpfw_parser.h"
#include "text_cases.h"

namespace qrex {

class ExpandTest : public ::testing::Test, public ImportHandler {
 protected:
  ExpandTest() { frame.AddVariable(std::make_unique<LSVar>("@where", "here")); }

  // The expansion, or the error as it is printed: path, line and message where the position is known.
  std::string Expand(const std::string& text) {
    try {
      return ExpandFile("t", text);
    } catch (const LexScannerException& exception) {
      MemoryTextWriter writer;
      WriteMessage(writer, ParseErrorOf(sources, exception));
      const std::string report = writer.TakeText();
      return report.substr(1, report.size() - 2);
    }
  }

  // Each in a frame of its own, so that cases of a table don't see each other.
  static std::string ExpandAfresh(const std::string& text) {
    struct Fresh : ExpandTest {
      void TestBody() override {}
    } fresh;
    return fresh.Expand(text);
  }

  static void AssertCases(const std::string& file) {
    for (const auto& [name, input, expected] : TextCasesOf(file))
      EXPECT_EQ(expected, ExpandAfresh(input)) << name << "\n" << input;
  }

  bool ImportPath(const std::string& path, const char*) override {
    importPaths += path + ";";
    return takesImportPaths;
  }
  bool Import(LSFrame&, const std::string& path, const char*) override {
    auto found = files.find(path);
    if (found == files.end()) return false;
    ExpandFile(path, found->second);
    return true;
  }

  std::string ExpandFile(const std::string& path, const std::string& text) {
    sources.push_back(std::make_unique<MpfwSourceFile>());
    MpfwSourceFile& file = *sources.back();
    file.path = path;
    file.text = text;
    file.expansion = ExpandToStringWithMap(this, frame, TextRange(std::string_view(file.text)), 0, 0, file.map);
    return file.expansion;
  }

  SourceFileList sources;
  MacroWorld world;
  LSFileFrame frame{world};
  std::map<std::string, std::string> files;
  std::string importPaths;
  bool takesImportPaths = true;
};

}  // namespace qrex
