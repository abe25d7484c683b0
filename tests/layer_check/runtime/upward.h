// A header of the lowest layer that reaches up by path.
#include "server/stock.h"
