// Amounts in words for printed documents, in English, Estonian, Latvian and Lithuanian.
#pragma once

#include <string>

#include "runtime/variant.h"

namespace xal::server {

std::string VerbalSum(const Variant& pToConvert, const std::string& pConvLang, const std::string& pCurCode,
                      bool pUpperCase = true, const std::string& pOtherDollar = "", const std::string& pOtherCent = "");

}  // namespace xal::server
