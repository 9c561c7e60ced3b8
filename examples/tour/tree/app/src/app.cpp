@import "Vesk/vxObject/IObject.h"
@import "orders/api/kinds.h"
@import "orders/api/order.h"
@import "orders1/api/order1.h"
@import "shop.h"

vxDefineTarget(app, 1)
void Register_Project_app();
void Unregister_Project_app();

using vesk::xout;

namespace app
{

$warning(push; disable: 1002)
$var+ int32 g_started = 0;
$warning(pop)
$init { g_started += 1; }
$uninit { g_started -= 1; }

void PrintArguments(vesk::ReflectedArg const* args, vesk::ssize_t count, vesk::ConstStringZ const* strings)
{
    xout() << '(';
    for (vesk::ssize_t i = 0; i < count; ++i)
    {
        xout() << (i > 0 ? ", " : "") << vesk::TypeText({args[i].m_type, strings}) << ' ' << args[i].m_name;
    }
    xout() << ")\n";
}

void PrintClass(vesk::ReflectedClass const& record)
{
    xout() << "class " << record.m_name << " of " << vesk::TargetOf(record)->m_name << '\n';
    const vesk::ssize_t interfaces = record.m_numBaseInterfaces + record.m_numInterfaces;
    for (vesk::ssize_t i = 0; i < interfaces; ++i) xout() << "    isa " << record.m_interfaces[i] << '\n';
    for (vesk::ssize_t i = 0; i < record.m_numFields; ++i)
    {
        vesk::ReflectedField const& field = record.m_fields[i];
        xout() << "    field " << vesk::TypeText({field.m_type, record.m_strings}) << ' ' << field.m_name << '\n';
    }
    for (vesk::ssize_t i = 0; i < record.m_numModelFields; ++i)
    {
        vesk::ReflectedModelField const& field = record.m_modelFields[i];
        xout() << "    model " << vesk::TypeText({field.m_type, record.m_strings}) << ' ' << field.m_name << " since "
               << field.m_added;
        if (field.m_dropped >= 0) xout() << " until " << field.m_dropped;
        xout() << '\n';
    }
    for (vesk::ssize_t i = 0; i < record.m_numDepFields; ++i)
    {
        xout() << "    dep " << record.m_depFields[i].m_name << '\n';
    }
    for (vesk::ssize_t i = 0; i < record.m_numMethods; ++i)
    {
        vesk::ReflectedClassMethod const& method = record.m_methods[i];
        xout() << "    method " << method.m_name;
        PrintArguments(method.m_args, method.m_numArgs, record.m_strings);
    }
}

void PrintReflection()
{
    xout() << "== What reflection sees\n";
    for (vesk::ReflectedEnum const* record : vesk::All<vesk::ReflectedEnum>())
    {
        xout() << "enum " << record->m_name;
        for (vesk::ssize_t i = 0; i < record->m_numLabels; ++i)
        {
            xout() << ' ' << record->m_labels[i] << '=' << (record->m_values ? record->m_values[i] : i)
                   << (record->m_enabled && !record->m_enabled[i] ? " (disabled)" : "");
        }
        xout() << '\n';
    }
    for (vesk::ReflectedClass const* record : vesk::All<vesk::ReflectedClass>()) PrintClass(*record);
    for (vesk::ReflectedInterface const* record : vesk::All<vesk::ReflectedInterface>())
    {
        xout() << "interface " << record->m_name << ", methods " << record->m_numInheritedMethods << '+'
               << record->m_numMethods;
        if (record->m_metadata) xout() << ' ' << vesk::DecodeMetadata({record->m_metadata, record->m_strings});
        xout() << '\n';
    }
    for (vesk::ReflectedVariant const* record : vesk::All<vesk::ReflectedVariant>())
    {
        xout() << "variant " << record->m_name << '\n';
    }
    for (vesk::ReflectedTypedef const* record : vesk::All<vesk::ReflectedTypedef>())
    {
        xout() << "typedef " << vesk::TypeText({record->m_type, record->m_strings}) << ' ' << record->m_name << '\n';
    }
    for (vesk::ReflectedFunctor const* record : vesk::All<vesk::ReflectedFunctor>())
    {
        xout() << "functor " << record->m_name;
        PrintArguments(record->m_args, record->m_numArgs, record->m_strings);
    }
    for (vesk::ReflectedGlobalFunction const* record : vesk::All<vesk::ReflectedGlobalFunction>())
    {
        xout() << "function " << record->m_name;
        PrintArguments(record->m_args, record->m_numArgs, record->m_strings);
    }
    for (vesk::ReflectedGlobalVariable const* record : vesk::All<vesk::ReflectedGlobalVariable>())
    {
        xout() << "variable " << record->m_name << " = ";
        vesk::PrintValue(xout(), vesk::DecodeType({record->m_type, record->m_strings}), record->m_address);
        xout() << '\n';
    }
}

void ReadOldArchive()
{
    xout() << "== An archive of release 1, read by release 3\n";
    orders1::Order old;
    old.customer.insert(0, "Ada", 3);
    old.pieces = 120;
    old.price = 300;
    vesk::Archive archive;
    archive << old;
    xout() << old << ", " << archive.m_bytes.size() << " bytes\n";

    orders::Order order;
    vesk::InputArchive input(archive);
    input >> order;
    xout() << order << '\n';

    // Orders that refer to each other, as a graph of objects.
    orders::Order next;
    next.customer = "Ben";
    next.previous = &order;
    order.previous = &next;
    const auto bytes = vesk::WriteObject(vesk::ptr<orders::IOrder>(&next));
    const vesk::ptr<orders::IOrder> copy = vesk::ReadObject<orders::IOrder>(bytes);
    orders::Order& read = *static_cast<orders::Order*>(copy.Object());
    orders::Order& readBefore = *static_cast<orders::Order*>(read.previous.Get().Object());
    xout() << read.Name() << ", before: " << readBefore.Name() << ", before: " << readBefore.previous->Name() << '\n';
    readBefore.DestroyObject();
    read.DestroyObject();
}

void CallThroughInterfaces()
{
    xout() << "== Interfaces, near and far\n";
    Shop shop;
    orders::Order order;
    order.customer = "Cy";
    order.pieces = 3;
    order.price = 1.5;
    const vesk::ptr<orders::IOrder> near(&order);
    near->status = orders::Sent;
    const vesk::ptr<orders::INamed> named = near;
    xout() << named->Name() << ", total " << near->Total() << ", status " << orders::Status(near->status)
           << ", a counter: " << bool(vesk::QueryInterface<ICounter>(near)) << '\n';

    vesk::LocalChannel channel;
    vesk::Server server(channel.Server());
    const vesk::uint32 number = server.Export(vesk::ptr<ICounter>(&shop));
    vesk::ClientConnection connection(channel.Client(), [&] { server.Serve(); });
    const auto stub = vesk::Import<ICounter>(connection, number);
    const vesk::ptr<ICounter> far(stub->Interface());
    vesk::float64 price = 0;
    far->Quote(8, "Cy", price);
    vesk::string8 name = "Cy";
    far->Rename(name);
    orders::Address address("Main Street");
    far->Deliver(&address);
    xout() << "a quote: " << price << ", a name: " << name << ", delivered before it is served: " << shop.delivered;
    server.Serve();
    xout() << ", after: " << shop.delivered << '\n';
}

void ChangeModel()
{
    xout() << "== Each change of a model, with its path\n";
    vesk::ModelHook hook([](vesk::ModelChange const& change) {
        static vesk::ConstStringZ const verbs[] = {"write", "assign", "offset", "insert", "delete"};
        xout() << "    " << verbs[change.m_kind] << ' ' << change.PathText() << '\n';
    });
    orders::Order order;
    order.customer = "Di";
    order.points += 5;
    order.points -= 2;
    order.grades[1] = 4;
    order.extras["wrapping"] = 2;
    order.remarks.push_back("fragile");
    order.remarks.push_back("heavy");
    order.remarks.erase(0);
    order.address.number = 12;
    order.Archive();
    xout() << order << ", " << order.Summary() << '\n';
}

void Recalculate()
{
    xout() << "== Values that recalculate only when needed\n";
    Shop shop;
    auto show = [&shop](vesk::ConstStringZ what) {
        xout() << "    " << what << ": " << shop.label.read() << ", " << shop.subtotal.read() << ", calculations "
               << shop.m_calculations << '\n';
    };
    show("first");
    show("again");
    shop.price = 2;
    show("cheaper, and not large as before");
    shop.pieces = 40;
    show("many");
    shop.label.TryEvict(false);
    show("evicted");
    xout() << "    a share: " << shop.Share(4, 2) << ' ' << shop.Share(4, 2) << ' ' << shop.Share(5, 2)
           << ", calculations " << shop.m_calculations << ", evictions " << shop.m_evictions << '\n';
    xout() << "    the forecast: " << shop.Forecast();
    vesk::RunAsyncCalculations();
    xout() << ", later " << shop.Forecast();
    shop.pieces = 7;
    xout() << ", with a new input " << shop.Forecast();
    vesk::RunAsyncCalculations();
    xout() << ", later " << shop.Forecast() << '\n';
    shop.EvictDgsNodes();
}

void SmallKinds()
{
    xout() << "== The small kinds\n";
    vesk::xvector<orders::Payment> payments;
    payments.push_back(orders::Payment());
    payments.push_back(orders::Payment::card(4711));
    payments.push_back(orders::Payment::purse(vesk::xvector<vesk::int32>{5, 20}));
    payments.push_back(orders::Payment::transfer(2.5));
    vesk::Archive archive;
    archive << payments;
    vesk::InputArchive input(archive);
    vesk::xvector<orders::Payment> read;
    input >> read;
    xout() << payments << (read == payments ? " as read back" : " lost") << '\n';
    xout() << orders::Describe(orders::Amount(3)) << ", " << orders::Describe(orders::Amount(1.25)) << ", "
           << orders::Priority() << ", " << orders::Priority(orders::Priority::High) << '\n';

    Shop shop;
    $makefunctor orders::Discount none { return price; }
    $makeconstfunctor orders::Discount bulk(&shop, Shop) { return pieces > 10 ? price * 0.9 : price; }
    xout() << "discounts: " << none(100, 20) << ' ' << bulk(100, 20) << ", with tax " << orders::WithTax(100)
           << ", dozens " << orders::Dozens(2) << '\n';

    orders::Ledger* ledger = orders::OpenLedger();
    Enter(ledger, 2.5);
    Enter(ledger, 4);
    xout() << "ledger: " << Sum(ledger) << '\n';
    Close(ledger);
}

void CollectObjects()
{
    xout() << "== Objects of the heap\n";
    Shop* shop = $new Shop();
    Shop* friendly = $new Shop();
    orders::Order* order = $new orders::Order();
    order->customer = "Ed";
    friendly->friends.push_back(order);
    shop->friends.push_back(shop);
    vesk::ObjectHeap& heap = vesk::ObjectHeap::Get();
    xout() << heap.Count() << " objects, collected " << heap.Collect({friendly});
    xout() << ", kept " << friendly->friends[0]->Name() << ", collected " << heap.Collect({}) << '\n';
}

}

int main()
{
    Register_Project_app();
    xout() << "started " << app::g_started << '\n';
    app::PrintReflection();
    app::ReadOldArchive();
    app::CallThroughInterfaces();
    app::ChangeModel();
    app::Recalculate();
    app::SmallKinds();
    app::CollectObjects();
    Unregister_Project_app();
    xout() << "left " << app::g_started << '\n';
}
