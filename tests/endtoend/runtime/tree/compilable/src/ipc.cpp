@import "compilable/ipc.h"
