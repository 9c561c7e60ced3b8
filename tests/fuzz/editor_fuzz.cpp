// What an editor sends to the language server: frames in pieces, and texts that are coloured, folded and completed.
#include <cstdint>

#include "server/json_rpc.h"
#include "server/own_language.h"
#include "server/text_index.h"

using namespace qrex::server;

namespace {

std::vector<std::string> Bodies(std::string_view bytes, size_t piece) {
  FrameReader frames;
  std::vector<std::string> bodies;
  for (; !bytes.empty(); bytes.remove_prefix(std::min(piece, bytes.size()))) {
    frames.Add(bytes.substr(0, piece));
    while (auto body = frames.Next()) bodies.push_back(*body);
  }
  return bodies;
}

void Check(bool holds) {
  if (!holds) __builtin_trap();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  if (size == 0) return 0;
  const std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
  const Json message = Json::parse(text, nullptr, false);
  NumberAt(message, "params/position/line");
  TextAt(message, "params/textDocument/uri");
  const std::string framed = Framed({{"text", text}});
  Check(Bodies(framed + framed, 1 + data[0]).size() == 2);
  // What is skipped on the way depends on the pieces, what a header tells does not.
  if (text.find("Content-Length:") == std::string::npos) Check(Bodies(text + "\r\n\r\n" + framed, size).size() == 1);
  Bodies(text, 1 + data[0]);

  const TextIndex index(text);
  const size_t offset = data[0] * index.Text().size() / 255;
  for (const Columns columns : {Columns::Utf8, Columns::Utf16}) {
    const Position position = index.PositionOf(offset, columns);
    if (columns == Columns::Utf8) Check(index.OffsetOf(position, columns) == offset);
    SemanticTokens(index, columns);
  }
  FoldingRanges(index);
  CompletionInSource(index.Text(), offset);
  CompletionInProject("a.qrpj", index.Text(), offset);
  PathOfUri(text);
  Check(PathOfUri(UriOfPath("/" + text)) == "/" + text);
  return 0;
}
