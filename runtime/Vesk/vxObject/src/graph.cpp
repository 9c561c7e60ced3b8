// The dependency graph and the fields of models. The parts are one source, as what they share takes the compiler longer
// than they do.

@import "Vesk/vxObject/src/parts/graph.h"
@import "Vesk/vxObject/src/parts/graph_watch.h"
@import "Vesk/vxObject/src/parts/calculations.h"
@import "Vesk/vxObject/src/parts/stack.h"
@import "Vesk/vxObject/src/parts/sources.h"
@import "Vesk/vxObject/src/parts/models.h"
