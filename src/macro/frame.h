// Variables, macros and the frames that scope them, and the $(name) substitutions of double-quoted strings.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "lex/token.h"
#include "text/text_writer.h"

namespace qrex {

class LSFrame;
class LSFileFrame;

enum class VarType : int32_t { Macro = 1, Bool, Int, Double, Char, String };
VarType TypeCodeOf(std::string_view word);  // Macro: no type keyword

class LSVariable {
 public:
  virtual ~LSVariable() = default;
  virtual VarType Kind() const = 0;
  virtual void WriteDefinition(TextWriter& writer) const = 0;
  virtual void WriteValue(TextWriter& writer) const = 0;

  TextRange name;
};

struct MacroFormal {
  TextRange name;
  VarType type = VarType::Macro;
  bool isFunction = false;
};

class LSMacroVariable : public LSVariable {
 public:
  VarType Kind() const override { return VarType::Macro; }
  void WriteDefinition(TextWriter& writer) const override;
  void WriteValue(TextWriter& writer) const override;
  std::string Signature() const;

  bool isPython = false;
  bool isNaked = false;
  bool isFunctionArgument = false;
  VarType resultType = VarType::Macro;
  std::vector<MacroFormal> formals;
  LSFrame* homeFrame = nullptr;
  int stripIndent = 0;
  TextRange body;
  std::string ownedText;  // optional owned copy that `body` (and `name`) may refer to
};

class LSValueVariable : public LSVariable {
 public:
  LSValueVariable(VarType type, std::string value) : type(type), value(std::move(value)) {}
  VarType Kind() const override { return type; }
  void WriteDefinition(TextWriter& writer) const override;
  void WriteValue(TextWriter& writer) const override;

  VarType type;
  std::string value;  // canonical text
};

// A string variable that owns the text of its name.
class LSVar : public LSValueVariable {
 public:
  LSVar(std::string name, std::string value);
  std::string ownName;
};

class LSFrame {
 public:
  explicit LSFrame(LSFrame* parent);
  virtual ~LSFrame();
  LSFrame(const LSFrame&) = delete;
  LSFrame& operator=(const LSFrame&) = delete;

  void AddVariable(std::unique_ptr<LSVariable> variable);  // the newest of a name takes over the entry
  LSVariable* FindLocal(std::string_view name) const;
  LSVariable* FindInChain(std::string_view name) const;
  LSVariable* FindInFrame(std::string_view name, const char* position) const;  // with its imports
  LSVariable* Find(std::string_view name, const char* position) const;         // FindInFrame up the chain
  void WriteFrame(TextWriter& writer) const;

  LSFrame* Parent() const { return m_parent; }
  LSFileFrame* FileFrame() const { return m_fileFrame; }

 protected:
  friend class LSFileFrame;
  struct Names;  // the implementation's own: variables, names, import index
  std::unique_ptr<Names> m_names;
  LSFrame* m_parent;
  LSFileFrame* m_fileFrame;
};

class LSFileFrame : public LSFrame {
 public:
  explicit LSFileFrame(LSFrame* parent = nullptr);
  ~LSFileFrame() override;

  void AddImport(LSFileFrame& imported);
  void AddOrderedImport(LSFileFrame& imported);  // the same, and its substitutions are searched
  void DefineSubstitution(const std::string& name, const std::string& value);  // also the macro _name_
  const std::string* FindSubstitution(std::string_view name) const;
  bool Substitute(std::string& text) const;  // expands $(name) in place, repeatedly; true if anything changed
  void CopyFrom(const LSFileFrame& other);   // starts as a copy of another frame's definitions and substitutions

 private:
  struct FileNames;
  std::unique_ptr<FileNames> m_file;
};

}  // namespace qrex
