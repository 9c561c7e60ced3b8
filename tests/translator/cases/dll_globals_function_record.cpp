@import "t.h"
namespace n
{
$function+ string8 Find(int32 key : [ "k" ], string8 const& more = "") : [ 7 ] { return more; }
$function+ void Stop();
$function+ void Stop() { }
}
