@import "Vesk/vxObject/IObject.h"
$model Pos { bool y; };
namespace n
{
$interface+ ipc J
{
    void none() const;
    void all([in] int32 a, [in] const string8& b, [out] string8& c, [inout] xvector<int8>& d, [copy] Pos* e);
    void back([out] int8& r);
};
}
