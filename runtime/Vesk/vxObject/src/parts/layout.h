// The layout of records as text, and the modules that they stand in.

@import "Vesk/vxObject/Layout.h"
@import "Vesk/vxObject/src/shared.h"

#include <cstring>
#if defined(__linux__)
#include <link.h>
#endif

namespace vesk {

void WriteLayout(xostream& os, ConstStringZ const* strings, ReflectedReturnType type) {
  if (type.m_type) os << DecodeType({type.m_type, strings});
}
void WriteLayout(xostream& os, ConstStringZ const* strings, ReflectedArg const* args, ssize_t count) {
  os << '(';
  for (ssize_t i = 0; i < count; ++i) os << DecodeType({args[i].m_type, strings}) << ',';
  os << ')';
}
void WriteLayout(xostream& os, ConstStringZ const* strings, ReflectedField const* fields, ssize_t count) {
  for (ssize_t i = 0; i < count; ++i) {
    os << fields[i].m_name << '@' << fields[i].m_offset << ':';
    if (fields[i].m_type) os << DecodeType({fields[i].m_type, strings});
    os << ';';
  }
}

xstring LayoutText(ReflectedClass const& r) {
  return TextOf([&](xostream& os) {
    os << r.m_flags << ' ' << r.m_size << ' ';
    WriteLayout(os, r.m_strings, r.m_fields, r.m_numFields);
    for (ssize_t i = 0; i < r.m_numModelFields; ++i) {
      ReflectedModelField const& field = r.m_modelFields[i];
      os << field.m_name << '@' << field.m_offset << ':' << field.m_added << ':' << field.m_dropped << ':';
      if (field.m_type) os << DecodeType({field.m_type, r.m_strings});
      os << ';';
    }
    for (ssize_t i = 0; i < r.m_numMethods; ++i) {
      os << r.m_methods[i].m_name;
      WriteLayout(os, r.m_strings, r.m_methods[i].m_args, r.m_methods[i].m_numArgs);
      WriteLayout(os, r.m_strings, r.m_methods[i].m_return);
    }
    for (ssize_t i = 0; i < r.m_numBaseInterfaces + r.m_numInterfaces; ++i) os << ' ' << r.m_interfaces[i];
  });
}
xstring LayoutText(ReflectedInterface const& r) {
  return TextOf([&](xostream& os) {
    for (ssize_t i = 0; i < r.m_numBases; ++i) os << r.m_bases[i] << ' ';
    os << r.m_numInheritedMethods << ' ';
    for (ssize_t i = 0; i < r.m_numMethods; ++i) {
      os << r.m_methods[i].m_name;
      WriteLayout(os, r.m_strings, r.m_methods[i].m_args, r.m_methods[i].m_numArgs);
      WriteLayout(os, r.m_strings, r.m_methods[i].m_return);
    }
    for (ssize_t i = 0; i < r.m_numAttributes; ++i) {
      os << r.m_attributes[i].m_name << ':' << DecodeType({r.m_attributes[i].m_type, r.m_strings}) << ';';
    }
  });
}
xstring LayoutText(ReflectedEnum const& r) {
  return TextOf([&](xostream& os) {
    for (ssize_t i = 0; i < r.m_numLabels; ++i) os << r.m_labels[i] << '=' << (r.m_values ? r.m_values[i] : i) << ';';
  });
}
xstring LayoutText(ReflectedVariant const& r) {
  return TextOf([&](xostream& os) {
    os << r.m_size << ' ';
    WriteLayout(os, r.m_strings, r.m_items, r.m_numItems);
  });
}
template <typename R>
xstring FunctionLayoutText(R const& r) {
  return TextOf([&](xostream& os) {
    WriteLayout(os, r.m_strings, r.m_args, r.m_numArgs);
    WriteLayout(os, r.m_strings, r.m_return);
  });
}
xstring LayoutText(ReflectedFunctor const& r) { return FunctionLayoutText(r); }
xstring LayoutText(ReflectedGlobalFunction const& r) { return FunctionLayoutText(r); }
xstring LayoutText(ReflectedGlobalVariable const& r) { return TypeText({r.m_type, r.m_strings}); }
xstring LayoutText(ReflectedTypedef const& r) { return TypeText({r.m_type, r.m_strings}); }

bool operator==(InterfaceRecord a, InterfaceRecord b) {
  if (a.m_record == b.m_record) return true;
  if (!a.m_record || !b.m_record || std::strcmp(a.m_record->m_name, b.m_record->m_name) != 0) return false;
  return LayoutText(*a.m_record) == LayoutText(*b.m_record);
}

int ModuleOf(void const* address) {
#if defined(__linux__)
  struct Search {
    std::uintptr_t m_address;
    int m_module;
  } search = {reinterpret_cast<std::uintptr_t>(address), -1};
  auto isIn = [](dl_phdr_info* info, std::size_t, void* data) {
    Search& s = *static_cast<Search*>(data);
    ++s.m_module;
    for (int i = 0; i < info->dlpi_phnum; ++i) {
      ElfW(Phdr) const& header = info->dlpi_phdr[i];
      if (header.p_type == PT_LOAD && s.m_address - info->dlpi_addr - header.p_vaddr < header.p_memsz) return 1;
    }
    return 0;
  };
  return dl_iterate_phdr(isIn, &search) ? search.m_module : -1;
#else
  (void)address;
  return 0;
#endif
}

struct ProcessEnd {
  bool m_isNear = false;
};

bool IsProcessEnding(void const* object) {
  bool& isEnding = Shared<ProcessEnd>().m_isNear;
  if (ModuleOf(object) <= 0) isEnding = true;
  return isEnding;
}

}  // namespace vesk
