// Parts of archives as texts, and the text of all.

@import "Vesk/vxObject/views/archive_walker.h"
@import "Vesk/vxObject/JsonText.h"

namespace vesk {

inline uint32 CompactAt(octet_t const* bytes) {
  struct Bytes {
    void Read(void* to, std::size_t size) {
      std::memcpy(to, m_at, size);
      m_at += size;
    }
    octet_t const* m_at;
  } at{bytes};
  return ReadCompact(at);
}

// --- Values

inline namespace views {

inline std::size_t SizeOfCompact(octet_t first) {
  std::size_t size = 1;
  while (size < 5 && (first & 0x80 >> (size - 1))) ++size;
  return size;
}

inline xstring CountText(std::size_t count, ConstStringZ unit) {
  return vxMakeString(count << ' ' << unit << (count == 1 ? "" : "s"));
}

inline xstring Shortened(std::string text, std::size_t size, std::size_t shown, ConstStringZ unit) {
  if (shown < size) text += "... (" + CountText(size, unit) + ')';
  return xstring(std::move(text));
}

inline xstring QuotedText(octet_t const* bytes, std::size_t size, std::size_t most) {
  std::string text;
  std::size_t shown = std::min(size, most);
  while (shown < size && shown > 0 && (bytes[shown] & 0xC0) == 0x80) --shown;
  PutJsonString(text, std::string_view(reinterpret_cast<char const*>(bytes), shown), true);
  return Shortened(std::move(text), size, shown, "byte");
}
inline xstring QuotedText16(octet_t const* bytes, std::size_t count, std::size_t most) {
  std::u16string units(std::min(count, most), u'\0');
  std::memcpy(&units[0], bytes, units.size() * sizeof(char16_t));
  if (ArchivesSwapBytes) SwapBytes(&units[0], units.size(), sizeof(char16_t));
  std::string text;
  PutJsonString(text, units);
  return Shortened(std::move(text), count, units.size(), "unit");
}

inline xstring ScalarText(ValueType const& type, octet_t const* bytes) {
  if (type.m_kind == VK_CHAR) return type.m_size == 1 ? QuotedText(bytes, 1, 1) : QuotedText16(bytes, 1, 1);
  alignas(16) octet_t value[16];
  std::memcpy(value, bytes, type.m_size);
  if (ArchivesSwapBytes) SwapBytes(value, 1, type.m_size);
  return TextOf([&](xostream& os) { type.m_ops->m_print(os, value); });
}

inline xstring EnumText(ValueType const& type, octet_t const* bytes) {
  return TextOf([&](xostream& os) { PrintEnum(os, type.m_enum, static_cast<int32>(CompactAt(bytes))); });
}

}  // namespace views

inline xstring ArchiveValueText(ArchiveView::Content const& content, ValueType const& type, octet_t const* bytes) {
  if (type.m_kind == VK_ENUM) return EnumText(type, bytes);
  if (type.m_kind != VK_TEXT) return ScalarText(type, bytes);
  const std::size_t count = CompactAt(bytes);
  octet_t const* const text = bytes + SizeOfCompact(*bytes);
  if (type.m_code == RC_STRING16) return QuotedText16(text, count, content.m_options.m_text);
  return QuotedText(text, count, content.m_options.m_text);
}

// --- Nodes

inline namespace views {

// As a key stands in a path: without quotes.
inline xstring KeyText(ArchiveView::Content const& content, uint32 entry) {
  ArchiveNode const* const key = entry + 1 < content.m_nodes.size() && content.m_nodes[entry + 1].m_parent == entry
                                     ? &content.m_nodes[entry + 1]
                                     : nullptr;
  if (!key || key->m_kind != AP_VALUE || key->m_isBlock) {
    return vxMakeString('#' << content.m_nodes[entry].m_position);
  }
  xstring text = ArchiveValueText(content, *key->m_type, content.BytesOf(*key));
  if (key->m_type->m_code == RC_STRING8 && text.size() > 1 && text.back() == '"') {
    text = xstring(text.substr(1, text.size() - 2));
  }
  return LimitText(text, 60);
}

inline xstring ReferenceText(ArchiveNode const& node) {
  if (node.m_detail == 0) return "null";
  return vxMakeString('#' << node.m_detail << (node.m_isNew ? ", new" : ""));
}

inline xstring ReleaseText(ArchiveView::Content const& content, ArchiveNode const& node) {
  const uint32 release = CompactAt(content.BytesOf(node));
  return TextOf([&](xostream& os) {
    os << release;
    if (node.m_label) os << " of " << node.m_label;
    if (node.m_detail == kNoNode) {
      os << " of a project that is not here";
    } else if (node.m_detail != release) {
      os << ", today " << node.m_detail;
    }
  });
}

}  // namespace views

inline xstring ArchivePathText(ArchiveView::Content const& content, uint32 node) {
  xvector<uint32> way;
  for (uint32 at = node; at != kNoNode; at = content.m_nodes[at].m_parent) {
    way.push_back(at);
    if (content.m_nodes[at].m_step == EPathStep::Object) break;
  }
  return TextOf([&](xostream& os) {
    bool isFirst = true;
    while (!way.empty()) {
      ArchiveNode const& step = content.m_nodes[way.back()];
      if (step.m_step == EPathStep::Object) os << '#' << step.m_position;
      if (step.m_step == EPathStep::Field) os << (isFirst ? "" : ".") << step.m_label;
      if (step.m_step == EPathStep::Entry) os << '[' << KeyText(content, way.back()) << ']';
      if (step.m_step == EPathStep::Element && !step.m_isBlock) os << '[' << step.m_position << ']';
      if (step.m_step != EPathStep::None) isFirst = false;
      way.pop_back();
    }
  });
}

inline xstring ArchiveNodeText(ArchiveView::Content const& content, ArchiveNode const& node) {
  octet_t const* const bytes = content.BytesOf(node);
  switch (node.m_kind) {
    case AP_MARK:
      return vxMakeString("objects, form " << int32(bytes[3]));
    case AP_COUNT:
      return vxMakeString(CompactAt(bytes) << (node.m_label ? " " : "") << (node.m_label ? node.m_label : ""));
    case AP_NAME:
      return QuotedText(bytes + SizeOfCompact(*bytes), CompactAt(bytes), content.m_options.m_text);
    case AP_RELEASE:
      return ReleaseText(content, node);
    case AP_REFERENCE:
      return ReferenceText(node);
    case AP_TAG:
      return vxMakeString(CompactAt(bytes) << ", " << node.m_label);
    case AP_VALUE:
      return ArchiveValueText(content, *node.m_type, bytes);
    case AP_BYTES:
      return CountText(node.m_size, "byte") + " that only the class knows";
    case AP_REST:
      return CountText(node.m_size, "byte") + (content.m_error.empty() ? ", more than is shown" : ", not read");
    case AP_GROUP:
      break;
  }
  return xstring();
}

inline xstring ArchiveShortText(ArchiveView::Content const& content, uint32 node) {
  ArchiveNode const& of = content.m_nodes[node];
  if (of.m_kind != AP_GROUP) {
    return of.m_isBlock ? CountText(of.m_size / of.m_type->m_size, "element") : ArchiveNodeText(content, of);
  }
  ArchiveNode const* const first = node + 1 < of.m_end ? &content.m_nodes[node + 1] : nullptr;
  if (first && first->m_kind == AP_COUNT) return CountText(CompactAt(content.BytesOf(*first)), "element");
  if (first && (first->m_kind == AP_TAG || first->m_kind == AP_NAME)) {
    xstring held;
    if (node + 2 < of.m_end) held = ' ' + ArchiveShortText(content, node + 2);
    return (first->m_kind == AP_TAG ? xstring(first->m_label) : ArchiveNodeText(content, *first)) + held;
  }
  return of.m_type ? of.m_type->m_text : xstring();
}

// --- Parts

inline namespace views {

// Its type, where it has one.
inline xstring WhatOf(ArchiveNode const& node) {
  static constexpr ConstStringZ names[] = {"project", "class", "type"};
  switch (node.m_kind) {
    case AP_MARK:
      return "head";
    case AP_COUNT:
      return "count";
    case AP_NAME:
      return names[node.m_detail];
    case AP_RELEASE:
      return "release";
    case AP_TAG:
      return "tag";
    default:
      if (!node.m_type) return xstring();
      return node.m_step == EPathStep::Key ? xstring(node.m_type->m_text + ", key") : node.m_type->m_text;
  }
}

inline ArchivePart PartOf(ArchiveView::Content const& content, uint32 index, std::size_t part) {
  ArchiveNode const& node = content.m_nodes[index];
  ArchivePart shown;
  shown.m_kind = node.m_kind;
  shown.m_offset = node.m_offset;
  shown.m_size = node.m_size;
  for (uint32 at = node.m_parent; at != kNoNode; at = content.m_nodes[at].m_parent) ++shown.m_depth;
  shown.m_path = ArchivePathText(content, index);
  shown.m_type = WhatOf(node);
  if (!node.m_isBlock) {
    shown.m_value = ArchiveNodeText(content, node);
    return shown;
  }
  const std::size_t size = node.m_type->m_size;
  const std::size_t first = part * PerPart(*node.m_type);
  const std::size_t count = std::min(PerPart(*node.m_type), node.m_size / size - first);
  shown.m_offset += first * size;
  shown.m_size = count * size;
  shown.m_path += vxMakeString('[' << first);
  if (count > 1) shown.m_path += vxMakeString(".." << first + count - 1);
  shown.m_path += ']';
  for (std::size_t i = 0; i < count; ++i) {
    if (i > 0) shown.m_value += ' ';
    shown.m_value += ScalarText(*node.m_type, content.BytesOf(node) + (first + i) * size);
  }
  return shown;
}

inline void FindFirstParts(ArchiveView::Content& content) {
  std::size_t count = 0;
  content.m_firstParts.reserve(content.m_nodes.size() + 1);
  for (ArchiveNode const& node : content.m_nodes) {
    content.m_firstParts.push_back(count);
    const std::size_t perPart = node.m_isBlock ? PerPart(*node.m_type) * node.m_type->m_size : 0;
    count += perPart > 0 ? (node.m_size + perPart - 1) / perPart : 1;
  }
  content.m_firstParts.push_back(count);
}

template <typename Each>
void EachPart(ArchiveView::Content const& content, std::size_t first, std::size_t count, Each each) {
  auto const& firsts = content.m_firstParts;
  auto node = static_cast<uint32>(std::upper_bound(firsts.begin(), firsts.end() - 1, first) - firsts.begin());
  for (--node; node < content.m_nodes.size(); ++node) {
    for (std::size_t part = std::max(first, firsts[node]); part < firsts[node + 1]; ++part) {
      if (count-- == 0) return;
      each(PartOf(content, node, part - firsts[node]));
    }
  }
}

constexpr std::size_t kBytesPerLine = 8;

inline void PrintBytes(std::string& line, octet_t const* bytes, std::size_t size) {
  for (std::size_t i = 0; i < kBytesPerLine; ++i) {
    if (i < size) {
      line += kHexDigits[bytes[i] >> 4];
      line += kHexDigits[bytes[i] & 15];
      line += ' ';
    } else {
      line += "   ";
    }
  }
}

inline std::string OffsetText(std::size_t offset) {
  std::string text;
  for (int shift = offset > 0xFFFFFFFF ? 60 : 28; shift >= 0; shift -= 4) text += kHexDigits[offset >> shift & 15];
  return text + "  ";
}

inline void Pad(std::string& line, std::size_t to) { line.resize(std::max(to, line.size() + 2), ' '); }

constexpr std::size_t kPathColumn = 36, kTypeColumn = 64, kValueColumn = 84;

inline void PrintLine(xostream& os, std::string line, std::string_view path, std::string_view type,
                      std::string_view value) {
  line.resize(kPathColumn, ' ');
  line += path;
  Pad(line, kTypeColumn);
  line += type;
  Pad(line, kValueColumn);
  line += value;
  line.erase(line.find_last_not_of(' ') + 1);
  os << line << '\n';
}

inline void PrintPart(xostream& os, ArchivePart const& part, octet_t const* bytes) {
  std::string line = OffsetText(part.m_offset);
  const bool isGroup = part.m_kind == AP_GROUP;
  if (!isGroup) PrintBytes(line, bytes, part.m_size);
  PrintLine(os, line, part.m_path, part.m_type, part.m_value);
  if (isGroup) return;
  for (std::size_t at = kBytesPerLine; at < part.m_size; at += kBytesPerLine) {
    std::string more = OffsetText(part.m_offset + at);
    PrintBytes(more, bytes + at, part.m_size - at);
    more.erase(more.find_last_not_of(' ') + 1);
    os << more << '\n';
  }
}

}  // namespace views

// --- The view

inline ArchiveView::Content::Content(xvector<octet_t> bytes, ArchiveOptions const& options) : m_options(options) {
  if (bytes.size() > options.m_limits.m_bytes) m_error = "archive larger than allowed";
  m_archive.m_bytes = std::move(bytes);
  m_archive.m_limits = options.m_limits;
  m_archive.m_objects.m_allow = options.m_allow;
  m_archive.m_objects.m_allowType = options.m_allowType;
}
inline ArchiveView::Content::~Content() {
  m_hold.reset();
  m_archive.m_objects.Destroy();
}

inline ArchiveView::ArchiveView(ArchiveView&&) noexcept = default;
inline ArchiveView& ArchiveView::operator=(ArchiveView&&) noexcept = default;
inline ArchiveView::~ArchiveView() = default;

inline ArchiveView::ArchiveView(xvector<octet_t> bytes, ArchiveOptions const& options)
    : m_content(std::make_unique<Content>(std::move(bytes), options)) {
  ArchiveWalker(*m_content).Objects();
  FindFirstParts(*m_content);
}
inline ArchiveView::ArchiveView(ReflectedType const& type, TypeOps const& ops, xvector<octet_t> bytes,
                                ArchiveOptions const& options)
    : m_content(std::make_unique<Content>(std::move(bytes), options)) {
  m_content->m_declared = type;
  m_content->m_type = &m_content->m_types.Of(type);
  m_content->m_ops = &ops;
  ArchiveWalker(*m_content).Value();
  FindFirstParts(*m_content);
}

inline ArchiveView ArchiveView::OfType(xstring const& name, xvector<octet_t> bytes, ArchiveOptions const& options) {
  ValueTypes types;
  ValueType const* const type = JsonTypeOfName(types, name);
  if (!type || !type->m_ops) throw AccessError(NotRegistered("type", name));
  ReflectedType const reflected =
      type->m_class || type->m_variant ? NamedType(type->m_code, name.c_str()) : NamedType(type->m_code, "");
  return ArchiveView(reflected, *type->m_ops, std::move(bytes), options);
}

inline xstring const& ArchiveView::Error() const { return m_content->m_error; }
inline xvector<octet_t> const& ArchiveView::Bytes() const { return m_content->m_archive.m_bytes; }
inline xvector<ArchiveRelease> const& ArchiveView::Releases() const { return m_content->m_releases; }

inline xstring ArchiveView::Class() const {
  if (m_content->m_type) return m_content->m_type->m_text;
  auto const& objects = m_content->m_objects;
  return objects.empty() || !objects[0].m_type ? xstring() : objects[0].m_type->m_text;
}

inline std::size_t ArchiveView::CountParts() const { return m_content->m_firstParts.back(); }

inline xvector<ArchivePart> ArchiveView::Parts(std::size_t first, std::size_t count) const {
  xvector<ArchivePart> parts;
  if (first < CountParts())
    EachPart(*m_content, first, count, [&](ArchivePart part) { parts.push_back(std::move(part)); });
  return parts;
}

inline void ArchiveView::Print(xostream& os) const {
  os << (Class().empty() ? xstring("archive") : Class()) << ", " << Bytes().size() << " bytes\n";
  PrintLine(os, "offset    bytes", "path", "type", "value");
  if (CountParts() > 0) {
    EachPart(*m_content, 0, std::size_t(-1),
             [&](ArchivePart const& part) { PrintPart(os, part, Bytes().data() + part.m_offset); });
  }
  if (!Error().empty()) os << "error: " << Error() << '\n';
  const xvector<ArchiveChange> evolved = Evolved();
  if (!evolved.empty()) os << "as it is read today:\n";
  for (ArchiveChange const& change : evolved) {
    os << "  " << change.m_path << ": " << (change.m_kind == ArchiveChange::Added ? "not written" : change.m_old)
       << " -> " << (change.m_kind == ArchiveChange::Removed ? "no longer there" : change.m_new) << '\n';
  }
}

inline xstring DumpArchive(xvector<octet_t> bytes, ArchiveOptions const& options) {
  return TextOf([&](xostream& os) { ArchiveView(std::move(bytes), options).Print(os); });
}

}  // namespace vesk
