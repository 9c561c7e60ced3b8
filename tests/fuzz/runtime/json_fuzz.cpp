// JSON of every kind. The first byte of an input says as what the rest is read; a text is read or refused with an
// AccessError, and what was read is written, and reads back as the same text.

#include "Vesk/vxObject/Json.h"
#include "kinds/plain.h"
#include "seeds.h"

namespace {

// The objects that a text made are the reader's to destroy.
struct Objects {
  void Add(vesk::Value const& value) {
    if (value.Kind() == vesk::VK_REFERENCE) return AddReference(value);
    value.Each([this](vesk::xstring const&, vesk::Value const& inner) {
      Add(inner);
      return true;
    });
  }
  void AddReference(vesk::Value const& reference) {
    void* const self = *static_cast<void* const*>(reference.Address());
    if (!self || !m_seen.Insert(self)) return;
    if (reference.TypeName() == "cref<kinds::Part>") {
      m_parts.push_back(static_cast<kinds::Part*>(self));
    } else if (reference.TypeName() != "cref<kinds::Size>") {
      m_objects.push_back(static_cast<vesk::pref<vesk::IObject> const*>(reference.Address())->Get());
      Add(vesk::Value(*m_objects.back()->GetReflectedClass(), self));
    } else {
      m_sizes.push_back(static_cast<kinds::Size*>(self));
    }
  }
  ~Objects() {
    for (kinds::Part* part : m_parts) delete part;
    for (kinds::Size* size : m_sizes) delete size;
    for (vesk::ptr<vesk::IObject> const& object : m_objects) object->DestroyObject();
  }
  vesk::xset<void*> m_seen;
  vesk::xvector<kinds::Part*> m_parts;
  vesk::xvector<kinds::Size*> m_sizes;
  vesk::xvector<vesk::ptr<vesk::IObject>> m_objects;
};

template <typename T>
void ReadAndWrite(std::string_view text) {
  vesk::JsonLimits limits;
  limits.m_memory = 10 << 20;
  // Objects that nothing leads to are nobody's: no text of ours has them.
  limits.m_allow = [](vesk::ReflectedClass const&) { return false; };
  T value = T();
  try {
    vesk::FromJsonText(value, text, limits);
    const vesk::xstring written = vesk::ToJsonText(value);
    T again = T();
    vesk::FromJsonText(again, written, limits);
    if (vesk::ToJsonText(again) != written) std::abort();
    (void)vesk::DumpText(vesk::Value::Of(value));
  } catch (vesk::AccessError const&) {
  }
}

void ReadObjects(std::string_view text) {
  vesk::JsonLimits limits;
  limits.m_memory = 10 << 20;
  Objects objects;
  vesk::pref<kinds::IDoc> root;
  try {
    vesk::FromJsonText(root, text, limits);
    objects.Add(vesk::Value::Of(root));
    (void)vesk::ToJsonText(root);
  } catch (vesk::AccessError const&) {
  }
}

using Read = void (*)(std::string_view);
const Read kKinds[] = {ReadAndWrite<kinds::Reflected>,
                       ReadAndWrite<kinds::Everything>,
                       ReadAndWrite<kinds::Value>,
                       ReadAndWrite<kinds::Tree>,
                       ReadAndWrite<vesk::xvector<kinds::Part>>,
                       ReadAndWrite<kinds::Doc>,
                       ReadObjects};
constexpr std::size_t kKindCount = sizeof(kKinds) / sizeof(*kKinds);

std::vector<std::string> Seeds() {
  kinds::Doc doc, next;
  doc.title = "title";
  doc.next = &next;
  next.next = &doc;
  kinds::Everything all;
  all.maps[2]["k"] = 2.5;
  all.any = vesk::string8("any");
  kinds::Reflected reflected;
  reflected.parts.resize(2);
  reflected.byName["a"] = kinds::Part();
  kinds::Tree::node node;
  node.branches = {kinds::Tree::leaf(1), kinds::Tree()};
  return {vesk::ToJsonText(reflected),
          vesk::ToJsonText(all),
          vesk::ToJsonText(kinds::Value(kinds::Value::list({1, 2}))),
          vesk::ToJsonText(kinds::Tree(node)),
          vesk::ToJsonText(reflected.parts),
          vesk::ToJsonText(kinds::Doc()),
          vesk::ObjectToJson(vesk::ptr<kinds::IDoc>(&doc))};
}

}  // namespace

extern "C" int LLVMFuzzerInitialize(int* count, char*** arguments) { return Begin(*count, *arguments, Seeds); }

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 0) kKinds[data[0] % kKindCount](std::string_view(reinterpret_cast<char const*>(data) + 1, size - 1));
  return 0;
}
