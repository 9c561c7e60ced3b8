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
  const Scope scope{.className = className,
                    .self = "ATTRIB_CAST" + arguments,
                    .constSelf = "CONST_ATTRIB_CAST" + arguments,
                    .attribute = attributeName,
                    .accessor = accessorName,
                    .member = memberName,
                    .readOnly = readOnly};
  Write(
      m_out, R"(
    struct
    {
        $operators$
    } $member$;
  )",
      "operators"_ = [&] { WriteOperators(scope, type); }, "member"_ = memberName);
}

void AttributeWriter::WriteOperators(Scope scope, TypeView type) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  const TypeOp op = inner.Op();
  scope.readOnly = scope.readOnly || undecorated.Has(kHasConst);
  WriteConversions(scope, TypeText(m_access == Access::GetAndSet ? inner : type), undecorated.Has(kHasOffsettable));

  if (undecorated.Has(kHasAssignable) || m_access == Access::GetAndSet) return WritePlain(scope, type, inner);
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

void AttributeWriter::WriteConversions(const Scope& scope, std::string_view type, bool isOffsettable) {
  const std::string key = scope.Key();
  Write(m_out, "operator $type$$reference$() const { return $self$->Get$field$($key$); }\n", "type"_ = type,
        "reference"_ = ReturnsByValue() || isOffsettable ? "" : " const&", "self"_ = scope.constSelf,
        "field"_ = scope.accessor, "key"_ = key);
  if (ReturnsByValue()) return;
  auto write = [&] {
    if (m_access != Access::Barriers) return;
    Write(m_out, "$type$ & write() { return $self$->Write$field$($key$); }\n", "type"_ = type, "self"_ = scope.self,
          "field"_ = scope.accessor, "key"_ = key);
  };
  Write(m_out, R"(
    $type$ const& read() const { return $constSelf$->Get$field$($key$); }
    $write$
    $type$ const& model() const { return $constSelf$->_model__$field$($key$); }
    $type$& model() { return $self$->_model__$field$($key$); }
    vesk::Path path() const { return $constSelf$->Get$field$Path($key$); }
  )",
        "type"_ = type, "self"_ = scope.self, "constSelf"_ = scope.constSelf, "field"_ = scope.accessor, "key"_ = key,
        "write"_ = write);
}

void AttributeWriter::WriteModel(const Scope& scope, const ClassDef& model) {
  auto writeFields = [&] {
    for (const ModelField* field : model.m_modelFields) {
      if (field->IsDropped()) continue;
      const std::string attribute = scope.attribute.empty() ? field->m_name : scope.attribute + "." + field->m_name;
      WriteStruct(scope.className, field->m_type, attribute, scope.accessor + field->m_name, field->m_name,
                  scope.readOnly);
    }
  };
  Write(m_out, R"(
    union
    {
        $fields$
    };
  )",
        "fields"_ = writeFields);
}

void AttributeWriter::WriteOffset(const Scope& scope, TypeView type, TypeOp op) {
  if (scope.readOnly) return;
  Write(m_out, R"(
    void operator+=($argument$) { $self$->Offset$field$($key$$name$); }
    void operator-=($argument$) { $self$->Offset$field$($key$-$cast$$name$); }
  )",
        "argument"_ = ConstReferenceText(type, scope.member), "self"_ = scope.self, "field"_ = scope.accessor,
        "key"_ = WithComma(scope.Key()), "cast"_ = NegationCast(op), "name"_ = scope.member);
}

void AttributeWriter::WritePlain(const Scope& scope, TypeView type, TypeView inner) {
  const std::string get = scope.constSelf + "->Get" + scope.accessor + "(" + scope.Key() + ")";
  const TypeOp op = inner.Op();
  if (op == kOpPointer || op == kOpPtr || op == kOpPref || op == kOpCref) {
    Write(m_out, "$type$ operator->() const { return $get$; }\n", "type"_ = type, "get"_ = get);
  }
  if (op == kOpPref) {
    Write(m_out, R"(
      $object$ operator*() const { return *$get$; }
      vesk::ptr<$object$ > Get() const { return $get$.Get(); }
    )",
          "object"_ = inner.Inner(), "get"_ = get);
  }
  if (op == kOpCref) {
    Write(m_out, R"(
      $object$& operator*() const { return *$get$; }
      $object$* Get() const { return $get$.Get(); }
    )",
          "object"_ = inner.Inner(), "get"_ = get);
  }
  if (scope.readOnly) return;
  Write(m_out, "void operator=($argument$) { $self$->Set$field$($key$_v); }\n",
        "argument"_ = ConstReferenceText(type, "_v"), "self"_ = scope.self, "field"_ = scope.accessor,
        "key"_ = WithComma(scope.Key()));
}

void AttributeWriter::WriteVector(const Scope& scope, TypeView element) {
  if (scope.readOnly) return;
  Write(m_out, R"(
    void insert(vesk::ssize_t _i,$type$ const* _src,vesk::ssize_t _n)
    {
        $self$->CreateInto$field$($key$_i,_src,_n);
    }
    void insert(vesk::ssize_t _i,$type$ const& _v)
    {
        insert(_i,&_v,1);
    }
    void push_front($type$ const& _v)
    {
        insert(0,_v);
    }
    void push_back($type$ const& _v)
    {
        insert(model().size(),_v);
    }
    void erase_range(vesk::ssize_t _i1,vesk::ssize_t _i2)
    {
        $self$->DeleteFrom$field$($key$_i1,_i2);
    }
    void erase(vesk::ssize_t _i)
    {
        erase_range(_i,_i+1);
    }
    void pop_front()
    {
        erase(0);
    }
    void pop_back()
    {
        erase(model().size()-1);
    }
    void clear()
    {
        erase_range(0,model().size());
    }
  )",
        "type"_ = element, "self"_ = scope.self, "field"_ = scope.accessor, "key"_ = WithComma(scope.Key()));
}

void AttributeWriter::WriteKeySet(const Scope& scope, TypeView key) {
  if (scope.readOnly) return;
  Write(m_out, R"(
    bool Insert($type$ const& _key)
    {
        return $self$->InsertInto$field$($key$_key);
    }
    bool Delete($type$ const& _key)
    {
        return $self$->DeleteFrom$field$($key$_key);
    }
  )",
        "type"_ = key, "self"_ = scope.self, "field"_ = scope.accessor, "key"_ = WithComma(scope.Key()));
}

// An element can't be a member of the union, so operator[] answers a small struct of the enclosing object and the
// index.
void AttributeWriter::WriteProxy(const Scope& scope, PathElement element, const std::string& keyType,
                                 TypeView elementType) {
  m_path.Push(std::move(element));
  const std::string proxy = scope.accessor + "Element";
  const std::string index = ParameterName(scope.depth);
  const Scope elementScope{.className = proxy,
                           .depth = scope.depth + 1,
                           .self = "_self",
                           .constSelf = "_self",
                           .accessor = proxy,
                           .member = proxy,
                           .inProxy = true,
                           .readOnly = scope.readOnly};
  auto writeForwarders = [&] {
    if (!NeedsForwarders(WithoutDecorators(elementType, m_root).type.Op())) return;
    WriteForwarders(scope.depth, scope.depth, elementType, proxy, scope.readOnly);
  };
  auto writeWritableIndexing = [&] {
    if (scope.readOnly) return;
    Write(m_out, R"(
      $proxy$ operator[]($key$ $index$)
      {
          return $proxy$($self$,$index$);
      }
    )",
          "proxy"_ = proxy, "key"_ = keyType, "index"_ = index, "self"_ = scope.inProxy ? "this" : scope.self);
  };
  Write(
      m_out, R"(
    struct $proxy$
    {
        $proxy$($object$* _self, $key$ _k) : _self(_self),$index$(_k) {}
        $forwarders$
        $operators$
        $object$* _self;
        $key$ $index$;
    };
    $writableIndexing$
    $proxy$ const operator[]($key$ $index$) const
    {
        return $proxy$(const_cast<$object$*>($self$),$index$);
    }
  )",
      "proxy"_ = proxy, "object"_ = scope.className, "key"_ = keyType, "index"_ = index,
      "forwarders"_ = writeForwarders, "operators"_ = [&] { WriteOperators(elementScope, elementType); },
      "writableIndexing"_ = writeWritableIndexing, "self"_ = scope.inProxy ? "this" : scope.constSelf);
  m_path.Pop();
}

// --- Forwarders: a proxy offers the accessors that the operators inside it call, with its own index filled in.

bool AttributeWriter::IsForwardedAsWhole(const Undecorated& type) const {
  const TypeOp op = type.type.Op();
  if (type.Has(kHasAssignable) || IsForwardedScalar(op)) return true;
  if (!m_forwardsAll || op == kOpSet || (op != kOpClass && NeedsForwarders(op))) return false;
  return !ModelOfType(type.type, m_root);
}

void AttributeWriter::WriteForwarders(size_t first, size_t last, TypeView type, const std::string& name,
                                      bool readOnly) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  const TypeOp op = inner.Op();
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  Write(m_out, R"(
    vesk::Path Get$name$Path($parameters$) const { return _self->Get$name$Path($arguments$); }
    $type$ const& _model__$name$($parameters$) const { return _self->_model__$name$($arguments$); }
    $type$& _model__$name$($parameters$) { return _self->_model__$name$($arguments$); }
    $type$ const& Get$name$($parameters$) const { return _self->Get$name$($arguments$); }
  )",
        "name"_ = name, "parameters"_ = parameters, "arguments"_ = arguments, "type"_ = TypeText(type));

  if (m_forwardsAll && m_access == Access::Barriers) {
    Write(m_out, "$type$& Write$name$($parameters$) { return _self->Write$name$($arguments$); }\n", "type"_ = type,
          "name"_ = name, "parameters"_ = parameters, "arguments"_ = arguments);
  }
  if (IsForwardedAsWhole(undecorated)) {
    if (readOnly) return;
    Write(m_out, "void $verb$$name$($parameters$$value$) { _self->$verb$$name$($arguments$_v); }\n",
          "verb"_ = undecorated.Has(kHasOffsettable) ? "Offset" : "Set", "name"_ = name,
          "parameters"_ = WithComma(parameters), "value"_ = ConstReferenceText(type, "_v"),
          "arguments"_ = WithComma(arguments));
  } else if (IsVectorLike(inner)) {
    if (readOnly) return;
    Write(m_out, R"(
      void CreateInto$name$($parameters$vesk::ssize_t _i,$element$ const* _src,vesk::ssize_t _n)
      {
          _self->CreateInto$name$($arguments$_i,_src,_n);
      }
      void DeleteFrom$name$($parameters$vesk::ssize_t _i1,vesk::ssize_t _i2)
      {
          _self->DeleteFrom$name$($arguments$_i1,_i2);
      }
    )",
          "name"_ = name, "parameters"_ = WithComma(parameters), "element"_ = TypeText(VectorElement(inner)),
          "arguments"_ = WithComma(arguments));
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
      Write(m_out, R"(
        bool $verb$$name$($parameters$$key$ const& _key)
        {
            return _self->$verb$$name$($arguments$_key);
        }
      )",
            "verb"_ = verb, "name"_ = name, "parameters"_ = WithComma(parameters), "key"_ = inner.Inner(),
            "arguments"_ = WithComma(arguments));
    }
  } else {
    TraceWriter() << "*bc = " << static_cast<uint8_t>(op) << "\n";
  }
}

void AttributeWriter::WriteContainerForwarders(size_t first, size_t last, PathElement element, TypeView elementType,
                                               const std::string& name, bool readOnly) {
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  Write(m_out, "vesk::ssize_t Get$name$Size($parameters$) const { return _self->Get$name$Size($arguments$); }\n",
        "name"_ = name, "parameters"_ = parameters, "arguments"_ = arguments);
  m_path.Push(std::move(element));
  if (elementType.WithoutMetadata().IsBuiltIn() && !m_forwardsAll) {
    const std::string elementParameters = ForwardedParameters(first, last + 1);
    const std::string elementArguments = FieldPath::Arguments(first, last + 2);
    Write(m_out,
          "$type$ const& Get$name$Element($parameters$) const { return _self->Get$name$Element($arguments$); }\n",
          "type"_ = elementType, "name"_ = name, "parameters"_ = elementParameters, "arguments"_ = elementArguments);
    if (!readOnly) {
      Write(m_out, "void Set$name$Element($parameters$$type$ _e) { _self->Set$name$Element($arguments$_e); }\n",
            "name"_ = name, "parameters"_ = WithComma(elementParameters), "type"_ = elementType,
            "arguments"_ = WithComma(elementArguments));
    }
  } else {
    WriteForwarders(first, last + 1, elementType, name + "Element", readOnly);
  }
  m_path.Pop();
}

}  // namespace qrex
