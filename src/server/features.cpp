// What the editor asks for: about our own languages it is answered here, about C++ by clangd, whose places are mapped.
#include <algorithm>

#include "server/quick_fixes.h"
#include "server/server.h"

namespace qrex::server {

const Server::Feature Server::kFeatures[] = {
    {"textDocument/hover", &Server::Hover},
    {"textDocument/completion", &Server::Completion},
    {"completionItem/resolve", &Server::ResolveCompletion},
    {"textDocument/signatureHelp", &Server::SignatureHelp},
    {"textDocument/definition", &Server::Definition},
    {"textDocument/declaration", &Server::Declaration},
    {"textDocument/typeDefinition", &Server::TypeDefinition},
    {"textDocument/implementation", &Server::Implementation},
    {"textDocument/references", &Server::References},
    {"textDocument/documentHighlight", &Server::Highlights},
    {"textDocument/documentSymbol", &Server::DocumentSymbols},
    {"workspace/symbol", &Server::WorkspaceSymbols},
    {"textDocument/prepareRename", &Server::PrepareRename},
    {"textDocument/rename", &Server::Rename},
    {"textDocument/inlayHint", &Server::InlayHints},
    {"textDocument/codeAction", &Server::CodeActions},
    {"textDocument/semanticTokens/full", &Server::SemanticTokensFull},
    {"textDocument/foldingRange", &Server::Folding},
    {"workspace/executeCommand", &Server::ExecuteCommand},
    {"", nullptr},
};

std::optional<Server::Place> Server::PlaceOf(const Json& params) {
  Document* const document = FindDocument(params);
  if (!document) return std::nullopt;
  Place place{document, document->file, 0, std::nullopt};
  const Position position = PositionFrom(At(params, "position"));
  place.offset = document->text.OffsetOf(position, m_columns);
  if (place.file) place.generated = m_mapping->ToGenerated(*place.file, position);
  return place;
}

void Server::AskAt(const std::string& method, const Json& params, const Place& place, Clangd::Answer answer) {
  if (!m_clangd || !place.generated) return answer(nullptr);
  Json asked = params;
  asked["textDocument"] = {{"uri", UriOfPath(m_world->GeneratedPathOf(*place.file))}};
  asked["position"] = ToJson(*place.generated);
  const std::string request = m_requestAtHand;
  const int64_t id = m_clangd->Ask(method, std::move(asked), std::move(answer));
  if (m_clangd->IsRunning()) m_askedOfClangd[request] = id;
}

void Server::Hover(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place) return reply(nullptr);
  const bool isProject = IsProjectText(*place->document);
  if (!isProject && !place->file) return reply(nullptr);
  const std::string own = isProject ? HoverInProject(place->document->path, place->document->text.Text(), place->offset)
                                    : m_own->Hover(*place->file, place->offset);
  if (!own.empty()) return reply({{"contents", {{"kind", "markdown"}, {"value", own}}}});
  if (isProject) return reply(nullptr);
  AskAt("textDocument/hover", params, *place, [this, file = place->file, reply](const Json& answer) {
    reply(answer.is_object() ? m_mapping->WithRanges(*file, answer) : Json(nullptr));
  });
}

// --- Completion

void Server::Completion(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place) return reply(nullptr);
  if (IsProjectText(*place->document)) {
    return reply(CompletionInProject(place->document->path, place->document->text.Text(), place->offset));
  }
  const TextIndex& text = place->document->text;
  Json own = CompletionInSource(text.Text(), place->offset);
  // Editors differ on whether `@` and `$` are parts of words: what is replaced is said.
  const Json range = RangeJson(text, WordAt(text.Text(), place->offset).begin, place->offset, m_columns);
  for (Json& item : own) item["textEdit"] = {{"range", range}, {"newText", item["label"]}};
  if (!own.is_null() || !place->file) return reply(std::move(own));
  AskAt("textDocument/completion", params, *place, [this, file = place->file, reply](const Json& answer) {
    Json list = {{"isIncomplete", At(answer, "isIncomplete") == true}, {"items", Json::array()}};
    for (const Json& item : answer.is_array() ? answer : At(answer, "items")) {
      Json mapped = item;
      mapped.erase("additionalTextEdits");  // they would stand in generated text
      if (const Json& edit = At(item, "textEdit"); edit.is_object()) {
        const auto moved = m_mapping->Edit(*file, edit);
        mapped.erase("textEdit");
        if (moved) mapped["textEdit"] = *moved;
      }
      list["items"].push_back(std::move(mapped));
    }
    reply(std::move(list));
  });
}

void Server::ResolveCompletion(const Json& params, const Reply& reply) {
  if (!m_clangd || !params.contains("data")) return reply(params);
  m_clangd->Ask("completionItem/resolve", params, [params, reply](const Json& answer) {
    Json item = params;
    for (const char* const part : {"documentation", "detail"}) {
      if (!At(answer, part).is_null()) item[part] = At(answer, part);
    }
    reply(std::move(item));
  });
}

void Server::SignatureHelp(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  AskAt("textDocument/signatureHelp", params, *place, reply);
}

// --- Places

void Server::Definition(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  Json own = m_own->Definition(*place->file, place->offset);
  if (!own.empty()) return reply(std::move(own));
  AskAt("textDocument/definition", params, *place,
        [this, reply](const Json& answer) { reply(m_mapping->Locations(answer)); });
}

void Server::OtherLocations(const std::string& method, const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  AskAt(method, params, *place, [this, reply](const Json& answer) { reply(m_mapping->Locations(answer)); });
}

void Server::Highlights(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  AskAt("textDocument/documentHighlight", params, *place, [this, file = place->file, reply](const Json& answer) {
    Json mapped = Json::array();
    for (const Json& highlight : answer) {
      if (m_mapping->ToSource(*file, At(highlight, "range")).isExact)
        mapped.push_back(m_mapping->WithRanges(*file, highlight));
    }
    reply(std::move(mapped));
  });
}

// --- Symbols: those of `$` declarations, and of C++ what stands in the source as it is.

void Server::DocumentSymbols(const Json& params, const Reply& reply) {
  Document* const document = FindDocument(params);
  if (!document || !document->file) return reply(nullptr);
  ProjectFile* const file = document->file;
  Json symbols = m_own->DocumentSymbols(*file);
  if (!m_clangd) return reply(std::move(symbols));
  const Json asked = {{"textDocument", {{"uri", UriOfPath(m_world->GeneratedPathOf(*file))}}}};
  m_clangd->Ask("textDocument/documentSymbol", asked, [this, file, symbols, reply](const Json& answer) {
    Json all = symbols;
    const std::function<void(const Json&, const std::string&)> add = [&](const Json& found,
                                                                         const std::string& container) {
      for (const Json& symbol : found) {
        const std::string name = TextAt(symbol, "name");
        const Mapping::SourceRange range = m_mapping->ToSource(*file, At(symbol, "selectionRange"));
        if (range.isExact) {
          all.push_back(
              {{"name", name},
               {"kind", NumberAt(symbol, "kind")},
               {"containerName", container},
               {"location", {{"uri", m_mapping->SourceUri(*file)}, {"range", m_mapping->RangeOf(*file, range)}}}});
        }
        add(At(symbol, "children"), name);
      }
    };
    add(answer, "");
    reply(std::move(all));
  });
}

void Server::WorkspaceSymbols(const Json& params, const Reply& reply) {
  if (!m_own || !m_world->IsLoaded()) return reply(nullptr);
  Json symbols = m_own->WorkspaceSymbols(TextAt(params, "query"));
  if (!m_clangd) return reply(std::move(symbols));
  m_clangd->Ask("workspace/symbol", params, [this, symbols, reply](const Json& answer) {
    Json all = symbols;
    for (const Json& symbol : answer) {
      const Json& location = At(symbol, "location");
      ProjectFile* const file = m_mapping->FileAt(TextAt(location, "uri"));
      if (!file || !m_mapping->ToSource(*file, At(location, "range")).isExact) continue;
      Json mapped = symbol;
      mapped["location"] = m_mapping->Locations(location);
      all.push_back(std::move(mapped));
    }
    reply(std::move(all));
  });
}

// --- Changes

void Server::PrepareRename(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  AskAt("textDocument/prepareRename", params, *place, [this, file = place->file, reply](const Json& answer) {
    const Json& range = answer.contains("range") ? At(answer, "range") : answer;
    if (!range.is_object()) return reply({{"refused", "this cannot be renamed"}});
    const Mapping::SourceRange found = m_mapping->ToSource(*file, range);
    if (!found.isExact)
      return reply({{"refused", "the name stands in generated text: rename its declaration by hand"}});
    reply(m_mapping->RangeOf(*file, found));
  });
}

void Server::Rename(const Json& params, const Reply& reply) {
  const auto place = PlaceOf(params);
  if (!place || !place->file) return reply(nullptr);
  AskAt("textDocument/rename", params, *place, [this, reply](const Json& answer) {
    if (!answer.is_object()) return reply({{"refused", "clangd cannot rename this"}});
    Json mapped;
    if (m_mapping->Edits(answer, mapped)) return reply(std::move(mapped));
    reply({{"refused", "the name also stands in generated text, which a declaration gives: rename it by hand"}});
  });
}

void Server::InlayHints(const Json& params, const Reply& reply) {
  Document* const document = FindDocument(params);
  if (!document || !document->file || !m_clangd) return reply(nullptr);
  ProjectFile* const file = document->file;
  const TextIndex& generated = m_world->TranslationOf(*file).generated;
  const Json asked = {{"textDocument", {{"uri", UriOfPath(m_world->GeneratedPathOf(*file))}}},
                      {"range", RangeJson(generated, 0, generated.Text().size(), Columns::Utf8)}};
  const Position first = PositionFrom(At(params, "range/start")), last = PositionFrom(At(params, "range/end"));
  m_clangd->Ask("textDocument/inlayHint", asked, [this, file, first, last, reply](const Json& answer) {
    Json hints = Json::array();
    for (const Json& hint : answer) {
      const Json at = {{"start", At(hint, "position")}, {"end", At(hint, "position")}};
      const Mapping::SourceRange found = m_mapping->ToSource(*file, at);
      if (!found.isExact) continue;
      const Position position = m_world->TranslationOf(*file).source.PositionOf(found.begin, m_columns);
      if (position < first || position > last) continue;
      Json mapped = hint;
      mapped.erase("textEdits");
      mapped["position"] = ToJson(position);
      if (At(hint, "label").is_array()) {
        std::string label;
        for (const Json& part : At(hint, "label")) label += TextAt(part, "value");
        mapped["label"] = label;
      }
      hints.push_back(std::move(mapped));
    }
    reply(std::move(hints));
  });
}

// What a message names as its cure, and what clangd offers for text that was copied.
void Server::CodeActions(const Json& params, const Reply& reply) {
  Document* const document = FindDocument(params);
  if (!document || !m_world) return reply(nullptr);
  Json actions = QuickFixes(*m_world, *m_mapping, m_texts)
                     .Of(document->uri, document->text, document->file, At(params, "context/diagnostics"));
  ProjectFile* const file = document->file;
  if (!m_clangd || !file) return reply(std::move(actions));
  const auto begin = m_mapping->ToGenerated(*file, PositionFrom(At(params, "range/start")));
  const auto last = m_mapping->ToGenerated(*file, PositionFrom(At(params, "range/end")));
  if (!begin || !last) return reply(std::move(actions));
  const Json asked = {{"textDocument", {{"uri", UriOfPath(m_world->GeneratedPathOf(*file))}}},
                      {"range", {{"start", ToJson(*begin)}, {"end", ToJson(std::max(*begin, *last))}}},
                      {"context", {{"diagnostics", document->clangdDiagnostics}, {"only", {"quickfix"}}}}};
  m_clangd->Ask("textDocument/codeAction", asked, [this, actions, reply](const Json& answer) {
    Json all = actions;
    for (const Json& action : answer) {
      Json edit;
      if (!At(action, "edit").is_object() || !m_mapping->Edits(At(action, "edit"), edit)) continue;
      all.push_back({{"title", TextAt(action, "title")}, {"kind", "quickfix"}, {"edit", std::move(edit)}});
    }
    reply(std::move(all));
  });
}

// --- Of the text alone

void Server::SemanticTokensFull(const Json& params, const Reply& reply) {
  const Document* const document = FindDocument(params);
  if (!document) return reply(nullptr);
  reply({{"data", SemanticTokens(document->text, m_columns)}});
}

void Server::Folding(const Json& params, const Reply& reply) {
  const Document* const document = FindDocument(params);
  reply(document ? FoldingRanges(document->text) : Json(nullptr));
}

void Server::ExecuteCommand(const Json& params, const Reply& reply) {
  const std::string command = TextAt(params, "command");
  const Json& arguments = At(params, "arguments");
  const std::string uri =
      arguments.is_array() && !arguments.empty() && arguments[0].is_string() ? arguments[0].get<std::string>() : "";
  const auto found = m_documents.find(uri);
  if (found == m_documents.end() || !found->second.file)
    return reply({{"refused", "no source of the workspace: " + uri}});
  Document& document = found->second;
  if (command == "qrex.hideGenerated") {
    document.isShown = false;
    return reply(nullptr);
  }
  if (command != "qrex.showGenerated") return reply({{"refused", "no command: " + command}});
  document.isShown = true;
  reply({{"uri", UriOfPath(m_world->GeneratedPathOf(*document.file))},
         {"languageId", document.file->kind == FileKind::C ? "c" : "cpp"},
         {"text", m_world->TranslationOf(*document.file).generated.Text()}});
}

}  // namespace qrex::server
