#include "translator/file/schema_check.h"

#include "translator/declared/class_def.h"

namespace qrex {

namespace {

void CheckElement(const NameSpaceElement& element) {
  if (element.category == Category::NameSpace) {
    for (const auto& [name, within] : static_cast<const NameSpace&>(element).Elements()) CheckElement(*within);
  }
  if (element.category != Category::Class || element.status == DeclStatus::Forward) return;
  const auto& def = static_cast<const ClassDef&>(element);
  const std::string fault = def.HasEmbeddedModel() ? def.owner.host.SchemaFault(def) : std::string();
  if (!fault.empty()) throw LexScannerException(fault, def.m_schemaPosition ? def.m_schemaPosition : def.position);
  for (const auto& nested : def.m_ownedElements) CheckElement(*nested);
}

}  // namespace

void CheckSchemas(const ScannedFile& file) {
  if (file.host.KeepsSchemas() && !file.file.project->exported) CheckElement(*file.rootNameSpace);
}

}  // namespace qrex
