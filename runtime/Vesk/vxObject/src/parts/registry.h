// The tables of what is registered.

@import "Vesk/vxObject/Registry.h"
@import "Vesk/vxObject/src/shared.h"

#include <cstring>
#include <mutex>

namespace vesk {

// --- Projects

struct Targets {
  std::mutex m_mutex;
  xvector<XTarget const*> m_list;
};

XTarget::XTarget(ConstStringZ name, RSN rsn) : m_name(name), m_rsn(rsn) {
  Targets& targets = Shared<Targets>();
  std::lock_guard<std::mutex> lock(targets.m_mutex);
  targets.m_list.push_back(this);
}

xvector<XTarget const*> AllTargets() {
  Targets& targets = Shared<Targets>();
  std::lock_guard<std::mutex> lock(targets.m_mutex);
  return targets.m_list;
}

// --- Records

struct RegisteredRecord {
  void const* m_record;
  XTarget* m_target;
};
// By name: the record in use in front, behind it the copies of it that other modules of the process have. Of all kinds,
// as the compiler takes a while over each map.
typedef std::vector<RegisteredRecord> Registered;
typedef std::map<std::string, Registered> RecordTable;

template <typename R>
struct TableOf {
  RecordTable m_table;
  static RecordTable& Get() { return Shared<TableOf<R>>().m_table; }
};

enum class EAdded { New, Known, Refused };

// `isLike`: whether another one of its name is of the same layout.
static EAdded AddRecord(Registered& records, RegisteredRecord record, bool (*isLike)(void const*, void const*)) {
  for (RegisteredRecord const& registered : records) {
    if (registered.m_record == record.m_record) return EAdded::Known;
  }
  if (!records.empty() && !isLike(records.front().m_record, record.m_record)) return EAdded::Refused;
  records.push_back(record);
  return EAdded::New;
}
static RegisteredRecord FindRecord(RecordTable const& table, std::string const& name) {
  const auto at = table.find(name);
  return at == table.end() || at->second.empty() ? RegisteredRecord{nullptr, nullptr} : at->second.front();
}

template <typename R>
bool IsLike(void const* a, void const* b) {
  return LayoutText(*static_cast<R const*>(a)) == LayoutText(*static_cast<R const*>(b));
}
template <typename R>
NSE RegisterRecord(R const* record, XTarget* target) {
  const EAdded added = AddRecord(TableOf<R>::Get()[record->m_name], {record, target}, IsLike<R>);
  if constexpr (std::is_same<R, ReflectedClass>::value) {
    if (added == EAdded::New) {
      ReflectedClass const*& latest = target->m_latestModel;
      if (!latest || LastRelease(*latest) < LastRelease(*record)) latest = record;
    }
  }
  return added == EAdded::Refused ? NSE_ALREADY_DEFINED : NSE_OK;
}
template <typename R>
R const* Find(std::string const& name) {
  return static_cast<R const*>(FindRecord(TableOf<R>::Get(), name).m_record);
}
static xvector<void const*> InUse(RecordTable const& table) {
  xvector<void const*> records;
  for (auto const& [name, registered] : table) {
    if (!registered.empty()) records.push_back(registered.front().m_record);
  }
  return records;
}
template <typename R>
xvector<void const*> AllOfKind() {
  return InUse(TableOf<R>::Get());
}
template <typename R>
XTarget* TargetOf(R const& record) {
  return FindRecord(TableOf<R>::Get(), record.m_name).m_target;
}

// --- Types

struct TypeOpsByText {
  std::map<xstring, TypeOps const*> m_table = {
      {"bool", &MakeTypeOps<bool>()},       {"int8", &MakeTypeOps<int8>()},        {"int16", &MakeTypeOps<int16>()},
      {"int32", &MakeTypeOps<int32>()},     {"int64", &MakeTypeOps<int64>()},      {"int128", &MakeTypeOps<int128>()},
      {"uint8", &MakeTypeOps<uint8>()},     {"uint16", &MakeTypeOps<uint16>()},    {"uint32", &MakeTypeOps<uint32>()},
      {"uint64", &MakeTypeOps<uint64>()},   {"uint128", &MakeTypeOps<uint128>()},  {"float32", &MakeTypeOps<float32>()},
      {"float64", &MakeTypeOps<float64>()}, {"char8", &MakeTypeOps<char8>()},      {"char16", &MakeTypeOps<char16>()},
      {"string8", &MakeTypeOps<string8>()}, {"string16", &MakeTypeOps<string16>()}};
};
std::map<xstring, TypeOps const*>& TypeOpsTable() { return Shared<TypeOpsByText>().m_table; }

bool RegisterTypeOps(ReflectionByteCodeValue const& type, TypeOps const* ops) {
  TypeOpsTable().insert({type.m_text, ops});
  return true;
}

TypeOps const* FindTypeOps(ReflectedType const& type) {
  if (type.m_code >= RC_VOLATILE && type.m_code <= RC_OFFSETTABLE) return FindTypeOps(type.m_inner.front());
  if (type.m_code == RC_CLASS) {
    ReflectedClass const* record = Find<ReflectedClass>(type.m_name);
    return record ? &record->m_ops : nullptr;
  }
  if (type.m_code == RC_VARIANT) {
    ReflectedVariant const* record = Find<ReflectedVariant>(type.m_name);
    return record ? &record->m_ops : nullptr;
  }
  if (type.m_code == RC_ENUM) return &MakeTypeOps<int32>();
  if (type.m_code == RC_TYPEDEF) {
    ReflectedTypedef const* record = Find<ReflectedTypedef>(type.m_name);
    return record ? FindTypeOps(DecodeType({record->m_type, record->m_strings})) : nullptr;
  }
  ReflectedType plain = type;
  plain.m_metadata.clear();
  const auto at = TypeOpsTable().find(vxMakeString(plain));
  return at == TypeOpsTable().end() ? nullptr : at->second;
}

bool IsTypeAllowed(std::function<bool(ReflectedClass const&)> const& allow,
                   std::function<bool(xstring const&)> const& allowType, xstring const& name) {
  ReflectedClass const* record = allow ? Find<ReflectedClass>(name) : nullptr;
  return (!record || allow(*record)) && (!allowType || allowType(name));
}

TypeOps const* FindTypeOps(ReflectionByteCode code) { return FindTypeOps(DecodeType(code)); }

void PrintValue(xostream& os, ReflectedType const& type, void const* value) {
  if (type.m_code == RC_ENUM) {
    PrintEnum(os, Find<ReflectedEnum>(type.m_name), *static_cast<int32 const*>(value));
    return;
  }
  TypeOps const* ops = FindTypeOps(type);
  if (ops && ops->m_print) {
    ops->m_print(os, value);
  } else {
    os << '?';
  }
}

// --- Unloading

static void UnregisterRecords(RecordTable& table, XTarget const* target) {
  for (auto at = table.begin(); at != table.end();) {
    Registered& records = at->second;
    records.erase(std::remove_if(records.begin(), records.end(),
                                 [=](RegisteredRecord const& record) { return record.m_target == target; }),
                  records.end());
    at = records.empty() ? table.erase(at) : std::next(at);
  }
}

XTarget::~XTarget() {
  {
    Targets& targets = Shared<Targets>();
    std::lock_guard<std::mutex> lock(targets.m_mutex);
    targets.m_list.erase(std::remove(targets.m_list.begin(), targets.m_list.end(), this), targets.m_list.end());
  }
  if (IsProcessEnding(this)) return;
  UnregisterTarget(this);
  auto& table = TypeOpsTable();
  for (auto at = table.begin(); at != table.end();) {
    at = ModuleOf(at->second) == ModuleOf(this) ? table.erase(at) : std::next(at);
  }
}

// --- What the header declares for each kind of record

#define VESK_RECORD_KINDS(DO) \
  DO(ReflectedClass)          \
  DO(ReflectedInterface)      \
  DO(ReflectedEnum)           \
  DO(ReflectedVariant)        \
  DO(ReflectedFunctor)        \
  DO(ReflectedGlobalFunction) \
  DO(ReflectedGlobalVariable) \
  DO(ReflectedTypedef)

#define VESK_DEFINE(R)                                                               \
  NSE Register##R(R const* record, XTarget* t) { return RegisterRecord(record, t); } \
  template R const* Find(std::string const&);                                        \
  template xvector<void const*> AllOfKind<R>();                                      \
  template XTarget* TargetOf(R const&);
VESK_RECORD_KINDS(VESK_DEFINE)

// A project that has records, and none of them is registered, is one whose registration was forgotten.
static bool HasRecords(RecordTable const& table, XTarget const* target) {
  for (auto const& [name, records] : table) {
    for (RegisteredRecord const& record : records) {
      if (record.m_target == target) return true;
    }
  }
  return false;
}
#define VESK_OR_HAS_RECORDS(R) || HasRecords(TableOf<R>::Get(), target)

xstring NotRegistered(std::string_view what, std::string const& name) {
  xstring calls;
  for (XTarget const* target : AllTargets()) {
    if (false VESK_RECORD_KINDS(VESK_OR_HAS_RECORDS)) continue;
    // The function has the name of the project, which is that of its folder, but for what stands around that.
    const bool isNested = std::strchr(target->m_name, '_');
    calls += calls.empty() ? "" : " or ";
    calls += vxMakeString((isNested ? "the Register_Project_ function of " : "Register_Project_")
                          << target->m_name << (isNested ? "" : "()"));
  }
  xstring text = vxMakeString(what << " is not registered");
  if (!name.empty()) text += ": " + name;
  if (!calls.empty()) text += " (call " + calls + " first)";
  return text;
}

#define VESK_UNREGISTER(R) UnregisterRecords(TableOf<R>::Get(), target);
void UnregisterTarget(XTarget const* target) { VESK_RECORD_KINDS(VESK_UNREGISTER) }

}  // namespace vesk
