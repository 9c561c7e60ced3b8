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
    AddTag(name, attributes, Ending::Empty);
    m_line += '\n';
    WriteLine();
  }

  // <NAME A="B">VALUE</NAME>
  template <typename Attributes = std::initializer_list<XmlAttribute>>
  void Value(std::string_view name, std::string_view value, const Attributes& attributes = {}) {
    AddTag(name, attributes, Ending::Open);
    m_line.append(value).append("</").append(name).append(">\n");
    WriteLine();
  }

 private:
  friend class XmlElement;
  enum class Ending { Open, Empty };

  template <typename Attributes>
  void AddTag(std::string_view name, const Attributes& attributes, Ending ending) {
    m_line.append(m_tabs).append("<").append(name);
    for (const XmlAttribute& attribute : attributes) AddAttribute(attribute);
    EndTag(ending, m_layout == XmlLayout::AttributeLines && !std::empty(attributes));
  }
  void AddAttribute(const XmlAttribute& attribute);
  void EndTag(Ending ending, bool isLine);
  void BeginBody();
  void EndBody(std::string_view name);
  void WriteLine();

  TextWriter& m_out;
  const XmlLayout m_layout;
  std::string m_tabs;  // ahead of each line; blanks are the indentation of the text
  std::string m_line;  // what is being composed: the text is written to once for each
};

// What is written until the end of the scope is the body of the element. `name` outlives it.
class XmlElement {
 public:
  template <typename Attributes = std::initializer_list<XmlAttribute>>
  XmlElement(XmlWriter& xml, std::string_view name, const Attributes& attributes = {}) : m_xml(xml), m_name(name) {
    m_xml.AddTag(name, attributes, XmlWriter::Ending::Open);
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
