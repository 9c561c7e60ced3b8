#include "translator/interface/interface_emission.h"

#include <algorithm>

#include "translator/emit/byte_code.h"
#include "translator/emit/emit.h"
#include "translator/emit/records.h"
#include "translator/interface/remote_interface.h"
#include "translator/model/attribute_struct.h"
#include "translator/symbols/scanned_file.h"

namespace qrex {

namespace {

// The parameters of the function in a table that calls a method.
void WriteTableParameters(TextWriter& out, const FunctionSignature& method) {
  Write(out, "void$const$* _self$comma$$arguments$", "const"_ = If(method.isConst, " const"),
        "comma"_ = If(!method.arguments.empty(), ","),
        "arguments"_([&] { WriteArgDeclarations(out, method.arguments); }));
}

void WriteTableSlot(TextWriter& out, const FunctionSignature& method) {
  Write(out, "$type$ (__stdcall *$method$)($parameters$);\n", "type"_ = TypeView(method.returnType),
        "method"_ = method.name, "parameters"_([&] { WriteTableParameters(out, method); }));
}

void WriteStub(TextWriter& out, const FunctionSignature& method) {
  Write(out, "static $type$ __stdcall $method$($parameters$) { $return$(($const$T*)_self)->$method$($arguments$); }\n",
        "type"_ = TypeView(method.returnType), "method"_ = method.name,
        "parameters"_([&] { WriteTableParameters(out, method); }),
        "return"_ = If(!IsVoid(method.returnType), "return "), "const"_ = If(method.isConst, "const "),
        "arguments"_([&] { WriteArgNames(out, method.arguments); }));
}

// `path` leads from the handle's table to that of the base that has the method.
void WriteForwarder(TextWriter& out, const FunctionSignature& method, std::string_view path) {
  Write(out, "$signature$ { $return$m_table->$path$$method$(m_self$comma$$arguments$); }\n", "signature"_ = method,
        "return"_ = If(!IsVoid(method.returnType), "return "), "path"_ = path, "method"_ = method.name,
        "comma"_ = If(!method.arguments.empty(), ","), "arguments"_([&] { WriteArgNames(out, method.arguments); }));
}

void WriteForwarders(TextWriter& out, const InterfaceDef& interface,
                     const std::vector<InterfaceDef::FlatBase>& flattened) {
  for (const auto& [base, path] : flattened) {
    for (const FunctionSignature& method : base->m_methods) WriteForwarder(out, method, path + ".");
  }
  for (const FunctionSignature& method : interface.m_methods) WriteForwarder(out, method, "");
}

void WriteBaseTable(TextWriter& out, const InterfaceDef& base) {
  const Block table(out, ",");
  for (const InterfaceDef* deeper : base.m_bases) WriteBaseTable(out, *deeper);
  for (const FunctionSignature& method : base.m_methods) {
    Write(out, "&$base$::Stubs<T>::$method$,\n", "base"_ = base.GetQualifiedName(), "method"_ = method.name);
  }
}

// The table of T's functions. Tables of bases are part of it by value.
void WriteTable(TextWriter& out, const InterfaceDef& interface) {
  if (interface.m_bases.empty() && interface.m_methods.empty()) {
    out << "static const FnTable t = {};\n";
    return;
  }
  auto methods = [&] {
    for (const FunctionSignature& method : interface.m_methods) {
      out << "&" << method.name << (&method == &interface.m_methods.back() ? "\n" : ",\n");
    }
  };
  Write(out, R"(
    static const FnTable t =
    {
        $baseTables$
        $methods$
    };
  )",
        "baseTables"_ = Each(out, interface.m_bases, "", [&](const InterfaceDef* base) { WriteBaseTable(out, *base); }),
        "methods"_ = methods);
}

void WriteTables(TextWriter& out, const InterfaceDef& interface) {
  auto baseTable = [&](const InterfaceDef* base) {
    Write(out, "$base$::FnTable _$name$;\n", "base"_ = base->GetQualifiedName(), "name"_ = base->name);
  };
  Write(out, R"(
    struct FnTable
    {
        $baseTables$
        $slots$
    };
    $name$(void* _self, const FnTable* table) : m_self(_self), m_table(table) {}

    void AssignFrom($name$& _rhs) { m_self = _rhs.m_self; m_table = _rhs.m_table; }
    void AssignFrom($name$ const& _rhs) const { const_cast<$name$*>(this)->m_self = _rhs.m_self; const_cast<$name$*>(this)->m_table = _rhs.m_table; }

    template<typename T> struct Stubs
    {
        $stubs$
        static const FnTable& GetTable()
        {
            $table$
            return t;
        }
    };

    template<typename T> void CoerceFrom(T* _rhs) { m_self = _rhs; m_table = &Stubs<T>::GetTable(); }
    template<typename T> void CoerceFrom(const T* _rhs) const { const_cast<$name$*>(this)->m_self = const_cast<T*>(_rhs); const_cast<$name$*>(this)->m_table = &Stubs<T>::GetTable(); }

  )",
        "name"_ = interface.name, "baseTables"_ = Each(out, interface.m_bases, "", baseTable),
        "slots"_ = Each(out, interface.m_methods, "", [&](const auto& method) { WriteTableSlot(out, method); }),
        "stubs"_ = Each(out, interface.m_methods, "", [&](const auto& method) { WriteStub(out, method); }),
        "table"_([&] { WriteTable(out, interface); }));
}

// Vectors and classes are reached part by part instead.
bool HasGetter(TypeView type, NameSpace& root) {
  for (type = Resolved(type, root); type.Op() == kOpConst;) type = Resolved(type.Inner(), root);
  return type.Op() != kOpClass && type.Op() != kOpVector;
}

// An attribute has no storage: its struct is at the place of the object's address and calls the methods.
void WriteAttributes(TextWriter& out, const InterfaceDef& interface) {
  NameSpace& root = *interface.owner.rootNameSpace;
  const bool isWhole = interface.WantsCompilableText();  // a value has no methods but Get and Set
  for (const AttributeDef& attribute : interface.m_attributes) {
    if (isWhole && !HasGetter(attribute.type, root)) continue;
    AttributeWriter writer(out, root, isWhole ? Access::GetAndSet : Access::Methods);
    writer.WriteStruct(interface.name, attribute.type, attribute.name, attribute.name, attribute.name, false);
  }
}

}  // namespace

void WriteInterfaceHandle(TextWriter& out, const InterfaceDef& interface) {
  const std::vector<InterfaceDef::FlatBase> flattened = interface.FlattenedBases();
  auto conversion = [&](const InterfaceDef::FlatBase& flat) {
    Write(out, "operator $base$() const { return $base$(m_self, &m_table->$path$); }\n",
          "base"_ = flat.base->GetQualifiedName(), "path"_ = flat.path);
  };
  Write(out, R"(
    struct $name$
    {
        $tables$
        $forwarders$
        $emptyLine$
        $conversions$

        union
        {
            $attributes$
            void* m_self;
        };
        FnTable const* m_table;
    };
  )",
        "name"_ = interface.name, "tables"_([&] { WriteTables(out, interface); }),
        "forwarders"_([&] { WriteForwarders(out, interface, flattened); }),
        "emptyLine"_ = If(!flattened.empty(), [&] { out << "\n"; }),
        "conversions"_ = Each(out, flattened, "", conversion), "attributes"_([&] { WriteAttributes(out, interface); }));
}

void WriteInterfaceDeclarations(TextWriter& out, const InterfaceDef& interface) {
  auto delegator = [&](const FunctionSignature& method) {
    Write(out, "$signature$ { $return$BC::Get$name$().$method$($arguments$); }\n", "signature"_ = method,
          "return"_ = If(!IsVoid(method.returnType), "return "), "name"_ = interface.name, "method"_ = method.name,
          "arguments"_([&] { WriteArgNames(out, method.arguments); }));
  };
  Write(out, R"(
    template <typename BC>
    struct $name$DelegatorMixin : public BC
    {
        $delegators$
    };
  )",
        "name"_ = interface.name, "delegators"_ = Each(out, interface.m_methods, "", delegator));
  if (interface.m_registered) {
    Write(out, R"(

      $api$vesk::ReflectedInterface const& _GetReflected($name$ const*);
    )",
          "api"_ = ExportPrefix(interface), "name"_ = interface.name);
  }
  if (interface.m_isIpc || interface.m_isRmi) {
    Write(out, R"(

      inline vesk::ConstStringZ _GetIpcInterfaceName($name$ const*) { return "$qualifiedName$"; }
    )",
          "name"_ = interface.name, "qualifiedName"_ = interface.GetQualifiedName());
  }
}

void InterfaceDef::WriteExtraTraits(TextWriter& out) const {
  auto writeBase = [&](std::string_view how, const InterfaceDef& base) {
    Write(out,
          "template<> struct _is_$how$_superinterface_of<$base$,$interface$> { static const bool value = true; };\n",
          "how"_ = how, "base"_ = base.GetQualifiedName(), "interface"_ = GetQualifiedName());
  };
  auto indirectBase = [&](const FlatBase& flat) {
    if (std::find(m_bases.begin(), m_bases.end(), flat.base) == m_bases.end()) writeBase("indirect", *flat.base);
  };
  const std::vector<FlatBase> flattened = FlattenedBases();
  Write(out, R"(
    template<> struct InterfaceTypeTraits<$interface$>
    {
        static const bool is_ipc = $isIpc$;
        static const bool is_rmi = $isRmi$;
    };
    $directBases$
    $indirectBases$
  )",
        "interface"_ = GetQualifiedName(), "isIpc"_ = BoolText(m_isIpc), "isRmi"_ = BoolText(m_isRmi),
        "directBases"_ = Each(out, m_bases, "", [&](const InterfaceDef* base) { writeBase("direct", *base); }),
        "indirectBases"_ = Each(out, flattened, "", indirectBase));
}

// --- Record

namespace {

class InterfaceRecord {
 public:
  InterfaceRecord(TextWriter& out, const InterfaceDef& interface)
      : m_out(out), m_interface(interface), m_name(interface.name) {}

  void WriteFunction() {
    Write(m_out, R"(
      $api$vesk::ReflectedInterface const& _GetReflected($name$ const*)
      {
          $metadata$
          $bases$
          $signatures$
          $attributes$
          $strings$
          $methods$
          $record$
          return $name$_interface;
      }
    )",
          "api"_ = ExportPrefix(m_interface), "name"_ = m_name, "metadata"_([&] { WriteMetadata(); }),
          "bases"_([&] { WriteBases(); }), "signatures"_([&] { WriteSignatures(); }),
          "attributes"_([&] { WriteAttributeTable(); }),
          "strings"_([&] { WriteStringTable(m_out, m_strings, m_name); }), "methods"_([&] { WriteMethods(); }),
          "record"_([&] { WriteRecord(); }));
  }

 private:
  void WriteMetadata() {
    if (m_interface.metadata.empty()) return;
    WriteMetadataByteCode(m_out, m_name + "_metadata", m_strings, m_interface.metadata);
  }

  void WriteBases() {
    if (m_interface.m_bases.empty()) return;
    auto row = [&](const InterfaceDef* base) { m_out << "\"" << base->GetQualifiedName() << "\",\n"; };
    Write(m_out, R"(
      static vesk::ConstStringZ $name$_bases[] =
      {
          $rows$
      };
    )",
          "name"_ = m_name, "rows"_ = Each(m_out, m_interface.m_bases, "", row));
  }

  void WriteSignatures() {
    for (const FunctionSignature& method : m_interface.m_methods) {
      WriteSignatureArrays(m_out, m_name + "_" + method.name, method, m_strings);
    }
  }

  void WriteAttributeTable() {
    if (m_interface.m_attributes.empty()) return;
    for (const AttributeDef& attribute : m_interface.m_attributes) {
      WriteTypeByteCode(m_out, m_name + "_" + attribute.name, m_strings, attribute.type);
    }
    auto row = [&](const AttributeDef& attribute) {
      Write(m_out, "{ \"$attribute$\",$name$_$attribute$ },\n", "attribute"_ = attribute.name, "name"_ = m_name);
    };
    Write(m_out, R"(
      static const vesk::ReflectedAttribute $name$_attributes[] =
      {
          $rows$
      };
    )",
          "name"_ = m_name, "rows"_ = Each(m_out, m_interface.m_attributes, "", row));
  }

  void WriteMethods() {
    if (m_interface.m_methods.empty()) return;
    auto row = [&](const FunctionSignature& method) {
      const std::string prefix = m_name + "_" + method.name;
      Write(m_out, "{\"$method$\",{$return$},$arguments$,$metadata$},\n", "method"_ = method.name,
            "return"_ = NameOrZero(!IsVoid(method.returnType), prefix + "_return"),
            "arguments"_ = CountedName(method.arguments.size(), prefix + "_args"),
            "metadata"_ = NameOrZero(!method.metadata.empty(), prefix + "_metadata"));
    };
    Write(m_out, R"(
      static const vesk::ReflectedInterfaceMethod $name$_methods[] =
      {
          $rows$
      };
    )",
          "name"_ = m_name, "rows"_ = Each(m_out, m_interface.m_methods, "", row));
  }

  void WriteRecord() {
    Write(m_out, R"(
      static const vesk::ReflectedInterface $name$_interface =
      {
          "$qualifiedName$",
          $metadata$,
          $bases$,
          $inheritedMethods$,
          $methods$,
          $attributes$,
          $strings$
      };
    )",
          "name"_ = m_name, "qualifiedName"_ = m_interface.GetQualifiedName(),
          "metadata"_ = NameOrZero(!m_interface.metadata.empty(), m_name + "_metadata"),
          "bases"_ = CountedName(m_interface.m_bases.size(), m_name + "_bases"),
          "inheritedMethods"_ = m_interface.InheritedMethodCount(),
          "methods"_ = CountedName(m_interface.m_methods.size(), m_name + "_methods"),
          "attributes"_ = CountedName(m_interface.m_attributes.size(), m_name + "_attributes"),
          "strings"_ = NameOrZero(!m_strings.Empty(), m_name + "_stringTable"));
  }

  TextWriter& m_out;
  const InterfaceDef& m_interface;
  const std::string& m_name;
  StringTable m_strings;
};

}  // namespace

void InterfaceDef::WriteReflectedDefinition(TextWriter& out) { InterfaceRecord(out, *this).WriteFunction(); }

void InterfaceDef::WriteReflection(TextWriter& out, RegistrationLists& lists) {
  RecordedElement::WriteReflection(out, lists);
  if (status == DeclStatus::Defined && m_isIpc) WriteRemoteInterface(out, *this);
}

}  // namespace qrex
