// Type-library entries of the collection classes: ValueTexts/ValueText, LOItems/LOItem,
// StringArray and DVItems/DVItem. One line per member, in interface order; plain fields come
// first as property get/put pairs, Item is each collection's default member, NewEnum is hidden.
// ValueText and DVItem are made only by their collections and cannot be created by name.
#include "collections/dv_items.h"
#include "collections/lo_items.h"
#include "collections/string_array.h"
#include "collections/value_texts.h"
#include "runtime/binding.h"

namespace xal {
namespace {

void RegisterValueTexts() {
  ClassBuilder<ValueText>("ValueText")
      .Get<&ValueText::Value>("Value")
      .Get<&ValueText::Text>("Text", {Opt("LangID")})
      .Put<&ValueText::SetText>("Text", {Opt("LangID"), Param("Value")})
      .Get<&ValueText::Tag>("Tag")
      .Put<&ValueText::SetTag>("Tag", {Param("Value")})
      .PutRef<&ValueText::SetTag>("Tag", {Param("Value")})
      .Get<&ValueText::Key>("Key");

  ClassBuilder<ValueTexts>("ValueTexts").Creatable()
      .Get<&ValueTexts::Name>("Name")
      .Put<&ValueTexts::SetName>("Name", {Param("Value")})
      .Method<&ValueTexts::Add>("Add", {Param("Value"), Param("Text"), Opt("LangID")})
      .Method<&ValueTexts::Value>("Value", {Param("Text"), Opt("LangID")})
      .Get<&ValueTexts::Item>("Item", {Param("Value")}).Default()
      .Method<&ValueTexts::Exists>("Exists", {Param("Value")})
      .Get<&ValueTexts::Count>("Count")
      .Method<&ValueTexts::Remove>("Remove", {Param("Value")})
      .Method<&ValueTexts::Clear>("Clear")
      .Get<&ValueTexts::NewEnum>("NewEnum").Hidden();
}

void RegisterLOItems() {
  ClassBuilder<LOItem>("LOItem").Creatable()
      .Get<&LOItem::Visible>("Visible")
      .Put<&LOItem::SetVisible>("Visible", {Param("Value")})
      .Get<&LOItem::Skip>("Skip")
      .Put<&LOItem::SetSkip>("Skip", {Param("Value")})
      .Get<&LOItem::Width>("Width")
      .Put<&LOItem::SetWidth>("Width", {Param("Value")})
      .Get<&LOItem::Name>("Name")
      .Put<&LOItem::SetName>("Name", {Param("Value")})
      .Get<&LOItem::Locked>("Locked")
      .Put<&LOItem::SetLocked>("Locked", {Param("Value")})
      .Get<&LOItem::Script>("Script")
      .Put<&LOItem::SetScript>("Script", {Param("Value")})
      .Get<&LOItem::Show>("Show")
      .Put<&LOItem::SetShow>("Show", {Param("Value")})
      .Get<&LOItem::When>("When")
      .Put<&LOItem::SetWhen>("When", {Param("Value")})
      .Get<&LOItem::Valid>("Valid")
      .Put<&LOItem::SetValid>("Valid", {Param("Value")})
      .Get<&LOItem::AddNew>("AddNew")
      .Put<&LOItem::SetAddNew>("AddNew", {Param("Value")})
      .Get<&LOItem::Delete>("Delete")
      .Put<&LOItem::SetDelete>("Delete", {Param("Value")})
      .Get<&LOItem::Filter>("Filter")
      .Put<&LOItem::SetFilter>("Filter", {Param("Value")})
      .Get<&LOItem::Order>("Order")
      .Put<&LOItem::SetOrder>("Order", {Param("Value")})
      .Get<&LOItem::Tag>("Tag")
      .Put<&LOItem::SetTag>("Tag", {Param("Value")})
      .PutRef<&LOItem::SetTag>("Tag", {Param("Value")})
      .Get<&LOItem::Caption>("Caption")
      .Put<&LOItem::SetCaption>("Caption", {Param("Value")})
      .Get<&LOItem::Enabled>("Enabled")
      .Put<&LOItem::SetEnabled>("Enabled", {Param("Value")})
      .Get<&LOItem::ToolTipText>("ToolTipText")
      .Put<&LOItem::SetToolTipText>("ToolTipText", {Param("Value")})
      .Get<&LOItem::Key>("Key")
      .Get<&LOItem::Index>("Index");

  ClassBuilder<LOItems>("LOItems").Creatable()
      .Method<&LOItems::Add>("Add", {Param("Caption"), Opt("Key"), Opt("Before"), Opt("After")})
      .Get<&LOItems::Item>("Item", {Param("vntIndexKey")}).Default()
      .Method<&LOItems::Exists>("Exists", {Param("vntIndexKey")})
      .Get<&LOItems::Count>("Count")
      .Method<&LOItems::Remove>("Remove", {Param("vntIndexKey")})
      .Method<&LOItems::Clear>("Clear")
      .Get<&LOItems::NewEnum>("NewEnum").Hidden();
}

void RegisterStringArray() {
  ClassBuilder<StringArray>("StringArray").Creatable()
      .Method<&StringArray::Add>("Add", {Param("Text")})
      .Get<&StringArray::Text>("Text", {Def("Line", -1)})
      .Put<&StringArray::SetText>("Text", {Def("Line", -1), Param("Value")})
      .Get<&StringArray::Count>("Count");
}

void RegisterDVItems() {
  ClassBuilder<DVItem>("DVItem")
      .Get<&DVItem::Category>("Category")
      .Put<&DVItem::SetCategory>("Category", {Param("Value")})
      .Get<&DVItem::State>("State")
      .Put<&DVItem::SetState>("State", {Param("Value")})
      .Get<&DVItem::Value>("Value")
      .Put<&DVItem::SetValue>("Value", {Param("Value")})
      .Get<&DVItem::DefaultValue>("DefaultValue")
      .Put<&DVItem::SetDefaultValue>("DefaultValue", {Param("Value")})
      .Get<&DVItem::DValue>("DValue")
      .Get<&DVItem::SubItems>("SubItems")
      .Get<&DVItem::Tag>("Tag")
      .Put<&DVItem::SetTag>("Tag", {Param("Value")})
      .PutRef<&DVItem::SetTag>("Tag", {Param("Value")})
      .Get<&DVItem::Key>("Key");

  ClassBuilder<DVItems>("DVItems").Creatable()
      .Method<&DVItems::Add>("Add", {Param("Name"), Opt("Value"), Opt("DefaultValue")})
      .Get<&DVItems::Item>("Item", {Param("Name")}).Default()
      .Method<&DVItems::Exists>("Exists", {Param("Name")})
      .Get<&DVItems::Count>("Count")
      .Method<&DVItems::Remove>("Remove", {Param("Name")})
      .Method<&DVItems::Clear>("Clear")
      .Get<&DVItems::NewEnum>("NewEnum").Hidden()
      .Method<&DVItems::Clone>("Clone")
      .Method<&DVItems::Create>("Create", {Param("Source"), Def("AsDefault", false)})
      .Method<&DVItems::ToString>("ToString", {Def("UseDefault", false)});
}

const bool kRegistered = (RegisterValueTexts(), RegisterLOItems(), RegisterStringArray(), RegisterDVItems(), true);

}  // namespace
}  // namespace xal
