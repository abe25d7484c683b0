// MDInfo: a whole form, the root of a layout: its sheets (aSI). Only the sheets are written as
// script; the form's other fields belong to the host's store.
#pragma once

#include <cstdint>
#include <string>

#include "layout/property_bag.h"
#include "layout/script_writer.h"
#include "runtime/variant.h"

namespace xal {

class MDInfo : public PropertyBag<MDInfo> {
 public:
  int16_t serverID = 0;
  Variant aDS;
  int32_t lID = 0;
  Variant aSI;  // one-dimensional array of SheetInfo, or Empty

  // Appends the form's script to `sc` and returns the whole text. Each sheet writes itself through
  // a late-bound call of its GetScript, so whatever object sits in aSI answers for itself; an
  // element without that member stops with error 438, a non-object with 424, Nothing with 91.
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;
};

}  // namespace xal
