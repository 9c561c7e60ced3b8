// The way from a model to a field or an element of it, in bytes: compact integers for the positions of fields and the
// indices of arrays, the bytes of a key as an archive writes it. A path that is the beginning of another one holds it.

@import "Vesk/vxObject/Registry.h"
#include <algorithm>
#include <cstring>

namespace vesk {

class Path {
 public:
  Path() {}
  Path(Path const& rhs) {
    octet_t* const to = Resize(rhs.m_size);
    if (m_size == 1) {  // a field, just written: no processor is quick to read more than that
      *to = *rhs.Data();
    } else {
      std::memcpy(to, rhs.Data(), static_cast<std::size_t>(m_size));
    }
  }
  Path& operator=(Path const& rhs) {
    if (this != &rhs) std::memcpy(Resize(rhs.m_size), rhs.Data(), static_cast<std::size_t>(rhs.m_size));
    return *this;
  }
  ~Path() { delete[] m_heap; }

  // A path of a known size: the caller fills the buffer.
  octet_t* InitLocalBuffer(ssize_t size) { return Resize(size); }
  octet_t* InitHeapBuffer(ssize_t size) { return Resize(size); }
  // A path of at most `size` bytes: the caller fills the buffer and tells its end.
  octet_t* BeginReserveLocal() { return Resize(16); }
  octet_t* BeginReserveHeap(ssize_t size) { return Resize(size); }
  void EndReserveLocal(octet_t* end) { m_size = end - Data(); }
  void EndReserveHeap(octet_t* end) { m_size = end - Data(); }

  octet_t const* Data() const { return (m_heap ? m_heap : m_local) + Ahead; }
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

  octet_t* Data() { return (m_heap ? m_heap : m_local) + Ahead; }
  octet_t* Resize(ssize_t size) {
    if (size > LocalSize) delete[] std::exchange(m_heap, new octet_t[static_cast<std::size_t>(Ahead + size)]);
    m_size = size;
    return Data();
  }

  alignas(8) octet_t m_local[Ahead + LocalSize];
  octet_t* m_heap = nullptr;  // of a longer path
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

xstring PathText(ReflectedClass const& record, Path const& path);

}  // namespace vesk
