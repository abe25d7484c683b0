// Type-library entries of the layout definitions (DSInfo, MDInfo, SheetInfo, CSInfo, LinkInfo,
// ImpParams, Cellinfo, BrowInfo) and the cell enumerations. Every class is creatable; members are
// listed in interface order, one line each. Plain fields are read-write properties; object fields
// are assigned by reference.
#include <type_traits>

#include "layout/brow_info.h"
#include "layout/cell_info.h"
#include "layout/cs_info.h"
#include "layout/ds_info.h"
#include "layout/enums.h"
#include "layout/imp_params.h"
#include "layout/link_info.h"
#include "layout/md_info.h"
#include "layout/sheet_info.h"
#include "runtime/binding.h"

namespace xal {
namespace {

template <class T>
constexpr bool kIsObjectField = false;
template <class T>
constexpr bool kIsObjectField<std::shared_ptr<T>> = true;

// ClassBuilder with the few shapes the layout classes need, so each member stays one line.
template <class C>
class LayoutClass {
 public:
  explicit LayoutClass(std::string name) : b_(std::move(name)) { b_.Creatable(); }

  // A plain field: get and put (put by reference for an object).
  template <auto F>
  LayoutClass& Field(const char* name) {
    b_.template Get<&C::template GetField<F>>(name);
    if constexpr (kIsObjectField<FieldType<F>>)
      b_.template PutRef<&C::template PutField<F>>(name, {Param("Value")});
    else
      b_.template Put<&C::template PutField<F>>(name, {Param("Value")});
    return *this;
  }
  template <auto G, auto P>
  LayoutClass& Property(const char* name) {
    b_.template Get<G>(name);
    b_.template Put<P>(name, {Param("Value")});
    return *this;
  }
  template <auto G, auto P>
  LayoutClass& ObjectProperty(const char* name) {
    b_.template Get<G>(name);
    b_.template PutRef<P>(name, {Param("Value")});
    return *this;
  }
  // A property with one index parameter, as Prop(propName).
  template <auto G, auto P>
  LayoutClass& IndexedProperty(const char* name, const char* index) {
    b_.template Get<G>(name, {Param(index)});
    b_.template Put<P>(name, {Param(index), Param("Value")});
    return *this;
  }
  template <auto G>
  LayoutClass& ReadOnly(const char* name) {
    b_.template Get<G>(name);
    return *this;
  }
  template <auto M>
  LayoutClass& Method(const char* name, std::vector<Param> params = {}) {
    b_.template Method<M>(name, std::move(params));
    return *this;
  }
  LayoutClass& Default() {
    b_.Default();
    return *this;
  }
  // GetScript(sc, Tabs = 0): the text by reference, the indentation optional.
  LayoutClass& GetScript() { return Method<&C::GetScript>("GetScript", {Param("sc"), Def("Tabs", int16_t{0})}); }
  LayoutClass& AddLangString() { return Method<&C::AddLangString>("AddLangString", {Param("Text"), Param("LangID")}); }

 private:
  ClassBuilder<C> b_;
};

void RegisterDSInfo() {
  using C = DSInfo;
  LayoutClass<C>("DSInfo")
      .Field<&C::serverID>("serverID")
      .Field<&C::lID>("lID")
      .Property<&C::sCaption, &C::SetsCaption>("sCaption")
      .Field<&C::lType>("lType")
      .Field<&C::bList>("bList")
      .Field<&C::bLocked>("bLocked")
      .Field<&C::sExpr>("sExpr")
      .Field<&C::iPos>("iPos")
      .Field<&C::iRows>("iRows")
      .Field<&C::iCols>("iCols")
      .Field<&C::iLHeight>("iLHeight")
      .Field<&C::iBHeight>("iBHeight")
      .Field<&C::iBSplitPos>("iBSplitPos")
      .Field<&C::sProgname>("sProgname")
      .Field<&C::sColWidth>("sColWidth")
      .Field<&C::sValid>("sValid")
      .Field<&C::sWhen>("sWhen")
      .Field<&C::iLayout>("iLayout")
      .Field<&C::bHeader>("bHeader")
      .Field<&C::bBrowser>("bBrowser")
      .Field<&C::iBrowmode>("iBrowmode")
      .Field<&C::iListmode>("iListmode")
      .Field<&C::sListmaster>("sListmaster")
      .Field<&C::sOnAddNew>("sOnAddNew")
      .Field<&C::sOnDelete>("sOnDelete")
      .Field<&C::bMultiRow>("bMultiRow")
      .Field<&C::bAltStyle>("bAltStyle")
      .Field<&C::isLoaded>("isLoaded")
      .Field<&C::needRefresh>("needRefresh")
      .Field<&C::isSingle>("isSingle")
      .Field<&C::aCells>("aCells")
      .Field<&C::aCS>("aCS")
      .Field<&C::aBrow>("aBrow")
      .Field<&C::SkipMaster>("SkipMaster")
      .Field<&C::U_SplitPos>("U_SplitPos")
      .ObjectProperty<&C::LnkInfo, &C::SetLnkInfo>("LnkInfo")
      .Property<&C::LinkXALIndex, &C::SetLinkXALIndex>("LinkXALIndex")
      .Property<&C::XALFormIndex, &C::SetXALFormIndex>("XALFormIndex")
      .Property<&C::lIDLinkForm, &C::SetlIDLinkForm>("lIDLinkForm")
      .Property<&C::lIDXALForms, &C::SetlIDXALForms>("lIDXALForms")
      .GetScript()
      .IndexedProperty<&C::Prop, &C::SetProp>("Prop", "propName")
      .Field<&C::LangID>("LangID")
      .AddLangString()
      .Field<&C::OnGetStyle>("OnGetStyle");
}

void RegisterMDInfo() {
  using C = MDInfo;
  LayoutClass<C>("MDInfo")
      .Field<&C::serverID>("serverID")
      .Field<&C::aDS>("aDS")
      .Field<&C::lID>("lID")
      .Field<&C::aSI>("aSI")
      .GetScript();
}

void RegisterSheetInfo() {
  using C = SheetInfo;
  LayoutClass<C>("SheetInfo")
      .Field<&C::serverID>("serverID")
      .Field<&C::bLocked>("bLocked")
      .Field<&C::sExpr>("sExpr")
      .Field<&C::sClone>("sClone")
      .Field<&C::isLoaded>("isLoaded")
      .Field<&C::needRefresh>("needRefresh")
      .Field<&C::isSingle>("isSingle")
      .Field<&C::sScript>("sScript")
      .Field<&C::sFilter>("sFilter")
      .Field<&C::sOrder>("sOrder")
      .Field<&C::aDS>("aDS")
      .Field<&C::LangID>("LangID")
      .ObjectProperty<&C::LnkInfo, &C::SetLnkInfo>("LnkInfo")
      .Property<&C::XALFormIndex, &C::SetXALFormIndex>("XALFormIndex")
      .Property<&C::lIDXALForms, &C::SetlIDXALForms>("lIDXALForms")
      .Property<&C::sCaption, &C::SetsCaption>("sCaption")
      .AddLangString()
      .GetScript();
}

void RegisterCSInfo() {
  using C = CSInfo;
  LayoutClass<C>("CSInfo")
      .Field<&C::sCaption>("sCaption")
      .Field<&C::lType>("lType")
      .Field<&C::sExpr>("sExpr")
      .Field<&C::iWidth>("iWidth")
      .Field<&C::bLocked>("bLocked")
      .Field<&C::sValid>("sValid")
      .Field<&C::sWhen>("sWhen")
      .Field<&C::iPos>("iPos")
      .Field<&C::bSkip>("bSkip")
      .Field<&C::bRefresh>("bRefresh")
      .Field<&C::sScript>("sScript")
      .Field<&C::lLinkFType>("lLinkFType")
      .Field<&C::lIDLinkForm>("lIDLinkForm")
      .Field<&C::LinkXALIndex>("LinkXALIndex")
      .GetScript();
}

void RegisterLinkInfo() {
  using C = LinkInfo;
  LayoutClass<C>("LinkInfo")
      .Field<&C::FormID>("FormID")
      .Field<&C::FormDXCode>("FormDXCode")
      .Field<&C::FormXALIndex>("FormXALIndex")
      .Field<&C::FormType>("FormType")
      .Field<&C::SCID>("SCID")
      .Field<&C::SCDXCode>("SCDXCode")
      .Field<&C::SCXALIndex>("SCXALIndex")
      .Field<&C::LinkName>("LinkName")
      .Field<&C::LinkOrder>("LinkOrder")
      .Field<&C::LinkFilter>("LinkFilter")
      .Field<&C::LinkQuery>("LinkQuery")
      .GetScript()
      .ReadOnly<&C::Value>("Value").Default()
      .Method<&C::Clone>("Clone")
      .Field<&C::RTFormID>("RTFormID")
      .Field<&C::ShowAsDocument>("ShowAsDocument");
}

void RegisterImpParams() {
  using C = ImpParams;
  LayoutClass<C>("ImpParams")
      .Field<&C::sCaption>("sCaption")
      .Field<&C::sExpr>("sExpr");
}

void RegisterCellinfo() {
  using C = Cellinfo;
  LayoutClass<C>("Cellinfo")
      .Field<&C::CType>("CType")
      .Field<&C::AmountMode>("AmountMode")
      .Field<&C::LangSuffix>("LangSuffix")
      .Field<&C::Editable>("Editable")
      .Field<&C::Text>("Text")
      .Field<&C::isChanged>("isChanged")
      .Field<&C::isEditing>("isEditing")
      .Field<&C::LOID>("LOID")
      .Field<&C::OnDisplay>("OnDisplay")
      .Field<&C::Valid>("Valid")
      .Field<&C::When>("When")
      .Field<&C::isValid>("isValid")
      .Field<&C::OnGetStyle>("OnGetStyle")
      .Field<&C::Flags>("Flags")
      .Field<&C::FromList>("FromList")
      .Field<&C::Mask>("Mask")
      .Field<&C::DataWidth>("DataWidth")
      .Field<&C::DataType>("DataType")
      .Field<&C::Style>("Style")
      .Field<&C::FStyle>("FStyle")
      .Field<&C::RTSkip>("RTSkip")
      .Field<&C::ItemArray>("ItemArray")
      .Field<&C::ItemsInitialized>("ItemsInitialized")
      .Field<&C::RefreshItems>("RefreshItems")
      .Field<&C::ValueList>("ValueList")
      .Field<&C::needRefresh>("needRefresh")
      .Field<&C::lastRefreshed>("lastRefreshed")
      .Field<&C::Script>("Script")
      .Field<&C::LinkTypes>("LinkTypes")
      .Field<&C::showIDFields>("showIDFields")
      .Field<&C::selectFolders>("selectFolders")
      .Field<&C::Width>("Width")
      .Field<&C::Height>("Height")
      .Field<&C::DDWidth>("DDWidth")
      .Field<&C::RT_DDWidth>("RT_DDWidth")
      .Field<&C::Feature>("Feature")
      .Field<&C::Visible>("Visible")
      .Field<&C::Shrink>("Shrink")
      .Field<&C::ListLink>("ListLink")
      .Field<&C::ListSave>("ListSave")
      .Field<&C::Dynamic>("Dynamic")
      .Field<&C::GridCol>("GridCol")
      .Field<&C::xExpr>("xExpr")
      .Field<&C::OldValue>("OldValue")
      .Field<&C::Value>("Value")
      .Field<&C::TempCType>("TempCType")
      .Field<&C::CDOrder>("CDOrder")
      .Field<&C::CDFilter>("CDFilter")
      .Field<&C::RowFilter>("RowFilter")
      .Field<&C::SkipN1>("SkipN1")
      .Field<&C::NoUTFilter>("NoUTFilter")
      .Field<&C::InputFilterID>("InputFilterID")
      .Field<&C::InputFilter>("InputFilter")
      .Field<&C::Row>("Row")
      .Field<&C::Col>("Col")
      .Field<&C::isDDLoaded>("isDDLoaded")
      .Field<&C::Required>("Required")
      .Field<&C::DispCType>("DispCType")
      .Field<&C::isLongText>("isLongText")
      .Field<&C::ScriptName>("ScriptName")
      .Field<&C::Description>("Description")
      .Property<&C::ObjectName, &C::SetObjectName>("ObjectName")
      .Property<&C::Skip, &C::SetSkip>("Skip")
      .Property<&C::ListShow, &C::SetListShow>("ListShow")
      .Property<&C::Expr, &C::SetExpr>("Expr")
      .Property<&C::Caption, &C::SetCaption>("Caption")
      .Property<&C::LinkFilter, &C::SetLinkFilter>("LinkFilter")
      .Property<&C::LinkOrder, &C::SetLinkOrder>("LinkOrder")
      .Property<&C::LinkQuery, &C::SetLinkQuery>("LinkQuery")
      .ObjectProperty<&C::LnkInfo, &C::SetLnkInfo>("LnkInfo")
      .Property<&C::LinkXALIndex, &C::SetLinkXALIndex>("LinkXALIndex")
      .Property<&C::IDLinkForm, &C::SetIDLinkForm>("IDLinkForm")
      .Property<&C::LinkFType, &C::SetLinkFType>("LinkFType")
      .Property<&C::LangID, &C::SetLangID>("LangID")
      .Property<&C::Translated, &C::SetTranslated>("Translated")
      .AddLangString()
      .GetScript()
      .Property<&C::Valuefilter, &C::SetValuefilter>("Valuefilter")
      .ReadOnly<&C::NN_DataFld>("NN_DataFld")
      .ReadOnly<&C::NN_DataIDFld>("NN_DataIDFld")
      .ReadOnly<&C::NN_RelTable>("NN_RelTable")
      .ReadOnly<&C::NN_RelIDFld>("NN_RelIDFld")
      .ReadOnly<&C::NN_RelNIDFld>("NN_RelNIDFld");
}

void RegisterBrowInfo() {
  using C = BrowInfo;
  LayoutClass<C>("BrowInfo")
      .Field<&C::LOID>("LOID")
      .Field<&C::Expr>("Expr")
      .Field<&C::sClone>("sClone")
      .Field<&C::DataFilter>("DataFilter")
      .Field<&C::DataOrder>("DataOrder")
      .Field<&C::Locked>("Locked")
      .Field<&C::Valid>("Valid")
      .Field<&C::When>("When")
      .Field<&C::OnGetStyle>("OnGetStyle")
      .Field<&C::Pos>("Pos")
      .Field<&C::ProgName>("ProgName")
      .Field<&C::AltStyle>("AltStyle")
      .Field<&C::MultiRow>("MultiRow")
      .Field<&C::Master>("Master")
      .Field<&C::SkipMaster>("SkipMaster")
      .Field<&C::OnAddNew>("OnAddNew")
      .Field<&C::OnDelete>("OnDelete")
      .Field<&C::Loaded>("Loaded")
      .Field<&C::CIArray>("CIArray")
      .Field<&C::XALBrowNr>("XALBrowNr")
      .Field<&C::Filter>("Filter")
      .Field<&C::DefaultData>("DefaultData")
      .Field<&C::SheetName>("SheetName")
      .Field<&C::DocName>("DocName")
      .Field<&C::DocNr>("DocNr")
      .Field<&C::AlreadyUpdated>("AlreadyUpdated")
      .Field<&C::TreeSrc>("TreeSrc")
      .Field<&C::TreeName>("TreeName")
      .Field<&C::TreeFields>("TreeFields")
      .Field<&C::ShowTree>("ShowTree")
      .Field<&C::MaxRows>("MaxRows")
      .Field<&C::LangID>("LangID")
      .ReadOnly<&C::ColCount>("ColCount")
      .Property<&C::Caption, &C::SetCaption>("Caption")
      .AddLangString()
      .GetScript();
}

void RegisterCellEnums() {
  TypeRegistry& registry = TypeRegistry::Instance();
  registry.AddEnum(EnumInfo{"cellTypes", {
      {"ctText", ctText},
      {"ctData", ctData},
      {"ctYesNo", ctYesNo},
      {"ctScript", ctScript},
      {"ctLink", ctLink},
      {"ctList", ctList},
      {"ctLList", ctLList},
      {"ctDLink", ctDLink},
      {"ctCombo", ctCombo},
      {"ctCheck", ctCheck},
      {"ctMemo", ctMemo},
      {"ctStruct", ctStruct},
      {"ctCurData", ctCurData},
      {"ctCurCode", ctCurCode},
      {"ctMLink", ctMLink},
      {"ctFile", ctFile},
      {"ctComboFind", ctComboFind},
      {"ctComboValues", ctComboValues},
      {"ctRefCurData", ctRefCurData},
      {"ctURL", ctURL},
      {"ctNNLink", ctNNLink},
      {"ctNNData", ctNNData},
      {"ctFolder", ctFolder},
  }});
  registry.AddEnum(EnumInfo{"cellFlags", {
      {"cfNone", cfNone},
      {"cfReCalc", cfReCalc},
  }});
  registry.AddEnum(EnumInfo{"cellTrans", {
      {"ctrNone", ctrNone},
      {"ctrOnRead", ctrOnRead},
      {"ctrOnRW", ctrOnRW},
  }});
}

const bool kRegistered = (RegisterDSInfo(), RegisterMDInfo(), RegisterSheetInfo(), RegisterCSInfo(),
                          RegisterLinkInfo(), RegisterImpParams(), RegisterCellinfo(), RegisterBrowInfo(),
                          RegisterCellEnums(), true);

}  // namespace
}  // namespace xal
