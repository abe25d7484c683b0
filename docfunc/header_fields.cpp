// The handlers the form calls when the user leaves a header field: the deal state and series, the
// reference number, the document and deal dates against the closed periods, the payment and
// delivery terms, the values carried into the rows (delivery date, country, department, worker,
// project, registers), and the small fills of names, addresses and the supplier's reference.
// The company and the partner have their own file (company.cpp).
#include <cmath>

#include "collections/ui_strings.h"
#include "docfunc/handler.h"
#include "docfunc/values.h"
#include "runtime/dates.h"
#include "runtime/dispatch.h"
#include "runtime/text.h"
#include "server/sql_utils.h"

namespace xal {

using namespace docfunc;  // NOLINT: the value readers of this folder

namespace {

const Variant kNone(int32_t{0});

// A date plus a number of days, as the terms add them.
Variant DaysAfter(Date date, const Variant& days) { return Variant(Date(date.serial + DoubleOf(days))); }

}  // namespace

// ---------------------------------------------------------------------------------------------
// Deal state, series, reference number
// ---------------------------------------------------------------------------------------------

// The document type and series follow the deal state, from the user's options for this kind.
bool DocFunc::VDealState() {
  return Handle("VDealState", [&](bool& result) {
    const Checked<xal::DataObject> doc = st_.DocData;
    const std::string state = TrimmedOf(doc->Field("DealState"));
    doc->SetField("IDGRDocType", UserOption(st_.DocTable, state + "GRDocType", kNone));
    doc->SetField("IDGRDocSeries", UserOption(st_.DocTable, state + "GRDocSeries", kNone));
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// A new series draws a new number, so the number is cleared and shown at once.
bool DocFunc::VGRDocSeries() {
  return Handle("VGRDocSeries", [&](bool& result) {
    st_.DocData->SetField("DocNo", kNone);
    st_.Doc->RefreshHeader("DocNo");
    result = true;
  });
}

// The reference number's check digit. The rule:
//   1. The status line is cleared; the number is taken without leading and trailing blanks.
//   2. An empty number is accepted.
//   3. The number is compared (in any letter case) with itself with the 7-3-1 check digit put in
//      its last place; when they differ the status line names the right digit (text 71) and the
//      entry is refused.
//   4. A number with anything but digits before its last place has no check digit: the
//      check-digit function refuses it with a type mismatch, which the handler reports in the
//      status line like any failure, and the entry is refused.
bool DocFunc::VReferenceNo() {
  return Handle("VReferenceNo", [&](bool& result) {
    Status("");
    const std::string number = TrimmedOf(st_.DocData->Field("ReferenceNo"));
    if (!number.empty()) {
      const std::string corrected = server::SetTargetFigure(number);
      if (!TextEquals(number, corrected)) {
        Status(GetUIString(71, {Variant(Right(corrected, 1))}));
        return;
      }
    }
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// Dates
// ---------------------------------------------------------------------------------------------

// The checks a document date and a deal date share:
//   1. No date (0 or blank): the host message `missingKey` in the status line; refused.
//   2. The subsystem of the document (its "RefType", else its table, through GetSysName) has its
//      periods closed up to the system option "DateFixed"/subsystem (0: none closed).
//   3. A date strictly before that day: the host message `closedKey`; refused. The day itself is
//      still open.
//   4. A date (its whole day) after today plus the user's "DocDateLimit" days, or before the year
//      1900, is asked about (text 72); No refuses it.
bool DocFunc::DateAccepted(const std::string& field, const std::string& missingKey, const std::string& closedKey) {
  const Checked<xal::DataObject> doc = st_.DocData;
  const Date date = DateOf(doc->Field(field));
  if (date.serial == 0) {
    Status(HostText(missingKey));
    return false;
  }
  // A header without the field has no reference type.
  std::string refType = TrimmedOf(TryOr([&] { return doc->Field("RefType"); }, Variant()));
  if (refType.empty()) refType = doc->TableName();
  const Date closedUpTo = DateOf(SystemOption("DateFixed", server::GetSysName(refType), kNone));
  if (closedUpTo.serial != 0 && date < closedUpTo) {
    Status(HostText(closedKey));
    return false;
  }
  const bool beyondLimit = std::floor(date.serial) > Today().serial + st_.DocDateLimit;
  if ((beyondLimit || Year(date) < 1900) && st_.Doc->MsgBox(GetUIString(72), kMbYesNo, "") == kAnswerNo) return false;
  return true;
}

namespace {

// A due date that is set (after 1900) and earlier than the document date.
bool DueDateBeforeDocDate(xal::DataObject& doc) {
  const Date due = DateOf(doc.Field("PromptDate"));
  return Year(due) > 1900 && due < DateOf(doc.Field("DocDate"));
}

}  // namespace

// The document date; an accepted date becomes the deal date and moves the due date.
bool DocFunc::VDocDate() {
  return Handle("VDocDate", [&](bool& result) {
    if (!DateAccepted("DocDate", "Err_DocDateMissing", "Err_DocInClosedPeriod")) return;
    const Checked<xal::DataObject> doc = st_.DocData;
    if (st_.UseTermPayment && DueDateBeforeDocDate(*doc) && LongOf(doc->Field("IDGRTermPayment")) == 0) {
      Status(GetUIString(73));
      return;
    }
    doc->SetField("DealDate", doc->Field("DocDate"));
    VTermPayment();
    Status("");
    result = true;
  });
}

bool DocFunc::VDealDate() {
  return Handle("VDealDate", [&](bool& result) {
    if (!DateAccepted("DealDate", "Err_DealDateMissing", "Err_DealDateOutOfRange")) return;
    Status("");
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// Terms
// ---------------------------------------------------------------------------------------------

// The due date from the payment term's longest prompt time, and its penalty (not while a new
// document is being filled). A term without rows, or a document without a date, changes nothing.
bool DocFunc::VTermPayment() {
  return Handle("VTermPayment", [&](bool& result) {
    const Checked<xal::DataObject> doc = st_.DocData;
    const int32_t term = LongOf(doc->Field("IDGRTermPayment"));
    const Date docDate = DateOf(doc->Field("DocDate"));
    if (st_.UseTermPayment && term != 0 && docDate.serial != 0) {
      const std::string id = std::to_string(term);
      Ref<xal::DataObject> row = OpenQuery(
          "SELECT A.PromptTime, A.PenaltyPercent FROM GRTermPaymentRow A WHERE A.IDGRTermPayment = " + id +
          " AND A.PromptTime = (SELECT Max(X.PromptTime) FROM GRTermPaymentRow X WHERE X.IDGRTermPayment = " + id + ")");
      if (!row->IsEOF()) {
        doc->SetField("PromptDate", DaysAfter(docDate, row->Field("PromptTime")));
        if (!st_.NewDocPending) doc->SetField("PenaltyPercent", row->Field("PenaltyPercent"));
      }
    }
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

bool DocFunc::VPromptDate() {
  return Handle("VPromptDate", [&](bool& result) {
    if (DueDateBeforeDocDate(*st_.DocData)) {
      Status(GetUIString(73));
      return;
    }
    Status("");
    result = true;
  });
}

// The delivery date from the delivery term's delivery time. A term that points at no row, or a
// document without a date, changes nothing.
bool DocFunc::VTermDelivery() {
  return Handle("VTermDelivery", [&](bool& result) {
    const Checked<xal::DataObject> doc = st_.DocData;
    if (st_.UseTermDelivery && !st_.NewDocPending && LongOf(doc->Field("IDGRTermDelivery")) != 0) {
      const Variant days = doc->Field("GRTermDelivery.DeliveryTime");
      const Date docDate = DateOf(doc->Field("DocDate"));
      if (!IsBlank(days) && docDate.serial != 0) doc->SetField("DeliveryDate", DaysAfter(docDate, days));
    }
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// ---------------------------------------------------------------------------------------------
// Values carried into the rows
// ---------------------------------------------------------------------------------------------

// A blank header date travels as date 0, the rows' "no date".
bool DocFunc::VDeliveryDate() {
  return Handle("VDeliveryDate", [&](bool& result) {
    if (st_.UseDeliveryDate) PropagateToRows("DeliveryDate", Variant(DateOf(st_.DocData->Field("DeliveryDate"))));
    result = true;
  });
}

bool DocFunc::VCountry() {
  return Handle("VCountry", [&](bool& result) {
    PropagateToRows("Country", Variant(TextOf(st_.DocData->Field("Country"))));
    result = true;
  });
}

bool DocFunc::VGRDepartment() {
  return HandleAlwaysTrue("VGRDepartment",
                          [&](bool&) { CarryRegisterToRows("IDGRDepartment", 11, st_.DepartmentField); });
}

bool DocFunc::VWorker() {
  return HandleAlwaysTrue("VWorker", [&](bool&) { CarryRegisterToRows("IDWorker", 13, st_.WorkerField); });
}

bool DocFunc::VGRProject() {
  return HandleAlwaysTrue("VGRProject", [&](bool&) { CarryRegisterToRows("IDGRProject", 12, st_.ProjectField); });
}

// The register of the cell being edited, named by the cell's expression:
//   1. "GRArticle." at its start names the article register; otherwise its first 11 characters
//      name the register ("GARegister3.Code" names "GARegister3").
//   2. The header field is "ID" & register; the row field is the A-register field & the register's
//      last character for a "GA…" register, the B-register field & it for "GB…", else the
//      article field.
//   3. Without a cell or with an empty expression there is no register and nothing happens.
bool DocFunc::VRegisters() {
  return HandleAlwaysTrue("VRegisters", [&](bool&) {
    const ObjectRef cell = st_.Doc->Cell();
    if (!cell) return;
    const std::string expr = TextOf(GetProperty(cell, "Expr"));
    const std::string name = TextEquals(Left(expr, 10), "GRArticle.") ? std::string("GRArticle") : Left(expr, 11);
    if (name.empty()) return;
    std::string rowField = st_.ArticleField;
    if (TextEquals(Left(name, 2), "GA")) rowField = st_.ARegisterField + Right(name, 1);
    if (TextEquals(Left(name, 2), "GB")) rowField = st_.BRegisterField + Right(name, 1);
    CarryRegisterToRows("ID" + name, 14, rowField);
  });
}

// ---------------------------------------------------------------------------------------------
// Small fills
// ---------------------------------------------------------------------------------------------

// On the purchase side the reference number comes from the supplier: its bank account's, the
// partner's or the company's, the first that is not blank.
bool DocFunc::VGRBankAccount() {
  return Handle("VGRBankAccount", [&](bool& result) {
    const Checked<xal::DataObject> doc = st_.DocData;
    if (st_.IsPurchase) {
      for (const char* source : {"PartnerBAcc.ReferenceNo", "Partner.ReferenceNo", "GRCompany.ReferenceNo"}) {
        const std::string number = TrimmedOf(doc->Field(source));
        if (number.empty()) continue;
        doc->SetField("ReferenceNo", Variant(number));
        break;
      }
    }
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

// A new currency has new rates: they are looked up again when the header is refreshed.
void DocFunc::ResetExchangeRates() {
  st_.DocData->SetField("ExchangeRate", kNone);
  st_.DocData->SetField("ExchangeRateRef", kNone);
}

bool DocFunc::VGRCurrency() {
  return Handle("VGRCurrency", [&](bool& result) {
    ResetExchangeRates();
    st_.HeaderRefreshPending = true;
    result = true;
  });
}

bool DocFunc::VCode() {
  return Handle("VCode", [&](bool& result) {
    const Checked<xal::DataObject> doc = st_.DocData;
    if (TrimmedOf(doc->Field("Name")).empty()) {
      doc->SetField("Name", doc->Field("Code"));
      st_.HeaderRefreshPending = true;
    }
    result = true;
  });
}

namespace {

// The partner's side follows the company's when it is blank or the partner is the company itself.
bool CopyToPartnerSide(xal::DataObject& doc, const char* from, const char* to) {
  const std::string value = TrimmedOf(doc.Field(from));
  if (value.empty()) return false;
  if (!TrimmedOf(doc.Field(to)).empty() && LongOf(doc.Field("IDGRCompany")) != LongOf(doc.Field("IDPartner")))
    return false;
  doc.SetField(to, Variant(value));
  return true;
}

}  // namespace

bool DocFunc::VCompanyName() {
  return Handle("VCompanyName", [&](bool& result) {
    if (CopyToPartnerSide(*st_.DocData, "CompanyName", "PartnerName")) st_.HeaderRefreshPending = true;
    result = true;
  });
}

bool DocFunc::VCompanyAddr() {
  return Handle("VCompanyAddr", [&](bool& result) {
    if (CopyToPartnerSide(*st_.DocData, "CompanyAddr", "PartnerAddr")) st_.HeaderRefreshPending = true;
    result = true;
  });
}

}  // namespace xal
