#include "apps/xal/cli.h"

#include <cstdio>

namespace xal::app {
int Main(int, char**) {
  std::puts("xal: nothing yet");
  return 0;
}
}  // namespace xal::app
