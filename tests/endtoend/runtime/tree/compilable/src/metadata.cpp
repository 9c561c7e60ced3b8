@import "compilable/metadata.h"
@import "compilable/src/row.h"

$warning(disable: 1009)

namespace metadata
{

$var+ int32 g_count : [ "variable" ] = 3;

ROW
{
    Shows shows;
    shows.a = 2;
    CHECK(shows.Add(3), 5);
    CHECK(g_count, 3);
}

}
