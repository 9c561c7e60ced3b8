#include "translator/model/attribute_struct.h"

#include "translator/emit/emit.h"

namespace qrex {

namespace {

// The negation of an unsigned value happens in the signed type of its width.
std::string_view NegationCast(TypeOp op) {
  switch (op) {
    case kOpUInt8:
      return "(vesk::int8)";
    case kOpUInt16:
      return "(vesk::int16)";
    case kOpUInt32:
      return "(vesk::int32)";
    case kOpUInt64:
      return "(vesk::int64)";
    default:
      return "";
  }
}

// Element types whose operators inside a proxy call accessors that the proxy must forward.
bool NeedsForwarders(TypeOp op) {
  return op == kOpString8 || op == kOpString16 || op == kOpClass || op == kOpVector || op == kOpDynArray ||
         op == kOpArray || op == kOpMap;
}

bool IsForwardedScalar(TypeOp op) {
  return op <= kOpChar16 || op == kOpEnum || op == kOpVariant || op == kOpPtr || op == kOpPref || op == kOpCref;
}

}  // namespace

bool IsVectorLike(TypeView type) {
  return type.Op() == kOpVector || type.Op() == kOpString8 || type.Op() == kOpString16;
}

TypeCode VectorElement(TypeView type) {
  if (type.Op() == kOpVector) return TypeCode(type.Inner().Code());
  TypeCode element;
  AppendOp(element, type.Op() == kOpString8 ? kOpChar8 : kOpChar16);
  return element;
}

const ClassDef* ModelOfType(TypeView type, NameSpace& root) {
  if (type.Op() != kOpClass) return nullptr;
  const auto* element = NamedElement(type, root);
  if (!element || element->category != Category::Class) return nullptr;
  const auto* def = static_cast<const ClassDef*>(element);
  return def->IsPureModel() ? def : nullptr;
}

void AttributeWriter::WriteStruct(const std::string& className, TypeView type, const std::string& attributeName,
                                  const std::string& accessorName, const std::string& memberName, bool readOnly) {
  const std::string arguments = "(" + className + "," + attributeName + ")";
  m_out << "struct\n{\n";
  {
    IndentScope indent(m_out, 4);
    WriteOperators({.className = className,
                    .self = "ATTRIB_CAST" + arguments,
                    .constSelf = "CONST_ATTRIB_CAST" + arguments,
                    .attribute = attributeName,
                    .accessor = accessorName,
                    .member = memberName,
                    .readOnly = readOnly},
                   type);
  }
  m_out << "} " << memberName << ";\n";
}

void AttributeWriter::WriteOperators(Scope scope, TypeView type) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  const TypeOp op = inner.Op();
  scope.readOnly = scope.readOnly || undecorated.Has(kHasConst);
  WriteConversions(scope, TypeText(type), undecorated.Has(kHasOffsettable));

  if (undecorated.Has(kHasAssignable)) return WritePlain(scope, type, inner);
  if (undecorated.Has(kHasOffsettable)) return WriteOffset(scope, type, op);
  if (const ClassDef* model = ModelOfType(inner, m_root)) return WriteModel(scope, *model);
  if (IsVectorLike(inner)) {
    const TypeCode element = VectorElement(inner);
    return WriteVector(scope, element);
  }
  switch (op) {
    case kOpArray:
      return WriteProxy(scope, PathElement::Index(inner.Count()), "vesk::ssize_t", inner.Inner());
    case kOpDynArray:
      return WriteProxy(scope, PathElement::Index(-1), "vesk::ssize_t", inner.Inner());
    case kOpMap:
      return WriteProxy(scope, PathElement::Key(inner.Key()), TypeText(inner.Key()), inner.Value());
    case kOpSet:
      return WriteKeySet(scope, inner.Inner());
    default:
      return WritePlain(scope, type, inner);
  }
}

void AttributeWriter::WriteConversions(const Scope& scope, std::string_view typeText, bool isOffsettable) {
  const std::string key = scope.Key();
  WriteText(
      m_out, "operator $0$1() const { return $2->Get$3($4); }\n",
      {typeText, m_access == Access::Methods || isOffsettable ? "" : " const&", scope.constSelf, scope.accessor, key});
  if (m_access == Access::Methods) return;
  WriteText(m_out, "$0 const& read() const { return $1->Get$2($3); }\n",
            {typeText, scope.constSelf, scope.accessor, key});
  if (m_access == Access::Barriers) {
    WriteText(m_out, "$0 & write() { return $1->Write$2($3); }\n", {typeText, scope.self, scope.accessor, key});
  }
  WriteText(m_out,
            "$0 const& model() const { return $1->_model__$3($4); }\n"
            "$0& model() { return $2->_model__$3($4); }\n"
            "vesk::Path path() const { return $1->Get$3Path($4); }\n",
            {typeText, scope.constSelf, scope.self, scope.accessor, key});
}

void AttributeWriter::WriteModel(const Scope& scope, const ClassDef& model) {
  m_out << "union\n";
  Block body(m_out, ";");
  for (const ModelField* field : model.m_modelFields) {
    if (field->IsDropped()) continue;
    const std::string attribute = scope.attribute.empty() ? field->m_name : scope.attribute + "." + field->m_name;
    WriteStruct(scope.className, field->m_type, attribute, scope.accessor + field->m_name, field->m_name,
                scope.readOnly);
  }
}

void AttributeWriter::WriteOffset(const Scope& scope, TypeView type, TypeOp op) {
  if (scope.readOnly) return;
  WriteText(m_out,
            "void operator+=($0) { $1->Offset$2($3$4); }\n"
            "void operator-=($0) { $1->Offset$2($3-$5$4); }\n",
            {ConstReferenceText(type, scope.member), scope.self, scope.accessor, WithComma(scope.Key()), scope.member,
             NegationCast(op)});
}

void AttributeWriter::WritePlain(const Scope& scope, TypeView type, TypeView inner) {
  const std::string typeText = TypeText(type);
  const std::string get = scope.constSelf + "->Get" + scope.accessor + "(" + scope.Key() + ")";
  const TypeOp op = inner.Op();
  if (op == kOpPointer || op == kOpPtr || op == kOpPref || op == kOpCref) {
    WriteText(m_out, "$0 operator->() const { return $1; }\n", {typeText, get});
  }
  if (op == kOpPref) {
    WriteText(m_out,
              "$0 operator*() const { return *$1; }\n"
              "vesk::ptr<$0 > Get() const { return $1.Get(); }\n",
              {TypeText(inner.Inner()), get});
  }
  if (op == kOpCref) {
    WriteText(m_out,
              "$0& operator*() const { return *$1; }\n"
              "$0* Get() const { return $1.Get(); }\n",
              {TypeText(inner.Inner()), get});
  }
  if (scope.readOnly) return;
  WriteText(m_out, "void operator=($0) { $1->Set$2($3_v); }\n",
            {ConstReferenceText(type, "_v"), scope.self, scope.accessor, WithComma(scope.Key())});
}

void AttributeWriter::WriteVector(const Scope& scope, TypeView element) {
  if (scope.readOnly) return;
  const std::string type = TypeText(element);
  const std::string key = WithComma(scope.Key());
  auto write = [&](const std::string& heading, const std::string& statement) {
    m_out << "void " << heading << "\n";
    Block body(m_out);
    m_out << statement << "\n";
  };
  write("insert(vesk::ssize_t _i," + type + " const* _src,vesk::ssize_t _n)",
        scope.self + "->CreateInto" + scope.accessor + "(" + key + "_i,_src,_n);");
  write("insert(vesk::ssize_t _i," + type + " const& _v)", "insert(_i,&_v,1);");
  write("push_front(" + type + " const& _v)", "insert(0,_v);");
  write("push_back(" + type + " const& _v)", "insert(model().size(),_v);");
  write("erase_range(vesk::ssize_t _i1,vesk::ssize_t _i2)",
        scope.self + "->DeleteFrom" + scope.accessor + "(" + key + "_i1,_i2);");
  write("erase(vesk::ssize_t _i)", "erase_range(_i,_i+1);");
  write("pop_front()", "erase(0);");
  write("pop_back()", "erase(model().size()-1);");
  write("clear()", "erase_range(0,model().size());");
}

void AttributeWriter::WriteKeySet(const Scope& scope, TypeView key) {
  if (scope.readOnly) return;
  const std::string type = TypeText(key);
  auto write = [&](std::string_view member, std::string_view accessor) {
    m_out << "bool " << member << "(" << type << " const& _key)\n";
    Block body(m_out);
    m_out << "return " << scope.self << "->" << accessor << scope.accessor << "(" << WithComma(scope.Key())
          << "_key);\n";
  };
  write("Insert", "InsertInto");
  write("Delete", "DeleteFrom");
}

// An element can't be a member of the union, so operator[] answers a small struct of the enclosing object and the
// index.
void AttributeWriter::WriteProxy(const Scope& scope, PathElement element, const std::string& keyType,
                                 TypeView elementType) {
  m_path.Push(std::move(element));
  const std::string proxy = scope.accessor + "Element";
  const std::string index = ParameterName(scope.depth);
  m_out << "struct " << proxy << "\n{\n";
  {
    IndentScope indent(m_out, 4);
    WriteText(m_out, "$0($1* _self, $2 _k) : _self(_self),$3(_k) {}\n", {proxy, scope.className, keyType, index});
    if (NeedsForwarders(WithoutDecorators(elementType, m_root).type.Op())) {
      WriteForwarders(scope.depth, scope.depth, elementType, proxy, scope.readOnly);
    }
    WriteOperators({.className = proxy,
                    .depth = scope.depth + 1,
                    .self = "_self",
                    .constSelf = "_self",
                    .accessor = proxy,
                    .member = proxy,
                    .inProxy = true,
                    .readOnly = scope.readOnly},
                   elementType);
    WriteText(m_out, "$0* _self;\n$1 $2;\n", {scope.className, keyType, index});
  }
  m_out << "};\n";
  if (!scope.readOnly) {
    m_out << proxy << " operator[](" << keyType << " " << index << ")\n";
    Block body(m_out);
    WriteText(m_out, "return $0($1,$2);\n", {proxy, scope.inProxy ? "this" : scope.self, index});
  }
  m_out << proxy << " const operator[](" << keyType << " " << index << ") const\n";
  {
    Block body(m_out);
    WriteText(m_out, "return $0(const_cast<$1*>($2),$3);\n",
              {proxy, scope.className, scope.inProxy ? "this" : scope.constSelf, index});
  }
  m_path.Pop();
}

// --- Forwarders: a proxy offers the accessors that the operators inside it call, with its own index filled in.

void AttributeWriter::WriteForwarders(size_t first, size_t last, TypeView type, const std::string& name,
                                      bool readOnly) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  const TypeOp op = inner.Op();
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  WriteText(m_out,
            "vesk::Path Get$0Path($1) const { return _self->Get$0Path($2); }\n"
            "$3 const& _model__$0($1) const { return _self->_model__$0($2); }\n"
            "$3& _model__$0($1) { return _self->_model__$0($2); }\n"
            "$3 const& Get$0($1) const { return _self->Get$0($2); }\n",
            {name, parameters, arguments, TypeText(type)});

  if (undecorated.Has(kHasAssignable) || IsForwardedScalar(op)) {
    if (readOnly) return;
    WriteText(m_out, "void $0$1($2$3) { _self->$0$1($4_v); }\n",
              {undecorated.Has(kHasOffsettable) ? "Offset" : "Set", name, WithComma(parameters),
               ConstReferenceText(type, "_v"), WithComma(arguments)});
  } else if (IsVectorLike(inner)) {
    if (readOnly) return;
    WriteText(m_out,
              "void CreateInto$0($1vesk::ssize_t _i,$2 const* _src,vesk::ssize_t _n)\n"
              "{\n    _self->CreateInto$0($3_i,_src,_n);\n}\n"
              "void DeleteFrom$0($1vesk::ssize_t _i1,vesk::ssize_t _i2)\n"
              "{\n    _self->DeleteFrom$0($3_i1,_i2);\n}\n",
              {name, WithComma(parameters), TypeText(VectorElement(inner)), WithComma(arguments)});
  } else if (op == kOpClass) {
    const NameSpaceElement* element = NamedElement(inner, m_root);
    if (!element || element->category != Category::Class) return;
    for (const ModelField* field : static_cast<const ClassDef*>(element)->m_modelFields) {
      if (!field->IsDropped()) WriteForwarders(first, last, field->m_type, name + field->m_name, readOnly);
    }
  } else if (op == kOpArray) {
    WriteContainerForwarders(first, last, PathElement::Index(inner.Count()), inner.Inner(), name, readOnly);
  } else if (op == kOpDynArray) {
    WriteContainerForwarders(first, last, PathElement::Index(-1), inner.Inner(), name, readOnly);
  } else if (op == kOpMap) {
    WriteContainerForwarders(first, last, PathElement::Key(inner.Key()), inner.Value(), name, readOnly);
  } else if (op == kOpSet) {
    if (readOnly) return;
    for (std::string_view verb : {"InsertInto", "DeleteFrom"}) {
      WriteText(m_out,
                "bool $0$1($2$3 const& _key)\n"
                "{\n    return _self->$0$1($4_key);\n}\n",
                {verb, name, WithComma(parameters), TypeText(inner.Inner()), WithComma(arguments)});
    }
  } else {
    TraceWriter() << "*bc = " << static_cast<uint8_t>(op) << "\n";
  }
}

void AttributeWriter::WriteContainerForwarders(size_t first, size_t last, PathElement element, TypeView elementType,
                                               const std::string& name, bool readOnly) {
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  WriteText(m_out, "vesk::ssize_t Get$0Size($1) const { return _self->Get$0Size($2); }\n",
            {name, parameters, arguments});
  m_path.Push(std::move(element));
  if (elementType.WithoutMetadata().IsBuiltIn()) {
    const std::string deeper = ForwardedParameters(first, last + 1);
    const std::string deeperArguments = FieldPath::Arguments(first, last + 2);
    const std::string type = TypeText(elementType);
    WriteText(m_out, "$0 const& Get$1Element($2) const { return _self->Get$1Element($3); }\n",
              {type, name, deeper, deeperArguments});
    if (!readOnly) {
      WriteText(m_out, "void Set$1Element($2$0 _e) { _self->Set$1Element($3_e); }\n",
                {type, name, WithComma(deeper), WithComma(deeperArguments)});
    }
  } else {
    WriteForwarders(first, last + 1, elementType, name + "Element", readOnly);
  }
  m_path.Pop();
}

}  // namespace qrex
