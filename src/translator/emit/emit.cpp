#include "translator/emit/emit.h"

#include <algorithm>

#include "translator/symbols/scanned_file.h"

namespace qrex {

void WriteIndentedText(TextWriter& out, std::string_view text, size_t blanks) {
  for (size_t lineFeed; blanks > 0 && (lineFeed = text.find('\n')) != std::string_view::npos;
       text.remove_prefix(lineFeed + 1)) {
    out << text.substr(0, lineFeed + 1) << kBlanks.substr(0, blanks);
  }
  out << text;
}

Block::Block(TextWriter& out, std::string_view suffix) : m_out(out), m_suffix(suffix) {
  m_out << "{\n";
  m_out.Flush();
  m_out.AddIndent(4);
}

Block::~Block() {
  m_out.Flush();
  m_out.AddIndent(-4);
  m_out << "}" << m_suffix << "\n";
}

namespace {

std::string_view InlineWord(const NameSpace& nameSpace) { return nameSpace.isInline ? "inline " : ""; }

}  // namespace

std::vector<const NameSpace*> EnclosingNameSpaces(const NameSpace* innermost) {
  std::vector<const NameSpace*> path;
  for (; innermost && !innermost->IsRoot(); innermost = innermost->parent) path.push_back(innermost);
  std::reverse(path.begin(), path.end());
  return path;
}

NameSpaceFrame::NameSpaceFrame(TextWriter& out, const NameSpace* innermost)
    : m_out(out), m_path(EnclosingNameSpaces(innermost)) {
  for (const NameSpace* nameSpace : m_path) {
    m_out << InlineWord(*nameSpace) << "namespace " << nameSpace->name << "\n{\n";
  }
}

NameSpaceFrame::~NameSpaceFrame() {
  for (auto it = m_path.rbegin(); it != m_path.rend(); ++it) m_out << "} // " << (*it)->name << "\n";
}

// Braces are closed and opened as the text around has them: one for each head, which may have several names.
void WriteOutsideNameSpaces(TextWriter& out, const NameSpace* innermost, const std::function<void()>& write) {
  const std::vector<const NameSpace*> path = EnclosingNameSpaces(innermost);
  for (auto it = path.rbegin(); it != path.rend(); ++it) {
    if (!(*it)->sharesBrace) out << "} //" << (*it)->name << "\n";
  }
  write();
  for (size_t i = 0; i < path.size(); ++i) {
    if (path[i]->sharesBrace) {
      out << "::" << InlineWord(*path[i]) << path[i]->name;
    } else {
      out << InlineWord(*path[i]) << "namespace " << path[i]->name;
    }
    if (i + 1 == path.size() || !path[i + 1]->sharesBrace) out << "\n{\n";
  }
}

std::string ExportPrefix(const NameSpaceElement& element) {
  const Project& project = *element.owner.file.project;
  if (!element.m_exported || project.targetType != TargetType::DynamicLinkLibrary) return {};
  return project.name + "_API ";
}

std::string TargetIdentifier(const NameSpaceElement& element) { return element.owner.file.project->MangledProjDir(); }

void WriteArgDeclarations(TextWriter& out, const std::vector<FunctionArg>& arguments) {
  auto writeArgument = [&](const FunctionArg& argument) {
    PrintDeclaration(out, argument.type, argument.name, DeclarationMode::Plain);
  };
  Each(out, arguments, ",", writeArgument)();
}

void WriteSelfAndArgDeclarations(TextWriter& out, std::string_view className, const FunctionSignature& method) {
  out << className << (method.isConst ? " const" : "") << "* _self";
  if (!method.arguments.empty()) out << ",";
  WriteArgDeclarations(out, method.arguments);
}

void WriteArgNames(TextWriter& out, const std::vector<FunctionArg>& arguments) {
  Each(out, arguments, ",", [&](const FunctionArg& argument) { out << argument.name; })();
}

void WriteReturn(TextWriter& out, const TypeCode& returnType) {
  if (!IsVoid(returnType)) out << "return ";
}

void WriteSignature(TextWriter& out, const FunctionSignature& signature) {
  auto writeArgument = [&](const FunctionArg& argument) {
    PrintDeclaration(out, argument.type, argument.name, DeclarationMode::Plain);
    if (!argument.defaultValue.empty()) out << "=" << argument.defaultValue;
  };
  Write(out, "$inline$$result$ $name$($arguments$)$const$", "inline"_ = signature.isInline ? "inline " : "",
        "result"_ = TypeView(signature.returnType), "name"_ = signature.name,
        "arguments"_ = Each(out, signature.arguments, ",", writeArgument),
        "const"_ = signature.isConst ? " const" : "");
}

std::string NameOrZero(bool present, const std::string& name) { return present ? name : "0"; }

std::string CountedName(size_t count, const std::string& name) {
  return count == 0 ? "0,0" : name + "," + std::to_string(count);
}

}  // namespace qrex
