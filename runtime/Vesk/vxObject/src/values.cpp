// The dependency graph, the fields of models, values by their types, and as JSON. The parts are one source, as what they
// share takes the compiler longer than they do.

@import "Vesk/vxObject/src/parts/graph.h"
@import "Vesk/vxObject/src/parts/graph_watch.h"
@import "Vesk/vxObject/src/parts/calculations.h"
@import "Vesk/vxObject/src/parts/stack.h"
@import "Vesk/vxObject/src/parts/sources.h"
@import "Vesk/vxObject/src/parts/models.h"
@import "Vesk/vxObject/src/parts/value_types.h"
@import "Vesk/vxObject/src/parts/containers.h"
@import "Vesk/vxObject/src/parts/access.h"
@import "Vesk/vxObject/src/parts/json_strings.h"
@import "Vesk/vxObject/src/parts/json_tokens.h"
@import "Vesk/vxObject/src/parts/json_numbers.h"
@import "Vesk/vxObject/src/parts/json_reader.h"
@import "Vesk/vxObject/src/parts/json_writer.h"
