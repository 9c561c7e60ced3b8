#include "translator/model/attribute_struct.h"

#include "translator/emit/emit.h"

namespace qrex {

namespace {

constexpr char kChar8Code[] = {kOpChar8};
constexpr char kChar16Code[] = {kOpChar16};

// The negation of an unsigned value happens in the signed type of its width.
std::string_view NegationCast(uint8_t op) {
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
bool NeedsForwarders(uint8_t op) {
  return op == kOpString8 || op == kOpString16 || op == kOpClass || op == kOpVector || op == kOpDynArray ||
         op == kOpArray || op == kOpMap;
}

bool IsForwardedScalar(uint8_t op) {
  return op <= kOpChar16 || op == kOpEnum || op == kOpVariant || op == kOpPtr || op == kOpPref || op == kOpCref;
}

}  // namespace

std::string_view VectorElement(std::string_view code) {
  switch (static_cast<uint8_t>(code.front())) {
    case kOpString8:
      return {kChar8Code, 1};
    case kOpString16:
      return {kChar16Code, 1};
    default:
      return code.substr(1);
  }
}

const ClassDef* ModelOfType(std::string_view code, NameSpace& root) {
  if (static_cast<uint8_t>(code.front()) != kOpClass) return nullptr;
  const auto* element = NamedElement(code, root);
  if (!element || element->category != Category::Class) return nullptr;
  const auto* def = static_cast<const ClassDef*>(element);
  return def->IsPureModel() ? def : nullptr;
}

void AttributeWriter::WriteStruct(const std::string& className, std::string_view type, const std::string& attributeName,
                                  const std::string& accessorName, const std::string& memberName, bool readOnly) {
  const std::string arguments = "(" + className + "," + attributeName + ")";
  m_out << "struct\n{\n";
  {
    IndentScope indent(m_out, 4);
    WriteOperators({className, 0, "ATTRIB_CAST" + arguments, "CONST_ATTRIB_CAST" + arguments, attributeName,
                    accessorName, memberName, false, readOnly},
                   type);
  }
  m_out << "} " << memberName << ";\n";
}

void AttributeWriter::WriteOperators(Scope scope, std::string_view type) {
  uint32_t decorators = 0;
  const std::string_view code = SkipDecorators(type, m_root, decorators);
  const uint8_t op = static_cast<uint8_t>(code.front());
  scope.readOnly = scope.readOnly || (decorators & kHasConst);
  WriteConversions(scope, TypeText(type), (decorators & kHasOffsettable) != 0);

  if (decorators & kHasAssignable) return WritePlain(scope, type, code);
  if (decorators & kHasOffsettable) return WriteOffset(scope, type, op);
  if (const ClassDef* model = ModelOfType(code, m_root)) return WriteModel(scope, *model);
  if (IsVectorLike(op)) return WriteVector(scope, VectorElement(code));
  switch (op) {
    case kOpArray:
      return WriteProxy(scope, PathElement::Index(ArraySize(code)), "vesk::ssize_t", ArrayElement(code));
    case kOpDynArray:
      return WriteProxy(scope, PathElement::Index(-1), "vesk::ssize_t", code.substr(1));
    case kOpMap:
      return WriteProxy(scope, PathElement::Key(MapKey(code)), TypeText(MapKey(code)), MapValue(code));
    case kOpSet:
      return WriteKeySet(scope, code.substr(1));
    default:
      return WritePlain(scope, type, code);
  }
}

void AttributeWriter::WriteConversions(const Scope& scope, std::string_view typeText, bool isOffsettable) {
  const std::string key = scope.Key();
  WriteText(m_out, "operator $0$1() const { return $2->Get$3($4); }\n",
            {typeText, m_byValue || isOffsettable ? "" : " const&", scope.constSelf, scope.accessor, key});
  if (m_byValue) return;
  WriteText(m_out, "$0 const& read() const { return $1->Get$2($3); }\n",
            {typeText, scope.constSelf, scope.accessor, key});
  if (m_hasWrite) {
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

void AttributeWriter::WriteOffset(const Scope& scope, std::string_view type, uint8_t op) {
  if (scope.readOnly) return;
  WriteText(m_out,
            "void operator+=($0) { $1->Offset$2($3$4); }\n"
            "void operator-=($0) { $1->Offset$2($3-$5$4); }\n",
            {ConstReferenceText(type, scope.member), scope.self, scope.accessor, WithComma(scope.Key()), scope.member,
             NegationCast(op)});
}

void AttributeWriter::WritePlain(const Scope& scope, std::string_view type, std::string_view code) {
  const std::string typeText = TypeText(type);
  const std::string get = scope.constSelf + "->Get" + scope.accessor + "(" + scope.Key() + ")";
  const uint8_t op = static_cast<uint8_t>(code.front());
  if (op == kOpPointer || op == kOpPtr || op == kOpPref || op == kOpCref) {
    WriteText(m_out, "$0 operator->() const { return $1; }\n", {typeText, get});
  }
  if (op == kOpPref) {
    WriteText(m_out,
              "$0 operator*() const { return *$1; }\n"
              "vesk::ptr<$0 > Get() const { return $1.Get(); }\n",
              {TypeText(code.substr(1)), get});
  }
  if (op == kOpCref) {
    WriteText(m_out,
              "$0& operator*() const { return *$1; }\n"
              "$0* Get() const { return $1.Get(); }\n",
              {TypeText(code.substr(1)), get});
  }
  if (scope.readOnly) return;
  WriteText(m_out, "void operator=($0) { $1->Set$2($3_v); }\n",
            {ConstReferenceText(type, "_v"), scope.self, scope.accessor, WithComma(scope.Key())});
}

void AttributeWriter::WriteVector(const Scope& scope, std::string_view element) {
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

void AttributeWriter::WriteKeySet(const Scope& scope, std::string_view key) {
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
                                 std::string_view elementType) {
  m_path.Push(std::move(element));
  const std::string proxy = scope.accessor + "Element";
  const std::string index = ParameterName(scope.depth);
  m_out << "struct " << proxy << "\n{\n";
  {
    IndentScope indent(m_out, 4);
    WriteText(m_out, "$0($1* _self, $2 _k) : _self(_self),$3(_k) {}\n", {proxy, scope.className, keyType, index});
    uint32_t decorators = 0;
    const std::string_view code = SkipDecorators(elementType, m_root, decorators);
    if (NeedsForwarders(static_cast<uint8_t>(code.front()))) {
      WriteForwarders(scope.depth, scope.depth, elementType, proxy, scope.readOnly);
    }
    WriteOperators({proxy, scope.depth + 1, "_self", "_self", "", proxy, proxy, true, scope.readOnly}, elementType);
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

void AttributeWriter::WriteForwarders(size_t first, size_t last, std::string_view type, const std::string& name,
                                      bool readOnly) {
  uint32_t decorators = 0;
  const std::string_view code = SkipDecorators(type, m_root, decorators);
  const uint8_t op = static_cast<uint8_t>(code.front());
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  WriteText(m_out,
            "vesk::Path Get$0Path($1) const { return _self->Get$0Path($2); }\n"
            "$3 const& _model__$0($1) const { return _self->_model__$0($2); }\n"
            "$3& _model__$0($1) { return _self->_model__$0($2); }\n"
            "$3 const& Get$0($1) const { return _self->Get$0($2); }\n",
            {name, parameters, arguments, TypeText(type)});

  if ((decorators & kHasAssignable) || IsForwardedScalar(op)) {
    if (readOnly) return;
    WriteText(m_out, "void $0$1($2$3) { _self->$0$1($4_v); }\n",
              {decorators & kHasOffsettable ? "Offset" : "Set", name, WithComma(parameters),
               ConstReferenceText(type, "_v"), WithComma(arguments)});
  } else if (IsVectorLike(op)) {
    if (readOnly) return;
    WriteText(m_out,
              "void CreateInto$0($1vesk::ssize_t _i,$2 const* _src,vesk::ssize_t _n)\n"
              "{\n    _self->CreateInto$0($3_i,_src,_n);\n}\n"
              "void DeleteFrom$0($1vesk::ssize_t _i1,vesk::ssize_t _i2)\n"
              "{\n    _self->DeleteFrom$0($3_i1,_i2);\n}\n",
              {name, WithComma(parameters), TypeText(VectorElement(code)), WithComma(arguments)});
  } else if (op == kOpClass) {
    const NameSpaceElement* element = NamedElement(code, m_root);
    if (!element || element->category != Category::Class) return;
    for (const ModelField* field : static_cast<const ClassDef*>(element)->m_modelFields) {
      if (!field->IsDropped()) WriteForwarders(first, last, field->m_type, name + field->m_name, readOnly);
    }
  } else if (op == kOpArray) {
    WriteContainerForwarders(first, last, PathElement::Index(ArraySize(code)), ArrayElement(code), name, readOnly);
  } else if (op == kOpDynArray) {
    WriteContainerForwarders(first, last, PathElement::Index(-1), code.substr(1), name, readOnly);
  } else if (op == kOpMap) {
    WriteContainerForwarders(first, last, PathElement::Key(MapKey(code)), MapValue(code), name, readOnly);
  } else if (op == kOpSet) {
    if (readOnly) return;
    for (std::string_view verb : {"InsertInto", "DeleteFrom"}) {
      WriteText(m_out,
                "bool $0$1($2$3 const& _key)\n"
                "{\n    return _self->$0$1($4_key);\n}\n",
                {verb, name, WithComma(parameters), TypeText(code.substr(1)), WithComma(arguments)});
    }
  } else {
    TraceWriter() << "*bc = " << op << "\n";
  }
}

void AttributeWriter::WriteContainerForwarders(size_t first, size_t last, PathElement element,
                                               std::string_view elementType, const std::string& name, bool readOnly) {
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  WriteText(m_out, "vesk::ssize_t Get$0Size($1) const { return _self->Get$0Size($2); }\n",
            {name, parameters, arguments});
  m_path.Push(std::move(element));
  const std::string_view code = SkipMetadata(elementType);
  if (static_cast<uint8_t>(code.front()) <= kOpString16) {
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
