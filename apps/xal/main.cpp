#include "apps/xal/cli.h"

int main(int argc, char** argv) { return xal::app::Main(argc, argv); }
