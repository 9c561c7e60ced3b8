// An order: a model whose schema has grown since the first release, in a class that offers interfaces, made of mixins.

@import "Vesk/vxObject/IObject.h"
@import "orders/api/kinds.h"

namespace orders
{

$interface+ INamed : vesk::IObject
{
    string8 Name() const;
};

$interface+ IOrder : [ "an order" ] : INamed, vesk::IPersistable
{
    float64 Total() const;
    Status status;
};

$model+ Address
{
    string8 street;
    int32 number;
    explicit $$(vesk::string8 const& s) : street(s), number(1) {}
};

// Counts how often it was asked to.
$mixin Counted
{
    $int32 counter;
    void Count() { ++counter; }
    vesk::string8 Summary() const { return vxMakeString($this->Name() << " #" << counter); }
};

$class+ Order isa IOrder : model
{
    assignable<string8> customer;
    int32 pieces : [ unit("piece"), 1 ];
    float64 price;
    offsettable<int32> points;
    Priority priority;
    xvector<string8> remarks;
    xmap<string8,int32> extras;
    int32 grades[3];
    Address address;
    pref<IOrder> previous;
    $dropped { float64 total; }
    $schema
    {
        1: + customer + pieces + total
        2: - total + price
        3: + points + priority + remarks + extras + grades + address + previous
    }
    $evolve
    {
        price (pieces, total) { price = pieces ? total / pieces : 0; }
        points (pieces) { points = pieces; }
        priority (pieces) { priority = pieces > 100 ? Priority::High : Priority::Normal; }
    }
}
mixin [ Counted { bool m_archived = false; void Archive() { m_archived = true; $this->Count(); } } ]
{
public:
    Order() { counter = 0; }
    float64 Total() const { return pieces * price; }
    Status Getstatus() const { return m_status; }
    void Setstatus(Status status) { m_status = status; }
    $implementing INamed;
    $bool IsLarge(int32 limit = 100) const { return pieces >= limit; }
    $evict { Evicted(); }

private:
    static void Evicted() {}
    Status m_status = Open;
};

// Opaque: its users see three functions.
$adt+ Ledger
{
    void Enter(float64 amount);
    float64 Sum() const;
    void Close();
};
$function+ Ledger* OpenLedger();

}
