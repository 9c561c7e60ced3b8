#include "translator/emit/records.h"

#include "workspace/project_model.h"

namespace qrex {

void WriteReflectionHead(TextWriter& out, const NameSpaceElement& element) {
  Write(out, R"(

    //### $element$
    namespace vesk { XTarget* $target$_GetXTarget(); }
  )",
        "element"_([&] { PrintElement(out, element); }), "target"_ = TargetIdentifier(element));
}

void WriteRegistration(TextWriter& out, const NameSpaceElement& element, RegistrationLists& lists) {
  if (!element.m_registered) return;
  lists.registerNames.push_back(element.GetQualifiedName());
  Write(out, R"(

    // Registration of $element$
    void _Register_$name$()
    {
        vxVerify(vesk::RegisterReflected$kind$(&_GetReflected( ($name$*) 0),vesk::$target$_GetXTarget()) == vesk::NSE_OK);
    }
  )",
        "element"_([&] { PrintElement(out, element); }), "name"_ = element.name,
        "kind"_ = element.GetReflectedKindName(), "target"_ = TargetIdentifier(element));
}

void WriteSignatureArrays(TextWriter& out, const std::string& prefix, const FunctionSignature& signature,
                          StringTable& strings, std::string_view infix) {
  if (!signature.metadata.empty()) WriteMetadataByteCode(out, prefix + "_metadata", strings, signature.metadata);
  if (!IsVoid(signature.returnType)) WriteTypeByteCode(out, prefix + "_return", strings, signature.returnType);
  for (const FunctionArg& argument : signature.arguments) {
    WriteTypeByteCode(out, prefix + std::string(infix) + argument.name, strings, argument.type);
  }
  if (signature.arguments.empty()) return;
  auto writeRow = [&](const FunctionArg& argument) {
    Write(out, R"(
      { "$argument$", $prefix$$infix$$argument$ },
    )",
          "argument"_ = argument.name, "prefix"_ = prefix, "infix"_ = infix);
  };
  Write(out, R"(
    static const vesk::ReflectedArg $prefix$_args[] =
    {
        $rows$
    };
  )",
        "prefix"_ = prefix, "rows"_ = Each(out, signature.arguments, "", writeRow));
}

void WriteSignatureRows(TextWriter& out, const NameSpaceElement& element, const FunctionSignature& signature,
                        const StringTable& strings) {
  const std::string& name = element.name;
  Write(out, R"(
    "$qualifiedName$",
    {$return$},
    $arguments$,
    $metadata$,
    $strings$,
  )",
        "qualifiedName"_ = element.GetQualifiedName(),
        "return"_ = NameOrZero(!IsVoid(signature.returnType), name + "_return"),
        "arguments"_ = CountedName(signature.arguments.size(), name + "_args"),
        "metadata"_ = NameOrZero(!element.metadata.empty(), name + "_metadata"),
        "strings"_([&] { WriteStringTableName(out, strings, name); }));
}

void RecordedElement::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  if (!HaveSomethingToRegister() || !HasRecord()) return;
  WriteReflectionHead(out, *this);
  NameSpaceFrame frame(out, parent);
  IndentScope indent(out, 4);
  WriteReflectedDefinition(out);
  WriteRegistration(out, *this, lists);
}

void WriteTypeTraits(TextWriter& out, const NameSpaceElement& element) {
  auto traits = [&] {
    Write(out, R"(
      namespace vesk
      {
      template<> struct TypeTraits<$name$>
      {
          static const bool is_exported = $exported$;
          static const bool is_reflected = $reflected$;
          static const bool is_registered = $registered$;
          static const vesk::ETypeTraitKind kind = vesk::$kind$;
          static const bool has_metadata = $metadata$;
      };
      $extraTraits$
      } // namespace vesk
    )",
          "name"_ = element.GetQualifiedName(), "exported"_ = BitText(element.m_exported),
          "reflected"_ = BitText(element.m_reflected), "registered"_ = BitText(element.EffectivelyRegistered()),
          "kind"_ = element.kindTraits.traits, "metadata"_ = BitText(element.ContainsMetaData()),
          "extraTraits"_([&] { element.WriteExtraTraits(out); }));
  };
  out << "\n";
  WriteOutsideNameSpaces(out, element.parent, traits);
}

}  // namespace qrex
