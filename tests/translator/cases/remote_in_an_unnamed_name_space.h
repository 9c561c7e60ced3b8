@import "Vesk/vxObject/IObject.h"
namespace { $interface ipc J { }; namespace n { $interface rmi K { }; } }
