// Joins the macro layer to the configuration, workspace and project languages: loads files, keeps them in memory,
// answers imports, and reads what these languages have in common.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "macro/expand.h"
#include "macro/expression_parser.h"
#include "macro/frame.h"
#include "macro/source_map.h"

namespace qrex {

// A loaded file. Never released before the run's end: macro bodies and error positions point into its text.
struct MpfwSourceFile {
  virtual ~MpfwSourceFile() = default;
  std::string path;
  std::string text;
  size_t addedText = std::string::npos;  // where the lines that were added to the file begin
  std::string expansion;
  SourceMap map;
};

struct MpfwContext {
  MpfwContext(SourceFileList& sourceFiles, MacroWorld& world) : sourceFiles(sourceFiles), rootFrame(world) {}
  // The frame starts as a copy of the parent's, which it also has as its parent.
  explicit MpfwContext(MpfwContext& parent) : sourceFiles(parent.sourceFiles), rootFrame(&parent.rootFrame) {
    rootFrame.CopyFrom(parent.rootFrame);
  }
  SourceFileList& sourceFiles;
  LSFileFrame rootFrame;
  std::vector<std::string> importPaths;
};

class MpfwParser : public ExpressionParser, public ImportHandler {
 public:
  explicit MpfwParser(MpfwContext& context) : context(context) {}

  bool ImportPath(const std::string& path, const char* position) override;
  bool Import(LSFrame& frame, const std::string& path, const char* position) override;
  std::string PlaceOf(const char* position) const override;
  virtual std::unique_ptr<MpfwSourceFile> CreateSourceFile();
  virtual bool ResolveImport(const std::string& path, std::string& found) = 0;
  virtual void OnImportedFile(MpfwSourceFile& file) = 0;

  // Null if the macro expansion failed (already reported). Throws "Couldn't open file ". The extra text stands on lines
  // of its own behind the file.
  MpfwSourceFile* LoadSourceFile(const std::string& path, const std::string& extraText = {});

  void SubstituteVariables(std::string& text) const;
  void ReadString(std::string& out);  // does not advance
  void ReadPath(std::string& out);    // does not advance
  // Names and paths are put in quotes on the command lines of tools.
  static void RequireNoQuote(const std::string& name, const LexToken& token);
  void ReadStringOrExpression(std::string& out);  // advances
  void ReadNamedString(const std::string& name, std::string& out);
  void ReadNamedPath(const std::string& name, std::string& out);
  bool ParseImportStatement();
  bool ParseVariableStatement(std::string* name = nullptr, std::string* value = nullptr);

  // Expands the text of a file that the context has already; false after an error, which is reported.
  bool ExpandSourceFile(MpfwSourceFile& file);

 protected:
  // The common part of OnImportedFile: runs `parse` with a parser of its own over the file's expansion. An error is
  // written, and "while processing @import of " is raised at the @import; so is what stands behind the last statement.
  void ParseImported(MpfwSourceFile& file, MpfwParser& parser, void (*parse)(MpfwParser& parser));

  MpfwContext& context;

 private:
  MpfwSourceFile* FindLoaded(const std::string& path) const;  // or null
  std::string CycleText(const std::string& path) const;

  static constexpr int kMaxImportDepth = 200;  // a file may import itself
  int m_importDepth = 0;
  std::vector<std::string> m_imports;  // under expansion, outermost first
  bool m_isTooDeep = false, m_isTooDeepTold = false;
  const char* m_importBegin = nullptr;  // the `@` of the import statement being read
};

}  // namespace qrex
