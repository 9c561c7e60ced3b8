@import "kinds/models.h"
@import "kinds/kinds.h"
@import "kinds/graph.h"
@import "kinds/remote.h"
@import "kinds/plain.h"
@import "kinds/bare.h"
@import "kinds/cached.h"

vxDefineTarget(kinds, 3)

namespace kinds {

vesk::string8 Mixed::Name() const { return "mixed"; }

$function int Local(int n) { return $new Deferred() ? n : 0; }

$adt+ implement Stack {
public:
    int32 Depth() const { return m_depth; }
    void Push(int32 n) { m_depth += n; }
    void Drop() { delete this; }

private:
    int32 m_depth = 0;
};
$function+ Stack* MakeStack() { return new Stack(); }

$var+ int32 g_count = 3;
$var xvector<int32> g_list = {1, 2};
$var int32 g_array[3] = {1, 2, 3};

$init { g_count = 4; }
$init { g_count *= 2; }
$uninit { g_count = 0; }

}
