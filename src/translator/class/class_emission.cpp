// The members and operators of a class: generated text inside the class and behind it.

#include "translator/class/class_emission.h"

#include <algorithm>

#include "translator/emit/emit.h"
#include "translator/interface/interface_def.h"
#include "translator/model/model.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

// Get of a const field answers a value.
TypeView WithoutConst(TypeView type, NameSpace& root) {
  const TypeView resolved = Resolved(type, root);
  return resolved.Op() == kOpConst ? resolved.Inner() : type;
}

// `holder`: the class, or one of its mixins. The base that holds a mixin's field may depend on template parameters.
void WriteFieldAccessors(TextWriter& out, const ClassDef& def, const ClassDef& holder) {
  const bool compilable = def.WantsCompilableText();
  const std::string_view self = If(compilable && &holder != &def, "this->");
  NameSpace& root = *holder.owner.rootNameSpace;
  for (const ClassField& field : holder.m_fields) {
    if (field.kind != FieldKind::Plain) continue;
    const bool isConst = compilable && IsConstField(field.type, root);
    const TypeView type = isConst ? WithoutConst(field.type, root) : field.type;
    auto set = [&] {
      Write(out, "void Set$name$($type$ _v) { $self$$name$ = _v; }\n", "type"_ = type, "name"_ = field.name,
            "self"_ = self);
    };
    Write(out, R"(
      $type$ Get$name$() const { return $self$$name$; }
      $set$
    )",
          "type"_ = type, "name"_ = field.name, "self"_ = self, "set"_ = If(!isConst, set));
  }
}

void WriteArchiveDeclarations(TextWriter& out) {
  Write(out, R"(
    void Serialise(vesk::Archive&) const;
    void Deserialise(vesk::InputArchive&);
  )");
}

void WriteArchiveMembers(TextWriter& out, const ClassDef& def) {
  if (def.IsWholeInPlace() && (def.m_inheritsModel || def.m_referencedModel)) {
    return WriteDataSourceRsnFunctions(out, def, Placement::InClass);
  }
  if (!def.HasEmbeddedModel()) {
    if (def.m_referencedModel) WriteArchiveDeclarations(out);
    return;
  }
  if (def.MemberPlacement() == Placement::InClass) {
    WriteSerialise(out, def, Placement::InClass);
    WriteDeserialise(out, def, Placement::InClass);
    if (!def.m_inheritsModel) WriteVisiting(out, def, Placement::InClass);
    return;
  }
  if (def.CanSerialiseEmbeddedModel()) WriteArchiveDeclarations(out);
  if (!def.m_inheritsModel) WriteVisitingDeclarations(out, def);
}

void WriteQueries(TextWriter& out, const ClassDef& def) {
  for (const InterfaceDef* interface : AllInterfaces(def)) {
    if (!interface->m_reflected) continue;
    Write(out, R"(
      if (&_ri == &vesk::GetReflectedInterface<$name$ >()) { vesk::ptr<$name$> p(this); return reinterpret_cast<vesk::AnyInterface&>(p); }
    )",
          "name"_ = interface->GetQualifiedName());
  }
}

void WriteInterfaceMembers(TextWriter& out, const ClassDef& def, std::string_view scope) {
  const std::string name = def.IsWholeInPlace() ? def.name : def.GetQualifiedName() + def.TemplateArgs();
  const std::string reflected = def.m_reflected ? "&_GetReflected( (" + name + "*) 0)" : "NULL";
  Write(out, R"(

    vesk::AnyInterface $scope$QueryInterface(const vesk::ReflectedInterface& _ri)
    {
        $queries$
        return vesk::AnyInterface();
    }
    vesk::ReflectedClass const* $scope$GetReflectedClass() const
    {
        return $reflected$;
    }
  )",
        "scope"_ = scope, "queries"_([&] { WriteQueries(out, def); }), "reflected"_ = reflected);
}

void WriteInterfaceMembers(TextWriter& out, const ClassDef& def) {
  if (!def.m_implementsIObject) return;
  if (!def.HaveSomethingToRegister() || def.MemberPlacement() == Placement::InClass) {
    return WriteInterfaceMembers(out, def, "");
  }
  Write(out, R"(
    vesk::AnyInterface QueryInterface(const vesk::ReflectedInterface&);
    vesk::ReflectedClass const* GetReflectedClass() const;
  )");
}

void WriteReflectionMembers(TextWriter& out, const ClassDef& def) {
  if (!def.m_reflected) return;
  if (HasCreateFunction(def)) WriteCreateInstanceMember(out, def);
  if (def.IsMixin()) return;
  if (def.MemberPlacement() == Placement::InClass) {
    out << "friend ";
    return WriteGetReflected(out, def);
  }
  Write(out, "friend $api$vesk::ReflectedClass const& _GetReflected($class$ const*);\n", "api"_ = ExportPrefix(def),
        "class"_ = def.name);
}

}  // namespace

void WriteInterfaceDefinitions(TextWriter& out, const ClassDef& def) {
  WriteInterfaceMembers(out, def, def.GetQualifiedName() + def.TemplateArgs() + "::");
}

void WriteClassMembers(TextWriter& out, const ClassDef& def) {
  out << "public:\n";
  const IndentScope indent(out, 4);
  Write(out, R"(
    $evict$
    $model$
    $fieldAccessors$

    $archive$
    $reflection$
    $interfaces$
  )",
        "evict"_([&] { WriteEvictDgsNodes(out, def); }),
        "model"_ = If(!def.m_inheritsModel && def.HasEmbeddedModel(), [&] { WriteModelFieldsAndAccessors(out, def); }),
        "fieldAccessors"_([&] {
          WriteFieldAccessors(out, def, def);
          for (const ClassDef* mixin : def.m_mixins) WriteFieldAccessors(out, def, *mixin);
        }),
        "archive"_([&] { WriteArchiveMembers(out, def); }), "reflection"_([&] { WriteReflectionMembers(out, def); }),
        "interfaces"_([&] { WriteInterfaceMembers(out, def); }));
}

void WriteEvictDgsNodes(TextWriter& out, const ClassDef& def) {
  auto isNode = [](const ClassField& field) { return field.kind != FieldKind::Plain; };
  const bool hasNode = std::any_of(def.m_fields.begin(), def.m_fields.end(), isNode);
  if (!hasNode && !def.m_hasEvictBlock && def.m_evictionMembers.empty()) return;
  const bool hasBase = !def.m_bases.empty() || def.m_inheritsModel || def.IsMixin() || def.m_implementsIPersistable ||
                       def.m_implementsIObject;
  auto evict = [&](const std::string& node) { Write(out, "$node$.TryEvict(false);\n", "node"_ = node); };
  auto nodes = [&] {
    for (const ClassField& field : def.m_fields) {
      if (isNode(field)) evict(field.name);
    }
    for (const std::string& member : def.m_evictionMembers) {
      if (member.starts_with("_map_")) {
        Write(out, "vesk::TryEvict($map$);\n", "map"_ = member);
      } else {
        evict(member);
      }
    }
  };
  Write(out, R"(
    void EvictDgsNodes() const
    {
        $extra$
        $base$
        $nodes$
    }
  )",
        "extra"_ = If(def.m_hasEvictBlock, "EvictDgsNodes_extra();"),
        "base"_ = If(hasBase, "BaseClass::EvictDgsNodes();"), "nodes"_ = nodes);
}

namespace {

void WriteVisitorOperators(TextWriter& out, const ClassDef& def, std::string_view prefix, std::string_view name) {
  const bool hasModel = !def.IsMixin() && (def.HasEmbeddedModel() || def.m_referencedModel);
  if (!hasModel && (!def.IsIObjectVisitable() || def.m_implementsIObject)) return;
  auto pointer = [&] {
    Write(out, R"(
      $prefix$inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$class$ const*) { return _v; }
    )",
          "prefix"_ = prefix, "class"_ = name);
  };
  auto prefs = [&] {
    Write(out, R"(
      $prefix$inline vesk::IPrefVisitor& operator<<(vesk::IPrefVisitor& _v,$class$ const& _x) { _x.VisitPrefs(_v); return _v; }
    )",
          "prefix"_ = prefix, "class"_ = name);
  };
  Write(out, R"(

    $prefix$inline vesk::IObjectVisitor& operator<<(vesk::IObjectVisitor& _v,$class$ const& _x) { _x.VisitObjects(_v); return _v; }
    $pointer$
    $prefs$
  )",
        "prefix"_ = prefix, "class"_ = name, "pointer"_ = If(hasModel && !def.m_implementsIObject, pointer),
        "prefs"_ = If(hasModel, prefs));
}

// Two template heads can't be those of one function: text that compiles has one with the parameters of both.
void WriteArchiveFunctions(TextWriter& out, const ClassDef& def, std::string_view name) {
  const bool compilable = def.WantsCompilableText();
  const std::string parameters = def.TemplateParameters();
  auto prefixLine = [&] { out << def.TemplatePrefix() << "\n"; };
  Write(out, R"(
    $prefixLine$
    template<typename Archive$parameters$> $friend$inline void Serialise(Archive& _ar,$class$ const& _x) { _x.Serialise(_ar); }
    $prefixLine$
    template<typename Archive$parameters$> $friend$inline void Deserialise(Archive& _ar,$class$& _x) { _x.Deserialise(_ar); }
  )",
        "prefixLine"_ = If(!compilable || parameters.empty(), prefixLine),
        "parameters"_ = If(compilable && !parameters.empty(), "," + parameters), "friend"_ = def.FriendWord(),
        "class"_ = name);
}

void WriteStreamInsertion(TextWriter& out, const ClassDef& def, std::string_view prefix, std::string_view name) {
  if (def.m_qualifiers.os == TriState::Off) return;
  if (def.m_qualifiers.os == TriState::Unset) {
    if (!def.IsMixin()) WriteModelStreamInsertion(out, def);
    return;
  }
  Write(out, R"(

    $prefix$inline vesk::xostream& operator<<(vesk::xostream& _os,$class$ const& _x) { (($class$&)_x).Write(_os); return _os; }
  )",
        "prefix"_ = prefix, "class"_ = name);
}

void WriteImplementedInterfaces(TextWriter& out, const ClassDef& def) {
  auto write = [&](std::string_view how, const InterfaceDef& interface) {
    Write(out,
          "template<> struct $how$_implements_interface<$class$,$interface$> { static const bool value = true; };\n",
          "how"_ = how, "class"_ = def.GetQualifiedName(), "interface"_ = interface.GetQualifiedName());
  };
  auto isIn = [](const auto& interfaces, const InterfaceDef* interface) {
    return std::find(interfaces.begin(), interfaces.end(), interface) != interfaces.end();
  };
  std::vector<const InterfaceDef*> inherited;
  for (const InterfaceDef* interface : def.m_interfaces) {
    write("directly", *interface);
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) {
      if (!isIn(inherited, flat.base)) inherited.push_back(flat.base);
    }
  }
  for (const InterfaceDef* interface : inherited) {
    if (!isIn(def.m_interfaces, interface)) write("indirectly", *interface);
  }
}

// The functions of a method begin with the line end that would close the text ahead of them.
void WriteForwarder(TextWriter& out, const ClassDef& def, const FunctionSignature& method) {
  const bool compilable = def.WantsCompilableText();
  out << "\n";
  Write(out, "$prefix$inline $type$ __stdcall $method$($parameters$) { $return$_self->$method$($arguments$); }",
        "prefix"_ = If(compilable, def.FunctionPrefix()), "type"_ = TypeView(method.returnType),
        "method"_ = method.name, "parameters"_([&] {
          WriteSelfAndArgDeclarations(out, compilable ? def.GetTemplateClassName() : def.name, method);
        }),
        "return"_ = If(!IsVoid(method.returnType), "return "),
        "arguments"_([&] { WriteArgNames(out, method.arguments); }));
}

void WriteAdtFunction(TextWriter& out, const ClassDef& def, const FunctionSignature& method) {
  out << "\n";
  Write(out, "$api$$type$ __stdcall $method$($parameters$);", "api"_ = ExportPrefix(def),
        "type"_ = TypeView(method.returnType), "method"_ = method.name,
        "parameters"_([&] { WriteSelfAndArgDeclarations(out, def.name, method); }));
}

}  // namespace

void WriteClassOperators(TextWriter& out, const ClassDef& def) {
  const std::string& name = def.GetTemplateClassName();
  const std::string prefix = def.FunctionPrefix();
  WriteVisitorOperators(out, def, prefix, name);
  if (def.WriteInsertionExtractionInTermsOfSerialise()) WriteArchiveFunctions(out, def, name);
  WriteStreamInsertion(out, def, prefix, name);
  if (def.IsAdt() && def.status == DeclStatus::Deferred) {
    WriteReflectionDeclarations(out, def);
    for (const FunctionSignature& method : def.m_methods) WriteAdtFunction(out, def, method);
    return;
  }
  for (const FunctionSignature& method : def.m_methods) WriteForwarder(out, def, method);
}

void ClassDef::WriteExtraTraits(TextWriter& out) const {
  Write(out, R"(
    template<> struct ClassTypeTraits<$class$>
    {
        static const bool has_reflected_default_ctor = $hasDefaultCtor$;
        static const bool has_reflected_dtor = $hasDtor$;
        static const bool has_reflected_copy_ctor = $hasCopy$;
        static const bool has_reflected_equality = $hasEquality$;
        static const bool has_reflected_compare = $hasEquality$;
        static const bool has_reflected_write_xostream = $hasPrint$;
        static const bool has_reflected_serialise = $hasSerialise$;
        static const bool has_reflected_visit_IObjects = $visitsObjects$;
        static const bool has_reflected_visit_Prefs = $visitsPrefs$;
        static const bool implements_IObject = $isIObject$;
        static const bool implements_IPersistable = $isIPersistable$;
        static const bool can_serialise_model = $canSerialiseModel$;
        static const bool has_model = $hasModel$;
        static const bool using_model_base_class = $inheritsModel$;
    };
    $implementedInterfaces$
  )",
        "class"_ = GetQualifiedName(), "hasDefaultCtor"_ = BitText(m_reflected && HasDefaultCtor()),
        "hasDtor"_ = BitText(m_reflected && HasDtor()), "hasCopy"_ = BitText(m_reflected && HasCopy()),
        "hasEquality"_ = BitText(m_reflected && HasEquality()), "hasPrint"_ = BitText(m_reflected && HasPrint()),
        "hasSerialise"_ = BitText(m_reflected && HasSerialise()),
        "visitsObjects"_ = BitText(m_reflected && IsIObjectVisitable()),
        "visitsPrefs"_ = BitText(m_reflected && IsPrefVisitable()), "isIObject"_ = BitText(m_implementsIObject),
        "isIPersistable"_ = BitText(m_implementsIPersistable),
        "canSerialiseModel"_ = BitText(CanSerialiseEmbeddedModel()), "hasModel"_ = BitText(HasEmbeddedModel()),
        "inheritsModel"_ = BitText(m_inheritsModel),
        "implementedInterfaces"_([&] { WriteImplementedInterfaces(out, *this); }));
}

std::vector<const InterfaceDef*> AllInterfaces(const ClassDef& def) {
  std::vector<const InterfaceDef*> all;
  for (const InterfaceDef* interface : def.m_interfaces) {
    for (const InterfaceDef::FlatBase& flat : interface->FlattenedBases()) all.push_back(flat.base);
    all.push_back(interface);
  }
  return all;
}

void WriteForwardDeclaration(TextWriter& out, const ClassDef& def) {
  Write(out, "$prefix$$struct$$class$;\n", "prefix"_ = def.TemplatePrefix(), "struct"_ = def.StructWord(),
        "class"_ = def.name);
}

void WriteReflectionDeclarations(TextWriter& out, const ClassDef& def) {
  if (!def.m_reflected) return;
  if (def.MemberPlacement() == Placement::InClass) return WriteGetTypeOps(out, def);
  Write(out, R"(
    $api$vesk::ReflectedClass const& _GetReflected($class$ const*);
    $api$vesk::TypeOps const& _GetTypeOps($class$ const*);
  )",
        "api"_ = ExportPrefix(def), "class"_ = def.GetTemplateClassName());
}

}  // namespace qrex
