@import "Vesk/vxObject/IObject.h"
$class Late;
$class+ Later isa vesk::IObject;
namespace geo
{
$struct Point { int x; $int32 y; };
$class+ Shape isa vesk::IObject : Base,private other::Base<int> : [ 7, "meta" ]
{
public:
    Shape() : m_count(0) { }
    $string8 name : [ colour(1) ];
    $xvector<const Point*> points[2];
    $Point const* at(int32 i, Late& late) const { return 0; }
    $void clear();
private:
    int m_count;
};
$class Pair<typename T, int N> <<reflect>> { public: T items[N]; };
}
