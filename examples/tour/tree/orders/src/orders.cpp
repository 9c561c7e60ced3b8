@import "api/kinds.h"
@import "api/order.h"

vxDefineTarget(orders, 3)

namespace orders
{

$function+ float64 WithTax(float64 price, float64 rate) { return price * (1 + rate); }

vesk::string8 Order::Name() const { return "order of " + customer.read(); }

$adt+ implement Ledger
{
public:
    void Enter(float64 amount) { m_sum += amount; }
    float64 Sum() const { return m_sum; }
    void Close() { delete this; }

private:
    float64 m_sum = 0;
};

$function+ Ledger* OpenLedger() { return $new Ledger(); }

}
