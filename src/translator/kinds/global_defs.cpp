#include "translator/kinds/global_defs.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/symbols/scanned_file.h"
#include "translator/symbols/type_predicates.h"

namespace qrex {

void GlobalFunctionDef::CollectReferences(std::vector<const NameSpaceElement*>& out) const {
  CollectNamedTypes(m_signature, *owner.rootNameSpace, out);
}

void GlobalDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister() || !m_registered) return;
  WriteReflectionHead(out, *this);
  NameSpaceFrame frame(out, parent);
  IndentScope indent(out, 4);
  lists.registerNames.push_back(GetQualifiedName());
  Write(out, R"(
    void _Register_$name$()
    {
        $definition$
    }
  )",
        "name"_ = name, "definition"_([&] { WriteReflectedDefinition(out); }));
}

namespace {

// `record`: the static object that the definition has written.
void WriteRegister(TextWriter& out, const NameSpaceElement& element, std::string_view record) {
  Write(out, R"(
    vxVerify(vesk::RegisterReflected$kind$(&$record$,vesk::$target$_GetXTarget()) == vesk::NSE_OK);
  )",
        "kind"_ = element.GetReflectedKindName(), "record"_ = record, "target"_ = TargetIdentifier(element));
}

// Of what has a type. `address`: the row of what has one.
void WriteTypedDefinition(TextWriter& out, const NameSpaceElement& element, const TypeCode& type,
                          std::string_view record, std::string_view address) {
  const std::string& name = element.name;
  StringTable strings;
  WriteTypeByteCode(out, name + "_type", strings, type);
  WriteStringTable(out, strings, name);
  Write(out, R"(
    static const vesk::Reflected$kind$ $record$ =
    {
        "$qualifiedName$",
        $address$
        $name$_type,
        $strings$
    };
    $register$
  )",
        "kind"_ = element.GetReflectedKindName(), "record"_ = record, "qualifiedName"_ = element.GetQualifiedName(),
        "address"_ = address, "name"_ = name, "strings"_ = NameOrZero(!strings.Empty(), name + "_stringTable"),
        "register"_([&] { WriteRegister(out, element, record); }));
}

}  // namespace

void GlobalFunctionDef::WriteReflectedDefinition(TextWriter& out) {
  StringTable strings;
  WriteSignatureArrays(out, name, m_signature, strings, "_arg_");
  WriteStringTable(out, strings, name);
  Write(out, R"(
    static const vesk::ReflectedGlobalFunction $name$_function =
    {
        $rows$
        (vesk::FunctionPointer)($result$ (*)($arguments$)$const$)&$qualifiedName$
    };
    $register$
  )",
        "name"_ = name, "rows"_([&] { WriteSignatureRows(out, *this, m_signature, strings); }),
        "result"_ = TypeView(m_signature.returnType),
        "arguments"_([&] { WriteArgDeclarations(out, m_signature.arguments); }),
        "const"_ = m_signature.isConst ? " const" : "", "qualifiedName"_ = GetQualifiedName(),
        "register"_([&] { WriteRegister(out, *this, name + "_function"); }));
}

void GlobalVarDef::WriteReflectedDefinition(TextWriter& out) {
  WriteTypedDefinition(out, *this, m_type, name + "_var", "&" + name + ",");
}

void TypedefDef::WriteReflectedDefinition(TextWriter& out) {
  WriteTypedDefinition(out, *this, m_type, name + "_typedef", "");
}

}  // namespace qrex
