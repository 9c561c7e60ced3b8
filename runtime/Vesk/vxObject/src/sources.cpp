// The nodes of the fields that calculations have read.

@import "Vesk/vxObject/Sources.h"

#include <algorithm>
#include <list>
#include <map>
#include <unordered_map>

namespace vesk {

// Sources that nobody reads any more. The last few are kept: what is written is most often read again soon.
struct IdlePlace : NodePlace {};
class Source;
struct IdleSources : PerThread<IdleSources> {
  enum { Most = 64 };
  ~IdleSources();
  void MakeRoom() {
    if (m_count >= Most) DropOldest();
  }
  void Add(Source const& source);
  void DropOldest();

  NodeList<IdlePlace> m_list;
  ssize_t m_count = 0;
};

class Source : public DGIndepNode, private IdlePlace {
 protected:
  explicit Source(IdleSources& idle) { idle.Add(*this); }
  ~Source() override { Leave(); }

  void Read(GraphState& state) const {
    Link(state);
    Leave();
  }
  void OnNoDependents() const override {
    if (m_idle) return;
    if (IdleSources* idle = IdleSources::Peek()) {
      idle->MakeRoom();
      idle->Add(*this);
    } else {
      delete this;
    }
  }

 private:
  friend struct IdleSources;
  void Leave() const {
    if (IdleSources* idle = std::exchange(m_idle, nullptr)) --idle->m_count;
    IdlePlace::Leave();
  }
  mutable IdleSources* m_idle = nullptr;
};

IdleSources::~IdleSources() {
  while (m_count > 0) DropOldest();
}
void IdleSources::Add(Source const& source) {
  if (source.m_idle) return;
  source.m_idle = this;
  m_list.Append(source);
  ++m_count;
}
void IdleSources::DropOldest() { delete static_cast<Source const*>(static_cast<IdlePlace const*>(m_list.First())); }

class DataNode : public Source {
 public:
  xstring Name() const override { return m_name->first; }

  static void OnRead(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(begin)) return;
    IdleSources& idle = IdleSources::Get();
    idle.MakeRoom();
    Table& table = Table::Get();
    AddressMap& addresses = table.m_bySize[SizeClass(size)];
    octet_t const* address = static_cast<octet_t const*>(begin);
    for (auto [at, end] = addresses.equal_range(address); at != end; ++at) {
      if (at->second->m_size == size && at->second->m_name->first == name) return at->second->Read(state);
    }
    (new DataNode(idle, table, addresses, address, size, object, name))->Read(state);
  }

  static void OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    Table* table = Table::Peek();
    if (!table || table->m_bySize.empty()) return;
    Changes found;
    table->FindMemory(static_cast<octet_t const*>(begin), size, found);
    if (name) table->FindField(object, name, found);
    if (!found.IsEmpty()) Change(found);
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
          if (at->first + at->second->m_size > address) at->second->Join(found);
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
      for (DataNode const* source : sources) source->Join(found);
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

  static void OnRead(void const* object, Path const& path) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(object)) return;
    IdleSources& idle = IdleSources::Get();
    idle.MakeRoom();
    Table& table = Table::Get();
    PathMap& paths = table.Make(object);
    const auto at = paths.find(Bytes(path));
    PathNode const* node = at != paths.end() ? at->second : new PathNode(idle, table, object, paths, Bytes(path));
    node->Read(state);
  }

  static void OnWrite(void const* object, Path const& path) {
    Table* table = Table::Peek();
    if (!table) return;
    PathMap const* paths = table->Find(object);
    if (!paths) return;
    Changes found;
    FindInside(*paths, Bytes(path), found);
    FindAround(*paths, Bytes(path), found);
    if (!found.IsEmpty()) Change(found);
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
  struct Table : PerThread<Table> {
    // Those of an object, which is most often the one of the last call.
    PathMap* Find(void const* object) {
      if (m_lastPaths && m_lastObject == object) return m_lastPaths;
      const auto at = m_byObject.find(object);
      return at != m_byObject.end() ? Remember(object, at->second) : nullptr;
    }
    PathMap& Make(void const* object) {
      PathMap* paths = Find(object);
      return paths ? *paths : *Remember(object, m_byObject[object]);
    }
    void Drop(void const* object) {
      m_lastPaths = nullptr;
      m_byObject.erase(object);
    }

   private:
    PathMap* Remember(void const* object, PathMap& paths) {
      m_lastObject = object;
      return m_lastPaths = &paths;
    }
    std::unordered_map<void const*, PathMap> m_byObject;
    void const* m_lastObject = nullptr;
    PathMap* m_lastPaths = nullptr;
  };

  PathNode(IdleSources& idle, Table& table, void const* object, PathMap& paths, std::string_view path)
      : Source(idle), m_table(table), m_object(object), m_paths(paths) {
    m_place = paths.emplace(path, this).first;
    table.Use();
  }
  ~PathNode() override {
    m_paths.erase(m_place);
    if (m_paths.empty()) m_table.Drop(m_object);
    m_table.Release();
  }

  static std::string_view Bytes(Path const& path) {
    return std::string_view(reinterpret_cast<char const*>(path.Data()), static_cast<std::size_t>(path.Size()));
  }

  // The path itself and those that begin with it stand side by side.
  static void FindInside(PathMap const& paths, std::string_view path, Changes& found) {
    for (auto at = paths.lower_bound(path); at != paths.end(); ++at) {
      if (std::string_view(at->first).substr(0, path.size()) != path) return;
      at->second->Join(found);
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
        at->second->Join(found);
      } else {
        at = paths.upper_bound(path = path.substr(0, same));
      }
    }
  }

  Table& m_table;
  void const* m_object;
  PathMap& m_paths;
  PathMap::iterator m_place;
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
void PathSource::OnWrite(void const* object, Path const& path) { PathNode::OnWrite(object, path); }

}  // namespace vesk
