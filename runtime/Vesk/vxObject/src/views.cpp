// What who looks into a program is shown: graphs, and the bytes of archives.

@import "Vesk/vxObject/src/parts/graph_view.h"
@import "Vesk/vxObject/src/parts/archive_walk.h"
@import "Vesk/vxObject/src/parts/archive_text.h"
@import "Vesk/vxObject/src/parts/archive_today.h"
@import "Vesk/vxObject/src/parts/archive_changes.h"
