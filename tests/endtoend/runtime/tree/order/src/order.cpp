// The order of the bytes of scalars in archives. Built with VESK_SWAP_SCALARS as well, which must change what is written
// and nothing else.
@import "Vesk/vxObject/IObject.h"

#include <cstdio>

vxDefineTarget(order, 1)

$class+ Keys isa vesk::IPersistable : model { xmap<int32,int32> numbers; xmap<string8,xmap<int16,int32>> nested; } { };

template <typename T>
void Show(T const& value) {
    vesk::Archive ar;
    ar << value;
    const vesk::xvector<vesk::octet_t> bytes = ar.m_bytes;
    vesk::InputArchive input(bytes);
    T read = T();
    input >> read;
    vesk::xout() << bytes << (read == value && input.Remaining() == 0 ? "" : " is read as another value") << "\n";
}

int main() {
    Show(vesk::int8(-2));
    Show(true);
    Show(vesk::int16(258));
    Show(vesk::uint32(0x01020304));
    Show(vesk::int64(-2));
    Show(vesk::int128(1));
    Show(vesk::float64(1));
    Show(vesk::string8("ab"));
    Show(vesk::string16(2, u'a'));
    Show(vesk::xvector<vesk::int16>{1, 2});
    Show(vesk::xlist<vesk::int16>{1, 2});
    Show(vesk::DynArray<vesk::uint32>{1});
    Show(vesk::xmap<vesk::int16, vesk::string8>{{3, "c"}});

    // Keys in paths are in memory only: the order of the host stays.
    vesk::ModelHook hook([](vesk::ModelChange const& change) { vesk::xout() << change.PathText() << "\n"; });
    Keys keys;
    keys.numbers[300] = 1;
    keys.nested["k"][300] = 2;
}
