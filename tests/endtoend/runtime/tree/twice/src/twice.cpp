@import "twice/twice.h"

vxDefineTarget(twice, 1)
void Register_Project_twice();
void Unregister_Project_twice();

extern "C" void Load() { Register_Project_twice(); }
extern "C" void Unload() { Unregister_Project_twice(); }
extern "C" void Make(vesk::AnyInterface* object) { *object = vesk::ptr<vesk::IObject>(new Twice()).Any(); }
