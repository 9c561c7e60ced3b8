// Values by name: what a property editor, a script or a dump needs of a value that only its record knows. A Value is a
// type of the reflection grammar and an address; it owns nothing and is good while what it shows stands where it stood.
// Fields, elements and entries are reached by position or by name, and are Values in turn. Containers need no
// registration: they are walked by what their kind and the type of their elements tell.
//
// The fields of a class are those that it reflects, then those of its models; a `$dep` field is calculated and no field
// here. Raw pointers, `ptr`, functors and, in what is shown, types without reflection have no value (VK_NONE).
//
// Import this file where it is used; IObject.h does not. Everything throws AccessError unless it says otherwise.

@import "Vesk/vxObject/TypeNames.h"

namespace vesk {

class AccessError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

enum EValueKind {
  VK_NONE,
  VK_BOOL,
  VK_INT,  // signed, 8 to 128 bits
  VK_UINT,
  VK_FLOAT,
  VK_CHAR,  // char8, char16
  VK_TEXT,  // string8, string16
  VK_ENUM,
  VK_CLASS,
  VK_LIST,  // xvector, xdeque, xlist, DynArray, a fixed array
  VK_SET,   // xset, xbag
  VK_MAP,
  VK_VARIANT,
  VK_OPENVARIANT,
  VK_REFERENCE  // pref, cref
};

struct ValueType;
class ValueTypes;

class Value {
 public:
  Value() {}
  // Any reflected type, and containers of such. Throws for a class that nobody registered.
  template <typename T>
  static Value Of(T& value) {
    return Value(TypeOf<std::remove_const_t<T>>(), const_cast<std::remove_const_t<T>*>(&value));
  }
  Value(ReflectedClass const& record, void* object);
  Value(ReflectedType const& type, void* address);
  Value(ReflectionByteCode type, void* address) : Value(DecodeType(type), address) {}
  // Of a type that is resolved already.
  Value(std::shared_ptr<ValueTypes> types, ValueType const& type, void* address)
      : m_types(std::move(types)), m_type(&type), m_address(address) {}

  explicit operator bool() const { return m_address != nullptr; }
  EValueKind Kind() const;
  xstring TypeName() const;  // "xvector<a::Point>"
  void* Address() const { return m_address; }
  // The record of a class; null for anything else.
  ReflectedClass const* Class() const;

  // How many fields, elements or entries; 0 for a value that has none.
  ssize_t Count() const;
  // A field's name, an entry's key, an element's position.
  xstring Name(ssize_t position) const;
  // The field, element or entry's value. Elements of sets must not be changed.
  Value At(ssize_t position) const;
  // All of them in order, until `each` answers false: one walk, where asking by position walks each time.
  typedef std::function<bool(xstring const& name, Value const& value)> EachFunction;
  void Each(EachFunction const& each) const;
  // Those of [first, first + count) alone; what stands ahead of them costs a step each at most, and no name.
  void EachOf(ssize_t first, ssize_t count, EachFunction const& each) const;
  // By a path such as "lines[2].amount" or "prices[apple]". Empty where there is no such thing.
  Value Find(std::string_view path) const;

  // What a reference leads to, the item of a variant, the value in an openvariant; with the item's or type's name.
  // Empty where there is none. The last two are copies, as where they stand only the variant knows: to change them,
  // change the variant.
  Value Target(xstring* name = nullptr) const;

  // A `$dep` field of a class: its value as it stands, calculated or not; empty where it has none.
  Value Dep(ReflectedDepField const& field) const;

  // The value itself. T must be its type.
  template <typename T>
  T const& As() const {
    CheckType(TypeOf<T>());
    return *static_cast<T const*>(m_address);
  }
  // Assigns; tells hooks and the dependency graph, as a write through an accessor does.
  template <typename T>
  void Set(T const& value) const {
    CheckType(TypeOf<T>());
    Change([&] { *static_cast<T*>(m_address) = value; });
  }
  // Lets `write` change what stands at the address, between what hooks and the graph are told.
  void Change(std::function<void()> const& write) const;

  // One line, as `xostream` would print it.
  xstring Text() const;

  ValueType const& Type() const;
  std::shared_ptr<ValueTypes> const& Types() const { return m_types; }

 private:
  // What encloses the value: the objects that are told of a change, and the way from the outermost one.
  struct Owner;

  void CheckType(ReflectedType const& type) const;
  Value Child(ValueType const* type, void* address, xstring const& name) const;
  Value Archived(ValueType const* type, InputArchive& ar) const;
  Value FieldAt(ssize_t position) const;
  xstring EntryName(ssize_t position, void* entry) const;
  bool IsNamed(void* entry, std::string_view name) const;  // of a set or map
  Value FindChild(std::string_view name) const;
  Value EntryAt(ssize_t position, void* entry) const;

  std::shared_ptr<ValueTypes> m_types;
  ValueType const* m_type = nullptr;
  void* m_address = nullptr;
  std::shared_ptr<Owner> m_owner;
};

// All of a value, a line for each field and element.
xstring DumpText(Value const& value);

// --- Methods by name

// Null when the class has no `$` method of this name.
ReflectedClassMethod const* FindMethod(ReflectedClass const& record, std::string_view name);

// Throws unless the method returns and takes exactly these types, and is const where the object is.
void CheckMethod(ReflectedClass const& record, ReflectedClassMethod const& method, ReflectedType const& result,
                 xvector<ReflectedType> const& arguments, bool isConst);

template <typename Signature>
struct MethodCall;
template <typename R, typename... Args>
struct MethodCall<R(Args...)> {
  template <typename C>
  static R Call(C* object, ReflectedClass const& record, std::string_view name, Args... args) {
    ReflectedClassMethod const* method = FindMethod(record, name);
    if (!method) throw AccessError(vxMakeString("no method " << name << " in " << record.m_name));
    CheckMethod(record, *method, TypeOf<R>(), {TypeOf<Args>()...}, std::is_const<C>::value);
    typedef std::remove_const_t<C> Class;
    if (method->m_isConst) {
      return reinterpret_cast<R(__stdcall*)(Class const*, Args...)>(method->m_function)(object,
                                                                                        static_cast<Args>(args)...);
    }
    return reinterpret_cast<R(__stdcall*)(Class*, Args...)>(method->m_function)(const_cast<Class*>(object),
                                                                                static_cast<Args>(args)...);
  }
};

// CallMethod<float64(a::Point const&)>(point, "DistanceTo", other): the signature must be the method's. AccessError
// where there is no such method or its signature differs.
template <typename Signature, typename C, typename... Args>
decltype(auto) CallMethod(C& object, std::string_view name, Args&&... args) {
  ReflectedClass const& record = GetReflectedClass<std::remove_const_t<C>>();
  return MethodCall<Signature>::Call(&object, record, name, std::forward<Args>(args)...);
}
// Of an object that only its record knows.
template <typename Signature, typename... Args>
decltype(auto) CallMethodOf(ReflectedClass const& record, void* object, std::string_view name, Args&&... args) {
  return MethodCall<Signature>::Call(object, record, name, std::forward<Args>(args)...);
}

}  // namespace vesk
