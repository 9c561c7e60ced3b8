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
  Write(m_out, R"(
    struct
    {
        $operators$
    } $member$;
  )",
        "operators"_([&] { WriteOperators(scope, type); }), "member"_ = memberName);
}

void AttributeWriter::WriteOperators(Scope scope, TypeView type) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  scope.readOnly = scope.readOnly || undecorated.Has(kHasConst);
  WriteConversions(scope, TypeText(m_access == Access::GetAndSet ? inner : type), undecorated.Has(kHasOffsettable));

  if (undecorated.Has(kHasAssignable) || m_access == Access::GetAndSet) return WritePlain(scope, type, inner);
  if (undecorated.Has(kHasOffsettable)) return WriteOffset(scope, type, inner.Op());
  const TypeShape shape = ShapeOf(inner, m_root);
  switch (shape.shape) {
    case Shape::Value:
      return WritePlain(scope, type, inner);
    case Shape::Model:
      return WriteModel(scope, *shape.model);
    case Shape::Vector:
      return WriteVector(scope, shape.element);
    case Shape::Indexed:
      return WriteProxy(scope, shape);
    case Shape::KeySet:
      return WriteKeySet(scope, shape.element);
  }
}

void AttributeWriter::WriteConversions(const Scope& scope, std::string_view type, bool isOffsettable) {
  const auto vars = WithVars(m_out, "type"_ = type, "self"_ = scope.self, "constSelf"_ = scope.constSelf,
                             "field"_ = scope.accessor, "key"_ = scope.Key());
  vars.Write("operator $type$$reference$() const { return $constSelf$->Get$field$($key$); }\n",
             "reference"_ = ReturnsByValue() || isOffsettable ? "" : " const&");
  if (ReturnsByValue()) return;
  vars.Write("$type$ const& read() const { return $constSelf$->Get$field$($key$); }\n");
  if (m_access == Access::Barriers) vars.Write("$type$ & write() { return $self$->Write$field$($key$); }\n");
  vars.Write(R"(
    $type$ const& model() const { return $constSelf$->_model__$field$($key$); }
    $type$& model() { return $self$->_model__$field$($key$); }
    vesk::Path path() const { return $constSelf$->Get$field$Path($key$); }
  )");
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
void AttributeWriter::WriteProxy(const Scope& scope, const TypeShape& shape) {
  m_path.Push(shape.Step());
  const std::string keyType = shape.KeyText();
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
    if (!NeedsForwarders(WithoutDecorators(shape.element, m_root).type.Op())) return;
    WriteForwarders(scope.depth, scope.depth, shape.element, proxy, scope.readOnly);
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
  Write(m_out, R"(
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
        "forwarders"_ = writeForwarders, "operators"_([&] { WriteOperators(elementScope, shape.element); }),
        "writableIndexing"_ = writeWritableIndexing, "self"_ = scope.inProxy ? "this" : scope.constSelf);
  m_path.Pop();
}

// --- Forwarders: a proxy offers the accessors that the operators inside it call, with its own index filled in.

bool AttributeWriter::IsForwardedAsWhole(const Undecorated& type) const {
  const TypeOp op = type.type.Op();
  if (type.Has(kHasAssignable) || IsForwardedScalar(op)) return true;
  if (!m_forwardsAll || op == kOpSet || (op != kOpClass && NeedsForwarders(op))) return false;
  return ShapeOf(type.type, m_root).shape != Shape::Model;
}

void AttributeWriter::WriteForwarders(size_t first, size_t last, TypeView type, const std::string& name,
                                      bool readOnly) {
  const Undecorated undecorated = WithoutDecorators(type, m_root);
  const TypeView inner = undecorated.type;
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  const auto vars =
      WithVars(m_out, "name"_ = name, "type"_ = TypeText(type), "parameters"_ = parameters, "arguments"_ = arguments,
               "parametersAnd"_ = WithComma(parameters), "argumentsAnd"_ = WithComma(arguments));
  vars.Write(R"(
    vesk::Path Get$name$Path($parameters$) const { return _self->Get$name$Path($arguments$); }
    $type$ const& _model__$name$($parameters$) const { return _self->_model__$name$($arguments$); }
    $type$& _model__$name$($parameters$) { return _self->_model__$name$($arguments$); }
    $type$ const& Get$name$($parameters$) const { return _self->Get$name$($arguments$); }
  )");
  if (m_forwardsAll && m_access == Access::Barriers) {
    vars.Write("$type$& Write$name$($parameters$) { return _self->Write$name$($arguments$); }\n");
  }
  if (IsForwardedAsWhole(undecorated)) {
    if (readOnly) return;
    return vars.Write("void $verb$$name$($parametersAnd$$value$) { _self->$verb$$name$($argumentsAnd$_v); }\n",
                      "verb"_ = undecorated.Has(kHasOffsettable) ? "Offset" : "Set",
                      "value"_ = ConstReferenceText(type, "_v"));
  }
  const TypeShape shape = ShapeOf(inner, m_root);
  switch (shape.shape) {
    case Shape::Value:
    case Shape::Model:
      return WriteFieldForwarders(first, last, inner, name, readOnly);
    case Shape::Indexed:
      return WriteElementForwarders(first, last, shape, name, readOnly);
    case Shape::Vector:
      if (readOnly) return;
      return vars.Write(R"(
        void CreateInto$name$($parametersAnd$vesk::ssize_t _i,$element$ const* _src,vesk::ssize_t _n)
        {
            _self->CreateInto$name$($argumentsAnd$_i,_src,_n);
        }
        void DeleteFrom$name$($parametersAnd$vesk::ssize_t _i1,vesk::ssize_t _i2)
        {
            _self->DeleteFrom$name$($argumentsAnd$_i1,_i2);
        }
      )",
                        "element"_ = shape.element);
    case Shape::KeySet:
      if (readOnly) return;
      return vars.Write(R"(
        bool InsertInto$name$($parametersAnd$$key$ const& _key)
        {
            return _self->InsertInto$name$($argumentsAnd$_key);
        }
        bool DeleteFrom$name$($parametersAnd$$key$ const& _key)
        {
            return _self->DeleteFrom$name$($argumentsAnd$_key);
        }
      )",
                        "key"_ = shape.element);
  }
}

// Of a class of any kind; other types have none.
void AttributeWriter::WriteFieldForwarders(size_t first, size_t last, TypeView type, const std::string& name,
                                           bool readOnly) {
  if (type.Op() != kOpClass) {
    TraceWriter() << "*bc = " << static_cast<uint8_t>(type.Op()) << "\n";
    return;
  }
  const NameSpaceElement* element = NamedElement(type, m_root);
  if (!element || element->category != Category::Class) return;
  for (const ModelField* field : static_cast<const ClassDef*>(element)->m_modelFields) {
    if (!field->IsDropped()) WriteForwarders(first, last, field->m_type, name + field->m_name, readOnly);
  }
}

void AttributeWriter::WriteElementForwarders(size_t first, size_t last, const TypeShape& shape, const std::string& name,
                                             bool readOnly) {
  const std::string parameters = ForwardedParameters(first, last);
  const std::string arguments = FieldPath::Arguments(first, last + 1);
  Write(m_out, "vesk::ssize_t Get$name$Size($parameters$) const { return _self->Get$name$Size($arguments$); }\n",
        "name"_ = name, "parameters"_ = parameters, "arguments"_ = arguments);
  m_path.Push(shape.Step());
  if (shape.element.WithoutMetadata().IsBuiltIn() && !m_forwardsAll) {
    const std::string elementParameters = ForwardedParameters(first, last + 1);
    const std::string elementArguments = FieldPath::Arguments(first, last + 2);
    Write(m_out,
          "$type$ const& Get$name$Element($parameters$) const { return _self->Get$name$Element($arguments$); }\n",
          "type"_ = shape.element, "name"_ = name, "parameters"_ = elementParameters, "arguments"_ = elementArguments);
    if (!readOnly) {
      Write(m_out, "void Set$name$Element($parameters$$type$ _e) { _self->Set$name$Element($arguments$_e); }\n",
            "name"_ = name, "parameters"_ = WithComma(elementParameters), "type"_ = shape.element,
            "arguments"_ = WithComma(elementArguments));
    }
  } else {
    WriteForwarders(first, last + 1, shape.element, name + "Element", readOnly);
  }
  m_path.Pop();
}

}  // namespace qrex
