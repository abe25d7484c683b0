// Variant <-> JSON for the command-line tool.
#include "apps/xal/json_values.h"

#include <cmath>
#include <limits>

#include "runtime/convert.h"
#include "runtime/dates.h"
#include "runtime/locale.h"
#include "runtime/text.h"

namespace xal::app {

namespace {

[[noreturn]] void Bad(const std::string& what) { Raise(kErrTypeMismatch, "Type mismatch: " + what); }

// Currency text is always read with "." whatever the runtime's locale is.
Currency ParseCurrencyText(const std::string& text) {
  RuntimeLocale dot;
  ScopedLocale scope(dot);
  return CCur(Variant(ParseNumber(text)));
}

Variant ArrayFromJson(const Json& j, const HandleMap& handles) {
  const Json& value = j.at("value");
  std::vector<int32_t> lbound;
  if (j.contains("lbound")) {
    if (j["lbound"].is_array()) {
      for (const auto& b : j["lbound"]) lbound.push_back(b.get<int32_t>());
    } else {
      lbound.push_back(j["lbound"].get<int32_t>());
    }
  }
  if (!value.is_array()) Bad("array value must be a list");
  // Dimensions: a list of lists is 2-D when lbound names two bounds (or every element is a list
  // and no lbound is given); deeper nesting is not encoded.
  bool twoD = lbound.size() == 2 || (lbound.empty() && !value.empty() &&
                                     std::all_of(value.begin(), value.end(), [](const Json& r) { return r.is_array(); }));
  if (lbound.size() > 2) Bad("arrays of more than two dimensions");
  if (!twoD) {
    std::vector<Variant> items;
    for (const auto& e : value) items.push_back(FromJson(e, handles));
    return Variant(SafeArray::Vector(std::move(items), lbound.empty() ? 0 : lbound[0]));
  }
  int32_t lb0 = lbound.empty() ? 0 : lbound[0], lb1 = lbound.size() > 1 ? lbound[1] : 0;
  size_t rows = value.size(), cols = rows ? value[0].size() : 0;
  for (const auto& r : value)
    if (!r.is_array() || r.size() != cols) Bad("rows of a 2-D array must be lists of one length");
  SafeArray a({{lb0, static_cast<int32_t>(lb0 + static_cast<int64_t>(rows) - 1)},
               {lb1, static_cast<int32_t>(lb1 + static_cast<int64_t>(cols) - 1)}});
  for (size_t i = 0; i < rows; ++i)
    for (size_t k = 0; k < cols; ++k)
      a.At({lb0 + static_cast<int32_t>(i), lb1 + static_cast<int32_t>(k)}) = FromJson(value[i][k], handles);
  return Variant(std::move(a));
}

Variant TypedFromJson(const Json& j, const HandleMap& handles) {
  const std::string type = j.at("type").get<std::string>();
  auto value = [&]() -> const Json& {
    if (!j.contains("value")) Bad(type + " needs a value");
    return j["value"];
  };
  if (TextEquals(type, "Empty")) return Variant();
  if (TextEquals(type, "Null")) return Variant::Null();
  if (TextEquals(type, "Missing")) return Variant::Missing();
  if (TextEquals(type, "Integer")) return Variant(CInt(Variant(value().get<double>())));
  if (TextEquals(type, "Long")) return Variant(CLng(Variant(value().get<double>())));
  if (TextEquals(type, "Double")) return Variant(value().get<double>());
  if (TextEquals(type, "Boolean")) return Variant(value().get<bool>());
  if (TextEquals(type, "String")) return Variant(value().get<std::string>());
  if (TextEquals(type, "Currency")) {
    const Json& v = value();
    return Variant(v.is_string() ? ParseCurrencyText(v.get<std::string>()) : Currency::FromDouble(v.get<double>()));
  }
  if (TextEquals(type, "Date")) {
    const Json& v = value();
    return Variant(v.is_string() ? ParseDate(v.get<std::string>()) : Date(v.get<double>()));
  }
  if (TextEquals(type, "Array")) return ArrayFromJson(j, handles);
  if (TextEquals(type, "Object")) return Variant(handles.fromHandle(j.contains("object") ? j["object"] : Json()));
  Bad("unknown type \"" + type + "\"");
}

Json ArrayToJson(const SafeArray& a, const HandleMap& handles) {
  Json out = {{"type", "Array"}};
  Json lb = Json::array();
  for (const auto& b : a.Bounds()) lb.push_back(b.lower);
  out["lbound"] = lb;
  if (a.Dims() == 1) {
    Json items = Json::array();
    for (const auto& e : a.Elements()) items.push_back(ToJson(e, handles));
    out["value"] = items;
  } else if (a.Dims() == 2) {
    Json rows = Json::array();
    const auto& b = a.Bounds();
    for (int32_t i = b[0].lower; i <= b[0].upper; ++i) {
      Json row = Json::array();
      for (int32_t k = b[1].lower; k <= b[1].upper; ++k) row.push_back(ToJson(a.At({i, k}), handles));
      rows.push_back(row);
    }
    out["value"] = rows;
  } else {
    Json items = Json::array();  // deeper arrays: elements in storage order
    for (const auto& e : a.Elements()) items.push_back(ToJson(e, handles));
    out["value"] = items;
  }
  return out;
}

}  // namespace

Variant FromJson(const Json& j, const HandleMap& handles) {
  try {
    switch (j.type()) {
      case Json::value_t::null: return Variant::Null();
      case Json::value_t::boolean: return Variant(j.get<bool>());
      case Json::value_t::string: return Variant(j.get<std::string>());
      case Json::value_t::number_integer:
      case Json::value_t::number_unsigned: {
        if (j.is_number_unsigned() && j.get<uint64_t>() > uint64_t(std::numeric_limits<int32_t>::max()))
          return Variant(j.get<double>());
        int64_t v = j.get<int64_t>();
        if (v >= std::numeric_limits<int32_t>::min() && v <= std::numeric_limits<int32_t>::max())
          return Variant(static_cast<int32_t>(v));
        return Variant(static_cast<double>(v));
      }
      case Json::value_t::number_float: return Variant(j.get<double>());
      case Json::value_t::object:
        if (j.contains("object") && !j.contains("type")) return Variant(handles.fromHandle(j["object"]));
        if (!j.contains("type")) Bad("an object value needs \"type\" or \"object\"");
        return TypedFromJson(j, handles);
      default: Bad("a JSON list is not a value; use {\"type\":\"Array\",…}");
    }
  } catch (const Json::exception& e) {
    Bad(e.what());
  }
}

Json ToJson(const Variant& v, const HandleMap& handles) {
  const std::string type = VarTypeName(v.Type());
  return v.Visit(Overloaded{
      [&](std::monostate) -> Json { return {{"type", type}}; },
      [&](NullValue) -> Json { return {{"type", type}}; },
      [&](MissingValue) -> Json { return {{"type", type}}; },
      [&](int16_t x) -> Json { return {{"type", type}, {"value", x}}; },
      [&](int32_t x) -> Json { return {{"type", type}, {"value", x}}; },
      [&](double x) -> Json {
        if (!std::isfinite(x)) return {{"type", type}, {"value", DoubleToString(x)}};
        return {{"type", type}, {"value", x}};
      },
      [&](Currency c) -> Json {
        // Four decimals always, "." always.
        int64_t raw = c.raw();
        bool neg = raw < 0;
        uint64_t mag = neg ? 0 - static_cast<uint64_t>(raw) : static_cast<uint64_t>(raw);
        std::string frac = std::to_string(mag % 10000);
        frac.insert(0, 4 - frac.size(), '0');
        return {{"type", type}, {"value", (neg ? "-" : "") + std::to_string(mag / 10000) + "." + frac}};
      },
      [&](Date d) -> Json { return {{"type", type}, {"value", DateToIso(d)}}; },
      [&](const std::string& s) -> Json { return {{"type", type}, {"value", s}}; },
      [&](bool b) -> Json { return {{"type", type}, {"value", b}}; },
      [&](const ObjectRef& o) -> Json { return {{"object", o ? handles.toHandle(o) : Json()}}; },
      [&](const SafeArray& a) -> Json { return ArrayToJson(a, handles); },
  });
}

}  // namespace xal::app
