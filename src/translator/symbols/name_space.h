// The translator's symbol table: what a declared thing knows about itself, and how names resolve across imported files.
//
// A name space's tree is private to its file. Importing a file never copies elements: the imported files become visible
// ("mounted"), and a name space of the same path in several files is searched as one. Because a file may see thousands
// of others, nothing is copied per import either: one SymbolIndex per build lists the declarations of each qualified
// name, and a look-up keeps those whose file is in the asking file's import closure, a bit set. Its cost does not grow
// with the number of files.
#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "text/index_set.h"
#include "text/text_writer.h"
#include "translator/symbols/declaration_kinds.h"

namespace qrex {

class NameSpace;
class ScannedFile;

enum class DeclStatus { Forward, Deferred, Defined };

// The names that a file registers and unregisters, qualified.
struct RegistrationLists {
  std::vector<std::string> registerNames;
  std::vector<std::string> unregisterNames;
};

class NameSpaceElement {
 public:
  NameSpaceElement(ScannedFile& owner, const char* position, DeclKind kind)
      : owner(owner), position(position), kindTraits(TraitsOf(kind)), category(kindTraits.category) {}
  virtual ~NameSpaceElement() = default;
  NameSpaceElement(const NameSpaceElement&) = delete;
  NameSpaceElement& operator=(const NameSpaceElement&) = delete;

  std::string_view GetKeyword() const { return kindTraits.keyword; }           // the word behind `$`
  std::string_view GetReflectedKindName() const { return kindTraits.record; }  // suffix of RegisterReflected
  virtual bool HaveSomethingToRegister() const = 0;
  virtual bool HasRecord() const { return m_reflected; }
  virtual void WriteReflectedDefinition(TextWriter& out) = 0;  // the record
  // The element's text in the reflection tail (emit/records.h).
  virtual void WriteReflection(TextWriter& out, RegistrationLists& lists) = 0;
  DeclStatus GetDeclStatus() const { return status; }
  virtual bool EffectivelyRegistered() const { return m_registered; }
  virtual void CollectReferences(std::vector<const NameSpaceElement*>& out) const = 0;  // appends
  virtual bool ContainsMetaData() const { return !metadata.empty(); }
  virtual void WriteExtraTraits(TextWriter&) const {}  // inside namespace vesk, behind TypeTraits

  const std::string& GetQualifiedName() const;  // a::b::N; a root's elements have their bare name

  bool WantsCompilableText() const;  // where the plain text could not compile

  void ForgetQualifiedName() { m_qualifiedName.clear(); }  // after the name was set late
  void SetExported(bool exported) { m_exported = m_reflected = m_registered = m_strict = exported; }  // what `+` says

  ScannedFile& owner;
  const char* position;  // in the source text
  std::string name;
  std::string metadata;  // an encoded list, often empty
  NameSpace* parent = nullptr;
  const KindTraits& kindTraits;
  const Category category;
  DeclStatus status = DeclStatus::Forward;
  bool m_exported = false;
  bool m_reflected = false;
  bool m_registered = false;
  bool m_strict = false;  // reflected on request, not because a base forces it
  bool m_nested = false;  // declared inside a class: no TypeTraits

 private:
  mutable std::string m_qualifiedName;
};

// All declarations of one name in a build. Forward declarations may occur in hundreds of files and never
// conflict; they are stored separately so that look-ups scan only the few definitions. An element's status changes only
// while its own statement is parsed, so the newest one is filed when the next of its name is entered.
class Symbol {
 public:
  void Enter(NameSpaceElement& element);
  void Remove(const NameSpaceElement& element);
  bool Empty() const { return !m_newest && m_declared.empty() && m_forward.empty(); }
  bool HasNameSpace(const IndexSet& files) const;
  bool IsDeclaredIn(const IndexSet& files) const;
  // The declaration that counts for a file that sees `files` and holds `own` (or null) itself; or null. Throws
  // "Ambiguous identifier : ".
  NameSpaceElement* Choose(NameSpaceElement* own, const IndexSet& files) const;
  // The same where files were translated in several passes: as if all of them had been in this one, as far as it is.
  NameSpaceElement* ChooseInOrder(NameSpaceElement* own, const IndexSet& files) const;

 private:
  std::vector<NameSpaceElement*> m_declared;  // in the order of the build, as the next
  std::vector<NameSpaceElement*> m_forward;
  NameSpaceElement* m_newest = nullptr;
  uint32_t m_categories = 0;  // a bit for each category that was entered
};

// Every declaration of the build, kept by NameSpace::Add. The key is the path of name spaces and the name. It differs
// from the qualified name inside unnamed name spaces: `b` in one of them is not the `b` beside it.
class SymbolIndex {
 public:
  Symbol& Enter(const std::string& key) { return m_symbols[key]; }
  void Leave(const std::string& key, const NameSpaceElement& element);
  const Symbol* Find(std::string_view key) const;  // or null

  // A pass goes through the files of a build in their order, and through what they import ahead of each. Where several
  // declarations of a name are in view, the order of their files counts; a file that is kept from an earlier pass has
  // its place in this one as if it were translated.
  void BeginPass() {
    m_isFirstPass = false;
    m_places = 0;
  }
  bool IsFirstPass() const { return m_isFirstPass; }
  size_t NextPlace() { return ++m_places; }

 private:
  bool m_isFirstPass = true;
  size_t m_places = 0;
  struct Hash {
    using is_transparent = void;
    size_t operator()(std::string_view text) const { return std::hash<std::string_view>()(text); }
  };
  std::unordered_map<std::string, Symbol, Hash, std::equal_to<>> m_symbols;
};

class NameSpace : public NameSpaceElement {
 public:
  NameSpace(ScannedFile& owner, NameSpace* parent, std::string name);  // a root has no parent and an empty name

  bool HaveSomethingToRegister() const override;
  void WriteReflectedDefinition(TextWriter&) override {}
  void WriteReflection(TextWriter& out, RegistrationLists& lists) override;  // each element, in map order
  void CollectReferences(std::vector<const NameSpaceElement*>&) const override {}
  bool ContainsMetaData() const override { return false; }

  NameSpaceElement* LookupLocal(std::string_view name);  // own map, with the name spaces that imports bring
  NameSpaceElement* Lookup(std::string_view name);       // with mounted name spaces; throws "Ambiguous identifier : "
  NameSpaceElement* LookupPath(std::string_view path);   // a::b::c
  bool Sees(std::string_view name) const;                // is anything of that name visible here; never throws
  template <typename T>
  T* LookupKind(std::string_view name, Category kind) {
    NameSpaceElement* element = Lookup(name);
    return element && element->category == kind ? static_cast<T*>(element) : nullptr;
  }
  NameSpace* FindOrCreateNameSpace(std::string_view name);           // null: the name is that of another kind
  NameSpaceElement& Add(std::unique_ptr<NameSpaceElement> element);  // sets `parent`; replaces what the map had
  void LeaveIndex();                                                 // with all elements, ahead of their end
  bool IsRoot() const { return parent == nullptr; }
  bool sharesBrace = false;  // where it was opened last, as `b` of "namespace a::b {"
  bool isInline = false;     // known of C++ of today alone
  bool Empty() const { return m_elements.empty(); }
  const std::map<std::string, std::unique_ptr<NameSpaceElement>, std::less<>>& Elements() const { return m_elements; }
  const std::vector<std::unique_ptr<NameSpaceElement>>& Replaced() const { return m_replaced; }

 private:
  const Symbol* FindSymbol(std::string_view name) const;  // or null
  const std::string m_keyPrefix;  // "a::b::", where an unnamed name space, too, is a part: "::" at file level
  std::map<std::string, std::unique_ptr<NameSpaceElement>, std::less<>> m_elements;
  std::vector<std::unique_ptr<NameSpaceElement>> m_replaced;  // earlier declarations: others may still refer to them
};

// "$", the keyword, "+" if exported, a blank and the qualified name: "$struct+ a::B". The form of all messages.
void PrintElement(TextWriter& out, const NameSpaceElement& element);
std::string PrintedElement(const NameSpaceElement& element);

}  // namespace qrex
