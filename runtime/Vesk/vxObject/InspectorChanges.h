// What the page changes, and how it is undone. A change goes the way that Value::Change goes: hooks are told, and may
// refuse it by throwing; models, `$indep` fields and what depends on them hear of it. It is checked whole before
// anything changes: the text by the reader of JSON, the number against the range in the metadata.
//
// What is kept of a change is a copy of the value before and after it, or of the element that came or went. It is
// undone while what it made is still there: not when the program has changed the place meanwhile. References are not
// changed: a copy might outlive what it refers to. Lists of them are only put in another order.

@import "Vesk/vxObject/InspectorRows.h"

namespace vesk {

// A copy of a value, with its type.
class InspectorCopy {
 public:
  explicit InspectorCopy(Value const& value) : InspectorCopy(value.Types(), value.Type()) {
    CopyValue(m_type, m_held.Get(), value.Address());
  }
  // A fresh value.
  InspectorCopy(std::shared_ptr<ValueTypes> types, ValueType const& type)
      : m_types(std::move(types)), m_type(type), m_held(type) {}

  ValueType const& Type() const { return m_type; }
  void* Address() const { return m_held.Get(); }
  bool IsTypeOf(Value const& value) const { return value && value.Type().m_text == m_type.m_text; }
  // Whether the value is what was copied, as far as that can be told: by its equality, else by its archive.
  bool Equals(Value const& value) const {
    if (!IsTypeOf(value)) return false;
    if (m_type.m_ops && m_type.m_ops->m_equal && m_type.m_kind != VK_FLOAT) {
      return m_type.m_ops->m_equal(m_held.Get(), value.Address());
    }
    if (InspectorRows::IsScalar(m_type.m_kind)) return std::memcmp(m_held.Get(), value.Address(), m_type.m_size) == 0;
    try {
      Archive a, b;
      WriteValue(a, m_type, m_held.Get());
      WriteValue(b, value.Type(), value.Address());
      return std::equal(a.m_bytes.begin(), a.m_bytes.end(), b.m_bytes.begin(), b.m_bytes.end());
    } catch (std::exception const&) {
      return true;
    }
  }

 private:
  std::shared_ptr<ValueTypes> m_types;
  ValueType const& m_type;
  HeldValue m_held;
};

// InspectorError unless the numbers in a value are what the metadata allow: its own, for the fields of a class theirs,
// and for the elements of a container what is said of it.
inline void CheckInspectorRange(Value const& value, xvector<MetadataValue> const& metadata) {
  const EValueKind kind = value.Kind();
  if (kind == VK_CLASS || kind == VK_LIST || kind == VK_SET || kind == VK_MAP) {
    value.Each([&](xstring const& name, Value const& inner) {
      CheckInspectorRange(inner, kind == VK_CLASS ? InspectorDeclared(*value.Class(), name).m_metadata : metadata);
      return true;
    });
    return;
  }
  const InspectorMetadata range(metadata);
  if ((!range.m_hasLeast && !range.m_hasMost) || (kind != VK_INT && kind != VK_UINT && kind != VK_FLOAT)) return;
  const xstring text = value.Text();
  const float64 number = std::strtod(text.c_str(), nullptr);
  if (range.m_hasLeast && !(number >= range.m_least)) {
    throw InspectorError(vxMakeString(text << " is less than " << range.m_least));
  }
  if (range.m_hasMost && !(number <= range.m_most)) {
    throw InspectorError(vxMakeString(text << " is more than " << range.m_most));
  }
}

class InspectorChanges {
 public:
  explicit InspectorChanges(InspectorTree const& tree) : m_tree(tree) {}

  bool IsAllowed() const { return m_isAllowed; }
  void Allow(bool isAllowed) { m_isAllowed = isAllowed; }
  void CheckAllowed() const {
    if (!m_isAllowed) throw InspectorError("the program does not allow changes");
  }

  // Whether values of the type may come and go.
  static bool IsPlain(Value const& value, ValueType const& type) { return !HasReferences(*value.Types(), type); }

  // Gives the value at a path what the JSON says.
  void Set(InspectorJson const& path, InspectorJson const& json) {
    InspectorPlace const place = Changeable(path);
    CheckPlain(place.m_value, place.m_value.Type());
    if (place.m_value.Kind() != VK_CLASS && place.m_value.Count() > kMostSet)
      throw InspectorError("too large to be set");
    Change change(Change::Set, path, place.m_name);
    change.m_before = std::make_shared<InspectorCopy>(place.m_value);
    change.m_after = Made(place, place.m_value.Type(), json);
    Do(std::move(change));
  }
  // A new element of a list ahead of a position: what the JSON says, or a fresh one.
  void Insert(InspectorJson const& path, ssize_t at, InspectorJson const& json) {
    InspectorPlace const place = List(path);
    Change change(Change::Insert, path, place.m_name);
    change.m_from = at;
    ValueType const& item = *place.m_value.Type().m_item;
    CheckPlain(place.m_value, item);
    InspectorPlace element;
    element.m_declared = InspectorInner(place.m_declared);
    if (element.m_declared.m_metadata.empty()) element.m_declared.m_metadata = place.m_declared.m_metadata;
    element.m_value = place.m_value;
    change.m_after = json.m_kind == InspectorJson::Null ? std::make_shared<InspectorCopy>(place.m_value.Types(), item)
                                                        : Made(element, item, json);
    Do(std::move(change));
  }
  void Remove(InspectorJson const& path, ssize_t at) {
    InspectorPlace const place = List(path);
    CheckPlain(place.m_value, *place.m_value.Type().m_item);
    Change change(Change::Remove, path, place.m_name);
    change.m_from = at;
    change.m_before = std::make_shared<InspectorCopy>(place.m_value.At(at));
    Do(std::move(change));
  }
  void Move(InspectorJson const& path, ssize_t from, ssize_t to) {
    InspectorPlace const place = List(path);
    Change change(Change::Move, path, place.m_name);
    change.m_from = from;
    change.m_to = to;
    Do(std::move(change));
  }

  void Undo() { Step(m_done, m_undone, true); }
  void Redo() { Step(m_undone, m_done, false); }
  // What would be undone and redone, for who asks; empty for nothing.
  xstring UndoText() const { return m_done.empty() ? xstring() : m_done.back().Text(); }
  xstring RedoText() const { return m_undone.empty() ? xstring() : m_undone.back().Text(); }

 private:
  struct Change {
    enum EKind { Set, Insert, Remove, Move };
    Change(EKind kind, InspectorJson const& path, xstring const& name)
        : m_kind(kind), m_path(path.m_raw), m_name(name) {}
    xstring Text() const {
      constexpr ConstStringZ kVerbs[] = {"set ", "add to ", "remove from ", "move in "};
      return kVerbs[m_kind] + m_name;
    }

    EKind m_kind;
    xstring m_path;  // as JSON
    xstring m_name;
    std::shared_ptr<InspectorCopy> m_before, m_after;  // of an element that goes, that comes
    ssize_t m_from = 0, m_to = 0;
  };
  typedef xdeque<Change> Changes;
  static constexpr std::size_t kMostChanges = 200;
  static constexpr ssize_t kMostSet = 10000;  // elements of what is set as a whole: both values are kept

  static void CheckPlain(Value const& value, ValueType const& type) {
    if (!IsPlain(value, type)) throw InspectorError("references are not changed from here");
  }
  InspectorPlace Changeable(InspectorJson const& path) const {
    CheckAllowed();
    InspectorPlace place = m_tree.Find(path);
    if (place.m_node) throw InspectorError("the value is calculated");
    if (place.m_isFixed || !place.m_value) throw InspectorError("what stands here cannot be changed by itself");
    return place;
  }
  InspectorPlace List(InspectorJson const& path) const {
    InspectorPlace place = InspectorTree::Opened(Changeable(path));
    if (place.m_isFixed || !InspectorRows::IsList(place)) throw InspectorError("no list of any length");
    return place;
  }

  // No objects come of it: nothing would own them.
  static std::shared_ptr<InspectorCopy> Made(InspectorPlace const& place, ValueType const& type,
                                             InspectorJson const& json) {
    const auto made = std::make_shared<InspectorCopy>(place.m_value.Types(), type);
    const Value value(place.m_value.Types(), type, made->Address());
    JsonLimits limits;
    limits.m_memory = 16 << 20;
    limits.m_allow = [](ReflectedClass const&) { return false; };
    FromJson(value, json.m_raw, limits);
    CheckInspectorRange(value, place.m_declared.m_metadata);
    return made;
  }
  void Do(Change change) {
    Apply(change, false);
    m_undone.clear();
    m_done.push_back(std::move(change));
    if (m_done.size() > kMostChanges) m_done.pop_front();
  }
  // What cannot be done any more is forgotten.
  void Step(Changes& from, Changes& to, bool isUndo) {
    CheckAllowed();
    if (from.empty()) throw InspectorError(isUndo ? "nothing to undo" : "nothing to redo");
    Change change = std::move(from.back());
    from.pop_back();
    Apply(change, isUndo);
    to.push_back(std::move(change));
  }

  void Apply(Change const& change, bool isUndo) const {
    const InspectorJson path = InspectorJson::Parse(change.m_path);
    if (change.m_kind == Change::Set) {
      return Assign(Changeable(path).m_value, isUndo ? *change.m_after : *change.m_before,
                    isUndo ? *change.m_before : *change.m_after);
    }
    const Value list = List(path).m_value;
    if (change.m_kind == Change::Move) {
      return isUndo ? Shift(list, change.m_to, change.m_from) : Shift(list, change.m_from, change.m_to);
    }
    const bool isRemoval = (change.m_kind == Change::Remove) != isUndo;
    InspectorCopy const& element = change.m_kind == Change::Insert ? *change.m_after : *change.m_before;
    isRemoval ? TakeOut(list, change.m_from, element) : PutIn(list, change.m_from, element);
  }

  static void Assign(Value const& value, InspectorCopy const& was, InspectorCopy const& becomes) {
    if (!was.Equals(value)) throw InspectorError("the program has changed it meanwhile");
    value.Change([&] { CopyValue(becomes.Type(), value.Address(), becomes.Address()); });
  }
  static void CheckPosition(ssize_t at, ssize_t end) {
    if (at < 0 || at >= end) throw InspectorError("no such position");
  }
  static void PutIn(Value const& list, ssize_t at, InspectorCopy const& element) {
    const ssize_t count = list.Count();
    CheckPosition(at, count + 1);
    Rebuild(list, count + 1, &element, at, [at](ssize_t position) { return position < at ? position : position - 1; });
  }
  static void TakeOut(Value const& list, ssize_t at, InspectorCopy const& element) {
    const ssize_t count = list.Count();
    CheckPosition(at, count);
    if (!element.Equals(list.At(at))) throw InspectorError("the program has changed it meanwhile");
    Rebuild(list, count - 1, nullptr, -1, [at](ssize_t position) { return position < at ? position : position + 1; });
  }
  static void Shift(Value const& list, ssize_t from, ssize_t to) {
    const ssize_t count = list.Count();
    CheckPosition(from, count);
    CheckPosition(to, count);
    Rebuild(list, count, nullptr, -1, [from, to](ssize_t position) {
      if (position == to) return from;
      const ssize_t rest = position > to ? position - 1 : position;
      return rest < from ? rest : rest + 1;
    });
  }
  // A list of the elements at other positions, with one that comes at `at`, takes the place of the old one.
  static void Rebuild(Value const& list, ssize_t count, InspectorCopy const* added, ssize_t at,
                      std::function<ssize_t(ssize_t)> const& positionOf) {
    ValueType const& type = list.Type();
    const HeldValue made(type);
    ResizeList(type, made.Get(), count);
    if (type.m_code == RC_VECTOR && type.m_item->m_kind == VK_BOOL) {
      xvector<bool> const& old = list.As<xvector<bool>>();
      xvector<bool>& bits = *static_cast<xvector<bool>*>(made.Get());
      for (ssize_t i = 0; i < count; ++i)
        bits[i] = i == at ? *static_cast<bool*>(added->Address()) : old[positionOf(i)];
    } else {
      xvector<void*> elements;
      EachEntry(type, list.Address(), [&](void* element) {
        elements.push_back(element);
        return true;
      });
      ssize_t i = 0;
      EachEntry(type, made.Get(), [&](void* element) {
        CopyValue(*type.m_item, element, i == at ? added->Address() : elements[positionOf(i)]);
        return ++i > 0;
      });
    }
    list.Change([&] { SwapLists(type, list.Address(), made.Get()); });
  }

  InspectorTree const& m_tree;
  bool m_isAllowed = false;
  Changes m_done, m_undone;
};

}  // namespace vesk
