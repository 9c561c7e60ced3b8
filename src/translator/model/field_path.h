// The way from a model to a field, as generated accessors build it: a byte-encoded vesk::Path of constant steps (a
// field's position), integer indexes and keys. Indexes and keys are parameters of the accessor, named _k0, _k1, ... in
// their order.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "translator/symbols/name_space.h"
#include "translator/types/type_view.h"

namespace qrex {

struct PathElement {
  enum class Kind { Constant, Index, Key };
  Kind kind;
  int64_t value = -1;  // Constant: the position among the model's fields; Index: the bound, -1 for none
  TypeCode key;

  static PathElement Constant(size_t position) { return {Kind::Constant, static_cast<int64_t>(position), {}}; }
  static PathElement Index(int64_t bound) { return {Kind::Index, bound, {}}; }
  static PathElement Key(TypeView type) { return {Kind::Key, -1, TypeCode(type.Code())}; }
};

class FieldPath {
 public:
  void Push(PathElement element) { m_elements.push_back(std::move(element)); }
  void Pop() { m_elements.pop_back(); }
  size_t ParameterCount() const;  // of indexes and keys

  // "T const& _k0,vesk::ssize_t _k1": the parameters from number `first` up to, not including, `last`.
  std::string Parameters(size_t first, size_t last) const;
  std::string Parameters() const { return Parameters(0, ParameterCount()); }
  static std::string Arguments(size_t first, size_t last);  // "_k0,_k1"
  std::string Arguments() const { return Arguments(0, ParameterCount()); }

  // The statements that fill `_path`, each followed by a blank.
  void WriteBody(TextWriter& out) const;

 private:
  template <typename Visit>
  void ForEach(Visit visit) const;
  void WriteChecks(TextWriter& out) const;
  void WriteArchiveBody(TextWriter& out) const;
  void WriteReserveBody(TextWriter& out, size_t size) const;
  void WriteInitBody(TextWriter& out, size_t size) const;
  std::vector<PathElement> m_elements;
};

inline std::string ParameterName(size_t number) { return "_k" + std::to_string(number); }
inline std::string WithComma(const std::string& list) { return list.empty() ? list : list + ","; }

}  // namespace qrex
