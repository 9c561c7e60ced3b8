// The engine below Access.h and Json.h: types of the reflection grammar resolved against the registry, with what can be
// done with a value that only its type tells: make, destroy and compare it, and walk and fill containers.
//
// The containers of one kind are laid out alike whatever they hold, as far as code that touches no element can see: a
// vector is a vector of bytes in steps of the element's size, the nodes of a list or tree are links and room behind
// them. So one container of stand-in elements serves as the view of all of its kind, and no container needs to be
// registered or pays for being walked.

@import "Vesk/vxObject/Access.h"

#include <functional>
#include <unordered_map>

namespace vesk {

struct ValueField {
  xstring m_name;
  ssize_t m_offset;
  ValueType const* m_type;
};

struct ValueType {
  EValueKind m_kind = VK_NONE;
  octet_t m_code = RC_VOID;  // behind decorators, const and typedefs
  xstring m_text;
  std::size_t m_size = 0;  // 0 for a type without values
  std::size_t m_align = 1;
  ssize_t m_count = 0;                // of a fixed array
  ValueType const* m_key = nullptr;   // of a map
  ValueType const* m_item = nullptr;  // of a container: its elements, a map's values
  TypeOps const* m_ops = nullptr;     // of a scalar, a string, a class, a variant
  ReflectedClass const* m_class = nullptr;
  ReflectedEnum const* m_enum = nullptr;
  ReflectedVariant const* m_variant = nullptr;
  xstring m_target;     // what a reference leads to: an interface or a class
  xstring m_forgotten;  // of a type without values: the class or variant in it that nobody registered

  // A map's value in its pair.
  std::size_t ValueOffset() const { return (m_key->m_size + m_item->m_align - 1) / m_item->m_align * m_item->m_align; }
  std::size_t EntrySize() const {
    if (!m_key) return m_item->m_size;
    const std::size_t align = EntryAlign();
    return (ValueOffset() + m_item->m_size + align - 1) / align * align;
  }
  std::size_t EntryAlign() const { return m_key ? std::max(m_key->m_align, m_item->m_align) : m_item->m_align; }
  // The value of an entry (of a map) or the element itself.
  void* ItemOf(void* entry) const { return m_key ? static_cast<octet_t*>(entry) + ValueOffset() : entry; }
};

// Resolves types, each once. It belongs to one thread, and what it resolved must stay registered.
class ValueTypes {
 public:
  ValueType const& Of(ReflectedType const& type);
  ValueType const& Of(ReflectedClass const& record);
  xvector<ValueField> const& FieldsOf(ValueType const& type);
  // Null unless they were asked for before.
  xvector<ValueField> const* KnownFieldsOf(ValueType const& type) const;
  // The type of a variant's item: null for an item without reflection.
  ValueType const* ItemOf(ReflectedVariant const& record, ssize_t item);

 private:
  template <typename Fill>
  ValueType const& Add(xstring const& text, Fill fill);
  void Resolve(ValueType& type, ReflectedType const& plain);
  void ResolveContainer(ValueType& type, ReflectedType const& plain);
  void AddFields(xvector<ValueField>& fields, ReflectedClass const& record, ssize_t offset);

  std::map<xstring, ValueType> m_types;
  std::unordered_map<ReflectedClass const*, xvector<ValueField>> m_fields;
};

// --- Values of any type. Make throws AccessError for a type without a default.

void MakeValue(ValueType const& type, void* address);
void DestroyValue(ValueType const& type, void* address);
bool LessValue(ValueType const& type, void const* a, void const* b);

// A value of its own.
class HeldValue {
 public:
  explicit HeldValue(ValueType const& type)
      : m_type(type), m_memory(::operator new(std::max<std::size_t>(type.m_size, 1))) {
    try {
      MakeValue(type, m_memory);
    } catch (...) {
      ::operator delete(m_memory);
      throw;
    }
  }
  ~HeldValue() {
    DestroyValue(m_type, m_memory);
    ::operator delete(m_memory);
  }
  HeldValue(HeldValue const&) = delete;
  void operator=(HeldValue const&) = delete;
  void* Get() const { return m_memory; }

 private:
  ValueType const& m_type;
  void* m_memory;
};

// --- Containers. An entry is an element, or the pair of a map.

// What is called for the time of a call, and not kept. For each lambda that is a std::function the compiler makes a
// dozen functions.
template <typename R>
class EntryFunction {
 public:
  template <typename F>
  EntryFunction(F const& function) : m_function(&function), m_call(Call<F>) {}
  R operator()(void* entry) const { return m_call(m_function, entry); }

 private:
  template <typename F>
  static R Call(void const* function, void* entry) {
    return static_cast<R>((*static_cast<F const*>(function))(entry));
  }

  void const* m_function;
  R (*m_call)(void const*, void*);
};
typedef EntryFunction<void> ValueFunction;

ssize_t CountOf(ValueType const& type, void const* container);
// The entry at a position that the container has; of bits nothing but that there is one.
void* EntryOf(ValueType const& type, void* container, ssize_t position);
// Until `each` answers false.
void EachEntry(ValueType const& type, void* container, EntryFunction<bool> const& each);
void MakeContainer(ValueType const& type, void* container);
// Destroys the entries, not the container.
void ClearContainer(ValueType const& type, void* container);
void DestroyContainer(ValueType const& type, void* container);
// A vector, deque, list or DynArray of so many fresh elements, in place of what it held.
void ResizeList(ValueType const& type, void* container, ssize_t count);
// The entry of the key that `fill` completes, its value fresh. Null when a set or map has the key already.
void* InsertEntry(ValueType const& type, void* container, ValueFunction const& fill);

// Whether a pref or cref may stand in such a value.
bool HasReferences(ValueTypes& types, ValueType const& type);

// --- Copies. Both values are of the type; AccessError for what cannot be copied. After an error `to` is any value.

void CopyValue(ValueType const& type, void* to, void const* from);
// Two lists of the type: no element is touched.
void SwapLists(ValueType const& type, void* a, void* b);

// --- Archives of values by structure, as the archive of a variant or an openvariant holds them

void WriteValue(Archive& ar, ValueType const& type, void* address);
void ReadValue(InputArchive& ar, ValueType const& type, void* address);

// --- `$indep` fields: the record tells where the node stands, and the value stands before it

// Null for a field that is no `$indep`.
DGIndepNode* IndepNodeAt(ReflectedClass const& record, void* object, ValueField const& field);
// Null where the node does not tell.
void* ValueBeforeNode(DGIndepNode& node, ValueType const& type);

}  // namespace vesk
