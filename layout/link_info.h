// LinkInfo: a link from a form, sheet, data sheet or cell to another form — which form, which
// stored search or query, and the filter and order to open it with. The owners create it on first
// use and hand its fields through their own pass-through properties.
#pragma once

#include <cstdint>
#include <string>

#include "layout/property_bag.h"
#include "layout/script_writer.h"

namespace xal {

class LinkInfo : public PropertyBag<LinkInfo> {
 public:
  int32_t FormID = 0;
  std::string FormDXCode;
  std::string FormXALIndex;
  int32_t FormType = 0;
  int32_t SCID = 0;
  std::string SCDXCode;
  std::string SCXALIndex;
  std::string LinkName;
  std::string LinkOrder;
  std::string LinkFilter;
  std::string LinkQuery;
  int32_t RTFormID = 0;
  bool ShowAsDocument = false;

  // Appends the link's lines to `sc` (LinkName, FormXALIndex, FormDXCode, FormType, SCXALIndex,
  // texts with their quotes doubled) and returns the whole text.
  std::string GetScript(std::string& sc, int16_t Tabs) const;
  void WriteScript(ScriptWriter& w) const;

  // The default member: what the link points at, by the first name that is set; empty for a link
  // resolved at run time (RTFormID set).
  std::string Value() const;
  // A new link with the stored fields copied; the run-time ones (RTFormID, ShowAsDocument) stay
  // at their defaults.
  Ref<LinkInfo> Clone() const;
};

// The link block of an owner: "With .LnkInfo", the link's lines one level deeper, "End With".
// Nothing when the owner has no link object; an empty link still gives the two lines, so that
// running the text creates the link again.
void WriteLinkBlock(ScriptWriter& w, const LinkInfo* link);

}  // namespace xal
