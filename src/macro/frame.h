// Variables, macros and the frames that scope them, and the $(name) substitutions of double-quoted strings.
#pragma once

#include <boost/container/small_vector.hpp>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "lex/byte_class.h"
#include "lex/token.h"
#include "macro/macro_world.h"
#include "text/index_set.h"
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
  virtual std::string ValueText() const = 0;
  virtual std::unique_ptr<LSVariable> Clone() const = 0;

  TextRange name;
};

struct MacroFormal {
  TextRange name;
  VarType type = VarType::Macro;
  bool isFunction = false;
};

// The words of a macro's body that may be names, and each `@@`, for a body that has nothing else that acts: a call
// looks at these and copies what lies between, without scanning it again. Never changed once made.
struct BodyWords {
  struct Word {
    int32_t kind;        // kIdentifier or kAt
    size_t begin, size;  // in the body
  };
  uint64_t asOf;    // NamesInUse::Changes
  Dialect dialect;  // in which the body was scanned
  bool isComplete;  // false: the body has directives, strings or lines, and is scanned
  std::vector<Word> words;
};

class LSMacroVariable : public LSVariable {
 public:
  VarType Kind() const override { return VarType::Macro; }
  void WriteDefinition(TextWriter& writer) const override;
  void WriteValue(TextWriter& writer) const override;
  std::string ValueText() const override { return body.Text(); }
  std::unique_ptr<LSVariable> Clone() const override;
  std::string Signature() const;
  // Makes name, formals and body refer to a copy of `text`, in which they lie now.
  void OwnText(TextRange text);  // by value: it may be one of them
  void OwnBody();                // the same for the body alone
  // The body contains nothing to expand, so a call can copy it. The mark becomes invalid as soon as a new name is
  // defined.
  bool HasPlainBody(const NamesInUse& names) const { return m_plainAsOf == names.Changes(); }
  void SetPlainBody(const NamesInUse& names) const { m_plainAsOf = names.Changes(); }
  // Once the body has been asked for often enough for it to pay; else null, as for a body that must be scanned. Shared
  // with the call, in whose course another may find them anew.
  std::shared_ptr<const BodyWords> WordsOfBody(const NamesInUse& names, Dialect dialect) const;

  bool isPython = false;
  bool isNaked = false;
  bool isFunctionArgument = false;
  bool isTemporary = false;  // the body was composed on the way: it is no source text
  VarType resultType = VarType::Macro;
  std::vector<MacroFormal> formals;
  LSFrame* homeFrame = nullptr;
  int stripIndent = 0;
  TextRange body;
  std::shared_ptr<const std::string> ownedText;

 private:
  static constexpr uint64_t kNever = ~uint64_t{0};
  static constexpr int kScansAhead = 3;
  mutable uint64_t m_plainAsOf = kNever;
  mutable int m_scans = 0;
  mutable std::shared_ptr<const BodyWords> m_words;
};

class LSValueVariable : public LSVariable {
 public:
  LSValueVariable(VarType type, std::string value) : type(type), value(std::move(value)) {}
  VarType Kind() const override { return type; }
  void WriteDefinition(TextWriter& writer) const override;
  void WriteValue(TextWriter& writer) const override;
  std::string ValueText() const override { return value; }
  std::unique_ptr<LSVariable> Clone() const override;

  VarType type;
  std::string value;  // canonical text
};

// A value variable that owns the text of its name.
class LSVar : public LSValueVariable {
 public:
  LSVar(std::string name, std::string value) : LSVar(std::move(name), VarType::String, std::move(value)) {}
  LSVar(std::string name, VarType type, std::string value);
  std::unique_ptr<LSVariable> Clone() const override;
  const std::string ownName;
};

// A scope of names. Child frames come and go with every body and expression, so one without definitions owns nothing,
// and one with a few is searched without an index.
class LSFrame {
 public:
  explicit LSFrame(LSFrame* parent);    // not null
  explicit LSFrame(MacroWorld& world);  // without a parent, and of no file
  virtual ~LSFrame();
  LSFrame(const LSFrame&) = delete;
  LSFrame& operator=(const LSFrame&) = delete;

  void AddVariable(std::unique_ptr<LSVariable> variable);  // the newest of a name takes over the entry
  LSVariable* FindLocal(std::string_view name) const;
  LSVariable* FindInChain(std::string_view name) const;
  virtual LSVariable* FindInFrame(std::string_view name, const char* position) const;  // with its imports
  LSVariable* Find(std::string_view name, const char* position) const;                 // FindInFrame up the chain
  void WriteFrame(TextWriter& writer) const;

  LSFrame* Parent() const { return m_parent; }
  LSFileFrame* FileFrame() const { return m_fileFrame; }
  MacroWorld& World() const { return m_world; }

 protected:
  virtual void OnAdded(LSVariable&, bool /*replaces*/) {}
  void EnterInIndex(LSVariable& variable);

  using Index = std::unordered_map<std::string_view, LSVariable*>;
  static constexpr size_t kMostWithoutIndex = 8;

  boost::container::small_vector<std::unique_ptr<LSVariable>, 4> m_variables;  // oldest first
  std::unique_ptr<Index> m_names;                                              // the newest of each name; or null
  MacroWorld& m_world;
  LSFrame* m_parent = nullptr;
  LSFileFrame* m_fileFrame = nullptr;
};

// The frame of a file. Every identifier of every text is looked up through all imports, so this must not cost time that
// grows with their number: one table lists the definitions of each name in all file frames, and each frame keeps the
// set of the frames that it sees. A name that is nowhere is answered by one probe.
class LSFileFrame : public LSFrame {
 public:
  explicit LSFileFrame(MacroWorld& world);
  explicit LSFileFrame(LSFrame* parent);
  Dialect dialect = Dialect::Qrex;  // of the file's text, and of the macro bodies in it
  ~LSFileFrame() override;

  void AddImport(LSFileFrame& imported);
  void AddOrderedImport(LSFileFrame& imported);  // the same, and its substitutions are searched
  LSVariable* FindInFrame(std::string_view name, const char* position) const override;
  void DefineSubstitution(const std::string& name, const std::string& value);  // also the macro _name_
  const std::map<std::string, std::string, std::less<>>& Substitutions() const { return m_substitutions; }  // own ones
  const std::string* FindSubstitution(std::string_view name) const;
  bool Substitute(std::string& text) const;  // expands $(name) in place, repeatedly; true if anything changed
  void CopyFrom(const LSFileFrame& other);   // the definitions and substitutions of another frame
  void Clear();                              // as it was made, but for its dialect

 protected:
  void OnAdded(LSVariable& variable, bool replaces) override;

 private:
  class NearestDefinition;
  void LeaveDefinitions();
  bool SubstituteOnce(std::string& text) const;

  const size_t m_index;
  IndexSet m_allImports;
  std::vector<std::string_view> m_entered;  // names in the table of all definitions
  std::vector<LSFileFrame*> m_directImports;
  std::vector<LSFileFrame*> m_orderedImports;
  std::map<std::string, std::string, std::less<>> m_substitutions;
};

}  // namespace qrex
