#include "generators/xml.h"

namespace qrex {

namespace {

constexpr int64_t kBlanks = 2;

}  // namespace

void XmlWriter::AddAttribute(const XmlAttribute& attribute) {
  if (m_layout == XmlLayout::AttributeLines) {
    m_line.append("\n").append(m_tabs).append("\t");
  } else {
    m_line += ' ';
  }
  m_line.append(attribute.name).append("=\"").append(attribute.value) += '"';
}

void XmlWriter::EndTag(Ending ending, bool isLine) {
  if (isLine) {
    m_line.append("\n").append(m_tabs).append(ending == Ending::Empty ? "/>" : "\t>");
  } else {
    m_line.append(ending == Ending::Empty ? " />" : ">");
  }
}

void XmlWriter::BeginBody() {
  m_line += '\n';
  WriteLine();
  if (m_layout != XmlLayout::Blanks) {
    m_tabs += '\t';
    return;
  }
  m_out.Flush();
  m_out.AddIndent(kBlanks);
}

void XmlWriter::EndBody(std::string_view name) {
  if (m_layout != XmlLayout::Blanks) {
    m_tabs.pop_back();
  } else {
    m_out.Flush();
    m_out.AddIndent(-kBlanks);
  }
  m_line.append(m_tabs).append("</").append(name).append(">\n");
  WriteLine();
}

void XmlWriter::WriteLine() {
  m_out << m_line;
  m_line.clear();
}

}  // namespace qrex
