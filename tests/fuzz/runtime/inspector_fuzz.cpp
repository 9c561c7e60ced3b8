// The messages of a page of the inspector, one behind each zero byte; one that begins with `#` is of bytes. Each gets
// one answer, which is JSON in UTF-8, and the values that are shown can still be shown afterwards.

#include "Vesk/vxObject/InspectorSession.h"
#include "kinds/plain.h"
#include "seeds.h"

namespace {

struct Shown {
  Shown() {
    reflected.parts.resize(3);
    sources.tiny = 1;
    sources.number = 2;
    Show("reflected", reflected);
    Show("everything", everything);
    Show("tree", tree);
    Show("doc", doc);
    Show("sources", sources);
    shared.m_changes.Allow(true);
    shared.m_log.Listen(true);
  }
  template <typename T>
  void Show(vesk::xstring const& name, T& value) {
    shared.m_tree.Show(
        name, [&value] { return vesk::Value::Of(value); }, false);
  }
  kinds::Reflected reflected;
  kinds::Everything everything;
  kinds::Tree tree;
  kinds::Doc doc;
  kinds::Sources sources;
  vesk::InspectorShared shared;
};

void Converse(std::string_view input) {
  Shown shown;
  int answers = 0;
  vesk::InspectorSession session(shown.shared, [&](vesk::xstring const& text) {
    ++answers;
    Require(vesk::InspectorTree::IsUtf8(text));
    Require(vesk::InspectorJson::Parse(text).m_kind == vesk::InspectorJson::Object);
  });
  for (int i = 0; i < 30 && !input.empty(); ++i) {
    const std::size_t end = std::min(input.find('\0'), input.size());
    const std::string_view message = input.substr(0, end);
    input.remove_prefix(std::min(end + 1, input.size()));
    answers = 0;
    const bool isBytes = !message.empty() && message[0] == '#';
    session.Receive(message.substr(isBytes), !isBytes);
    Require(answers == 1);
    session.Tick();
  }
  for (vesk::ConstStringZ path :
       {"[]", "[\"reflected\"]", "[\"everything\"]", "[\"doc\"]", "[\"tree\"]", "[\"sources\"]"}) {
    session.Receive(vxMakeString("{\"do\":\"rows\",\"path\":" << path << '}'));
  }
}

// What is no text; requests are in tests/fuzz/seeds.
std::vector<std::string> Seeds() {
  const kinds::Doc doc;
  const vesk::xvector<vesk::octet_t> bytes = vesk::WriteObject(vesk::ptr<kinds::IDoc>(const_cast<kinds::Doc*>(&doc)));
  return {"#{\"do\":\"archive\",\"slot\":0}\n" + std::string(bytes.begin(), bytes.end())};
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* count, char*** arguments) { return Begin(*count, *arguments, Seeds); }

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 0) Converse(std::string_view(reinterpret_cast<char const*>(data) + 1, size - 1));
  return 0;
}
