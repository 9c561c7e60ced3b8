// What makes two records of one name the same thing: their layout as text. Two modules of a process may each have a
// copy of a record (plug-ins that hold the same library, a host that exports no symbols); the copies then stand for one
// thing.

@import "Vesk/vxObject/ByteCode.h"

namespace vesk {

xstring LayoutText(ReflectedClass const& r);
xstring LayoutText(ReflectedInterface const& r);
xstring LayoutText(ReflectedEnum const& r);
xstring LayoutText(ReflectedVariant const& r);
xstring LayoutText(ReflectedFunctor const& r);
xstring LayoutText(ReflectedGlobalFunction const& r);
xstring LayoutText(ReflectedGlobalVariable const& r);
xstring LayoutText(ReflectedTypedef const& r);

// The number of the module of the process (the program is 0) that has an address of code or static data; -1 for none.
int ModuleOf(void const* address);

// Whether a static object that is being destroyed goes with the whole process, not with a module that is unloaded.
// The program itself is only ever left at the end; whatever goes after one of its objects goes then as well.
bool IsProcessEnding(void const* object);

}  // namespace vesk
