// IXALUIObject: the interface of the UI objects a host registers with a document (a property bag
// by name). The component's own class fixes only the interface — reading gives Empty and writing
// keeps nothing; host UI objects derive from it and keep their own storage.
#pragma once

#include <string>

#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class IXALUIObject : public Object {
 public:
  virtual Variant Properties(const std::string& Name) { return Variant(); }
  virtual void SetProperties(const std::string& Name, const Variant& value) {}
};

}  // namespace xal
