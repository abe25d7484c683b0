// Small stateless helpers the component uses to build SQL text and to handle names, codes and
// numbers: date and number literals, quoted text literals, rounding through formatting, a search
// that skips quoted text, a check digit, document-name mappings, code <-> id translation through
// linked tables and a chunked delete. (Whole-file transfer is in server/files.h, the array sort in
// server/array_sort.h.)
// Every SQL text the component builds takes its literals from SQLDate, SQLDouble and SQLText, so
// no value reaches SQL unquoted.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "bridge/host_model.h"
#include "runtime/convert.h"
#include "runtime/trap.h"
#include "runtime/variant.h"

namespace xal::server {

// #month/day/year# (with " h:m:s" when asked), no leading zeros: #3/5/2009 14:7:0#.
std::string SQLDate(const Variant& pInDate, bool pWithTime = false);
// The number's text with its first comma made a point.
std::string SQLDouble(const Variant& pNum);
// A whole number as SQL text: its digits, "-" in front when negative.
inline std::string Num(int32_t v) { return std::to_string(v); }
// A text literal: the text between single quotes, each quote inside doubled.
std::string SQLText(std::string_view text);
// Fields of a query's current row read with a default: no row (Empty) and Null count as 0 — a
// part of a union with no rows, a store that is not there. A Nothing data object is error 91.
inline double NumberField(const Checked<DataObject>& rs, const char* name) { return ValueOr(rs->Field(name), 0.0); }
inline int32_t IdField(const Checked<DataObject>& rs, const char* name) { return ValueOr(rs->Field(name), 0); }
// Rounding through formatting; the result is a Variant holding text.
Variant Round(const Variant& pInVal, int16_t pPos = 0);
// Case-insensitive search of pString2 in pString1 that skips matches inside quotes.
int16_t InWhereStr(const std::string& pString1, const std::string& pString2, int32_t pStart = 1);
// The last character replaced by the 7-3-1 check digit of the characters before it.
std::string SetTargetFigure(const std::string& pSourceString);
std::string GetRowName(const std::string& pDocName);
std::string GetIDFieldName(const std::string& pDocName);
std::string GetSysName(const std::string& pDocName);
std::string GetDXCode(const Ref<DataObject>& pObj);
std::string QueryCodeToID(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                          const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable);
std::string QueryIDToCode(const std::string& pField, const std::string& pCondition, const std::string& pArgument,
                          const Ref<DataObject>& pSourceTableOB, const std::string& pQueryLinkTable);
bool SQLDelete(const Ref<XALConnect>& pXALConnect, const std::string& pSQLString, int32_t pOptions = 0);

}  // namespace xal::server
