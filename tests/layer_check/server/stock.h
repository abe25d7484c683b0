// A header that uses only what is below it.
#include <vector>

#include "runtime/fine.h"
