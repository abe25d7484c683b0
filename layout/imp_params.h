// ImpParams: one parameter of an import — the caption the user sees and the expression that
// supplies the value. A plain property bag with no script text of its own.
#pragma once

#include <string>

#include "layout/property_bag.h"

namespace xal {

class ImpParams : public PropertyBag<ImpParams> {
 public:
  std::string sCaption;
  std::string sExpr;
};

}  // namespace xal
