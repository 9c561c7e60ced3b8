@import "Vesk/vxObject/IObject.h"

$warning(disable: 1009)

namespace mixin_visits
{


$interface+ IDoc : vesk::IPersistable { };
$mixin Visits { vesk::ptr<vesk::IObject> m_seen; $visit { v << m_seen; } };
$mixin Body { $model { int32 a; xmap<int32,string8> map; xset<int32> set; pref<IDoc> doc; xvector<pref<IDoc>> docs; } };
$mixin Small { $model { int32 small; } };
$class+ Uses isa vesk::IObject : mixin [ Visits ] { };
$class+ Holds isa IDoc : mixin [ Body ] { };
$class+ Lists isa vesk::IObject : mixin [ Small ] { };
$struct+ Plain : mixin [ Small ] { };

}
