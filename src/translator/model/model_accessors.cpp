#include "translator/model/model_accessors.h"

#include "translator/emit/emit.h"
#include "translator/model/attribute_struct.h"
#include "translator/model/field_path.h"
#include "translator/model/type_shape.h"
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

  void WriteAll() {
    for (size_t i = 0; i < m_model.m_modelFields.size(); ++i) {
      const ModelField& field = *m_model.m_modelFields[i];
      if (field.IsDropped()) continue;
      WriteField(PathElement::Constant(i), field.m_type, field.m_name,
                 (m_access == Access::Struct ? "" : "_model_.") + field.m_name);
    }
  }

 private:
  void WriteField(PathElement element, TypeView type, const std::string& name, const std::string& expression);
  void WriteWriting(TypeView type, const std::string& name, const std::string& expression);
  void WriteByType(TypeView type, const std::string& name, const std::string& expression);
  void WritePathFunctions(const std::string& name);
  void WriteSet(TypeView type, const std::string& name, const std::string& expression);
  void WriteOffset(TypeView type, const std::string& name, const std::string& expression);
  void WriteVector(TypeView element, const std::string& name, const std::string& expression);
  void WriteKeySet(TypeView key, const std::string& name, const std::string& expression);

  std::string PathCall(const std::string& name) const { return "Get" + name + "Path(" + m_path.Arguments() + ")"; }
  // Statements, each with what must be ahead of it.
  void WriteReadBarrier(const std::string& name, const std::string& expression);
  void WriteWriteBarrier(const std::string& expression);
  void WriteOperation(std::string_view function, const std::string& name, const std::string& expression,
                      std::string_view arguments);

  std::string_view AssignOperation(TypeView type) const;
  // "genop_XMVector" and the like: by what the elements hold.
  std::string VectorOperation(std::string_view verb, TypeView element) const;
  bool IsMovable(TypeView type) const { return WithoutDecorators(type, m_root).Has(kHasMovable); }

  TextWriter& m_out;
  const ClassDef& m_model;
  NameSpace& m_root;
  FieldPath m_path;
  const Access m_access;
  const bool m_implementsIObject;
  const bool m_allAreWritten = m_root.WantsCompilableText();  // attribute structs have write() for containers, too
};

void AccessorWriter::WriteReadBarrier(const std::string& name, const std::string& expression) {
  if (m_access == Access::Struct) return;
  if (m_access == Access::Operations) {
    Write(m_out, "vesk::IndepFieldReadBarrier($object$,Get$name$Path($arguments$)); ", "object"_ = kConstFinal,
          "name"_ = name, "arguments"_ = m_path.Arguments());
    return;
  }
  Write(m_out, R"(vesk::DataSourceReadBarrier(&$expression$,$object$,"$model$::$expression$"); )",
        "expression"_ = expression, "object"_ = m_implementsIObject ? kConstFinal : "vesk::null",
        "model"_ = m_model.name);
}

void AccessorWriter::WriteWriteBarrier(const std::string& expression) {
  if (m_access != Access::Barriers) return;
  Write(m_out, R"(vesk::DataSourceWriteBarrier(&$expression$,$object$,"$model$::$expression$"); )",
        "expression"_ = expression, "object"_ = m_implementsIObject ? kFinal : "vesk::null", "model"_ = m_model.name);
}

void AccessorWriter::WriteOperation(std::string_view function, const std::string& name, const std::string& expression,
                                    std::string_view arguments) {
  Write(m_out, "vesk::$function$($object$,Get$name$Path($path$),$expression$,$arguments$);", "function"_ = function,
        "object"_ = kFinal, "name"_ = name, "path"_ = m_path.Arguments(), "expression"_ = expression,
        "arguments"_ = arguments);
}

void AccessorWriter::WritePathFunctions(const std::string& name) {
  const std::string parameters = m_path.Parameters();
  Write(m_out, R"(
    static void Get$name$Path(vesk::Path& _path$further$) { $body$}
    static vesk::Path Get$name$Path($parameters$) { vesk::Path _path; Get$name$Path($pathAndArguments$); return _path; }
  )",
        "name"_ = name, "further"_ = parameters.empty() ? "" : "," + parameters,
        "body"_([&] { m_path.WriteBody(m_out); }), "parameters"_ = parameters,
        "pathAndArguments"_ = parameters.empty() ? "_path" : "_path," + m_path.Arguments());
}

void AccessorWriter::WriteField(PathElement element, TypeView type, const std::string& name,
                                const std::string& expression) {
  m_path.Push(std::move(element));
  m_out << "\n";
  WritePathFunctions(name);
  Write(m_out, R"(
    $type$ const& _model__$name$($parameters$) const { return $expression$; }
    $type$& _model__$name$($parameters$) { return $expression$; }
    $type$ const& Get$name$($parameters$) const { $barrier$return $expression$; }
  )",
        "type"_ = TypeText(type), "name"_ = name, "parameters"_ = m_path.Parameters(), "expression"_ = expression,
        "barrier"_([&] { WriteReadBarrier(name, expression); }));
  if (m_allAreWritten) WriteWriting(type, name, expression);
  WriteByType(type, name, expression);
  m_path.Pop();
}

void AccessorWriter::WriteByType(TypeView type, const std::string& name, const std::string& expression) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  if (undecorated.Has(kHasAssignable)) return WriteSet(type, name, expression);
  if (undecorated.Has(kHasOffsettable)) return WriteOffset(type, name, expression);
  const TypeShape shape = ShapeOf(undecorated.type, m_root);
  switch (shape.shape) {
    case Shape::Value:
      return WriteSet(type, name, expression);
    case Shape::Model:
      for (size_t i = 0; i < shape.model->m_modelFields.size(); ++i) {
        const ModelField& field = *shape.model->m_modelFields[i];
        if (field.IsDropped()) continue;
        WriteField(PathElement::Constant(i), field.m_type, name + field.m_name, expression + "." + field.m_name);
      }
      return;
    case Shape::Vector:
      return WriteVector(shape.element, name, expression);
    case Shape::Indexed:
      return WriteField(shape.Step(), shape.element, name + "Element",
                        expression + "[" + ParameterName(m_path.ParameterCount()) + "]");
    case Shape::KeySet:
      return WriteKeySet(shape.element, name, expression);
  }
}

std::string_view AccessorWriter::AssignOperation(TypeView type) const {
  if (IsMovable(type)) return "genop_AssignPref";
  return NeedsVisitPrefs(type, m_root) ? "genop_Assign_VisitPrefs" : "genop_Assign";
}

std::string AccessorWriter::VectorOperation(std::string_view verb, TypeView element) const {
  const std::string function = "genop_" + std::string(verb);
  if (IsMovable(element)) return function + "MVector";
  return function + (NeedsVisitPrefs(element, m_root) ? "Vector_VisitPrefs" : "Vector");
}

void AccessorWriter::WriteWriting(TypeView type, const std::string& name, const std::string& expression) {
  if (m_access == Access::Operations) return;
  Write(m_out, "$type$& Write$name$($parameters$) { $barrier$ return $expression$; }\n", "type"_ = type, "name"_ = name,
        "parameters"_ = m_path.Parameters(), "barrier"_([&] { WriteWriteBarrier(expression); }),
        "expression"_ = expression);
}

void AccessorWriter::WriteSet(TypeView type, const std::string& name, const std::string& expression) {
  if (!m_allAreWritten) WriteWriting(type, name, expression);
  auto writeAssignment = [&] {
    if (m_access == Access::Operations) return WriteOperation(AssignOperation(type), name, expression, "_v");
    Write(m_out, "$barrier$$expression$ = _v;", "barrier"_([&] { WriteWriteBarrier(expression); }),
          "expression"_ = expression);
  };
  Write(m_out, "void Set$name$($parameters$$value$) { $assignment$ }\n", "name"_ = name,
        "parameters"_ = WithComma(m_path.Parameters()), "value"_ = ConstReferenceText(type, "_v"),
        "assignment"_ = writeAssignment);
}

void AccessorWriter::WriteOffset(TypeView type, const std::string& name, const std::string& expression) {
  auto writeAddition = [&] {
    if (m_access == Access::Operations) return WriteOperation("genop_OffsetValue", name, expression, "_v");
    Write(m_out, "$barrier$$expression$ += _v;", "barrier"_([&] { WriteWriteBarrier(expression); }),
          "expression"_ = expression);
  };
  Write(m_out, "void Offset$name$($parameters$$value$) { $addition$ }\n", "name"_ = name,
        "parameters"_ = WithComma(m_path.Parameters()), "value"_ = ConstReferenceText(type, "_v"),
        "addition"_ = writeAddition);
}

void AccessorWriter::WriteVector(TypeView element, const std::string& name, const std::string& expression) {
  auto writeBarrier = [&] { WriteWriteBarrier(expression); };
  auto writeInsertion = [&] {
    if (m_access == Access::Operations) {
      WriteOperation(VectorOperation("CreateInto", element), name, expression, "_i,_src,_n");
    } else {
      Write(m_out, "$barrier$$expression$.insert($expression$.begin()+_i,_src,_src+_n);", "barrier"_ = writeBarrier,
            "expression"_ = expression);
    }
    m_out << "\n";
  };
  auto writeErasure = [&] {
    if (m_access == Access::Operations) {
      WriteOperation(VectorOperation("DeleteFrom", element), name, expression, "_i1,_i2");
    } else {
      Write(m_out, "$barrier$$expression$.erase(_i1,_i2-_i1);", "barrier"_ = writeBarrier, "expression"_ = expression);
    }
    m_out << "\n";
  };
  Write(m_out, R"(
    void CreateInto$name$($parameters$vesk::ssize_t _i,$element$ const* _src,vesk::ssize_t _n)
    {
        $insertion$
    }
    void DeleteFrom$name$($parameters$vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        $erasure$
    }
  )",
        "name"_ = name, "parameters"_ = WithComma(m_path.Parameters()), "element"_ = element,
        "insertion"_ = writeInsertion, "erasure"_ = writeErasure);
}

void AccessorWriter::WriteKeySet(TypeView key, const std::string& name, const std::string& expression) {
  if (IsMovable(key) && m_access == Access::Operations) {
    for (std::string_view verb : {"InsertInto", "DeleteFrom"}) {
      auto writeOperation = [&] { WriteOperation("genop_" + std::string(verb) + "MSet", name, expression, "_v"); };
      Write(m_out, "bool $verb$$name$($parameters$$key$ const& _v) { return $operation$ }\n", "verb"_ = verb,
            "name"_ = name, "parameters"_ = WithComma(m_path.Parameters()), "key"_ = key,
            "operation"_ = writeOperation);
    }
    return;
  }
  const std::string index = ParameterName(m_path.ParameterCount());
  const std::string element = name + "Element";
  m_path.Push(PathElement::Key(key));
  WritePathFunctions(element);
  auto write = [&](std::string_view verb, std::string_view operation, std::string_view member) {
    auto writeReturn = [&] {
      if (m_access == Access::Operations) {
        m_out << "return ";
        return WriteOperation(operation, element, expression, index);
      }
      Write(m_out, "$barrier$return $expression$.$member$($index$);",
            "barrier"_([&] { WriteWriteBarrier(expression); }), "expression"_ = expression, "member"_ = member,
            "index"_ = index);
    };
    Write(m_out, "bool $verb$$name$($parameters$) { $return$ }\n", "verb"_ = verb, "name"_ = name,
          "parameters"_ = m_path.Parameters(), "return"_ = writeReturn);
  };
  write("InsertInto", "genop_SetInsert", "Insert");
  write("DeleteFrom", "genop_SetDelete", "Delete");
  m_path.Pop();
}

}  // namespace

void WriteModelStructAccessors(TextWriter& out, const ClassDef& def) {
  AccessorWriter(out, def, Access::Struct, def.m_implementsIObject).WriteAll();
}

void WriteModelMixinAccessors(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access) {
  AccessorWriter(out, model, access, def.m_implementsIObject).WriteAll();
}

void WriteModelMixinAttributeStructs(TextWriter& out, const ClassDef& def, const ClassDef& model, Access access) {
  for (const ModelField* field : model.m_modelFields) {
    if (field->IsDropped()) continue;
    AttributeWriter writer(out, *model.owner.rootNameSpace, access);
    writer.WriteStruct(def.name + "_model_mixin", field->m_type, field->m_name, field->m_name, field->m_name, false);
  }
}

}  // namespace qrex
