@import "Vesk/vxObject/IObject.h"
namespace { namespace n { $interface ipc J { }; } }
