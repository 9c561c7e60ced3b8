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
#include "text/index_set.h"
#include "text/text_writer.h"

namespace qrex {

class LSFrame;
class LSFileFrame;

enum class VarType : int32_t { Macro = 1, Bool, Int, Double, Char, String };
VarType TypeCodeOf(std::string_view word);  // Macro: no type keyword

// Which names stand in any frame of the process, roughly: the lengths that begin with each byte, and a bit for some
// more of a name's bytes. Most words of a text are no names, and are told so without a look into the frames.
class NamesInUse {
 public:
  static bool MayHold(std::string_view name) {
    if ((m_lengths[FirstOf(name)] >> (name.size() % 64) & 1) == 0) return false;
    const size_t bit = BitOf(name);
    return (m_bits[bit / 64] >> (bit % 64) & 1) != 0;
  }
  static void Add(std::string_view name) {
    if (MayHold(name)) return;
    m_lengths[FirstOf(name)] |= uint64_t{1} << (name.size() % 64);
    const size_t bit = BitOf(name);
    m_bits[bit / 64] |= uint64_t{1} << (bit % 64);
    ++m_changes;
  }
  static uint64_t Changes() { return m_changes; }  // as long as it stays, so do the answers

 private:
  static constexpr size_t kBits = 16384;
  static unsigned char ByteOf(std::string_view name, size_t at) { return static_cast<unsigned char>(name[at]); }
  static unsigned char FirstOf(std::string_view name) { return name.empty() ? 0 : ByteOf(name, 0); }
  static size_t BitOf(std::string_view name) {
    if (name.empty()) return 0;
    const size_t last = name.size() - 1;
    return ((ByteOf(name, 0) * size_t{31} + ByteOf(name, last)) * 31 + ByteOf(name, last / 2) * 7 + last) % kBits;
  }
  static inline uint64_t m_lengths[256];
  static inline uint64_t m_bits[kBits / 64];
  static inline uint64_t m_changes = 0;
};

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
  // Nothing in the body is to be expanded, so that it can be copied. Forgotten when a name comes up that is new.
  bool HasPlainBody() const { return m_plainAsOf == NamesInUse::Changes(); }
  void SetPlainBody() const { m_plainAsOf = NamesInUse::Changes(); }

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
  mutable uint64_t m_plainAsOf = kNever;
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
  explicit LSFrame(LSFrame* parent);
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

 protected:
  virtual void OnAdded(LSVariable&, bool /*replaces*/) {}
  void EnterInIndex(LSVariable& variable);

  using Index = std::unordered_map<std::string_view, LSVariable*>;
  static constexpr size_t kMostWithoutIndex = 8;

  boost::container::small_vector<std::unique_ptr<LSVariable>, 4> m_variables;  // oldest first
  std::unique_ptr<Index> m_names;                                              // the newest of each name; or null
  LSFrame* m_parent;
  LSFileFrame* m_fileFrame;
};

// The frame of a file. Every identifier of every text is looked up through all imports, so this must not cost time that
// grows with their number: one table lists the definitions of each name in all file frames, and each frame keeps the
// set of the frames that it sees. A name that stands nowhere is answered by one probe.
class LSFileFrame : public LSFrame {
 public:
  explicit LSFileFrame(LSFrame* parent = nullptr);
  Dialect dialect = Dialect::Qrex;  // of the file's text, and of the macro bodies in it
  ~LSFileFrame() override;

  void AddImport(LSFileFrame& imported);
  void AddOrderedImport(LSFileFrame& imported);  // the same, and its substitutions are searched
  LSVariable* FindInFrame(std::string_view name, const char* position) const override;
  void DefineSubstitution(const std::string& name, const std::string& value);  // also the macro _name_
  const std::string* FindSubstitution(std::string_view name) const;
  bool Substitute(std::string& text) const;  // expands $(name) in place, repeatedly; true if anything changed
  void CopyFrom(const LSFileFrame& other);   // the definitions and substitutions of another frame

 protected:
  void OnAdded(LSVariable& variable, bool replaces) override;

 private:
  class NearestDefinition;
  bool SubstituteOnce(std::string& text) const;

  const size_t m_index;
  IndexSet m_allImports;
  std::vector<std::string_view> m_entered;  // names in the table of all definitions
  std::vector<LSFileFrame*> m_directImports;
  std::vector<LSFileFrame*> m_orderedImports;
  std::map<std::string, std::string, std::less<>> m_substitutions;
};

}  // namespace qrex
