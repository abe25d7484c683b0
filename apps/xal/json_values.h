// The JSON encoding of Variants used by `xal session` and `xal call --json`.
//   Plain JSON in: string, boolean, null (Null) as such; an integer that fits 32 bits is a Long,
//   any other number a Double.
//   Typed form (always used for results): {"type":"Long","value":5}, {"type":"Currency",
//   "value":"12.3400"}, {"type":"Date","value":"2009-03-05T14:07:00"} (or "2009-03-05"),
//   {"type":"Empty"}, {"type":"Missing"}, {"type":"Array","lbound":[0,0],"value":[[…],[…]]},
//   objects as {"object":H} with H a session handle (null for Nothing).
#pragma once

#include <functional>

#include <nlohmann/json.hpp>

#include "runtime/variant.h"

namespace xal::app {

using Json = nlohmann::ordered_json;

// Maps objects to session handles and back.
struct HandleMap {
  std::function<Json(const ObjectRef&)> toHandle;
  std::function<ObjectRef(const Json&)> fromHandle;  // error 91 for an unknown handle
};

// Decodes a JSON value; a malformed typed form is error 13 ("Type mismatch") with a description
// that says what is wrong.
Variant FromJson(const Json& j, const HandleMap& handles);
Json ToJson(const Variant& v, const HandleMap& handles);

}  // namespace xal::app
