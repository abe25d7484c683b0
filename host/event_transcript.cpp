// Lines of the proxy's events, from the `log` column of the event list.
#include "host/event_transcript.h"

#include <string_view>

#include "runtime/convert.h"
#include "runtime/text.h"

namespace xal::host {

namespace {

std::string ArgText(const Variant& v) {
  if (v.IsString()) return "\"" + v.AsString() + "\"";
  if (v.IsObject()) return v.AsObject() ? "<object>" : "Nothing";
  if (v.IsEmpty() || v.IsMissing()) return "";
  try {
    return CStr(v);
  } catch (const VbError&) {
    return VarTypeName(v.Type());
  }
}

bool IsBlank(const Variant& v) { return v.IsEmpty() || v.IsMissing() || (v.IsString() && v.AsString().empty()); }

}  // namespace

// A line is built in these steps:
//   1. An event whose log is nullptr has no line.
//   2. The name is the event's without a leading "Do"; a posted command reads "CmdPost", as the
//      script wrote it.
//   3. The arguments are the parameters the log names, in its order, as ArgText writes them: text
//      in quotes, numbers and Booleans as CStr writes them, an object as "<object>" or "Nothing".
//      A "[Name]" parameter is left out when it is Empty, Missing or "".
//   4. "->Name" appends the answer after the call; an object answer shows only when it is Nothing.
std::string ProxyEventLine(const ProxyEventEntry& event, std::span<const Variant> args) {
  if (!event.log) return "";
  const std::vector<std::string> params = ProxyEventParams(event);
  auto arg = [&](std::string_view name) -> const Variant& {
    for (size_t i = 0; i < params.size() && i < args.size(); ++i)
      if (params[i] == name) return args[i];
    static const Variant kNone = Variant::Missing();
    return kNone;
  };
  std::string_view name(event.name);
  if (name == "DoCmdExecute" && CBool(arg("Posted"))) name = "CmdPost";
  if (name.starts_with("Do")) name.remove_prefix(2);
  const std::string_view log(event.log);
  const size_t arrow = log.find("->");
  std::string line = std::string(name) + "(";
  bool first = true;
  for (const std::string& part : Split(log.substr(0, arrow), ",")) {
    const bool optional = part.starts_with("[");
    const Variant& v = arg(optional ? std::string_view(part).substr(1, part.size() - 2) : std::string_view(part));
    if (part.empty() || (optional && IsBlank(v))) continue;
    line += (first ? "" : ",") + ArgText(v);
    first = false;
  }
  line += ")";
  if (arrow == std::string_view::npos) return line;
  const Variant& answer = arg(log.substr(arrow + 2));
  return answer.IsObject() && answer.AsObject() ? line : line + "->" + ArgText(answer);
}

void ProxyEventTranscript::OnEvent(int32_t dispid, const std::string&, std::span<Variant> args) {
  const ProxyEventEntry* event = FindProxyEvent(dispid);
  if (!event || !event->log) return;
  record_(ProxyEventLine(*event, args));
}

}  // namespace xal::host
