// Archives. Scalars are their bytes, little-endian; lengths, tags and enumerations are compact: up to 7, 14, 21 or 28
// bits in 1 to 4 bytes, anything larger in 5. Strings and containers are a length and their items. A type is written by
// its own Serialise(Archive&), else by the function Serialise(Archive&, T) of its name space.

@import "Vesk/vxObject/Handles.h"

#include <cstring>
#include <unordered_map>

namespace vesk {

class ArchiveError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

// Writes into memory.
struct Archive {
  void Write(void const* data, std::size_t size) {
    octet_t const* bytes = static_cast<octet_t const*>(data);
    m_bytes.insert(m_bytes.end(), bytes, bytes + size);
  }

  xvector<octet_t> m_bytes;
  std::unordered_map<void const*, uint32> m_objects;  // written so far, by number
  bool m_writesAddresses = false;                     // of objects, in place of the objects
};

// Reads what an Archive wrote.
struct InputArchive {
  InputArchive() {}
  explicit InputArchive(xvector<octet_t> bytes) : m_bytes(std::move(bytes)) {}
  explicit InputArchive(Archive const& archive) : m_bytes(archive.m_bytes) {}

  void Read(void* data, std::size_t size) {
    if (size > m_bytes.size() - m_position) throw ArchiveError("read beyond the end of an archive");
    if (size > 0) std::memcpy(data, m_bytes.data() + m_position, size);
    m_position += size;
  }
  std::size_t Remaining() const { return m_bytes.size() - m_position; }

  struct ReadObject {
    void* m_self;                // as cref<C> sees it
    AnyInterface m_persistable;  // of an IPersistable object
  };

  xvector<octet_t> m_bytes;
  std::size_t m_position = 0;
  xvector<ReadObject> m_objects;  // read so far, by number
};

// --- Compact unsigned integers of 32 bits

template <typename Out>
Out WriteCompact(uint32 v, Out out) {
  const int more = v < 0x80 ? 0 : v < 0x4000 ? 1 : v < 0x200000 ? 2 : v < 0x10000000 ? 3 : 4;
  *out++ = more == 4 ? 0xF0 : static_cast<octet_t>((0xF00 >> more & 0xFF) | v >> 8 * more);
  for (int i = more - 1; i >= 0; --i) *out++ = static_cast<octet_t>(v >> 8 * i);
  return out;
}

inline uint32 CompactValue(int64 v) {
  if (v > 0xFFFFFFFF) throw ArchiveError("too large for a compact integer");
  return static_cast<uint32>(v);
}

template <typename A, typename T>
void SerialiseVariableLengthUint(A& ar, T v) {
  octet_t bytes[5];
  ar.Write(bytes, WriteCompact(CompactValue(static_cast<int64>(v)), bytes) - bytes);
}

template <typename A, typename T>
void DeserialiseVariableLengthUint(A& ar, T& v) {
  octet_t first;
  ar.Read(&first, 1);
  int more = 0;
  while (more < 4 && (first & 0x80 >> more)) ++more;
  uint32 value = more == 4 ? 0 : first & (0xFF >> (more + 1));
  for (int i = 0; i < more; ++i) {
    octet_t next;
    ar.Read(&next, 1);
    value = value << 8 | next;
  }
  v = static_cast<T>(value);
}

// Into a buffer; answers its new end.
inline octet_t* SerialiseVariableLengthInteger(octet_t* p, ssize_t v) { return WriteCompact(CompactValue(v), p); }

// --- Values

template <typename T>
Archive& operator<<(Archive& ar, T const& v);
template <typename T>
InputArchive& operator>>(InputArchive& ar, T& v);

template <typename T, typename = std::enable_if_t<IsArithmetic<T>>>
void Serialise(Archive& ar, T v) {
  ar.Write(&v, sizeof(v));
}
template <typename T, typename = std::enable_if_t<IsArithmetic<T>>>
void Deserialise(InputArchive& ar, T& v) {
  ar.Read(&v, sizeof(v));
}

template <typename C>
void Serialise(Archive& ar, basic_xstring<C> const& v) {
  SerialiseVariableLengthUint(ar, v.size());
  ar.Write(v.data(), v.size() * sizeof(C));
}
template <typename C>
void Deserialise(InputArchive& ar, basic_xstring<C>& v) {
  std::size_t size;
  DeserialiseVariableLengthUint(ar, size);
  if (size > ar.Remaining() / sizeof(C)) throw ArchiveError("string longer than its archive");
  v.resize(size);
  ar.Read(&v[0], size * sizeof(C));
}

template <typename A, typename B>
void Serialise(Archive& ar, std::pair<A, B> const& v) {
  ar << v.first << v.second;
}
template <typename A, typename B>
void Deserialise(InputArchive& ar, std::pair<A, B>& v) {
  ar >> v.first >> v.second;
}

template <typename T, typename = std::enable_if_t<IsContainer<T>>>
void Serialise(Archive& ar, T const& v) {
  SerialiseVariableLengthUint(ar, v.size());
  for (auto const& item : v) ar << item;
}
template <typename T, typename = std::enable_if_t<IsContainer<T>>, typename = void>
void Deserialise(InputArchive& ar, T& v) {
  typedef ContainerTraits<T> Traits;
  ssize_t size;
  DeserialiseVariableLengthUint(ar, size);
  if constexpr (Traits::grows || Traits::keyed) {
    v.clear();
    for (ssize_t i = 0; i < size; ++i) {
      typename Traits::element_type item = typename Traits::element_type();
      ar >> item;
      v.insert(v.end(), std::move(item));
    }
  } else {
    if constexpr (std::is_same<T, DynArray<typename Traits::element_type>>::value) {
      if (size > static_cast<ssize_t>(ar.Remaining())) throw ArchiveError("array longer than its archive");
      v.resize(size);
    }
    if (size != v.size()) throw ArchiveError("fixed array of another size");
    for (typename Traits::element_type& item : v) ar >> item;
  }
}

// --- Dispatch

template <typename T>
using SerialiseMember = decltype(std::declval<T const&>().Serialise(std::declval<Archive&>()));
template <typename T>
using SerialiseFunction = decltype(Serialise(std::declval<Archive&>(), std::declval<T const&>()));
template <typename T>
using DeserialiseMember = decltype(std::declval<T&>().Deserialise(std::declval<InputArchive&>()));
template <typename T>
using DeserialiseFunction = decltype(Deserialise(std::declval<InputArchive&>(), std::declval<T&>()));

template <typename T>
Archive& operator<<(Archive& ar, T const& v) {
  if constexpr (std::is_enum<T>::value) {
    SerialiseVariableLengthUint(ar, static_cast<uint32>(v));
  } else if constexpr (Detects<SerialiseMember, T>) {
    v.Serialise(ar);
  } else {
    Serialise(ar, v);
  }
  return ar;
}

template <typename T>
InputArchive& operator>>(InputArchive& ar, T& v) {
  if constexpr (std::is_enum<T>::value) {
    uint32 value;
    DeserialiseVariableLengthUint(ar, value);
    v = static_cast<T>(static_cast<int32>(value));
  } else if constexpr (Detects<DeserialiseMember, T>) {
    v.Deserialise(ar);
  } else {
    Deserialise(ar, v);
  }
  return ar;
}

}  // namespace vesk
