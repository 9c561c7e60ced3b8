// The objects that references lead to, as archives number them: from 1, in the order of their first mention. What is
// read here is checked before anything is made of it, and what a refused archive had made is destroyed.

@import "Vesk/vxObject/Visitors.h"
#include <functional>
#include <typeinfo>

namespace vesk {

struct WrittenObject {
  void const* m_object;
  AnyInterface m_persistable;                       // of an IPersistable object
  void (*m_write)(Archive&, WrittenObject const&);  // its content
};

// The numbers of objects by their addresses and types.
class ObjectNumbers {
 public:
  ObjectNumbers() {}
  ObjectNumbers(ObjectNumbers const& rhs);
  ObjectNumbers(ObjectNumbers&& rhs) noexcept : m_table(std::exchange(rhs.m_table, nullptr)) {}
  ObjectNumbers& operator=(ObjectNumbers rhs) noexcept {
    std::swap(m_table, rhs.m_table);
    return *this;
  }
  ~ObjectNumbers() {
    if (m_table) Drop();
  }

  // That of an object; `next` for a new one, which has it from now on.
  std::size_t Of(void const* object, std::type_info const& type, std::size_t next);

 private:
  struct Table;
  void Drop();
  Table* m_table = nullptr;
};

struct WrittenObjects {
  WrittenObjects();
  WrittenObjects(WrittenObjects const&);
  WrittenObjects(WrittenObjects&&);
  WrittenObjects& operator=(WrittenObjects const&);
  WrittenObjects& operator=(WrittenObjects&&);
  ~WrittenObjects();
  // Answers the number, and whether the object is new.
  std::pair<std::size_t, bool> Insert(WrittenObject const& object, std::type_info const& type);

  xvector<WrittenObject> m_list;
  ObjectNumbers m_numbers;
  std::size_t m_next = 0;                    // the first object whose content is not written yet
  bool m_isWriting = false;                  // who set it writes the contents
  ReflectedClass const* m_record = nullptr;  // the class that was written last
};

struct NumberedObject {
  void* m_self = nullptr;
  AnyInterface m_persistable;  // of an IPersistable object
  std::type_info const* m_type = nullptr;
  void (*m_read)(InputArchive&, NumberedObject const&) = nullptr;  // its content
  void (*m_forget)(NumberedObject const&) = nullptr;               // clears its references
  void (*m_destroy)(NumberedObject const&) = nullptr;
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
  void Destroy(std::size_t first = 0);

  xvector<NumberedObject> m_list;
  std::size_t m_next = 0;    // the first object whose content may have to be read
  bool m_isReading = false;  // who set it reads the contents
  // Asked before what the archive names is made; empty: all that fit.
  std::function<bool(ReflectedClass const&)> m_allow;    // of an object, or of an openvariant's value that has one
  std::function<bool(xstring const& type)> m_allowType;  // of any value of an openvariant
};

// How many bytes the calling thread's stack can still grow by, or a careful guess where the system does not say.
std::size_t StackLeft();

}  // namespace vesk
