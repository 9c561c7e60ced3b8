#include "twice/twice.h"
#include <dlfcn.h>
#include <cstdio>

void Register_Project_twice();

template <typename Function>
Function* Symbol(void* module, const char* name) { return reinterpret_cast<Function*>(dlsym(module, name)); }

const char* Found()
{
    vesk::ReflectedClass const* record = vesk::Find<vesk::ReflectedClass>("Twice");
    return record ? record->m_name : "none";
}

int main()
{
#ifdef OWN
    Register_Project_twice();
#endif
    void* modules[2];
    for (int i = 0; i < 2; ++i)
    {
        modules[i] = dlopen(i == 0 ? "./a.so" : "./b.so", RTLD_NOW | RTLD_LOCAL);
        if (!modules[i]) return std::puts(dlerror());
        Symbol<void()>(modules[i], "Load")();
        vesk::AnyInterface any;
        Symbol<void(vesk::AnyInterface*)>(modules[i], "Make")(&any);
        const vesk::ptr<vesk::IObject> object(any);
#ifdef OWN
        const vesk::ptr<ITwice> twice = vesk::QueryInterface<ITwice>(object);
        std::printf("%d ", twice ? twice->Number() : 0);
#endif
        object->DestroyObject();
    }
    std::printf("%s", Found());
    dlclose(modules[0]);
    std::printf(" %s", Found());
    Symbol<void()>(modules[1], "Unload")();
    std::printf(" %s\n", Found());
    dlclose(modules[1]);
}
