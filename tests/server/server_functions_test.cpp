// The ServerFunctions facade as scripts reach it, by name through the type library: its member
// table, omitted optional arguments taking their defaults, by-reference arguments written back,
// and Execute, which clears the callback it installs and never fails.
#include "server/server_functions.h"

#include <gtest/gtest.h>

#include "../host/host_fixture.h"
#include "bridge/callback_proxy.h"
#include "host/param_list.h"
#include "recording_host.h"
#include "runtime/convert.h"
#include "runtime/dispatch.h"
#include "server/ca_balance.h"
#include "server/currency.h"
#include "server/module_state.h"
#include "server/stock.h"
#include "server/verbal_sum.h"

namespace xal {
namespace {

using server::testing::RecordingConnection;
using server::testing::SqlCall;

// A member as one line: name, kind when not a method, and each parameter with "?" when optional,
// "=default" when it has one and "&" when passed by reference.
std::string Signature(const MemberInfo& m) {
  std::string s = m.name;
  if (m.kind != MemberKind::Method) s += std::string(" [") + MemberKindName(m.kind) + "]";
  s += "(";
  for (size_t i = 0; i < m.params.size(); ++i) {
    const ParamInfo& p = m.params[i];
    if (i) s += ", ";
    s += p.name;
    if (p.optional && p.defaultValue.IsMissing()) s += "?";
    if (!p.defaultValue.IsMissing()) s += "=" + CStr(p.defaultValue);
    if (p.byRef) s += "&";
  }
  return s + ")";
}

TEST(ServerFunctionsTypeLib, MembersInInterfaceOrder) {
  const ClassInfo* info = TypeRegistry::Instance().ByName("ServerFunctions");
  ASSERT_NE(info, nullptr);
  EXPECT_TRUE(info->creatable());
  const char* expected[] = {
      "ServerFunctions [get]()",
      "Execute(pName, pParams&)",
      "CheckCategory(pXALConnect&, pTableName, pID, pCatID)",
      "Bin2File(pFileName, pBinData&)",
      "File2Bin(pFileName)",
      "SQLDelete(pXALConnect&, pSQLString, pOptions?)",
      "CountBankBalance(pXALConnect, pIDGRBankAccount, pDocDate)",
      "CountCashBalance(pXALConnect, pIDVRCashDesk, pDocDate)",
      "CountStockBalance(pXALConnect, pIDGRArticle, pIDDRStore=0, pIDDDStoreDRow=0, pCountPreReservations=False, "
      "pCountSets=False)",
      "AggrRec(pObj&, pObjID, pParams&)",
      "SetTargetFigure(pSourceString&)",
      "Round(pInVal&, pPos?&)",
      "SQLDate(pInDate, pWithTime?)",
      "CurRate(pXALConnect, pCurID, pRateDate?)",
      "ConvertWithRates(pAmount, pRate1, pRate2?, pRefAmount?, pIsTriangulation?)",
      "Convert(pXALConnect, pCurID, pConvDate, pAmount, pRefAmount?&)",
      "SQLDouble(pNum)",
      "InWhereStr(pString1, pString2, pStart=1)",
      "GetRowName(pDocName)",
      "GetIDFieldName(pDocName)",
      "GetSysName(pDocName)",
      "GetBalanceDate(pXALConnect&, pDocDate, pBalanceName)",
      "ComputePenalty(pAmount, pPDate, pPromptDate?, pPenaltyPercent?, pIDGDPrompDate?, pXALConnect?&)",
      "ComputeWDays(pDate1, pDate2)",
      "GetEmployeeID(pXALConnect&)",
      "GetDXCode(pObj&)",
      "VerbalSum(pToConvert, pConvLang, pCurCode, pUpperCase=True, pOtherDollar=, pOtherCent=)",
      "ArraySort(pArray&)",
      "CountCost(pXALConnect, pIDGRArticle, pIDDRStore, pIDDoc=0, pResetOptions=False, pArticleType=X)",
      "GetTableFilter(XALConnect&, XALType&, IDListOnly?&, Alias?&, SubSelect?&)",
      "CountCABalance(XALConnect, IDCRCapitalAssets, IDCADocRow=0, DocDate?, BasicCost?&, BasicCostRef?&, "
      "DepreciatedCost?&, DepreciatedCostRef?&, DepreciationRate?&, DepreciationAmount?&, DepreciationAmountRef?&, "
      "Quantity?&, IDCALastRegRow?&)",
      "QueryCodeToID(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable)",
      "QueryIDToCode(pField, pCondition, pArgument, pSourceTableOB, pQueryLinkTable)",
      "GetCompanyPrice(pXALConnect, pIDGRArticle, pIDGRCompany, pDate?)",
  };
  ASSERT_EQ(info->members().size(), std::size(expected));
  for (size_t i = 0; i < std::size(expected); ++i) {
    SCOPED_TRACE(i + 1);
    EXPECT_EQ(Signature(info->members()[i]), expected[i]);
  }
}

class ServerFunctionsTest : public host::testing::HostTest {
 protected:
  void SetUp() override {
    HostTest::SetUp();
    sf = CreateObject("ServerFunctions");
    recorder = MakeRef<RecordingConnection>(conn);
  }
  Variant Call(const char* member, std::vector<Variant>& args) {
    return Invoke(sf, member, MemberKind::Method, std::span<Variant>(args));
  }
  Variant Conn() const { return Variant(ObjectRef(recorder)); }

  ObjectRef sf;
  Ref<RecordingConnection> recorder;
};

TEST_F(ServerFunctionsTest, ServerFunctionsPropertyIsTheObjectItself) {
  EXPECT_EQ(GetProperty(sf, "ServerFunctions").AsObject(), sf);
}

TEST_F(ServerFunctionsTest, OmittedStockArgumentsMeanAllStoresNoRowNoReservationsNoSets) {
  conn->db().ExecScript(
      "INSERT INTO GRArticle (ID, Code, ArticleType, Cost) VALUES (5, 'A5', '', 12.5);");
  // The SQL an explicit call sends, compared with what the call with omitted arguments sends.
  auto sent = [&](const std::function<void()>& call) {
    recorder->queried.clear();
    recorder->executed.clear();
    call();
    std::vector<SqlCall> all = recorder->queried;
    all.insert(all.end(), recorder->executed.begin(), recorder->executed.end());
    return all;
  };
  const auto omitted = sent([&] {
    std::vector<Variant> args{Conn(), Variant(int32_t{5})};
    Call("CountStockBalance", args);
  });
  const Ref<XALConnect> c = recorder;
  EXPECT_EQ(omitted, sent([&] { server::CountStockBalance(c, 5, 0, 0, false, false); }));
  EXPECT_NE(omitted, sent([&] { server::CountStockBalance(c, 5, 100, 0, false, false); }));  // the check can tell

  // CountCost(conn, article, store): no document, options kept, article type "X" (read from the
  // article, here not a fixed-cost "S" article).
  std::vector<Variant> args{Conn(), Variant(int32_t{5}), Variant(int32_t{100})};
  const auto costOmitted = sent([&] { Call("CountCost", args); });
  EXPECT_EQ(costOmitted, sent([&] { server::CountCost(c, 5, 100, 0, false, "X"); }));
  EXPECT_EQ(Call("CountCost", args), server::CountCost(c, 5, 100, 0, false, "X"));
  EXPECT_NE(costOmitted, sent([&] { server::CountCost(c, 5, 100, 0, false, "S"); }));  // "S" reads no flows
}

TEST_F(ServerFunctionsTest, VerbalSumUpperCasesByDefault) {
  std::vector<Variant> args{Variant(13.5), Variant("ENG"), Variant("USD")};
  const Variant got = Call("VerbalSum", args);
  EXPECT_EQ(got, Variant(server::VerbalSum(Variant(13.5), "ENG", "USD", true, "", "")));
  EXPECT_NE(got, Variant(server::VerbalSum(Variant(13.5), "ENG", "USD", false, "", "")));
}

TEST_F(ServerFunctionsTest, UtilitiesByName) {
  struct Row {
    const char* member;
    std::vector<Variant> args;
    Variant expected;
  } rows[] = {
      {"Round", {Variant(2.5)}, Variant("3")},                                     // pPos omitted: 0
      {"Round", {Variant(1234.5), Variant(int16_t{-2})}, Variant("1200")},
      {"SQLDate", {Variant(Date(39877.5))}, Variant("#3/5/2009#")},               // pWithTime omitted
      {"SQLDate", {Variant(Date(39877.5)), Variant(true)}, Variant("#3/5/2009 12:0:0#")},
      {"SQLDouble", {Variant("1,234,5")}, Variant("1.234,5")},
      {"InWhereStr", {Variant("a='x AND y' AND b"), Variant("and")}, Variant(int16_t{13})},  // pStart 1
      {"InWhereStr", {Variant("a AND b AND c"), Variant("AND"), Variant(int32_t{4})}, Variant(int16_t{9})},
      {"SetTargetFigure", {Variant("1234560")}, Variant("1234561")},
      {"GetRowName", {Variant("SDInvoice")}, Variant("SDINVOICERow")},
      {"GetIDFieldName", {Variant("sdinvoice")}, Variant("IDSDINVOICE")},
      {"GetSysName", {Variant("DDMovement")}, Variant("STORE")},
      {"File2Bin", {Variant("/nonexistent/file")}, Variant()},
  };
  for (Row& r : rows) {
    SCOPED_TRACE(r.member);
    const std::vector<Variant> before = r.args;
    EXPECT_EQ(Call(r.member, r.args), r.expected);
    EXPECT_EQ(r.args, before);  // by-reference arguments come back as they went in
  }
}

TEST_F(ServerFunctionsTest, ArraySortSortsTheCallersArray) {
  std::vector<Variant> args{Variant(SafeArray::Vector({Variant("b"), Variant("a"), Variant("C")}))};
  EXPECT_TRUE(Call("ArraySort", args).IsEmpty());
  EXPECT_EQ(args[0], Variant(SafeArray::Vector({Variant("a"), Variant("b"), Variant("C")})));
}

TEST_F(ServerFunctionsTest, ConnectionAndDataObjectArguments) {
  conn->db().ExecScript("INSERT INTO GRArticle (ID, Code) VALUES (5, 'A5'), (6, 'A6');");
  Ref<DataObject> article = conn->Server()->OpenQuery("GRArticle", 1, "ID = 5", "");
  std::vector<Variant> dx{Variant(ObjectRef(article))};
  EXPECT_EQ(Call("GetDXCode", dx), Variant("A5"));

  std::vector<Variant> del{Conn(), Variant("DELETE FROM GRArticle WHERE ID=6")};  // pOptions omitted
  EXPECT_EQ(Call("SQLDelete", del), Variant(true));
  EXPECT_EQ(recorder->executed, (std::vector<SqlCall>{{"DELETE FROM GRArticle WHERE ID=6", 0}}));
  EXPECT_EQ(CLng(conn->db().Scalar("SELECT COUNT(*) FROM GRArticle")), 1);
}

TEST_F(ServerFunctionsTest, ByReferenceOutputsAreWrittenBack) {
  // Convert: a currency without a row converts to the amount itself, also in pRefAmount.
  std::vector<Variant> conv{Conn(), Variant(int32_t{99}), Variant(Date(39877)), Variant(Currency::FromInt(40)),
                            Variant(Currency::FromInt(0))};
  Currency ref;
  const Currency direct = server::Convert(recorder, 99, Date(39877), Currency::FromInt(40), ref);
  EXPECT_EQ(Call("Convert", conv), Variant(direct));
  EXPECT_EQ(conv[4], Variant(ref));
  EXPECT_EQ(conv[4], Variant(Currency::FromInt(40)));

  // CountCABalance: every output comes back as the operation computed it.
  conn->db().Exec(
      "INSERT INTO CADocRow (ID, IDCRCapitalAssets, DocName, DocDate, BasicCost, BasicCostRef, DepreciationRate, "
      "Quantity) VALUES (1, 7, 'CDReceipts', 40101, 12000, 6000, 20, 1)");
  server::CABalance b;
  const bool ok = server::CountCABalance(recorder, 7, 0, Date(40283), b);
  const Variant zero(Currency{});
  std::vector<Variant> ca{Conn(), Variant(int32_t{7}), Variant(int32_t{0}), Variant(Date(40283)),
                          zero, zero, zero, zero, Variant(0.0), zero, zero, Variant(0.0), Variant(int32_t{0})};
  const Variant got = Call("CountCABalance", ca);
  EXPECT_EQ(got, Variant(ok));
  EXPECT_EQ(ca[4], Variant(b.basicCost));
  EXPECT_EQ(ca[5], Variant(b.basicCostRef));
  EXPECT_EQ(ca[6], Variant(b.depreciatedCost));
  EXPECT_EQ(ca[7], Variant(b.depreciatedCostRef));
  EXPECT_EQ(ca[8], Variant(b.depreciationRate));
  EXPECT_EQ(ca[9], Variant(b.depreciationAmount));
  EXPECT_EQ(ca[10], Variant(b.depreciationAmountRef));
  EXPECT_EQ(ca[11], Variant(b.quantity));
  EXPECT_EQ(ca[12], Variant(b.idCALastRegRow));
  EXPECT_NE(b.basicCost, Currency());  // the comparison above saw a real balance
}

// ---- Execute ------------------------------------------------------------------------------------

Ref<ParamList> ListWith(const char* name, const Variant& value) {
  auto list = MakeRef<host::HostParamList>();
  list->Set(name, value);
  return list;
}

TEST_F(ServerFunctionsTest, ExecuteClearsTheCallbackAndNeverFails) {
  const Variant callback(ObjectRef(MakeRef<XALCBProxy>()));
  struct Row {
    const char* name;
    Ref<ParamList> params;
    bool callbackBefore;  // a callback left over from elsewhere on this thread
    Variant expected;
  } rows[] = {
      {"closeperiod", ListWith("CallBack", callback), false, Variant(false)},  // any case; not closed
      {"ClosePeriod", ListWith("XALConnect", Conn()), true, Variant(false)},
      {"ClosePeriod", ListWith("CallBack", Variant("no object")), false, Variant(false)},  // skipped
      {"ClosePeriod", nullptr, false, Variant(false)},                       // no list at all
      {"Other", ListWith("CallBack", callback), false, Variant()},           // unknown: nothing runs
      {"Other", nullptr, true, Variant()},
      {"", ListWith("CallBack", callback), false, Variant()},
  };
  for (Row& r : rows) {
    SCOPED_TRACE(r.name);
    if (r.callbackBefore) server::CurrentCallback() = MakeRef<XALCBProxy>();
    std::vector<Variant> args{Variant(r.name), r.params ? Variant(ObjectRef(r.params)) : Variant::Nothing()};
    const Variant got = Call("Execute", args);
    EXPECT_EQ(got, r.expected);
    EXPECT_EQ(server::CurrentCallback(), nullptr);
  }
}

}  // namespace
}  // namespace xal
