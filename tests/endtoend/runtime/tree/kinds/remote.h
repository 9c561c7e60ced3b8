@import "Vesk/vxObject/IObject.h"
@import "kinds/models.h"

$warning(disable: 1009)

namespace kinds {

$interface+ rmi ICalc : vesk::IObject {
    void Add([in] int32 a, [in] const string8& b, [out] int32& sum);
    void Swap([inout] string8& a, [inout] int32& b) const;
    void Notify([in] int32 n);
    void Ping();
    void Take([copy] Size* size);
    void Vectors([in] const xvector<int32>& in, [out] xvector<int32>& out);
};
$interface rmi IPlain { void Ping(); };
$interface ipc IEmptyIpc { };
// An object that archives could hold.
$interface+ rmi IKept : vesk::IPersistable {
    void Put([in] int32 n);
    void Take([in] int32 more, [out] int32& n) const;
};
$class+ Kept isa IKept : model { int32 number; }
{
public:
    void Put(int32 n) { number = n; }
    void Take(int32 more, int32& n) const { n = number + more; }
};

$class+ Calc isa ICalc {
public:
    void Add(int32 a, const vesk::string8& b, int32& sum) { sum = Sum(a, int32(b.size())); }
    void Swap(vesk::string8& a, int32& b) const {
        if (onSwap) onSwap(a);
        a += "!";
        b = Sum(~b, 1);
    }
    void Notify(int32 n) { notified = Sum(notified, n); }
    void Ping() { notified = Sum(notified, 1); }
    void Take(Size* size) { notified = Sum(notified, size->width); delete size; }
    void Vectors(const vesk::xvector<int32>& in, vesk::xvector<int32>& out) { out = in; out.push_back(1); }
    // Wraps: anyone may call.
    static int32 Sum(int32 a, int32 b) { return int32(uint32(a) + uint32(b)); }
    int32 notified = 0;
    std::function<void(vesk::string8&)> onSwap;
};

}
