// The objects that references lead to, as archives number them: from 1, in the order of their first mention. What is
// read here is checked before anything is made of it, and what a refused archive had made is destroyed.

@import "Vesk/vxObject/Visitors.h"
#include <functional>
#include <map>
#include <typeindex>

#if defined(__linux__)
#include <pthread.h>
#endif

namespace vesk {

struct WrittenObject {
  void const* m_object;
  AnyInterface m_persistable;                       // of an IPersistable object
  void (*m_write)(Archive&, WrittenObject const&);  // its content
};

struct WrittenObjects {
  // An address is several objects where a struct begins with another one. Those with interfaces share the type void.
  typedef std::pair<void const*, std::type_index> Key;

  // Answers the number, and whether the object is new.
  std::pair<std::size_t, bool> Insert(WrittenObject const& object, std::type_info const& type) {
    const auto [at, isNew] = m_numbers.insert({Key(object.m_object, type), m_list.size() + 1});
    if (isNew) m_list.push_back(object);
    return {at->second, isNew};
  }

  xvector<WrittenObject> m_list;
  std::map<Key, std::size_t> m_numbers;
  std::size_t m_next = 0;    // the first object whose content is not written yet
  bool m_isWriting = false;  // who set it writes the contents
};

struct ReadObject {
  void* m_self = nullptr;
  AnyInterface m_persistable;  // of an IPersistable object
  std::type_info const* m_type = nullptr;
  void (*m_read)(InputArchive&, ReadObject const&) = nullptr;  // its content
  void (*m_forget)(ReadObject const&) = nullptr;               // clears its references
  void (*m_destroy)(ReadObject const&) = nullptr;
  bool m_isRead = false;
};

// Clears every reference that it is shown.
struct ReferenceCleaner : IPrefVisitor {
  void VisitPref(PersistentReference const& reference) override {
    const_cast<PersistentReference&>(reference).m_self = nullptr;
  }
};

struct ReadObjects {
  // Destroys the objects from this position on. Their references are cleared ahead of it, so that a destructor that
  // follows one meets nothing that is gone.
  void Destroy(std::size_t first = 0) {
    for (std::size_t i = first; i < m_list.size(); ++i) {
      if (m_list[i].m_self) m_list[i].m_forget(m_list[i]);
    }
    while (m_list.size() > first) {
      const ReadObject object = m_list.back();
      m_list.pop_back();
      if (object.m_self) object.m_destroy(object);
    }
  }

  xvector<ReadObject> m_list;
  std::size_t m_next = 0;                              // the first object whose content may have to be read
  bool m_isReading = false;                            // who set it reads the contents
  std::function<bool(ReflectedClass const&)> m_allow;  // asked before an object is made; empty: all that fit
};

// How many bytes the calling thread's stack can still grow by, or a careful guess where the system does not say.
inline std::size_t StackLeft() {
  char const* here = static_cast<char const*>(__builtin_frame_address(0));
#if defined(__linux__)
  static thread_local char const* s_end = nullptr;
  if (!s_end) {
    pthread_attr_t attributes;
    void* end = nullptr;
    std::size_t size;
    if (pthread_getattr_np(pthread_self(), &attributes) == 0) {
      pthread_attr_getstack(&attributes, &end, &size);
      pthread_attr_destroy(&attributes);
    }
    s_end = static_cast<char const*>(end);
  }
#else
  static thread_local char const* s_end = here - 256 * 1024;
#endif
  return here > s_end ? static_cast<std::size_t>(here - s_end) : 0;
}

}  // namespace vesk
