#include "translator/model/model_accessors.h"

#include "translator/emit/emit.h"
#include "translator/model/attribute_struct.h"
#include "translator/model/field_path.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

// One run over a model. Writing accessors either call the genop_ functions of the runtime (operations) or state a
// barrier and touch the field.
class AccessorWriter {
 public:
  AccessorWriter(TextWriter& out, const ClassDef& model, Access access, bool implementsIObject)
      : m_out(out),
        m_model(model),
        m_root(*model.owner.rootNameSpace),
        m_access(access),
        m_implementsIObject(implementsIObject) {}

  void Write() {
    for (size_t i = 0; i < m_model.m_modelFields.size(); ++i) {
      const ModelField& field = *m_model.m_modelFields[i];
      if (field.IsDropped()) continue;
      WriteField(PathElement::Constant(i), field.m_type, field.m_name,
                 (m_access == Access::Struct ? "" : "_model_.") + field.m_name);
    }
  }

 private:
  void WriteField(PathElement element, TypeView type, const std::string& name, const std::string& expression);
  void WriteByType(TypeView type, const std::string& name, const std::string& expression);
  void WritePathFunctions(const std::string& name);
  void WriteSet(TypeView type, const std::string& name, const std::string& expression);
  void WriteOffset(TypeView type, const std::string& name, const std::string& expression);
  void WriteVector(TypeView element, const std::string& name, const std::string& expression);
  void WriteKeySet(TypeView key, const std::string& name, const std::string& expression);

  std::string PathCall(const std::string& name) const { return "Get" + name + "Path(" + m_path.Arguments() + ")"; }
  std::string ReadBarrier(const std::string& name, const std::string& expression) const;
  std::string WriteBarrier(const std::string& expression) const;
  std::string GenopCall(std::string_view function, const std::string& name, const std::string& expression,
                        std::string_view rest) const;
  // "genop_XMVector" and the like: by what the elements hold.
  std::string VectorOperation(std::string_view verb, TypeView element) const;
  bool IsMovable(TypeView type) const { return WithoutDecorators(type, m_root).Has(kHasMovable); }

  TextWriter& m_out;
  const ClassDef& m_model;
  NameSpace& m_root;
  FieldPath m_path;
  const Access m_access;
  const bool m_implementsIObject;
};

constexpr std::string_view kConstFinal = "static_cast<const typename BC::FinalClass*>(this)";
constexpr std::string_view kFinal = "static_cast<typename BC::FinalClass*>(this)";

std::string AccessorWriter::ReadBarrier(const std::string& name, const std::string& expression) const {
  if (m_access == Access::Struct) return {};
  if (m_access == Access::Operations) {
    return "vesk::IndepFieldReadBarrier(" + std::string(kConstFinal) + "," + PathCall(name) + "); ";
  }
  return "vesk::DataSourceReadBarrier(&" + expression + "," +
         std::string(m_implementsIObject ? kConstFinal : "vesk::null") + ",\"" + m_model.name + "::" + expression +
         "\"); ";
}

std::string AccessorWriter::WriteBarrier(const std::string& expression) const {
  if (m_access != Access::Barriers) return {};
  return "vesk::DataSourceWriteBarrier(&" + expression + "," +
         std::string(m_implementsIObject ? kFinal : "vesk::null") + ",\"" + m_model.name + "::" + expression + "\"); ";
}

std::string AccessorWriter::GenopCall(std::string_view function, const std::string& name, const std::string& expression,
                                      std::string_view rest) const {
  return "vesk::" + std::string(function) + "(" + std::string(kFinal) + "," + PathCall(name) + "," + expression +
         std::string(rest);
}

void AccessorWriter::WritePathFunctions(const std::string& name) {
  const std::string parameters = m_path.Parameters();
  const std::string arguments = m_path.Arguments();
  const std::string_view comma = parameters.empty() ? "" : ",";
  m_out << "static void Get" << name << "Path(vesk::Path& _path" << comma << parameters << ") { " << m_path.Body()
        << "}\n";
  m_out << "static vesk::Path Get" << name << "Path(" << parameters << ") { vesk::Path _path; Get" << name
        << "Path(_path" << comma << arguments << "); return _path; }\n";
}

void AccessorWriter::WriteField(PathElement element, TypeView type, const std::string& name,
                                const std::string& expression) {
  m_path.Push(std::move(element));
  m_out << "\n";
  WritePathFunctions(name);
  WriteText(m_out,
            "$0 const& _model__$1($2) const { return $3; }\n"
            "$0& _model__$1($2) { return $3; }\n"
            "$0 const& Get$1($2) const { $4return $3; }\n",
            {TypeText(type), name, m_path.Parameters(), expression, ReadBarrier(name, expression)});
  WriteByType(type, name, expression);
  m_path.Pop();
}

void AccessorWriter::WriteByType(TypeView type, const std::string& name, const std::string& expression) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  auto writeElement = [&](PathElement element, TypeView elementType) {
    const std::string index = ParameterName(m_path.ParameterCount());
    WriteField(std::move(element), elementType, name + "Element", expression + "[" + index + "]");
  };
  if (undecorated.Has(kHasAssignable)) return WriteSet(type, name, expression);
  if (undecorated.Has(kHasOffsettable)) return WriteOffset(type, name, expression);
  if (const ClassDef* model = ModelOfType(inner, m_root)) {
    for (size_t i = 0; i < model->m_modelFields.size(); ++i) {
      const ModelField& field = *model->m_modelFields[i];
      if (field.IsDropped()) continue;
      WriteField(PathElement::Constant(i), field.m_type, name + field.m_name, expression + "." + field.m_name);
    }
    return;
  }
  if (IsVectorLike(inner)) {
    const TypeCode element = VectorElement(inner);
    return WriteVector(element, name, expression);
  }
  switch (inner.Op()) {
    case kOpArray:
      return writeElement(PathElement::Index(inner.Count()), inner.Inner());
    case kOpDynArray:
      return writeElement(PathElement::Index(-1), inner.Inner());
    case kOpMap:
      return writeElement(PathElement::Key(inner.Key()), inner.Value());
    case kOpSet:
      return WriteKeySet(inner.Inner(), name, expression);
    default:
      return WriteSet(type, name, expression);
  }
}

void AccessorWriter::WriteSet(TypeView type, const std::string& name, const std::string& expression) {
  const std::string parameters = m_path.Parameters();
  if (m_access != Access::Operations) {
    WriteText(m_out, "$0& Write$1($2) { $3 return $4; }\n",
              {TypeText(type), name, parameters, WriteBarrier(expression), expression});
  }
  m_out << "void Set" << name << "(" << WithComma(parameters) << ConstReferenceText(type, "_v") << ") { ";
  if (m_access == Access::Operations) {
    const std::string_view function = IsMovable(type)                 ? "genop_AssignPref"
                                      : NeedsVisitPrefs(type, m_root) ? "genop_Assign_VisitPrefs"
                                                                      : "genop_Assign";
    m_out << GenopCall(function, name, expression, ",_v);");
  } else {
    m_out << WriteBarrier(expression) << expression << " = _v;";
  }
  m_out << " }\n";
}

void AccessorWriter::WriteOffset(TypeView type, const std::string& name, const std::string& expression) {
  m_out << "void Offset" << name << "(" << WithComma(m_path.Parameters()) << ConstReferenceText(type, "_v") << ") { ";
  if (m_access == Access::Operations) {
    m_out << GenopCall("genop_OffsetValue", name, expression, ",_v);");
  } else {
    m_out << WriteBarrier(expression) << expression << " += _v;";
  }
  m_out << " }\n";
}

std::string AccessorWriter::VectorOperation(std::string_view verb, TypeView element) const {
  const std::string function = "genop_" + std::string(verb);
  if (IsMovable(element)) return function + "MVector";
  return function + (NeedsVisitPrefs(element, m_root) ? "Vector_VisitPrefs" : "Vector");
}

void AccessorWriter::WriteVector(TypeView element, const std::string& name, const std::string& expression) {
  const std::string parameters = WithComma(m_path.Parameters());
  WriteText(m_out, "void CreateInto$0($1vesk::ssize_t _i,$2 const* _src,vesk::ssize_t _n)\n",
            {name, parameters, TypeText(element)});
  {
    Block body(m_out);
    if (m_access == Access::Operations) {
      m_out << GenopCall(VectorOperation("CreateInto", element), name, expression, ",_i,_src,_n);\n");
    } else {
      WriteText(m_out, "$0$1.insert($1.begin()+_i,_src,_src+_n);\n", {WriteBarrier(expression), expression});
    }
  }
  WriteText(m_out, "void DeleteFrom$0($1vesk::ssize_t _i1,vesk::ssize_t _i2)\n", {name, parameters});
  Block body(m_out);
  if (m_access == Access::Operations) {
    m_out << GenopCall(VectorOperation("DeleteFrom", element), name, expression, ",_i1,_i2);\n");
  } else {
    WriteText(m_out, "$0$1.erase(_i1,_i2-_i1);\n", {WriteBarrier(expression), expression});
  }
}

void AccessorWriter::WriteKeySet(TypeView key, const std::string& name, const std::string& expression) {
  if (IsMovable(key) && m_access == Access::Operations) {
    const std::string parameters = WithComma(m_path.Parameters());
    for (std::string_view verb : {"InsertInto", "DeleteFrom"}) {
      WriteText(m_out, "bool $0$1($2$3 const& _v) { return $4 }\n",
                {verb, name, parameters, TypeText(key),
                 GenopCall("genop_" + std::string(verb) + "MSet", name, expression, ",_v);")});
    }
    return;
  }
  const std::string index = ParameterName(m_path.ParameterCount());
  const std::string element = name + "Element";
  m_path.Push(PathElement::Key(key));
  WritePathFunctions(element);
  auto write = [&](std::string_view verb, std::string_view operation, std::string_view member) {
    WriteText(m_out, "bool $0$1($2) { ", {verb, name, m_path.Parameters()});
    if (m_access == Access::Operations) {
      m_out << "return " << GenopCall(operation, element, expression, "," + index + ");");
    } else {
      WriteText(m_out, "$0return $1.$2($3);", {WriteBarrier(expression), expression, member, index});
    }
    m_out << " }\n";
  };
  write("InsertInto", "genop_SetInsert", "Insert");
  write("DeleteFrom", "genop_SetDelete", "Delete");
  m_path.Pop();
}

}  // namespace

void WriteModelStructAccessors(TextWriter& out, const ClassDef& def) {
  AccessorWriter(out, def, Access::Struct, def.m_implementsIObject).Write();
}

void WriteModelMixinAccessors(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access) {
  AccessorWriter(out, model, access, def.m_implementsIObject).Write();
}

void WriteModelMixinAttributeStructs(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access) {
  for (const ModelField* field : model.m_modelFields) {
    if (field->IsDropped()) continue;
    AttributeWriter writer(out, *model.owner.rootNameSpace, access);
    writer.WriteStruct(def.name + "_model_mixin", field->m_type, field->m_name, field->m_name, field->m_name, false);
  }
}

}  // namespace qrex
