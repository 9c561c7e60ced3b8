// The releases of the projects whose models an archive of WriteObject holds. A class with a model writes the release of
// its project itself; a model of another project that it holds does not, so such an archive names them all ahead of the
// objects: those whose models occur in it, which the reader must know in this release or a later one, then the others
// of the program that wrote it. What an archive writes by `<<` is seen to occur. A model that is written by a call of
// its Serialise is not, but its project is among the others.

@import "Vesk/vxObject/ArchiveBytes.h"

#include <atomic>

namespace vesk {

// How to learn the project of a model from its type.
struct ModelKind {
  ReflectedClass const* (*m_record)();        // may be null
  XTarget const* (*m_ask)();                  // null, or answers null: it does not tell
  std::atomic<bool> m_isChecked;              // by CheckModel
  std::atomic<XTarget const*> m_asked;        // what it answered
};

// ArchiveError where the project of a registered model writes a release that is older than its `$schema`.
void CheckModel(ModelKind& kind);

class WrittenModels {
 public:
  void Add(ModelKind& kind) {
    ModelKind const*& recent = m_recent[reinterpret_cast<std::uintptr_t>(&kind) / alignof(ModelKind) % kRecent];
    if (recent == &kind) return;
    recent = &kind;
    AddNew(kind);
  }
  void Add(ReflectedClass const& record);  // of an object: the model that it references
  void Add(XTarget const& project);

  // The head of an archive: ahead of it stands its mark.
  void WriteHead(Archive& ar) const;

 private:
  static constexpr std::size_t kRecent = 16;
  void AddNew(ModelKind& kind);

  ModelKind const* m_recent[kRecent] = {};
  xvector<XTarget const*> m_projects;
};

// ArchiveError for a project that the program does not have in the archive's release or a later one.
void ReadReleases(InputArchive& ar);

// --- The project of a model

// Thrown at the question for the release, which a model with a `$schema` begins with.
struct ReleaseAsked {};

// Reads a model from nothing, to learn whose release it asks for.
class AskingScope {
 public:
  explicit AskingScope(XTarget const*& asked) : m_outer(t_reading) { t_reading.m_asked = &asked; }
  ~AskingScope() { t_reading = m_outer; }
  AskingScope(AskingScope const&) = delete;
  void operator=(AskingScope const&) = delete;

 private:
  ReadingState m_outer;
};

template <typename M>
XTarget const* AskProject() {
  XTarget const* asked = nullptr;
  M model;
  InputArchive nothing;
  nothing.m_limits.m_depth = 0;
  const AskingScope scope(asked);
  try {
    model.Deserialise(nothing);
  } catch (ReleaseAsked const&) {
  } catch (ArchiveError const&) {
  }
  return asked;
}

// None to a class in whose body a model stands: its constructor may do anything.
template <typename M>
constexpr auto Question() -> XTarget const* (*)() {
  if constexpr (TypeTraits<M>::kind == TTK_model) return AskProject<M>;
  return nullptr;
}

template <typename M>
void NoteModelOfType(WrittenModels* models) {
  static ModelKind kind = {RecordOf<M>, Question<M>(), {false}, {nullptr}};
  if (!kind.m_isChecked.load(std::memory_order_relaxed)) CheckModel(kind);
  if (models) models->Add(kind);
}

template <typename T>
using ModelTypeOf = typename T::model_type;
template <typename T, typename = void>
constexpr bool ReferencesModel = false;
template <typename T>
constexpr bool ReferencesModel<T, std::void_t<ModelTypeOf<T>>> = TypeTraits<ModelTypeOf<T>>::kind == TTK_model;

// Of a value that is written: `models` is null where no archive of objects is written.
template <typename T>
void NoteModel(WrittenModels* models) {
  if constexpr (TypeTraits<T>::kind == TTK_model) {
    NoteModelOfType<T>(models);
  } else if constexpr (ReferencesModel<T>) {
    NoteModelOfType<ModelTypeOf<T>>(models);
  } else if constexpr (ClassTypeTraits<T>::has_model && !ClassTypeTraits<T>::using_model_base_class) {
    NoteModelOfType<T>(models);  // in the body of a class
  }
}

}  // namespace vesk
