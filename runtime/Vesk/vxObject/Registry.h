// What is registered: records by qualified name, TypeOps by type. A project's Register_Project_ function fills the
// registry at start-up. Everything here can be listed, in the order of the names.

@import "Vesk/vxObject/Layout.h"
@import "Vesk/vxObject/TypeOps.h"

namespace vesk {

// A project at run time: vxDefineTarget (Model.h) makes it. Where its module is unloaded, what it registered goes
// with it.
struct XTarget {
  XTarget(ConstStringZ name, RSN rsn);
  ~XTarget();
  XTarget(XTarget const&) = delete;
  void operator=(XTarget const&) = delete;

  ConstStringZ m_name;
  RSN m_rsn;                                      // the release that it writes
  ReflectedClass const* m_latestModel = nullptr;  // the registered one whose `$schema` ends with the last release
};

// Those of the program and its modules.
xvector<XTarget const*> AllTargets();

// The last release in the `$schema` of a model; 0 without one.
RSN LastRelease(ReflectedClass const& record);

// ArchiveError where the project writes a release that is older than what a `$schema` ends with.
void CheckRelease(XTarget const& target);

enum NSE { NSE_OK, NSE_ALREADY_DEFINED };

// The same record may be registered again, and so may a copy of it that another module of the process has; another one
// of its name is refused.
NSE RegisterReflectedClass(ReflectedClass const* record, XTarget* target);
NSE RegisterReflectedInterface(ReflectedInterface const* record, XTarget* target);
NSE RegisterReflectedEnum(ReflectedEnum const* record, XTarget* target);
NSE RegisterReflectedVariant(ReflectedVariant const* record, XTarget* target);
NSE RegisterReflectedFunctor(ReflectedFunctor const* record, XTarget* target);
NSE RegisterReflectedGlobalFunction(ReflectedGlobalFunction const* record, XTarget* target);
NSE RegisterReflectedGlobalVariable(ReflectedGlobalVariable const* record, XTarget* target);
NSE RegisterReflectedTypedef(ReflectedTypedef const* record, XTarget* target);

// Find<ReflectedClass>("a::Name"), null when there is none. All<ReflectedClass>() lists them.
template <typename R>
R const* Find(std::string const& name);
template <typename R>
xvector<void const*> AllOfKind();
template <typename R>
xvector<R const*> All() {
  xvector<R const*> records;
  for (void const* record : AllOfKind<R>()) records.push_back(static_cast<R const*>(record));
  return records;
}
// The project that registered the record; null for none.
template <typename R>
XTarget* TargetOf(R const& record);

// What is said of something that nobody registered, with the calls that may be missing. The name may be empty.
xstring NotRegistered(std::string_view what, std::string const& name);

// --- Types

// By their text. Those of scalars and strings are always there.
std::map<xstring, TypeOps const*>& TypeOpsTable();

// The first table of a type stays.
bool RegisterTypeOps(ReflectionByteCodeValue const& type, TypeOps const* ops);

// Null when nobody registered the type. Decorators, metadata and typedefs are looked through.
TypeOps const* FindTypeOps(ReflectedType const& type);
TypeOps const* FindTypeOps(ReflectionByteCode code);

// Whether a value may be made of the type that an archive or a text names: as a class, and as a type.
bool IsTypeAllowed(std::function<bool(ReflectedClass const&)> const& allow,
                   std::function<bool(xstring const&)> const& allowType, xstring const& name);

// Prints a value known only by its type: an enumeration by its label, the items of containers one by one, "?" when
// the type is not registered.
void PrintValue(xostream& os, ReflectedType const& type, void const* value);

// --- Unloading

// Takes all records of a project out of the registry. What uses one of them must be gone.
void UnregisterTarget(XTarget const* target);

}  // namespace vesk
