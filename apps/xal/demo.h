// `xal demo`: the main job. It walks through what the component can do so far, entirely through
// late-bound calls by name, the way a document script reaches it.
#pragma once

#include <ostream>

namespace xal::app {
int RunDemo(std::ostream& out);
}
