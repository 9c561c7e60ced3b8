// Archives as bytes: the writer, the reader with its limits, and compact integers. Lengths, tags and enumerations are
// compact: up to 7, 14, 21 or 28 bits in 1 to 4 bytes, anything larger in 5. What is read may have been written by
// anyone: the reader refuses, with an ArchiveError, what its bytes cannot hold or its limits do not allow.

@import "Vesk/vxObject/Numbers.h"

#include <cstdlib>
#include <cstring>
#include <stdexcept>
#include <utility>

namespace vesk {

struct XTarget;

class ArchiveError : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
  ~ArchiveError() override;
};
[[noreturn]] void FailArchive(ConstStringZ text);

// Scalars are little-endian on every host. VESK_SWAP_SCALARS turns them around, so that a program on a little-endian
// host can be tested as if it ran on the other kind; all sources of a program must agree on it.
#if defined(VESK_SWAP_SCALARS) || __BYTE_ORDER__ != __ORDER_LITTLE_ENDIAN__
constexpr bool ArchivesSwapBytes = true;
#else
constexpr bool ArchivesSwapBytes = false;
#endif

// Bytes that are appended to, mostly a few at a time; a vector where they are wanted as one.
class ByteBuffer {
 public:
  ByteBuffer() {}
  ByteBuffer(ByteBuffer const& rhs) { Append(rhs.data(), rhs.size()); }
  ByteBuffer(ByteBuffer&& rhs) { Swap(rhs); }
  ByteBuffer& operator=(ByteBuffer rhs) {
    Swap(rhs);
    return *this;
  }
  ~ByteBuffer() { std::free(m_data); }
  operator xvector<octet_t>() const;

  void Append(void const* data, std::size_t size) {
    if (size > m_capacity - m_size) Reserve(size);
    if (size > 0) std::memcpy(m_data + m_size, data, size);
    m_size += size;
  }

  octet_t* data() { return m_data; }
  octet_t const* data() const { return m_data; }
  std::size_t size() const { return m_size; }
  bool empty() const { return m_size == 0; }
  octet_t const* begin() const { return m_data; }
  octet_t const* end() const { return m_data + m_size; }
  octet_t operator[](std::size_t i) const { return m_data[i]; }

 private:
  void Swap(ByteBuffer& rhs) {
    std::swap(m_data, rhs.m_data);
    std::swap(m_size, rhs.m_size);
    std::swap(m_capacity, rhs.m_capacity);
  }
  void Reserve(std::size_t more);

  octet_t* m_data = nullptr;
  std::size_t m_size = 0;
  std::size_t m_capacity = 0;
};

struct InputArchive;
class WrittenModels;

// Writes into memory.
struct Archive {
  void Write(void const* data, std::size_t size) { m_bytes.Append(data, size); }

  ByteBuffer m_bytes;
  WrittenObjects m_objects;
  bool m_writesAddresses = false;     // of objects, in place of the objects
  bool m_hostOrder = false;           // scalars as the host has them: for bytes that stay in memory
  InputArchive* m_answer = nullptr;   // of an `ipc` call, whose results are read through an Archive
  WrittenModels* m_models = nullptr;  // where the archive is to name the releases of what is in it
};

// What an archive may ask of its reader. Whatever takes bytes is bounded by the bytes that are left.
struct ArchiveLimits {
  std::size_t m_bytes = 0xFFFFFFFF;              // of the archive
  std::size_t m_objects = std::size_t(1) << 24;  // behind references
  std::size_t m_emptyElements = 1 << 20;         // of containers, that take no byte of the archive
  std::size_t m_depth = 1000;                    // of values within values
  bool m_anyEnumNumber = false;                  // take numbers of enumerations that have no label
};

// Reads what an Archive wrote. After an error it is of no more use.
struct InputArchive {
  InputArchive();
  explicit InputArchive(xvector<octet_t> bytes, ArchiveLimits const& limits = ArchiveLimits());
  explicit InputArchive(Archive const& archive, ArchiveLimits const& limits = ArchiveLimits());
  InputArchive(InputArchive const&);
  InputArchive(InputArchive&&) noexcept;
  InputArchive& operator=(InputArchive const&);
  InputArchive& operator=(InputArchive&&) noexcept;
  ~InputArchive();

  void Read(void* data, std::size_t size) {
    octet_t const* bytes = Take(size);
    if (size > 0) std::memcpy(data, bytes, size);
  }
  // The next bytes, where they stand.
  octet_t const* Take(std::size_t size) {
    if (size > Remaining()) FailArchive("read beyond the end of an archive");
    octet_t const* bytes = m_bytes.data() + m_position;
    m_position += size;
    return bytes;
  }
  std::size_t Remaining() const { return m_bytes.size() - m_position; }

  void CountEmptyElement() {
    if (++m_emptyElements > m_limits.m_emptyElements) FailArchive("too many empty elements in an archive");
  }

  xvector<octet_t> m_bytes;
  std::size_t m_position = 0;
  ReadObjects m_objects;
  ArchiveLimits m_limits;
  std::size_t m_depth = 0;
  std::size_t m_emptyElements = 0;
  xvector<std::pair<XTarget const*, RSN>> m_releases;  // of the projects that wrote it, as read so far
  bool m_hostOrder = false;
};

// --- The archive being read, for the generated text that asks its release without naming it

struct ReadingState {
  InputArchive const* m_archive = nullptr;  // the innermost one that `>>` reads on this thread
  XTarget const* m_target = nullptr;        // of a release read outside `>>`, for the model that follows it at once
  RSN m_release = 0;
  XTarget const** m_asked = nullptr;  // while a model is only asked for its project
};
inline thread_local ReadingState t_reading;

// A value of a class is read while it lives.
class ReadingScope {
 public:
  explicit ReadingScope(InputArchive& ar) : m_archive(ar), m_outer(t_reading.m_archive) {
    if (ar.m_depth >= ar.m_limits.m_depth) FailArchive("values nested too deeply in an archive");
    ++ar.m_depth;
    t_reading.m_archive = &ar;
  }
  ~ReadingScope() {
    --m_archive.m_depth;
    t_reading.m_archive = m_outer;
  }
  ReadingScope(ReadingScope const&) = delete;
  void operator=(ReadingScope const&) = delete;

 private:
  InputArchive& m_archive;
  InputArchive const* m_outer;
};

// The same for the content of an object, which is no deeper than what refers to it.
class ArchiveScope {
 public:
  explicit ArchiveScope(InputArchive const& ar) : m_outer(std::exchange(t_reading.m_archive, &ar)) {}
  ~ArchiveScope() { t_reading.m_archive = m_outer; }
  ArchiveScope(ArchiveScope const&) = delete;
  void operator=(ArchiveScope const&) = delete;

 private:
  InputArchive const* m_outer;
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
  if (v > 0xFFFFFFFF) FailArchive("too large for a compact integer");
  return static_cast<uint32>(v);
}

template <typename A, typename T>
void SerialiseVariableLengthUint(A& ar, T v) {
  const uint32 value = CompactValue(static_cast<int64>(v));
  octet_t bytes[5] = {static_cast<octet_t>(value)};
  if (value < 0x80) {
    ar.Write(bytes, 1);
  } else {
    ar.Write(bytes, WriteCompact(value, bytes) - bytes);
  }
}

template <typename A>
uint32 ReadCompact(A& ar) {
  octet_t first;
  ar.Read(&first, 1);
  if (first < 0x80) return first;
  int more = 1;
  while (more < 4 && (first & 0x80 >> more)) ++more;
  uint32 value = more == 4 ? 0 : first & (0xFF >> (more + 1));
  octet_t next[4];
  ar.Read(next, more);
  for (int i = 0; i < more; ++i) value = value << 8 | next[i];
  return value;
}

// A variant reads its tag so when its old value is destroyed already: should that fail, no value has the tag -1.
template <typename A, typename T>
void DeserialiseVariableLengthUint(A& ar, T& v) {
  v = static_cast<T>(-1);
  v = static_cast<T>(ReadCompact(ar));
}

// Into a buffer; answers its new end.
inline octet_t* SerialiseVariableLengthInteger(octet_t* p, ssize_t v) { return WriteCompact(CompactValue(v), p); }

}  // namespace vesk
