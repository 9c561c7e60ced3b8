// The way from a model to a field or an element of it, in bytes: compact integers for the positions of fields and the
// indices of arrays, the bytes of a key as an archive writes it. A path that is the beginning of another one holds it.

@import "Vesk/vxObject/Registry.h"

namespace vesk {

class Path {
 public:
  // A path of a known size: the caller fills the buffer.
  octet_t* InitLocalBuffer(ssize_t size) { return Resize(size); }
  octet_t* InitHeapBuffer(ssize_t size) { return Resize(size); }
  // A path of at most `size` bytes: the caller fills the buffer and tells its end.
  octet_t* BeginReserveLocal() { return Resize(16); }
  octet_t* BeginReserveHeap(ssize_t size) { return Resize(size); }
  void EndReserveLocal(octet_t* end) { m_size = end - Data(); }
  void EndReserveHeap(octet_t* end) { m_size = end - Data(); }

  octet_t const* Data() const { return (m_heap.empty() ? m_local : m_heap.data()) + Ahead; }
  ssize_t Size() const { return m_size; }
  bool Holds(Path const& other) const {
    return m_size <= other.m_size && std::equal(Data(), Data() + m_size, other.Data());
  }

  friend bool operator==(Path const& a, Path const& b) { return a.m_size == b.m_size && a.Holds(b); }
  friend bool operator!=(Path const& a, Path const& b) { return !(a == b); }
  friend bool operator<(Path const& a, Path const& b) {
    return std::lexicographical_compare(a.Data(), a.Data() + a.m_size, b.Data(), b.Data() + b.m_size);
  }

 private:
  // The bytes ahead of a path: with them a key behind one byte, where most are, is aligned. Generated text writes it
  // there as an integer.
  enum { Ahead = 7, LocalSize = 16 };

  octet_t* Data() { return (m_heap.empty() ? m_local : m_heap.data()) + Ahead; }
  octet_t* Resize(ssize_t size) {
    if (size > LocalSize) m_heap.resize(Ahead + size);
    m_size = size;
    return Data();
  }

  alignas(8) octet_t m_local[Ahead + LocalSize];
  xvector<octet_t> m_heap;
  ssize_t m_size = 0;
};

// Writes a path whose keys have no fixed size. A reference as a key is the address of its object.
struct FieldPathArchive : Archive {
  FieldPathArchive() {
    m_writesAddresses = true;
    m_hostOrder = true;
  }
  void InitPath(Path& path) const {
    std::copy(m_bytes.begin(), m_bytes.end(), path.InitHeapBuffer(static_cast<ssize_t>(m_bytes.size())));
  }
};

// --- Paths as text: "lines[2].amount", by the record of the class whose model the path starts in

class PathPrinter {
 public:
  PathPrinter(xostream& os, Path const& path)
      : m_os(os), m_bytes(xvector<octet_t>(path.Data(), path.Data() + path.Size())) {
    m_bytes.m_hostOrder = true;
    m_bytes.m_limits.m_anyEnumNumber = true;
  }

  void Print(ReflectedClass const& record) {
    ReflectedModelField const* field = ReadField(record);
    if (!field) return;
    m_os << field->m_name;
    PrintInside(DecodeType({field->m_type, record.m_strings}));
  }

 private:
  // The positions of a class that references a model are those of the model.
  ReflectedModelField const* ReadField(ReflectedClass const& record) {
    if (m_bytes.Remaining() == 0) return nullptr;
    if (record.m_flags & CF_REFERENCES_MODEL) {
      ReflectedClass const* model = Find<ReflectedClass>(record.m_modelFields[record.m_numModelFields - 1].m_name);
      if (model) Print(*model);
      return nullptr;
    }
    ssize_t position;
    DeserialiseVariableLengthUint(m_bytes, position);
    return position < record.m_numModelFields ? &record.m_modelFields[position] : nullptr;
  }

  void PrintInside(ReflectedType const& type) {
    if (m_bytes.Remaining() == 0) return;
    if (type.m_code >= RC_VOLATILE && type.m_code <= RC_OFFSETTABLE) return PrintInside(type.m_inner.front());
    if (type.m_code == RC_CLASS) {
      ReflectedClass const* record = Find<ReflectedClass>(type.m_name);
      m_os << '.';
      if (record) Print(*record);
    } else if (type.m_code == RC_ARRAY || type.m_code == RC_DYNARRAY) {
      ssize_t index;
      DeserialiseVariableLengthUint(m_bytes, index);
      m_os << '[' << index << ']';
      PrintInside(type.m_inner.front());
    } else if (type.m_code == RC_MAP || type.m_code == RC_SET) {
      m_os << '[';
      PrintKey(type.m_inner.front());
      m_os << ']';
      PrintInside(type.m_inner.back());
    }
  }

  void PrintKey(ReflectedType const& type) {
    if (type.m_code == RC_ENUM) {
      int32 value;
      m_bytes.Read(&value, sizeof(value));
      return PrintValue(m_os, type, &value);
    }
    if (type.m_code == RC_PREF || type.m_code == RC_CREF) {
      void* object;
      m_bytes.Read(&object, sizeof(object));
      m_os << object;
      return;
    }
    TypeOps const* ops = FindTypeOps(type);
    if (!ops || !ops->m_construct || !ops->m_deserialise) return;
    void* key = ::operator new(ops->m_size);
    ops->m_construct(key, 0, 1);
    ops->m_deserialise(m_bytes, key, 0, 1);
    ops->m_print(m_os, key);
    ops->m_destruct(key, 0, 1);
    ::operator delete(key);
  }

  xostream& m_os;
  InputArchive m_bytes;
};

inline xstring PathText(ReflectedClass const& record, Path const& path) {
  return TextOf([&](xostream& os) { PathPrinter(os, path).Print(record); });
}

}  // namespace vesk
