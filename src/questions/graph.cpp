#include "questions/graph.h"

#include <algorithm>
#include <map>

#include "report/json_writer.h"

namespace qrex {

size_t Graph::NodeOf(const std::string& id) {
  const auto [known, isNew] = m_byId.try_emplace(id, nodes.size());
  if (isNew) nodes.push_back({.id = id});
  return known->second;
}

// --- Projects and files

Graph GraphOfProjects(const Workspace& workspace) {
  Graph graph("projects");
  for (const auto& project : workspace.projects) {
    GraphNode& node = graph.nodes[graph.NodeOf(project->name)];
    node.kind = TargetTypeName(project->targetType);
    node.project = project->name;
    node.file = project->filePath;
  }
  for (const auto& project : workspace.projects) {
    for (const std::string& path : project->subprojects) {
      const Project* const used = workspace.FindSubproject(path);
      if (used) graph.edges.push_back({graph.NodeOf(project->name), graph.NodeOf(used->name), {}});
    }
  }
  return graph;
}

namespace {

size_t NodeOfFile(Graph& graph, const ProjectFile& file) {
  const size_t index = graph.NodeOf(file.path);
  graph.nodes[index].kind = file.extension;
  graph.nodes[index].project = file.project->name;
  graph.nodes[index].file = file.path;
  return index;
}

}  // namespace

Graph GraphOfImports(const std::vector<ScannedFile*>& files) {
  Graph graph("imports");
  for (const ScannedFile* file : files) NodeOfFile(graph, file->file);
  for (const ScannedFile* file : files) {
    const size_t from = NodeOfFile(graph, file->file);
    for (const ScannedFile* import : file->imports) graph.edges.push_back({from, NodeOfFile(graph, import->file), {}});
  }
  return graph;
}

// --- Parts of a graph

std::vector<size_t> FindNodes(const Graph& graph, const Workspace& workspace, const std::string& asked) {
  const ProjectFile* const file = FindAskedFile(workspace, asked);
  const bool showsProjects = graph.title == "projects";
  std::vector<size_t> found;
  for (size_t i = 0; i < graph.nodes.size(); ++i) {
    const GraphNode& node = graph.nodes[i];
    const bool isOfFile = file && (showsProjects ? node.project == file->project->name : node.file == file->path);
    if (isOfFile || node.id == asked || (showsProjects && node.file == asked)) found.push_back(i);
  }
  return found;
}

namespace {

// Marks what is reached from the nodes, each step along all edges at once.
void Reach(const std::vector<std::vector<size_t>>& next, std::vector<size_t> level, size_t depth,
           std::vector<bool>& isReached) {
  std::vector<bool> isMet(next.size());
  for (const size_t node : level) isMet[node] = isReached[node] = true;
  for (; depth > 0 && !level.empty(); --depth) {
    std::vector<size_t> following;
    for (const size_t node : level) {
      for (const size_t other : next[node]) {
        if (isMet[other]) continue;
        isMet[other] = isReached[other] = true;
        following.push_back(other);
      }
    }
    level = std::move(following);
  }
}

}  // namespace

Graph Around(const Graph& graph, const std::vector<size_t>& centre, size_t depth) {
  std::vector<std::vector<size_t>> forth(graph.nodes.size()), back(graph.nodes.size());
  for (const GraphEdge& edge : graph.edges) {
    forth[edge.from].push_back(edge.to);
    back[edge.to].push_back(edge.from);
  }
  std::vector<bool> isReached(graph.nodes.size());
  Reach(forth, centre, depth, isReached);
  Reach(back, centre, depth, isReached);
  Graph part(graph.title);
  for (size_t i = 0; i < graph.nodes.size(); ++i) {
    if (isReached[i]) part.nodes[part.NodeOf(graph.nodes[i].id)] = graph.nodes[i];
  }
  for (const GraphEdge& edge : graph.edges) {
    if (!isReached[edge.from] || !isReached[edge.to]) continue;
    part.edges.push_back({part.NodeOf(graph.nodes[edge.from].id), part.NodeOf(graph.nodes[edge.to].id), edge.label});
  }
  for (const size_t node : centre) part.centre.push_back(part.NodeOf(graph.nodes[node].id));
  return part;
}

// --- Texts

namespace {

// In the labels of Graphviz a backslash begins an escape, in names it does not; a name without a label is its label.
std::string Quoted(std::string_view text) {
  std::string quoted = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') quoted += '\\';
    if (c == '\n') {
      quoted += "\\n";
    } else if (static_cast<unsigned char>(c) >= ' ' || c == '\t') {
      quoted += c;
    }
  }
  return quoted + '"';
}

std::string NodeLine(const Graph& graph, size_t index) {
  const GraphNode& node = graph.nodes[index];
  const bool isAsked = std::find(graph.centre.begin(), graph.centre.end(), index) != graph.centre.end();
  std::string line = "    " + Quoted(node.id);
  if (isAsked) line += " [penwidth=3]";
  return line + ";\n";
}

}  // namespace

std::string DotText(const Graph& graph) {
  std::string text = "digraph " + graph.title + " {\n  rankdir=LR;\n  node [shape=box, fontname=\"sans-serif\"];\n";
  text += "  edge [fontname=\"sans-serif\", fontsize=10];\n";
  std::map<std::string, std::vector<size_t>> byProject;
  for (size_t i = 0; i < graph.nodes.size(); ++i) byProject[graph.nodes[i].project].push_back(i);
  const bool hasFrames = graph.title != "projects";
  size_t number = 0;
  for (const auto& [project, nodes] : byProject) {
    if (hasFrames) {
      text += "  subgraph cluster_" + std::to_string(number++) + " {\n    label=" + Quoted(project) + ";\n";
    }
    for (const size_t node : nodes) text += NodeLine(graph, node);
    if (hasFrames) text += "  }\n";
  }
  for (const GraphEdge& edge : graph.edges) {
    text += "  " + Quoted(graph.nodes[edge.from].id) + " -> " + Quoted(graph.nodes[edge.to].id);
    if (!edge.label.empty()) text += " [label=" + Quoted(edge.label) + "]";
    text += ";\n";
  }
  return text + "}\n";
}

std::string JsonText(const Graph& graph) {
  JsonWriter json;
  json.Open('{').Member("graph", graph.title).Key("nodes").Open('[');
  for (const GraphNode& node : graph.nodes) {
    json.Line().Open('{').Member("id", node.id).Member("kind", node.kind).Member("project", node.project);
    json.Member("file", node.file).Close('}');
  }
  json.Close(']').Key("edges").Open('[');
  for (const GraphEdge& edge : graph.edges) {
    json.Line().Open('{').Member("from", graph.nodes[edge.from].id).Member("to", graph.nodes[edge.to].id);
    if (!edge.label.empty()) json.Member("label", edge.label);
    json.Close('}');
  }
  json.Close(']').Close('}');
  return json.Text() + "\n";
}

}  // namespace qrex
