#include "questions/declarations.h"

#include <algorithm>
#include <tuple>

namespace qrex {

namespace {

void Add(const NameSpaceElement& element, std::vector<Declared>& out);

void AddAll(const NameSpace& nameSpace, std::vector<Declared>& out) {
  for (const auto& [name, element] : nameSpace.Elements()) Add(*element, out);
  for (const auto& element : nameSpace.Replaced()) Add(*element, out);
}

void Add(const NameSpaceElement& element, std::vector<Declared>& out) {
  if (element.category == Category::NameSpace) return AddAll(static_cast<const NameSpace&>(element), out);
  // The declaration of a function has what its definition does not repeat.
  if (element.status == DeclStatus::Forward && element.category != Category::GlobalFunction) return;
  Declared declared{&element, {}};
  element.owner.host.FindSourcePlace(element.position, declared.place);
  out.push_back(std::move(declared));
}

// What a macro of another file gives stands in that one, and goes behind the others.
void Sort(std::vector<Declared>& all, const ScannedFile& file) {
  const std::string own = file.SourcePath();
  const auto key = [&own](const Declared& declared) {
    return std::tuple(declared.place.file != own, std::string_view(declared.place.file), declared.place.begin);
  };
  std::stable_sort(all.begin(), all.end(), [&](const Declared& a, const Declared& b) { return key(a) < key(b); });
}

}  // namespace

std::vector<Declared> DeclarationsOf(const ScannedFile& file) {
  std::vector<Declared> all;
  if (!file.rootNameSpace) return all;  // it was copied
  AddAll(*file.rootNameSpace, all);
  Sort(all, file);
  return all;
}

std::vector<Declared> NestedDeclarationsOf(const ClassDef& def) {
  std::vector<Declared> all;
  for (const auto& element : def.m_ownedElements) Add(*element, all);
  Sort(all, def.owner);
  return all;
}

}  // namespace qrex
