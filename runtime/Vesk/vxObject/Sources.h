// Sources: the fields of models that calculations have read, found again by what a write says of a field. A source
// lives as long as someone depends on it. A read adds one source, a write looks up a few places, however many there
// are.

@import "Vesk/vxObject/Graph.h"
@import "Vesk/vxObject/Path.h"

namespace vesk {

// Whether what is read now becomes an input of a calculation.
inline bool IsInputWanted() {
  GraphState const* state = GraphState::Peek();
  return state && state->m_calculation && state->m_calculation->m_node;
}

// Fields without a path are known by their memory. Elements of a map or a dynamic array have memory of their own;
// they and their container find each other by the name of the field ("Doc::_model_.size.width",
// "Doc::_model_.notes[_k0]"), within the object where the barrier knows it.
class DataSource {
 public:
  // A calculation read the memory [begin, begin + size) of an object, which may be null.
  static void OnRead(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    if (IsInputWanted()) Read(begin, size, object, name);
  }
  // That memory changes.
  static void OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name);

 private:
  static void Read(void const* begin, std::size_t size, void const* object, ConstStringZ name);
};

// The same for models with operations, whose fields are known by object and path.
class PathSource {
 public:
  static void OnRead(void const* object, Path const& path) {
    if (IsInputWanted()) Read(object, path);
  }
  // A copy is handed on, so that the path itself need not be made in memory where nobody has read the object.
  static void OnWrite(void const* object, Path const& path) {
    if (object != s_unread) Write(object, Path(path));
  }

 private:
  friend class PathNode;
  static void Read(void const* object, Path const& path);
  static void Write(void const* object, Path const& path);

  // The object that was written last, if no calculation has read it: it is often the next one, too.
  static inline thread_local void const* s_unread = nullptr;
};

}  // namespace vesk
