// LinkInfo: its script lines (the only ones with doubled quotes), the value a link shows, its copy,
// and the "With .LnkInfo" block that every owner of a link writes.
#include "layout/link_info.h"

#include <array>

namespace xal {

std::string LinkInfo::GetScript(std::string& sc, int16_t Tabs) const {
  ScriptWriter w(sc, Tabs);
  WriteScript(w);
  return sc;
}

void LinkInfo::WriteScript(ScriptWriter& w) const {
  // Unlike the other definitions, a link quotes its texts properly and has no blanks around "=".
  w.Quoted(".LinkName=", LinkName);
  w.Quoted(".FormXALIndex=", FormXALIndex);
  w.Quoted(".FormDXCode=", FormDXCode);
  w.Number(".FormType=", FormType);
  w.Quoted(".SCXALIndex=", SCXALIndex);
}

std::string LinkInfo::Value() const {
  if (RTFormID != 0) return {};
  for (const std::string* name : std::array{&LinkName, &SCXALIndex, &FormXALIndex, &FormDXCode})
    if (!name->empty()) return *name;
  return {};
}

Ref<LinkInfo> LinkInfo::Clone() const {
  auto copy = MakeRef<LinkInfo>();
  copy->FormDXCode = FormDXCode;
  copy->FormID = FormID;
  copy->FormXALIndex = FormXALIndex;
  copy->FormType = FormType;
  copy->LinkFilter = LinkFilter;
  copy->LinkName = LinkName;
  copy->LinkOrder = LinkOrder;
  copy->LinkQuery = LinkQuery;
  copy->SCDXCode = SCDXCode;
  copy->SCID = SCID;
  copy->SCXALIndex = SCXALIndex;
  return copy;
}

void WriteLinkBlock(ScriptWriter& w, const LinkInfo* link) {
  if (!link) return;
  w.Line("With .LnkInfo");
  ScriptWriter inner = w.Child();
  link->WriteScript(inner);
  w.Line("End With");
}

}  // namespace xal
