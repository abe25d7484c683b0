// A small interpreter for the statement forms that layout definitions write with GetScript, used
// by the tests to prove that the text is faithful: run against a fresh object, it must rebuild an
// equal definition. It knows only those forms and fails loudly (std::runtime_error naming the line)
// on anything else, on a wrong indentation and on an unknown variable, so a writer that drifts from
// the forms it is meant to write is caught here too. Objects are created and set by name through
// the type library, as the host's script engine would do it.
#pragma once

#include <string>

#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal::testing {

struct ReaderStats {
  int statements = 0;   // statement lines run (not Dim or blank)
  int objects = 0;      // objects created with New
  int properties = 0;   // property assignments
};

// Runs `text` as the body of "With root ... End With". Statement lines must be indented by
// `baseTabs` plus the depth of the With blocks opened inside the text; Dim and blank lines by none.
ReaderStats RunScript(const std::string& text, const ObjectRef& root, int baseTabs);

}  // namespace xal::testing
