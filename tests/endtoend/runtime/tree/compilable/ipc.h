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

$class+ Counter isa ICounter
{
public:
    void Add(int32 n) { total += n; }
    void Get(int32& n) { n = total; }
    void Name(vesk::string8 const& name, vesk::string8& full) { full += name; }
    int32 total = 0;
};

}
