#include "translator/symbols/name_space.h"

#include <algorithm>

#include "lex/token.h"
#include "translator/symbols/position_mark.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

const std::string& NameSpaceElement::GetQualifiedName() const {
  if (m_qualifiedName.empty()) {
    m_qualifiedName = parent && !parent->name.empty() ? parent->GetQualifiedName() + "::" + name : name;
  }
  return m_qualifiedName;
}

bool NameSpaceElement::WantsCompilableText() const { return owner.host.Settings().compilableText; }

void PrintElement(TextWriter& out, const NameSpaceElement& element) {
  out << "$" << element.GetKeyword() << (element.m_exported ? "+ " : " ") << element.GetQualifiedName();
}

std::string PrintedElement(const NameSpaceElement& element) {
  MemoryTextWriter text;
  PrintElement(text, element);
  return text.TakeText();
}

// --- Symbols

void Symbol::Enter(NameSpaceElement& element) {
  if (m_newest) (m_newest->GetDeclStatus() == DeclStatus::Forward ? m_forward : m_declared).push_back(m_newest);
  m_newest = &element;
  m_categories |= 1u << static_cast<unsigned>(element.category);
}

void Symbol::Remove(const NameSpaceElement& element) {
  if (m_newest == &element) {
    m_newest = nullptr;
  } else if (std::erase(m_declared, &element) == 0) {
    std::erase(m_forward, &element);
  }
}

bool Symbol::HasNameSpace(const IndexSet& files) const {
  if (!(m_categories >> static_cast<unsigned>(Category::NameSpace) & 1)) return false;
  auto counts = [&](const NameSpaceElement* element) {
    return element->category == Category::NameSpace && files.Has(element->owner.index);
  };
  return (m_newest && counts(m_newest)) || std::any_of(m_declared.begin(), m_declared.end(), counts);
}

bool Symbol::IsDeclaredIn(const IndexSet& files) const {
  auto counts = [&](const NameSpaceElement* element) { return files.Has(element->owner.index); };
  return (m_newest && counts(m_newest)) || std::any_of(m_declared.begin(), m_declared.end(), counts) ||
         std::any_of(m_forward.begin(), m_forward.end(), counts);
}

namespace {

// Of the declarations of a name that a file sees, the one that counts.
class Choice {
 public:
  Choice(NameSpaceElement* own, const IndexSet& files) : m_files(files), result(own) {}

  void Consider(NameSpaceElement* element) {
    if (!m_files.Has(element->owner.index)) return;
    if (!result) {
      result = element;
      return;
    }
    const DeclStatus a = result->GetDeclStatus();
    const DeclStatus b = element->GetDeclStatus();
    if (result->category != element->category || (a != DeclStatus::Forward && a == b)) {
      throw LexScannerException("Ambiguous identifier : " + result->name, nullptr);
    }
    if (b > a) result = element;
  }

 private:
  const IndexSet& m_files;

 public:
  NameSpaceElement* result;
};

}  // namespace

NameSpaceElement* Symbol::Choose(NameSpaceElement* own, const IndexSet& files) const {
  Choice choice(own, files);
  for (NameSpaceElement* element : m_declared) choice.Consider(element);
  if (m_newest) choice.Consider(m_newest);
  const bool mayDiffer = (m_categories & (m_categories - 1)) != 0;
  for (NameSpaceElement* element : m_forward) {
    if (choice.result && !mayDiffer) break;
    choice.Consider(element);
  }
  return choice.result;
}

NameSpaceElement* Symbol::ChooseInOrder(NameSpaceElement* own, const IndexSet& files) const {
  std::vector<NameSpaceElement*> met;
  const auto meet = [&](NameSpaceElement* element) {
    if (element->owner.place != 0) met.push_back(element);
  };
  std::for_each(m_declared.begin(), m_declared.end(), meet);
  std::for_each(m_forward.begin(), m_forward.end(), meet);
  if (m_newest) meet(m_newest);
  std::sort(met.begin(), met.end(), [](auto* a, auto* b) { return a->owner.place < b->owner.place; });
  NameSpaceElement* const newest = met.empty() ? nullptr : met.back();
  if (newest) met.pop_back();
  Choice choice(own, files);
  const auto considerAll = [&](bool forward) {
    for (NameSpaceElement* element : met) {
      if ((element->GetDeclStatus() == DeclStatus::Forward) == forward) choice.Consider(element);
    }
  };
  considerAll(false);
  if (newest) choice.Consider(newest);
  considerAll(true);
  return choice.result;
}

void SymbolIndex::Leave(const std::string& key, const NameSpaceElement& element) {
  const auto found = m_symbols.find(key);
  if (found == m_symbols.end()) return;
  found->second.Remove(element);
  if (found->second.Empty()) m_symbols.erase(found);
}

const Symbol* SymbolIndex::Find(std::string_view key) const {
  auto found = m_symbols.find(key);
  return found == m_symbols.end() ? nullptr : &found->second;
}

// --- Name spaces

NameSpace::NameSpace(ScannedFile& owner, NameSpace* parent, std::string name)
    : NameSpaceElement(owner, nullptr, DeclKind::NameSpace),
      m_keyPrefix(parent ? parent->m_keyPrefix + name + "::" : std::string()) {
  this->name = std::move(name);
  this->parent = parent;
  status = DeclStatus::Defined;
}

bool NameSpace::HaveSomethingToRegister() const {
  return std::any_of(m_elements.begin(), m_elements.end(),
                     [](const auto& entry) { return entry.second->HaveSomethingToRegister(); });
}

void NameSpace::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  for (const auto& [elementName, element] : m_elements) {
    if (owner.HasLineDirectives()) out << PositionMark(element->position);
    element->WriteReflection(out, lists);
  }
}

const Symbol* NameSpace::FindSymbol(std::string_view elementName) const {
  const SymbolIndex& symbols = owner.host.Symbols();
  return IsRoot() ? symbols.Find(elementName) : symbols.Find(m_keyPrefix + std::string(elementName));
}

NameSpaceElement* NameSpace::LookupLocal(std::string_view elementName) {
  auto found = m_elements.find(elementName);
  if (found != m_elements.end()) return found->second.get();
  // A name space that an import opened is visible here as well; our part of it is created on first use.
  const Symbol* symbol = FindSymbol(elementName);
  return symbol && symbol->HasNameSpace(owner.mounted) ? FindOrCreateNameSpace(elementName) : nullptr;
}

NameSpaceElement* NameSpace::Lookup(std::string_view elementName) {
  NameSpaceElement* own = LookupLocal(elementName);
  if (own && own->category == Category::NameSpace) return own;
  const Symbol* symbol = FindSymbol(elementName);
  if (!symbol) return own;
  const bool inOrder = owner.host.Symbols().IsFirstPass();
  return inOrder ? symbol->Choose(own, owner.mounted) : symbol->ChooseInOrder(own, owner.mounted);
}

NameSpaceElement* NameSpace::LookupPath(std::string_view path) {
  NameSpace* scope = this;
  for (size_t colons; (colons = path.find("::")) != std::string_view::npos; path.remove_prefix(colons + 2)) {
    NameSpaceElement* element = scope->LookupLocal(path.substr(0, colons));
    if (!element || element->category != Category::NameSpace) return nullptr;
    scope = static_cast<NameSpace*>(element);
  }
  return scope->Lookup(path);
}

bool NameSpace::Sees(std::string_view elementName) const {
  if (m_elements.contains(elementName)) return true;
  const Symbol* symbol = FindSymbol(elementName);
  return symbol && symbol->IsDeclaredIn(owner.mounted);
}

NameSpace* NameSpace::FindOrCreateNameSpace(std::string_view elementName) {
  auto found = m_elements.find(elementName);
  if (found == m_elements.end()) {
    return &static_cast<NameSpace&>(Add(std::make_unique<NameSpace>(owner, this, std::string(elementName))));
  }
  return found->second->category == Category::NameSpace ? static_cast<NameSpace*>(found->second.get()) : nullptr;
}

NameSpaceElement& NameSpace::Add(std::unique_ptr<NameSpaceElement> element) {
  element->parent = this;
  NameSpaceElement& added = *element;
  std::unique_ptr<NameSpaceElement>& slot = m_elements[added.name];
  Symbol& symbol = owner.host.Symbols().Enter(m_keyPrefix + added.name);
  if (slot) {
    symbol.Remove(*slot);
    m_replaced.push_back(std::move(slot));
  }
  slot = std::move(element);
  symbol.Enter(added);
  return added;
}

// Replaced elements left when they were replaced, but not what a name space among them holds.
void NameSpace::LeaveIndex() {
  SymbolIndex& symbols = owner.host.Symbols();
  const auto leaveWithin = [](NameSpaceElement& element) {
    if (element.category == Category::NameSpace) static_cast<NameSpace&>(element).LeaveIndex();
  };
  for (const auto& [elementName, element] : m_elements) {
    symbols.Leave(m_keyPrefix + elementName, *element);
    leaveWithin(*element);
  }
  for (const auto& element : m_replaced) leaveWithin(*element);
}

}  // namespace qrex
