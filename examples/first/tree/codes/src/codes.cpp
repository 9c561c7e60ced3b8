@import "api/error_codes.h"
