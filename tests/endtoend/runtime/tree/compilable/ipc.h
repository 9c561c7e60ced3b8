@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace ipc
{


$interface+ ipc ICounter : vesk::IObject
{
    void Add([in] int32 n);
    void Get([out] int32& n);
    void Name([in] const string8& name, [inout] string8& full);
};
$interface ipc IPlain { void Ping(); };

}
