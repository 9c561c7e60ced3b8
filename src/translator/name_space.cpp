#include "translator/name_space.h"

#include <algorithm>
#include <unordered_set>

#include "lex/token.h"
#include "translator/scanned_file.h"

namespace qrex {

const std::string& NameSpaceElement::GetQualifiedName() const {
  if (m_qualifiedName.empty()) {
    m_qualifiedName = parent && !parent->name.empty() ? parent->GetQualifiedName() + "::" + name : name;
  }
  return m_qualifiedName;
}

void PrintElement(TextWriter& out, const NameSpaceElement& element) {
  out << "$" << element.GetKeyword() << (element.m_exported ? "+ " : " ") << element.GetQualifiedName();
}

std::string PrintedElement(const NameSpaceElement& element) {
  MemoryTextWriter text;
  PrintElement(text, element);
  return text.TakeText();
}

void SymbolIndex::Enter(const std::string& qualifiedName, NameSpaceElement& element) {
  m_elements[qualifiedName].push_back(&element);
}

void SymbolIndex::Remove(const std::string& qualifiedName, const NameSpaceElement& element) {
  auto found = m_elements.find(qualifiedName);
  if (found != m_elements.end()) std::erase(found->second, &element);
}

const std::vector<NameSpaceElement*>* SymbolIndex::Find(const std::string& qualifiedName) const {
  auto found = m_elements.find(qualifiedName);
  return found == m_elements.end() ? nullptr : &found->second;
}

namespace {

// The files that `file` sees, in order of first import, as far as they stand in `candidates`' owners: only needed where
// several of them declare one name, so the walk over the imports is not made for each look-up.
class ImportOrder {
 public:
  explicit ImportOrder(const ScannedFile& file) { Visit(file); }
  size_t Of(const ScannedFile& file) const {
    auto found = m_order.find(&file);
    return found == m_order.end() ? m_order.size() : found->second;
  }

 private:
  void Visit(const ScannedFile& root) {
    std::vector<const ScannedFile*> pending(root.imports.rbegin(), root.imports.rend());
    while (!pending.empty()) {
      const ScannedFile* file = pending.back();
      pending.pop_back();
      if (!m_order.emplace(file, m_order.size()).second) continue;
      pending.insert(pending.end(), file->imports.rbegin(), file->imports.rend());
    }
  }
  std::unordered_map<const ScannedFile*, size_t> m_order;
};

}  // namespace

NameSpace::NameSpace(ScannedFile& owner, NameSpace* parent, std::string name)
    : NameSpaceElement(owner, nullptr, Category::NameSpace) {
  this->name = std::move(name);
  this->parent = parent;
  status = DeclStatus::Defined;
}

NameSpace::~NameSpace() = default;

std::string NameSpace::KeyOf(std::string_view elementName) const {
  std::string key = GetQualifiedName();
  if (!IsRoot()) key += "::";
  return key.append(elementName);
}

bool NameSpace::HaveSomethingToRegister() const {
  return std::any_of(m_elements.begin(), m_elements.end(),
                     [](const auto& entry) { return entry.second->HaveSomethingToRegister(); });
}

void NameSpace::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  for (const auto& [elementName, element] : m_elements) element->WriteReflection(out, lists);
}

NameSpaceElement* NameSpace::LookupLocal(std::string_view elementName) {
  auto found = m_elements.find(elementName);
  if (found != m_elements.end()) return found->second.get();
  // A name space that an import opened stands here as well. It is made when first asked for.
  const auto* candidates = owner.host.Symbols().Find(KeyOf(elementName));
  if (!candidates) return nullptr;
  for (const NameSpaceElement* candidate : *candidates) {
    if (candidate->category == Category::NameSpace && owner.mounted.Has(candidate->owner.index)) {
      return FindOrCreateNameSpace(elementName);
    }
  }
  return nullptr;
}

NameSpaceElement* NameSpace::Lookup(std::string_view elementName) {
  NameSpaceElement* result = LookupLocal(elementName);
  if (result && result->category == Category::NameSpace) return result;
  const auto* all = owner.host.Symbols().Find(KeyOf(elementName));
  if (!all) return result;

  std::vector<NameSpaceElement*> mounted;
  for (NameSpaceElement* element : *all) {
    if (owner.mounted.Has(element->owner.index)) mounted.push_back(element);
  }
  if (mounted.size() > 1) {
    ImportOrder order(owner);
    std::stable_sort(mounted.begin(), mounted.end(), [&](const NameSpaceElement* a, const NameSpaceElement* b) {
      return order.Of(a->owner) < order.Of(b->owner);
    });
  }
  for (NameSpaceElement* element : mounted) {
    if (!result) {
      result = element;
      continue;
    }
    DeclStatus a = result->GetDeclStatus();
    DeclStatus b = element->GetDeclStatus();
    if (result->category != element->category || (a != DeclStatus::Forward && a == b)) {
      throw LexScannerException("Ambiguous identifier : " + std::string(elementName), nullptr);
    }
    if (b > a) result = element;
  }
  return result;
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
  const std::string key = KeyOf(added.name);
  std::unique_ptr<NameSpaceElement>& slot = m_elements[added.name];
  SymbolIndex& symbols = owner.host.Symbols();
  if (slot) {
    symbols.Remove(key, *slot);
    m_replaced.push_back(std::move(slot));
  }
  slot = std::move(element);
  symbols.Enter(key, added);
  return added;
}

}  // namespace qrex
