// Built only to prove that a host program can compile against the public header alone.
#include "qv1588/corbel.h"

static_assert(sizeof(GUID) == 16);
