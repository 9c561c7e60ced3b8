// Calls of methods that only their record knows. Arguments are passed as the calling convention passes what the record
// says they are: whole numbers, bools, characters, enumerations and addresses in one kind of register, float32 and
// float64 in another. So a method is called through a function type that has the same kinds in the same order. What is
// passed by address is made here: strings, containers, and whatever is taken by reference. A class or variant by value
// is passed in one of two ways, of which the record does not tell: such a method is not called.

@import "Vesk/vxObject/InspectorChanges.h"

namespace vesk {

// Results that are returned in memory: strings and containers, which are smaller.
struct InspectorMemory {
  InspectorMemory() {}
  InspectorMemory(InspectorMemory const&) {}
  ~InspectorMemory() {}
  alignas(std::max_align_t) octet_t m_bytes[256];
};

struct InspectorArgument {
  enum EPassed { Whole, Float, Double };
  EPassed m_passed = Whole;
  int64 m_whole = 0;
  float32 m_float = 0;
  float64 m_double = 0;
};

constexpr std::size_t kInspectorArguments = 4;

// Calls with the arguments from `next` on behind those that are passed already.
template <typename R, typename... Passed>
R InspectorInvoke(FunctionPointer function, void* self, InspectorArgument const* next, InspectorArgument const* end,
                  Passed... passed) {
  if constexpr (sizeof...(Passed) < kInspectorArguments) {
    if (next != end) {
      switch (next->m_passed) {
        case InspectorArgument::Float:
          return InspectorInvoke<R, Passed..., float32>(function, self, next + 1, end, passed..., next->m_float);
        case InspectorArgument::Double:
          return InspectorInvoke<R, Passed..., float64>(function, self, next + 1, end, passed..., next->m_double);
        default:
          return InspectorInvoke<R, Passed..., int64>(function, self, next + 1, end, passed..., next->m_whole);
      }
    }
  }
  return reinterpret_cast<R(__stdcall*)(void*, Passed...)>(function)(self, passed...);
}

// How a type of the record is passed, and the type of the value.
struct InspectorPassing {
  explicit InspectorPassing(ReflectedType type) {
    type = PlainType(std::move(type));
    while (type.m_code >= RC_VOLATILE && type.m_code <= RC_REFERENCE && type.m_code != RC_POINTER) {
      m_isReference |= type.m_code == RC_REFERENCE;
      ReflectedType inner = type.m_inner.front();
      type = std::move(inner);
    }
    m_type = std::move(type);
  }
  bool m_isReference = false;
  ReflectedType m_type;

  // Empty, or why such a value cannot be passed.
  xstring Trouble(ValueType const& type, bool isResult) const {
    const bool isClass = type.m_kind == VK_CLASS || type.m_kind == VK_VARIANT;
    if (type.m_size == 0 || type.m_kind == VK_NONE) return "no value: " + type.m_text;
    if (type.m_kind == VK_REFERENCE || type.m_kind == VK_OPENVARIANT) return "not from here: " + type.m_text;
    if (!m_isReference && (isClass || type.m_code == RC_ARRAY)) return "by value: " + type.m_text;
    if (!m_isReference && type.m_size > 8 && InspectorRows::IsScalar(type.m_kind) && type.m_kind != VK_TEXT) {
      return "by value: " + type.m_text;
    }
    if (isResult && type.m_size > sizeof(InspectorMemory)) return "too large: " + type.m_text;
    return xstring();
  }
};

class InspectorCalls {
 public:
  explicit InspectorCalls(InspectorTree const& tree) : m_tree(tree) {}

  // The methods of an object: what PutSignature tells, with what an editor of each argument needs, or why it cannot be
  // called.
  static void PutMethods(InspectorWriter& out, ReflectedClass const& record) {
    ValueTypes types;
    out.Name("methods").Open('[');
    for (ssize_t i = 0; i < record.m_numMethods; ++i) {
      ReflectedClassMethod const& method = record.m_methods[i];
      out.Open('{').Member("name", method.m_name);
      out.Member("result",
                 method.m_return.m_type ? TypeText({method.m_return.m_type, record.m_strings}) : xstring("void"));
      out.Name("args").Open('[');
      for (ssize_t k = 0; k < method.m_numArgs; ++k) PutArgument(out, types, record, method.m_args[k]);
      out.Close(']').Member("const", method.m_isConst);
      if (method.m_metadata) {
        InspectorMetadata({DecodeMetadata({method.m_metadata, record.m_strings})}).Put(out);
      }
      const xstring trouble = Trouble(types, record, method);
      if (!trouble.empty()) out.Member("trouble", trouble);
      out.Close('}');
    }
    out.Close(']');
  }

  // Calls a method of the object at a path. What it answers, and what it made of arguments that it takes by reference.
  void Call(InspectorWriter& out, InspectorJson const& path, xstring const& name, InspectorJson const& json) const {
    InspectorPlace const place = InspectorTree::Opened(m_tree.Find(path));
    if (place.m_value.Kind() != VK_CLASS || place.m_isFixed) throw InspectorError("no object stands there");
    ReflectedClass const& record = *place.m_value.Class();
    ReflectedClassMethod const* const method = FindMethod(record, name);
    if (!method) throw InspectorError("no method " + name + " in " + record.m_name);
    const auto types = std::make_shared<ValueTypes>();
    const xstring trouble = Trouble(*types, record, *method);
    if (!trouble.empty()) throw InspectorError(trouble);
    if (static_cast<ssize_t>(json.m_items.size()) != method->m_numArgs) {
      throw InspectorError(vxMakeString(name << " takes " << method->m_numArgs << " arguments"));
    }
    std::list<InspectorCopy> held;
    xvector<InspectorArgument> arguments;
    for (ssize_t i = 0; i < method->m_numArgs; ++i) {
      arguments.push_back(Made(types, record, method->m_args[i], json.m_items[i], held));
    }
    Invoke(out, types, record, *method, place.m_value.Address(), arguments);
    PutReferences(out, types, record, *method, held);
  }

 private:
  static xstring Trouble(ValueTypes& types, ReflectedClass const& record, ReflectedClassMethod const& method) {
    if (method.m_numArgs > static_cast<ssize_t>(kInspectorArguments)) return "too many arguments";
    for (ssize_t i = 0; i < method.m_numArgs; ++i) {
      const InspectorPassing passing(DecodeType({method.m_args[i].m_type, record.m_strings}));
      const xstring trouble = passing.Trouble(types.Of(passing.m_type), false);
      if (!trouble.empty()) return trouble;
    }
    if (!method.m_return.m_type) return xstring();
    const InspectorPassing passing(DecodeType({method.m_return.m_type, record.m_strings}));
    if (passing.m_type.m_code == RC_VOID) return xstring();
    return passing.Trouble(types.Of(passing.m_type), true);
  }

  static void PutArgument(InspectorWriter& out, ValueTypes& types, ReflectedClass const& record,
                          ReflectedArg const& argument) {
    const ReflectedType declared = DecodeType({argument.m_type, record.m_strings});
    ValueType const& type = types.Of(InspectorPassing(declared).m_type);
    ReflectedType plain = declared;
    plain.m_metadata.clear();
    out.Open('{').Member("name", argument.m_name).Member("type", vxMakeString(plain));
    out.Member("kind", InspectorRows::KindName(type.m_kind));
    InspectorMetadata(declared.m_metadata).Put(out);
    if (type.m_enum) {
      int32 number = 0;
      InspectorRows::PutLabels(out, Value(InspectorPassing(declared).m_type, &number));
    }
    out.Close('}');
  }

  static InspectorArgument Made(std::shared_ptr<ValueTypes> const& types, ReflectedClass const& record,
                                ReflectedArg const& argument, InspectorJson const& json,
                                std::list<InspectorCopy>& held) {
    const ReflectedType declared = DecodeType({argument.m_type, record.m_strings});
    const InspectorPassing passing(declared);
    ValueType const& type = types->Of(passing.m_type);
    held.emplace_back(types, type);
    const Value value(types, type, held.back().Address());
    JsonLimits limits;
    limits.m_memory = 16 << 20;
    limits.m_allow = [](ReflectedClass const&) { return false; };
    try {
      FromJson(value, json.m_raw, limits);
      CheckInspectorRange(value, declared.m_metadata);
    } catch (std::exception const& error) {
      throw InspectorError(vxMakeString(argument.m_name << ": " << error.what()));
    }
    return Passed(type, passing.m_isReference, value.Address());
  }
  static InspectorArgument Passed(ValueType const& type, bool isReference, void* address) {
    InspectorArgument passed;
    if (isReference || type.m_kind == VK_TEXT || !InspectorRows::IsScalar(type.m_kind)) {
      passed.m_whole = static_cast<int64>(reinterpret_cast<std::uintptr_t>(address));
    } else if (type.m_kind == VK_FLOAT && type.m_size == 4) {
      passed.m_passed = InspectorArgument::Float;
      std::memcpy(&passed.m_float, address, 4);
    } else if (type.m_kind == VK_FLOAT) {
      passed.m_passed = InspectorArgument::Double;
      std::memcpy(&passed.m_double, address, 8);
    } else {
      passed.m_whole = Whole(type, address);
    }
    return passed;
  }
  // As wide as a register, with the sign.
  static int64 Whole(ValueType const& type, void const* address) {
    const bool isSigned =
        type.m_kind == VK_INT || type.m_kind == VK_ENUM || (type.m_kind == VK_CHAR && type.m_size == 1);
    switch (type.m_size) {
      case 1:
        return isSigned ? *static_cast<int8 const*>(address) : *static_cast<uint8 const*>(address);
      case 2:
        return isSigned ? *static_cast<int16 const*>(address) : *static_cast<uint16 const*>(address);
      case 4:
        return isSigned ? *static_cast<int32 const*>(address) : *static_cast<uint32 const*>(address);
      default:
        return *static_cast<int64 const*>(address);
    }
  }

  static void SetWhole(ValueType const& type, void* address, int64 whole) {
    const int8 byte = static_cast<int8>(whole);
    const int16 half = static_cast<int16>(whole);
    const int32 word = static_cast<int32>(whole);
    void const* const from = type.m_size == 1   ? static_cast<void const*>(&byte)
                             : type.m_size == 2 ? static_cast<void const*>(&half)
                             : type.m_size == 4 ? static_cast<void const*>(&word)
                                                : &whole;
    std::memcpy(address, from, type.m_size);
  }

  static void Invoke(InspectorWriter& out, std::shared_ptr<ValueTypes> const& types, ReflectedClass const& record,
                     ReflectedClassMethod const& method, void* self, xvector<InspectorArgument> const& arguments) {
    InspectorArgument const *const begin = arguments.data(), *const end = begin + arguments.size();
    const ReflectedType declared =
        method.m_return.m_type ? DecodeType({method.m_return.m_type, record.m_strings}) : ReflectedType();
    const InspectorPassing passing(declared);
    if (passing.m_type.m_code == RC_VOID) {
      InspectorInvoke<void>(method.m_function, self, begin, end);
      return;
    }
    ValueType const& type = types->Of(passing.m_type);
    if (passing.m_isReference) {
      PutResult(out, Value(types, type, InspectorInvoke<void*>(method.m_function, self, begin, end)));
    } else if (type.m_kind == VK_TEXT || !InspectorRows::IsScalar(type.m_kind)) {
      InspectorMemory memory = InspectorInvoke<InspectorMemory>(method.m_function, self, begin, end);
      PutResult(out, Value(types, type, memory.m_bytes));
      DestroyValue(type, memory.m_bytes);
    } else if (type.m_kind == VK_FLOAT && type.m_size == 4) {
      float32 result = InspectorInvoke<float32>(method.m_function, self, begin, end);
      PutResult(out, Value(types, type, &result));
    } else if (type.m_kind == VK_FLOAT) {
      float64 result = InspectorInvoke<float64>(method.m_function, self, begin, end);
      PutResult(out, Value(types, type, &result));
    } else {
      // Of a register as many bytes are the result as it has.
      const int64 whole = InspectorInvoke<int64>(method.m_function, self, begin, end);
      const HeldValue result(type);
      SetWhole(type, result.Get(), whole);
      PutResult(out, Value(types, type, result.Get()));
    }
  }
  static void PutResult(InspectorWriter& out, Value const& value) {
    InspectorPlace place;
    place.m_value = value;
    out.Name("result").Open('{');
    InspectorRows::PutRow(out, place);
    out.Close('}');
  }
  // Those that are not const.
  static void PutReferences(InspectorWriter& out, std::shared_ptr<ValueTypes> const& types,
                            ReflectedClass const& record, ReflectedClassMethod const& method,
                            std::list<InspectorCopy> const& held) {
    out.Name("out").Open('[');
    auto at = held.begin();
    for (ssize_t i = 0; i < method.m_numArgs; ++i, ++at) {
      const ReflectedType type = PlainType(DecodeType({method.m_args[i].m_type, record.m_strings}));
      if (type.m_code != RC_REFERENCE || type.m_inner[0].m_code == RC_CONST) continue;
      InspectorPlace place;
      place.m_name = method.m_args[i].m_name;
      place.m_value = Value(types, at->Type(), at->Address());
      out.Open('{');
      InspectorRows::PutRow(out, place);
      out.Close('}');
    }
    out.Close(']');
  }

  InspectorTree const& m_tree;
};

}  // namespace vesk
