// A header of the lowest layer that reaches up by a relative path.
#include <string>
#include "../server/stock.h"
