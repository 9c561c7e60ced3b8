// XML as the project formats lay it out: an element on lines of its own, its body one level deeper. Names and values
// are written as they are; whoever has values that must be escaped escapes them.
#pragma once

#include <initializer_list>
#include <string>
#include <string_view>

#include "text/text_writer.h"

namespace qrex {

enum class XmlLayout {
  Blanks,         // two blanks a level, also ahead of the further lines of a value
  Tabs,           // a tab a level
  AttributeLines  // a tab a level, and each attribute on a line of its own
};

struct XmlAttribute {
  std::string_view name, value;
};

// Attributes are any range of XmlAttribute.
class XmlWriter {
 public:
  XmlWriter(TextWriter& out, XmlLayout layout) : m_out(out), m_layout(layout) {}

  // <NAME A="B" />
  template <typename Attributes = std::initializer_list<XmlAttribute>>
  void Empty(std::string_view name, const Attributes& attributes = {}) {
    WriteTag(name, attributes, Ending::Empty);
    m_out << '\n';
  }

  // <NAME A="B">VALUE</NAME>
  template <typename Attributes = std::initializer_list<XmlAttribute>>
  void Value(std::string_view name, std::string_view value, const Attributes& attributes = {}) {
    WriteTag(name, attributes, Ending::Open);
    m_out << value << "</" << name << ">\n";
  }

 private:
  friend class XmlElement;
  enum class Ending { Open, Empty };

  template <typename Attributes>
  void WriteTag(std::string_view name, const Attributes& attributes, Ending ending) {
    m_out << m_tabs << '<' << name;
    for (const XmlAttribute& attribute : attributes) WriteAttribute(attribute);
    WriteTagEnd(ending, m_layout == XmlLayout::AttributeLines && !std::empty(attributes));
  }
  void WriteAttribute(const XmlAttribute& attribute);
  void WriteTagEnd(Ending ending, bool isLine);
  void BeginBody();
  void EndBody(std::string_view name);

  TextWriter& m_out;
  const XmlLayout m_layout;
  std::string m_tabs;  // ahead of each line; blanks are the indentation of the text
};

// What is written until the end of the scope is the body of the element. `name` outlives it.
class XmlElement {
 public:
  template <typename Attributes = std::initializer_list<XmlAttribute>>
  XmlElement(XmlWriter& xml, std::string_view name, const Attributes& attributes = {}) : m_xml(xml), m_name(name) {
    m_xml.WriteTag(name, attributes, XmlWriter::Ending::Open);
    m_xml.BeginBody();
  }
  ~XmlElement() { m_xml.EndBody(m_name); }
  XmlElement(const XmlElement&) = delete;
  XmlElement& operator=(const XmlElement&) = delete;

 private:
  XmlWriter& m_xml;
  const std::string_view m_name;
};

}  // namespace qrex
