#include "translator/kinds/global_defs.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/symbols/scanned_file.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

void GlobalFunctionDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  CollectNamedTypes(signature, *owner.rootNameSpace, out);
}

void GlobalDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister() || !m_registered) return;
  WriteReflectionHead(out, *this);
  NameSpaceFrame frame(out, parent);
  IndentScope indent(out, 4);
  lists.registerNames.push_back(GetQualifiedName());
  out << "void _Register_" << name << "()\n";
  Block body(out);
  WriteReflectedDefinition(out);
}

namespace {

void WriteRegister(TextWriter& out, const NameSpaceElement& element, std::string_view suffix) {
  out << "vxVerify(vesk::RegisterReflected" << element.GetReflectedKindName() << "(&" << element.name << suffix
      << ",vesk::" << TargetIdentifier(element) << "_GetXTarget()) == vesk::NSE_OK);\n";
}

}  // namespace

void GlobalFunctionDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  WriteSignatureArrays(out, name, signature, strings, "_arg_");
  WriteStringTable(out, strings, name);
  out << "static const vesk::ReflectedGlobalFunction " << name << "_function =\n";
  {
    Block record(out, ";");
    WriteSignatureRows(out, *this, signature, strings);
    out << "(vesk::FunctionPointer)(";
    PrintType(out, signature.returnType);
    out << " (*)(";
    WriteArgDeclarations(out, signature.arguments);
    out << ")" << (signature.isConst ? " const" : "") << ")&" << GetQualifiedName() << "\n";
  }
  WriteRegister(out, *this, "_function");
}

void GlobalVarDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  WriteTypeByteCode(out, name + "_type", strings, type);
  WriteStringTable(out, strings, name);
  out << "static const vesk::ReflectedGlobalVariable " << name << "_var =\n";
  {
    Block record(out, ";");
    out << "\"" << GetQualifiedName() << "\",\n&" << name << ",\n" << name << "_type,\n";
    out << NameOrZero(!strings.Empty(), name + "_stringTable") << "\n";
  }
  WriteRegister(out, *this, "_var");
}

void TypedefDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  WriteTypeByteCode(out, name + "_type", strings, type);
  WriteStringTable(out, strings, name);
  out << "static const vesk::ReflectedTypedef " << name << "_typedef =\n";
  {
    Block record(out, ";");
    out << "\"" << GetQualifiedName() << "\",\n" << name << "_type,\n";
    out << NameOrZero(!strings.Empty(), name + "_stringTable") << "\n";
  }
  WriteRegister(out, *this, "_typedef");
}

}  // namespace qrex
