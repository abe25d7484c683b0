// A header that uses only itself and the standard library.
#include <string>
