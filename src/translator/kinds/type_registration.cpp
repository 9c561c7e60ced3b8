#include "translator/kinds/type_registration.h"

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

void ParseType(QrexParser& parser) {
  parser.RequireIObjectImport();
  parser.Advance();
  bool registered = parser.ParseExportModifier();
  bool reflected = registered;
  if (parser.Is(kShiftLeft)) parser.ParseQualifierFlags(reflected, registered, " >> on $type");
  const char* const begin = parser.current.text.begin;
  const std::optional<ParsedType> parsed = parser.ParseTypeWithName(Naming::None, reflected);
  if (!parsed) parser.Fail("Type expected when read " + Printed(parser.current));
  const std::string type = TypeText(parsed->type);
  const TypeView head = TypeView(parsed->type).WithoutMetadata();
  if (head.IsNamed() && head.Op() != kOpTypedef && head.Op() != kOpCppText && parser.WantsCompilableText()) {
    if (const NameSpaceElement* element = NamedElement(head, parser.Root())) {
      parser.WarnOfText(
          PrintedElement(*element) + " has a record of its own: leave $type out, and write + or <<reflect>> there",
          *element, begin);
    }
  }
  const Project& project = parser.GetProject();
  const std::string api =
      registered && project.targetType == TargetType::DynamicLinkLibrary ? project.name + "_API " : std::string();
  if (registered) {
    parser.file.registrations.types.push_back({parsed->type, &parser.Current(), parser.stream.SourcePosition(begin)});
  }
  Write(parser.out, R"(
    $api$vesk::ReflectionByteCode _GetReflected($type$ const*);
    $api$vesk::TypeOps const& _GetTypeOps($type$ const*);
  )",
        "api"_ = api, "type"_ = type);
  parser.Flush();
  parser.DropBehindCurrent();
  if (!parser.Is(kSemicolon)) {
    parser.Fail("; expected after $type " + type + " when read " + Printed(parser.current));
  }
}

void CheckNestedRecord(QrexParser& parser, const NameSpaceElement& element) {
  parser.WarnOfText(PrintedElement(element) +
                        " stands in a class, which has no place for a record: declare it in the name space, or leave "
                        "<<reflect>> out",
                    element);
}

void WriteTypeRegistration(TextWriter& out, const TypeRegistration& registration, RegistrationLists& lists) {
  const std::string type = TypeText(registration.code);
  const std::string mangled = MangledType(registration.code);
  std::string name;
  for (const NameSpace* nameSpace : EnclosingNameSpaces(registration.scope)) name += nameSpace->name + "::";
  lists.registerNames.push_back(name + mangled);

  NameSpaceFrame frame(out, registration.scope);
  StringTable strings;
  Write(out, R"(
    vesk::ReflectionByteCode _GetReflected($type$ const*)
    {
        $byteCode$
        $strings$
        return vesk::ReflectionByteCode(bc,$stringsName$);
    }
    vesk::TypeOps const& _GetTypeOps($type$ const*)
    {
        static vesk::TypeOps typeOps =
        {
            $typeOps$
        };
        return typeOps;
    }
    void _Register_$mangled$()
    {
        vxVerify(vesk::RegisterTypeOps(vesk::ReflectionByteCodeValue(_GetReflected(($type$*)0)),&_GetTypeOps(($type$*)0)));
    }
  )",
        "type"_ = type, "byteCode"_([&] { WriteTypeByteCode(out, "bc", strings, registration.code); }),
        "strings"_([&] { WriteStringTable(out, strings, ""); }),
        "stringsName"_([&] { out << (strings.Empty() ? "NULL" : "_stringTable"); }),
        "typeOps"_([&] { WriteTypeOps(out, type, kOpsAll); }), "mangled"_ = mangled);
}

}  // namespace qrex
