// The graph of models: they are where it begins, and whatever declared types they hold are in it, too.
#include <unordered_set>
#include <vector>

#include "questions/declarations.h"
#include "questions/graph.h"
#include "translator/kinds/variant_def.h"

namespace qrex {

namespace {

bool HoldsModel(const NameSpaceElement& element) {
  if (element.category != Category::Class) return false;
  const auto& def = static_cast<const ClassDef&>(element);
  return def.HasEmbeddedModel() || def.m_referencedModel;
}

class ModelGraph {
 public:
  explicit ModelGraph(const std::vector<ScannedFile*>& files) : m_files(files) {}

  Graph Make() {
    for (const ScannedFile* file : m_files) {
      for (const Declared& declared : DeclarationsOf(*file)) {
        if (HoldsModel(*declared.element)) NodeOf(*declared.element);
      }
    }
    while (!m_pending.empty()) {
      const NameSpaceElement& element = *m_pending.back();
      m_pending.pop_back();
      AddEdgesOf(element);
    }
    return std::move(m_graph);
  }

 private:
  // A header is translated in the build of each project that imports it: what it declares is one node. Another thing of
  // the name has its file behind it.
  size_t NodeOf(const NameSpaceElement& element) {
    const ProjectFile& file = element.owner.file;
    std::string id = element.GetQualifiedName();
    const std::string& first = m_fileOfName.try_emplace(id, file.path).first->second;
    if (first != file.path) id += " (" + file.path + ")";
    const size_t known = m_graph.nodes.size(), index = m_graph.NodeOf(id);
    if (index < known) return index;
    GraphNode& node = m_graph.nodes[index];
    node.kind = element.GetKeyword();
    node.project = file.project->name;
    node.file = file.path;
    m_pending.push_back(&element);
    return index;
  }

  void AddEdge(size_t from, const NameSpaceElement& to, std::string label) {
    m_graph.edges.push_back({from, NodeOf(to), std::move(label)});
  }

  void AddField(size_t from, const NameSpaceElement& holder, TypeView type, const std::string& name) {
    std::vector<const NameSpaceElement*> types;
    CollectNamedTypes(type, *holder.owner.rootNameSpace, types);
    std::unordered_set<const NameSpaceElement*> met;  // a map may hold it twice
    for (const NameSpaceElement* held : types) {
      if (met.insert(held).second) AddEdge(from, *held, name);
    }
  }

  void AddEdgesOf(const NameSpaceElement& element) {
    const size_t from = NodeOf(element);
    if (element.category == Category::Class) AddEdgesOfClass(from, static_cast<const ClassDef&>(element));
    if (element.category != Category::Variant) return;
    for (const auto& item : static_cast<const VariantDef&>(element).m_items) {
      if (!item->isStruct && !item->isVoid) AddField(from, element, item->type, item->EffectiveName());
      for (const ClassField& field : item->fields) AddField(from, element, field.type, item->name + "." + field.name);
    }
  }

  void AddEdgesOfClass(size_t from, const ClassDef& def) {
    if (def.m_referencedModel) AddEdge(from, *def.m_referencedModel, "model");
    for (const ClassDef* base : def.m_bases) {
      if (HoldsModel(*base)) AddEdge(from, *base, "base");
    }
    for (const ClassDef* mixin : def.m_mixins) {
      if (HoldsModel(*mixin)) AddEdge(from, *mixin, "mixin");
    }
    for (const ModelField* field : def.m_modelFields) {
      AddField(from, def, field->m_type, field->m_name + (field->IsDropped() ? " (dropped)" : ""));
    }
    if (!HoldsModel(def)) {
      for (const ClassField& field : def.m_fields) AddField(from, def, field.type, field.name);
    }
  }

  const std::vector<ScannedFile*>& m_files;
  Graph m_graph{"models"};
  std::unordered_map<std::string, std::string> m_fileOfName;
  std::vector<const NameSpaceElement*> m_pending;
};

}  // namespace

Graph GraphOfModels(const std::vector<ScannedFile*>& files) { return ModelGraph(files).Make(); }

}  // namespace qrex
