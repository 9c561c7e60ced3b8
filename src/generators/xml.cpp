#include "generators/xml.h"

namespace qrex {

namespace {

constexpr int64_t kBlanks = 2;

}  // namespace

void XmlWriter::WriteAttribute(const XmlAttribute& attribute) {
  if (m_layout == XmlLayout::AttributeLines) {
    m_out << '\n' << m_tabs << '\t';
  } else {
    m_out << ' ';
  }
  m_out << attribute.name << "=\"" << attribute.value << '"';
}

void XmlWriter::WriteTagEnd(Ending ending, bool isLine) {
  if (isLine) {
    m_out << '\n' << m_tabs << (ending == Ending::Empty ? "/>" : "\t>");
  } else {
    m_out << (ending == Ending::Empty ? " />" : ">");
  }
}

void XmlWriter::BeginBody() {
  m_out << '\n';
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
  m_out << m_tabs << "</" << name << ">\n";
}

}  // namespace qrex
