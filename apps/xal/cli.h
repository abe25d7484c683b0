// Entry point of the `xal` command: `call`, `session`, `typelib` and `demo`.
#pragma once

namespace xal::app {
int Main(int argc, char** argv);
}
