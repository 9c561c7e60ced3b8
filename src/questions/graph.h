// What leads to what in a workspace, for `Qrex --graph`: projects to their subprojects, files to what they import,
// models to the types that they hold.
//
// As JSON: { "graph": "imports", "nodes": [ { "id", "kind", "project", "file" } ], "edges": [ { "from", "to", "label" }
// ] } with the ids of nodes in edges; `file` is a path in the tree, of a project that of its project file, and a member
// that says nothing is left out.
#pragma once

#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "questions/asked_files.h"

namespace qrex {

struct GraphNode {
  std::string id;            // unique, and what is shown
  std::string kind = {};     // of a project its target type, of a file its extension, of a type the word behind `$`
  std::string project = {};  // that it is of
  std::string file = {};
};

struct GraphEdge {
  size_t from = 0, to = 0;  // nodes
  std::string label;
};

struct Graph {
  explicit Graph(std::string given) : title(std::move(given)) {}
  size_t NodeOf(const std::string& id);  // made where there is none

  std::string title;
  std::vector<GraphNode> nodes;
  std::vector<GraphEdge> edges;
  std::vector<size_t> centre;  // the nodes that were asked about

 private:
  std::unordered_map<std::string, size_t> m_byId;
};

Graph GraphOfProjects(const Workspace& workspace);
Graph GraphOfImports(const std::vector<ScannedFile*>& files);
Graph GraphOfModels(const std::vector<ScannedFile*>& files);

// The nodes that a user means: of a file, or by id. Empty: there is none.
std::vector<size_t> FindNodes(const Graph& graph, const Workspace& workspace, const std::string& asked);
// What the nodes lead to and what leads to them, by at most so many edges.
Graph Around(const Graph& graph, const std::vector<size_t>& centre, size_t depth);

std::string DotText(const Graph& graph);  // as Graphviz reads it
std::string JsonText(const Graph& graph);

}  // namespace qrex
