// The nodes of the fields that calculations have read.

@import "Vesk/vxObject/GraphWatch.h"
@import "Vesk/vxObject/Sources.h"

#include <algorithm>
#include <list>
#include <map>
#include <unordered_map>

namespace vesk {

// Sources that are kept though nobody reads them: what is written is most often read again soon. Those that are read
// while they are here stay until it is their turn to go.
struct IdlePlace : DGPlace {};
class Source;
struct IdleSources : PerThread<IdleSources> {
  enum { Most = 64 };
  ~IdleSources();
  void MakeRoom() {
    while (m_count >= Most) DropOldest();
  }
  void Add(Source const& source);
  void DropOldest();

  NodeList<IdlePlace> m_list;
  ssize_t m_count = 0;
};

class Source : public DGNode, private IdlePlace {
 public:
  void OnUnread() const {
    if (m_idle) return;
    if (IdleSources* idle = IdleSources::Peek()) {
      idle->MakeRoom();
      idle->Add(*this);
    } else {
      delete this;
    }
  }

 protected:
  explicit Source(IdleSources& idle) : DGNode(DF_SOURCE) { idle.Add(*this); }
  ~Source() override { LeaveIdle(); }

 private:
  friend struct IdleSources;
  void LeaveIdle() const {
    if (IdleSources* idle = std::exchange(m_idle, nullptr)) --idle->m_count;
    Leave(static_cast<IdlePlace const&>(*this));
  }
  mutable IdleSources* m_idle = nullptr;
};

void GraphState::OnSourceUnread(DGNode const& source) { static_cast<Source const&>(source).OnUnread(); }

IdleSources::~IdleSources() {
  while (m_count > 0) DropOldest();
}
void IdleSources::Add(Source const& source) {
  source.m_idle = this;
  m_list.Append(source);
  ++m_count;
}
void IdleSources::DropOldest() {
  Source const* const source = static_cast<Source const*>(static_cast<IdlePlace const*>(m_list.First()));
  source->LeaveIdle();
  if (!GraphState::IsRead(*source)) delete source;
}

typedef GraphState::Changes Changes;

class DataNode : public Source {
 public:
  xstring Name() const override { return m_name->first; }
  void Describe(GraphSource& source) const {
    source.m_object = m_field->first.first;
    source.m_name = m_name->first;
  }

  static void OnRead(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(begin)) return;
    IdleSources& idle = IdleSources::Get();
    idle.MakeRoom();
    Table& table = Table::Get();
    AddressMap& addresses = table.m_bySize[SizeClass(size)];
    octet_t const* address = static_cast<octet_t const*>(begin);
    for (auto [at, end] = addresses.equal_range(address); at != end; ++at) {
      if (at->second->m_size == size && at->second->m_name->first == name) return state.Link(*at->second);
    }
    state.Link(*new DataNode(idle, table, addresses, address, size, object, name));
  }

  static void OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    Table* table = Table::Peek();
    if (!table || table->m_bySize.empty()) return;
    Changes found;
    table->FindMemory(static_cast<octet_t const*>(begin), size, found);
    if (name) table->FindField(object, name, found);
    if (!found.IsEmpty()) GraphState::Get().Change(found);
  }

 private:
  typedef std::multimap<octet_t const*, DataNode*> AddressMap;
  typedef std::map<std::string, std::list<DataNode*>> NameMap;  // of one field and its elements
  typedef std::pair<void const*, std::string> Field;            // an object, and the name up to an index
  typedef std::pair<void const*, std::string_view> FieldView;

  struct FieldLess {
    typedef void is_transparent;
    template <typename A, typename B>
    bool operator()(A const& a, B const& b) const {
      return a.first != b.first ? std::less<void const*>()(a.first, b.first)
                                : std::string_view(a.second) < std::string_view(b.second);
    }
  };
  typedef std::map<Field, NameMap, FieldLess> FieldMap;

  struct Table : PerThread<Table> {
    // Fields of about one size are each within another or apart, so that only those near an address can hold it.
    void FindMemory(octet_t const* address, std::size_t size, Changes& found) const {
      for (auto const& [sizeClass, addresses] : m_bySize) {
        const std::uintptr_t most = std::uintptr_t(1) << sizeClass;
        const std::uintptr_t number = reinterpret_cast<std::uintptr_t>(address);
        const std::uintptr_t from = number > most ? number - most : 0;
        auto at = addresses.lower_bound(reinterpret_cast<octet_t const*>(from));
        for (; at != addresses.end() && at->first < address + size; ++at) {
          if (at->first + at->second->m_size > address) GraphState::Join(*at->second, found);
        }
      }
    }

    // A container, or a model around it, finds the elements; an element finds what is around it, and other depths.
    void FindField(void const* object, std::string_view name, Changes& found) const {
      const std::string_view field = name.substr(0, name.find('['));
      const auto at = m_byField.find(FieldView(object, field));
      if (at != m_byField.end()) {
        for (auto const& [other, sources] : at->second) {
          if (other != name) JoinAll(sources, found);
        }
      }
      if (field.size() == name.size()) return FindElementsInside(object, field, found);
      for (std::size_t end = field.rfind('.'); end != field.npos; end = field.substr(0, end).rfind('.')) {
        FindWhole(object, field.substr(0, end), found);
      }
      const std::size_t model = field.find("::_model_");
      if (model != field.npos) FindWhole(object, field.substr(0, model), found);
    }
    void FindElementsInside(void const* object, std::string_view field, Changes& found) const {
      auto at = m_byField.upper_bound(FieldView(object, field));
      for (; at != m_byField.end() && at->first.first == object; ++at) {
        std::string_view name = at->first.second;
        if (name.substr(0, field.size()) != field) return;
        name.remove_prefix(field.size());
        if (name[0] != '.' && name[0] != ':') continue;
        for (auto const& [other, sources] : at->second) {
          if (other.find('[') != other.npos) JoinAll(sources, found);
        }
      }
    }
    void FindWhole(void const* object, std::string_view name, Changes& found) const {
      const auto at = m_byField.find(FieldView(object, name));
      if (at == m_byField.end()) return;
      for (auto const& [other, sources] : at->second) JoinAll(sources, found);
    }

    static void JoinAll(std::list<DataNode*> const& sources, Changes& found) {
      for (DataNode const* source : sources) GraphState::Join(*source, found);
    }

    std::map<int, AddressMap> m_bySize;
    FieldMap m_byField;
  };

  DataNode(IdleSources& idle, Table& table, AddressMap& addresses, octet_t const* address, std::size_t size,
           void const* object, std::string_view name)
      : Source(idle), m_table(table), m_size(size) {
    const std::string_view field = name.substr(0, name.find('['));
    m_field =
        table.m_byField.emplace(std::piecewise_construct, std::forward_as_tuple(object, field), std::forward_as_tuple())
            .first;
    m_name = m_field->second.emplace(name, std::list<DataNode*>()).first;
    m_place = m_name->second.insert(m_name->second.end(), this);
    try {
      m_address = addresses.insert({address, this});
    } catch (...) {
      m_name->second.erase(m_place);
      throw;
    }
    table.Use();
  }
  ~DataNode() override {
    const auto addresses = m_table.m_bySize.find(SizeClass(m_size));
    addresses->second.erase(m_address);
    if (addresses->second.empty()) m_table.m_bySize.erase(addresses);
    m_name->second.erase(m_place);
    if (m_name->second.empty()) m_field->second.erase(m_name);
    if (m_field->second.empty()) m_table.m_byField.erase(m_field);
    m_table.Release();
  }

  static int SizeClass(std::size_t size) {
    int bits = 0;
    while ((size >> bits) > 1) ++bits;
    return bits + 1;
  }

  Table& m_table;
  std::size_t m_size;
  FieldMap::iterator m_field;
  NameMap::iterator m_name;
  std::list<DataNode*>::iterator m_place;
  AddressMap::iterator m_address;
};

class PathNode : public Source {
 public:
  xstring Name() const override { return "model field"; }
  void Describe(GraphSource& source) const {
    source.m_object = m_object;
    std::string const path = m_field < 0 ? m_place->first : std::string(1, static_cast<char>(m_field));
    std::copy(path.begin(), path.end(), source.m_path.InitLocalBuffer(static_cast<ssize_t>(path.size())));
  }

  static void OnRead(void const* object, Path const& path) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(object)) return;
    Table& table = Table::Get();
    Paths* paths = table.Find(object);
    PathNode const* node = paths ? paths->Find(path) : nullptr;
    state.Link(node ? *node : *Make(table, object, path));
  }

  static void OnWrite(void const* object, Path const& path) {
    Table* table = Table::Peek();
    Paths const* paths = table ? table->Find(object) : nullptr;
    if (!paths) {
      PathSource::s_unread = object;
      return;
    }
    if (paths->m_others.empty() && IsField(path)) {
      if (PathNode const* node = paths->m_ofField[path.Data()[0]]) GraphState::Change(*node);
      return;
    }
    Changes found;
    paths->FindMet(path, found);
    if (!found.IsEmpty()) GraphState::Get().Change(found);
  }

 private:
  // As memcmp, without a call: paths are short.
  struct PathLess {
    typedef void is_transparent;
    bool operator()(std::string_view a, std::string_view b) const {
      const std::size_t same = std::min(a.size(), b.size());
      for (std::size_t i = 0; i < same; ++i) {
        if (a[i] != b[i]) return static_cast<octet_t>(a[i]) < static_cast<octet_t>(b[i]);
      }
      return a.size() < b.size();
    }
  };
  typedef std::map<std::string, PathNode*, PathLess> PathMap;

  // Most paths are those of one of a model's first fields.
  static bool IsField(Path const& path) { return path.Size() == 1 && path.Data()[0] < NumFields; }
  enum { NumFields = 16 };

  // The nodes of one object.
  struct Paths {
    PathNode const* Find(Path const& path) const {
      if (IsField(path)) return m_ofField[path.Data()[0]];
      const auto at = m_others.find(Bytes(path));
      return at != m_others.end() ? at->second : nullptr;
    }
    // Those of a path, of what is inside and of what is around it.
    void FindMet(Path const& path, Changes& found) const {
      if (path.Size() > 0 && path.Data()[0] < NumFields) {
        if (PathNode const* node = m_ofField[path.Data()[0]]) GraphState::Join(*node, found);
      } else if (path.Size() == 0) {
        for (PathNode const* node : m_ofField) {
          if (node) GraphState::Join(*node, found);
        }
      }
      FindInside(m_others, Bytes(path), found);
      FindAround(m_others, Bytes(path), found);
    }

    PathNode* m_ofField[NumFields] = {};
    PathMap m_others;
    ssize_t m_count = 0;  // of all
  };

  struct Table : PerThread<Table> {
    // Those of an object, which is most often the one of the last call.
    Paths* Find(void const* object) {
      if (m_lastPaths && m_lastObject == object) return m_lastPaths;
      const auto at = m_byObject.find(object);
      return at != m_byObject.end() ? Remember(object, at->second) : nullptr;
    }
    Paths& Make(void const* object) {
      if (PathSource::s_unread == object) PathSource::s_unread = nullptr;
      return *Remember(object, m_byObject[object]);
    }
    void Drop(void const* object) {
      m_lastPaths = nullptr;
      m_byObject.erase(object);
    }

   private:
    Paths* Remember(void const* object, Paths& paths) {
      m_lastObject = object;
      return m_lastPaths = &paths;
    }
    std::unordered_map<void const*, Paths> m_byObject;
    void const* m_lastObject = nullptr;
    Paths* m_lastPaths = nullptr;
  };

  static PathNode* Make(Table& table, void const* object, Path const& path) {
    IdleSources& idle = IdleSources::Get();
    idle.MakeRoom();
    Paths& paths = table.Make(object);
    return new PathNode(idle, table, object, paths, path);
  }

  PathNode(IdleSources& idle, Table& table, void const* object, Paths& paths, Path const& path)
      : Source(idle), m_table(table), m_object(object), m_paths(paths) {
    if (IsField(path)) {
      m_field = path.Data()[0];
      paths.m_ofField[m_field] = this;
    } else {
      m_place = paths.m_others.emplace(Bytes(path), this).first;
    }
    ++paths.m_count;
    table.Use();
  }
  ~PathNode() override {
    if (m_field >= 0) {
      m_paths.m_ofField[m_field] = nullptr;
    } else {
      m_paths.m_others.erase(m_place);
    }
    if (--m_paths.m_count == 0) m_table.Drop(m_object);
    m_table.Release();
  }

  static std::string_view Bytes(Path const& path) {
    return std::string_view(reinterpret_cast<char const*>(path.Data()), static_cast<std::size_t>(path.Size()));
  }

  // The path itself and those that begin with it stand side by side.
  static void FindInside(PathMap const& paths, std::string_view path, Changes& found) {
    for (auto at = paths.lower_bound(path); at != paths.end(); ++at) {
      if (std::string_view(at->first).substr(0, path.size()) != path) return;
      GraphState::Join(*at->second, found);
    }
  }

  // The beginnings of a path: of those in front of it the nearest, then of what both have in common, and so on.
  static void FindAround(PathMap const& paths, std::string_view path, Changes& found) {
    for (auto at = paths.lower_bound(path); at != paths.begin();) {
      std::string_view nearest = (--at)->first;
      const std::size_t most = std::min(nearest.size(), path.size());
      std::size_t same = 0;
      while (same < most && nearest[same] == path[same]) ++same;
      if (same == nearest.size()) {
        GraphState::Join(*at->second, found);
      } else {
        at = paths.upper_bound(path = path.substr(0, same));
      }
    }
  }

  Table& m_table;
  void const* m_object;
  Paths& m_paths;
  int m_field = -1;
  PathMap::iterator m_place;  // of one without a field
};

template <typename Node, typename... Args>
void ReadSource(Args const&... args) {
  try {
    Node::OnRead(args...);
  } catch (...) {
    GraphState::Get().LoseInput();
    throw;
  }
}

void DataSource::Read(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
  ReadSource<DataNode>(begin, size, object, name);
}
void DataSource::OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
  DataNode::OnWrite(begin, size, object, name);
}

void PathSource::Read(void const* object, Path const& path) { ReadSource<PathNode>(object, path); }
void PathSource::Write(void const* object, Path const& path) { PathNode::OnWrite(object, path); }

bool GraphAccess::DescribeSource(DGNode const& node, GraphSource& source) {
  if (!(node.m_flags & DF_SOURCE)) return false;
  if (DataNode const* data = dynamic_cast<DataNode const*>(&node)) {
    data->Describe(source);
  } else {
    static_cast<PathNode const&>(node).Describe(source);
  }
  return true;
}

}  // namespace vesk
