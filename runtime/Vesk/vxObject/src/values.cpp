// Values by their types, and as JSON.

@import "Vesk/vxObject/src/parts/value_types.h"
@import "Vesk/vxObject/src/parts/containers.h"
@import "Vesk/vxObject/src/parts/access.h"
@import "Vesk/vxObject/src/parts/json_strings.h"
@import "Vesk/vxObject/src/parts/json_tokens.h"
@import "Vesk/vxObject/src/parts/json_numbers.h"
@import "Vesk/vxObject/src/parts/json_reader.h"
@import "Vesk/vxObject/src/parts/json_writer.h"
