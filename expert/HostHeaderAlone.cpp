// Compiled in every build: the public headers stand alone, each on its own.
#include "qv1588/corbel.h"
#include "qv1588/qv1588.h"
