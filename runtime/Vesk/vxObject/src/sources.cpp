// The nodes of the fields that calculations have read.

@import "Vesk/vxObject/Sources.h"

#include <algorithm>
#include <list>
#include <map>
#include <unordered_map>

namespace vesk {

class DataNode : public DGIndepNode {
 public:
  xstring Name() const override { return m_name->first; }

  static void OnRead(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(begin)) return;
    Table& table = Table::Get();
    AddressMap& addresses = table.m_bySize[SizeClass(size)];
    octet_t const* address = static_cast<octet_t const*>(begin);
    for (auto [at, end] = addresses.equal_range(address); at != end; ++at) {
      if (at->second->m_size == size && at->second->m_name->first == name) return at->second->Link(state);
    }
    (new DataNode(table, addresses, address, size, object, name))->Link(state);
  }

  static void OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
    Table* table = Table::Peek();
    if (!table || table->m_bySize.empty()) return;
    xvector<DGNode const*> found;
    table->FindMemory(static_cast<octet_t const*>(begin), size, found);
    if (name) table->FindField(object, name, found);
    if (found.empty()) return;
    std::sort(found.begin(), found.end());
    found.erase(std::unique(found.begin(), found.end()), found.end());
    Change(found);
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
    void FindMemory(octet_t const* address, std::size_t size, xvector<DGNode const*>& found) const {
      for (auto const& [sizeClass, addresses] : m_bySize) {
        const std::uintptr_t most = std::uintptr_t(1) << sizeClass;
        const std::uintptr_t number = reinterpret_cast<std::uintptr_t>(address);
        const std::uintptr_t from = number > most ? number - most : 0;
        auto at = addresses.lower_bound(reinterpret_cast<octet_t const*>(from));
        for (; at != addresses.end() && at->first < address + size; ++at) {
          if (at->first + at->second->m_size > address) found.push_back(at->second);
        }
      }
    }

    // A container, or a model around it, finds the elements; an element finds what is around it, and other depths.
    void FindField(void const* object, std::string_view name, xvector<DGNode const*>& found) const {
      const std::string_view field = name.substr(0, name.find('['));
      const auto at = m_byField.find(FieldView(object, field));
      if (at != m_byField.end()) {
        for (auto const& [other, sources] : at->second) {
          if (other != name) found.insert(found.end(), sources.begin(), sources.end());
        }
      }
      if (field.size() == name.size()) return FindElementsInside(object, field, found);
      for (std::size_t end = field.rfind('.'); end != field.npos; end = field.substr(0, end).rfind('.')) {
        FindWhole(object, field.substr(0, end), found);
      }
      const std::size_t model = field.find("::_model_");
      if (model != field.npos) FindWhole(object, field.substr(0, model), found);
    }
    void FindElementsInside(void const* object, std::string_view field, xvector<DGNode const*>& found) const {
      auto at = m_byField.upper_bound(FieldView(object, field));
      for (; at != m_byField.end() && at->first.first == object; ++at) {
        std::string_view name = at->first.second;
        if (name.substr(0, field.size()) != field) return;
        name.remove_prefix(field.size());
        if (name[0] != '.' && name[0] != ':') continue;
        for (auto const& [other, sources] : at->second) {
          if (other.find('[') != other.npos) found.insert(found.end(), sources.begin(), sources.end());
        }
      }
    }
    void FindWhole(void const* object, std::string_view name, xvector<DGNode const*>& found) const {
      const auto at = m_byField.find(FieldView(object, name));
      if (at == m_byField.end()) return;
      for (auto const& [other, sources] : at->second) found.insert(found.end(), sources.begin(), sources.end());
    }

    std::map<int, AddressMap> m_bySize;
    FieldMap m_byField;
  };

  DataNode(Table& table, AddressMap& addresses, octet_t const* address, std::size_t size, void const* object,
           std::string_view name)
      : m_table(table), m_size(size) {
    const std::string_view field = name.substr(0, name.find('['));
    m_field =
        table.m_byField.emplace(std::piecewise_construct, std::forward_as_tuple(object, field), std::forward_as_tuple())
            .first;
    m_name = m_field->second.emplace(name, std::list<DataNode*>()).first;
    m_place = m_name->second.insert(m_name->second.end(), this);
    m_address = addresses.insert({address, this});
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
  void OnNoDependents() const override { delete this; }

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

class PathNode : public DGIndepNode {
 public:
  xstring Name() const override { return "model field"; }

  static void OnRead(void const* object, Path const& path) {
    GraphState& state = GraphState::Get();
    if (state.m_calculation->Owns(object)) return;
    Table& table = Table::Get();
    PathMap& paths = table.m_byObject[object];
    const auto [at, isNew] = paths.emplace(Bytes(path), nullptr);
    if (isNew) at->second = new PathNode(table, object, at);
    at->second->Link(state);
  }

  static void OnWrite(void const* object, Path const& path) {
    Table* table = Table::Peek();
    if (!table) return;
    const auto object_ = table->m_byObject.find(object);
    if (object_ == table->m_byObject.end()) return;
    xvector<DGNode const*> found;
    FindInside(object_->second, Bytes(path), found);
    FindAround(object_->second, Bytes(path), found);
    if (!found.empty()) Change(found);
  }

 private:
  typedef std::map<std::string, PathNode*, std::less<>> PathMap;
  struct Table : PerThread<Table> {
    std::unordered_map<void const*, PathMap> m_byObject;
  };

  PathNode(Table& table, void const* object, PathMap::iterator place)
      : m_table(table), m_object(object), m_place(place) {
    table.Use();
  }
  ~PathNode() override {
    const auto paths = m_table.m_byObject.find(m_object);
    paths->second.erase(m_place);
    if (paths->second.empty()) m_table.m_byObject.erase(paths);
    m_table.Release();
  }
  void OnNoDependents() const override { delete this; }

  static std::string_view Bytes(Path const& path) {
    return std::string_view(reinterpret_cast<char const*>(path.Data()), static_cast<std::size_t>(path.Size()));
  }

  // The path itself and those that begin with it stand side by side.
  static void FindInside(PathMap const& paths, std::string_view path, xvector<DGNode const*>& found) {
    for (auto at = paths.lower_bound(path); at != paths.end(); ++at) {
      if (std::string_view(at->first).substr(0, path.size()) != path) return;
      found.push_back(at->second);
    }
  }

  // The beginnings of a path: of those in front of it the nearest, then of what both have in common, and so on.
  static void FindAround(PathMap const& paths, std::string_view path, xvector<DGNode const*>& found) {
    for (auto at = paths.lower_bound(path); at != paths.begin();) {
      std::string_view nearest = (--at)->first;
      const std::size_t most = std::min(nearest.size(), path.size());
      std::size_t same = 0;
      while (same < most && nearest[same] == path[same]) ++same;
      if (same == nearest.size()) {
        found.push_back(at->second);
      } else {
        at = paths.upper_bound(path = path.substr(0, same));
      }
    }
  }

  Table& m_table;
  void const* m_object;
  PathMap::iterator m_place;
};

void DataSource::Read(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
  DataNode::OnRead(begin, size, object, name);
}
void DataSource::OnWrite(void const* begin, std::size_t size, void const* object, ConstStringZ name) {
  DataNode::OnWrite(begin, size, object, name);
}

void PathSource::Read(void const* object, Path const& path) { PathNode::OnRead(object, path); }
void PathSource::OnWrite(void const* object, Path const& path) { PathNode::OnWrite(object, path); }

}  // namespace vesk
