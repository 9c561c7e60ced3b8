// What who looks into a program is shown: graphs, and the bytes of archives.

@import "Vesk/vxObject/src/parts/graph_view.h"
