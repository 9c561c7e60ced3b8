// Attribute structs: one unnamed struct per field in a union, whose operators make the field look like a data member
// while every use goes through accessors. They serve the fields of model mixins and the attributes of interface handles
// alike.
#pragma once

#include <string>
#include <string_view>

#include "text/text_writer.h"
#include "translator/declared/class_def.h"
#include "translator/model/field_path.h"
#include "translator/model/type_shape.h"

namespace qrex {

// What generated code goes through to get at a field or an attribute.
enum class Access {
  Struct,      // the field itself, in the struct that holds it
  Barriers,    // the field, behind a read or write barrier
  Operations,  // the genop_ functions of the runtime
  Methods,     // the methods of an interface, which return by value
  GetAndSet    // those two alone, of the whole value
};

class AttributeWriter {
 public:
  // `access`: of the accessors that the operators call.
  AttributeWriter(TextWriter& out, NameSpace& root, Access access) : m_out(out), m_root(root), m_access(access) {}

  void WriteStruct(const std::string& className, TypeView type, const std::string& attributeName,
                   const std::string& accessorName, const std::string& memberName, bool readOnly);

 private:
  // What the operators of one attribute or proxy refer to.
  struct Scope {
    std::string className;
    size_t depth = 0;
    std::string self = {}, constSelf = {};
    std::string attribute = {};
    std::string accessor = {};
    std::string member = {};
    bool inProxy = false;
    bool readOnly = false;
    std::string Key() const { return inProxy ? ParameterName(depth - 1) : std::string(); }
  };

  bool ReturnsByValue() const { return m_access == Access::Methods || m_access == Access::GetAndSet; }
  void WriteOperators(Scope scope, TypeView type);
  void WriteConversions(const Scope& scope, std::string_view type, bool isOffsettable);
  void WriteModel(const Scope& scope, const ClassDef& model);
  void WriteOffset(const Scope& scope, TypeView type, TypeOp op);
  void WritePlain(const Scope& scope, TypeView type, TypeView inner);
  void WriteVector(const Scope& scope, TypeView element);
  void WriteKeySet(const Scope& scope, TypeView key);
  void WriteProxy(const Scope& scope, const TypeShape& shape);

  bool IsForwardedAsWhole(const Undecorated& type) const;
  void WriteForwarders(size_t first, size_t last, TypeView type, const std::string& name, bool readOnly);
  void WriteFieldForwarders(size_t first, size_t last, TypeView type, const std::string& name, bool readOnly);
  void WriteElementForwarders(size_t first, size_t last, const TypeShape& shape, const std::string& name,
                              bool readOnly);
  std::string ForwardedParameters(size_t first, size_t last) const { return m_path.Parameters(first + 1, last + 1); }

  TextWriter& m_out;
  NameSpace& m_root;
  FieldPath m_path;  // indexes and keys only
  const Access m_access;
  const bool m_forwardsAll = m_root.WantsCompilableText();  // to elements of elements, too
};

}  // namespace qrex
