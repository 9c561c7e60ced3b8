@import "Vesk/vxObject/IObject.h"
$struct Pos { };
namespace n
{
$interface+ ipc rmi J
{
    void none() const;
    void all([in] int32 a, [in] const string8& b, [out] string8& c, [inout] xvector<int8>& d, [copy] Pos* e);
    void back([out] int8& r);
};
}
