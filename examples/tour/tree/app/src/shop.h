// What the program adds: values that recalculate, and an interface that is called from elsewhere.

@import "Vesk/vxObject/IObject.h"
@import "orders/api/order.h"

namespace app
{

$interface+ rmi ICounter : vesk::IObject
{
    void Quote([in] int32 pieces, [in] const string8& customer, [out] float64& price);
    void Rename([inout] string8& name);
    void Deliver([copy] orders::Address* address);
};

$class+ Shop isa ICounter, orders::INamed
{
public:
    Shop() { price = 2.5; }
    vesk::string8 Name() const { return "shop"; }

    $indep float64 price;
    $indep int32 pieces create { pieces = 4; };
    $dep float64 subtotal = { subtotal = pieces * price; };
    $dep bool isLarge = { ++m_calculations; isLarge = subtotal > 20; };
    $dep vesk::string8 label
        calc { ++m_calculations; label = isLarge ? "large" : "small"; }
        evict { ++m_evictions; _label_.clear(); };

    $cache float64 Share(int32 people, int32 rounds) const { ++m_calculations; return subtotal / people / rounds; }
    $cache <<async>> int32 Forecast() const with int32 sold = { sold = pieces; }; { ++m_calculations; return 10 * sold; }

    void Quote(int32 n, const vesk::string8& customer, float64& quoted) { quoted = customer.empty() ? 0 : n * price; }
    void Rename(vesk::string8& name) { name = "dear " + name; }
    void Deliver(orders::Address* address)
    {
        delivered.push_back(address->street);
        delete address;
    }

    $vesk::xvector<string8> delivered;
    $visit { v << friends; }
    vesk::xvector<vesk::ptr<orders::INamed>> friends;

    mutable int32 m_calculations = 0;
    mutable int32 m_evictions = 0;
};

}
