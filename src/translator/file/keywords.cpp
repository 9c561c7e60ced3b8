#include "translator/file/keywords.h"

#include "translator/class/class_body.h"
#include "translator/class/class_members.h"
#include "translator/class/class_parser.h"
#include "translator/class/mixin_list.h"
#include "translator/interface/interface_parser.h"
#include "translator/kinds/enum_parser.h"
#include "translator/kinds/functor_parser.h"
#include "translator/kinds/global_parsers.h"
#include "translator/kinds/type_registration.h"
#include "translator/kinds/variant_parser.h"
#include "translator/model/model.h"
#include "translator/reader/qrex_parser.h"

namespace qrex {

namespace {

template <ClassKind kind>
void ParseFileClass(QrexParser& parser) {
  ParseClass(parser, kind, nullptr);
}

template <ClassKind kind>
void ParseNestedClass(QrexParser& parser, ClassDef& def) {
  ParseClass(parser, kind, &def);
}

void ParseModelInBody(QrexParser& parser, ClassDef& def) {
  if (def.HasEmbeddedModel()) parser.Fail("Repeated model declaration");
  parser.Advance();
  ParseModelBlock(parser, def, Expansion::Accessors);
  parser.DropBehindCurrent();
}

constexpr Keyword kKeywords[] = {
    {"enum", [](QrexParser& parser) { ParseEnum(parser, nullptr); }},
    {"variant", [](QrexParser& parser) { ParseVariant(parser, nullptr); }},
    {"type", ParseType},
    {"typedef", ParseTypedef},
    {"interface", [](QrexParser& parser) { ParseInterface(parser, nullptr); }},
    {"struct", ParseFileClass<ClassKind::Struct>},
    {"class", ParseFileClass<ClassKind::Class>},
    {"adt", ParseFileClass<ClassKind::Adt>},
    {"mixin", ParseFileClass<ClassKind::Mixin>},
    {"model", ParseFileClass<ClassKind::Model>},
    {"var", ParseGlobalVar},
    {"function", [](QrexParser& parser) { ParseGlobalFunction(parser, false); }},
    {"polymorphic", [](QrexParser& parser) { ParseGlobalFunction(parser, true); }},
    {"functor", [](QrexParser& parser) { ParseFunctor(parser, false); }},
    {"makefunctor", ParseMakeFunctor},
    {"makeconstfunctor", ParseMakeFunctor},
    {"new", ParseNew, EndsOn::NextToken},
    {"warning", ParseWarning},
    {"init", ParseInit, EndsOn::NextToken},
    {"uninit", ParseUninit, EndsOn::NextToken},
};

constexpr ClassKeyword kClassKeywords[] = {
    {"class", ParseNestedClass<ClassKind::Class>, Scope::BodyAndCode},
    {"struct", ParseNestedClass<ClassKind::Struct>, Scope::BodyAndCode},
    {"mixin", ParseNestedClass<ClassKind::Mixin>, Scope::BodyAndCode},
    {"interface", [](QrexParser& parser, ClassDef& def) { ParseInterface(parser, &def); }, Scope::BodyAndCode},
    {"enum", [](QrexParser& parser, ClassDef& def) { ParseEnum(parser, &def); }, Scope::BodyAndCode},
    {"variant", [](QrexParser& parser, ClassDef& def) { ParseVariant(parser, &def); }, Scope::BodyAndCode},
    {"model", ParseModelInBody},
    {"cache", ParseCache, Scope::Body, EndsOn::NextToken},
    {"dep", ParseDep},
    {"indep", ParseIndep},
    {"evict", ParseEvict, Scope::Body, EndsOn::NextToken},
    {"visit", ParseVisit, Scope::Body, EndsOn::NextToken},
    {"functor", [](QrexParser& parser, ClassDef&) { ParseFunctor(parser, true); }},
    {"makefunctor", [](QrexParser& parser, ClassDef&) { ParseMakeFunctor(parser); }},
    {"makeconstfunctor", [](QrexParser& parser, ClassDef&) { ParseMakeFunctor(parser); }},
    {"implementing", ParseImplementing},
    {"new", [](QrexParser& parser, ClassDef&) { ParseNew(parser); }, Scope::BodyAndCode, EndsOn::NextToken},
    {"this", ParseThis, Scope::BodyAndCode, EndsOn::NextToken},
};

}  // namespace

const KeywordTables& AllKeywords() {
  static constexpr KeywordTables kTables{kKeywords, kClassKeywords};
  return kTables;
}

}  // namespace qrex
