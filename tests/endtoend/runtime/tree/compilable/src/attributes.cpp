@import "compilable/attributes.h"
