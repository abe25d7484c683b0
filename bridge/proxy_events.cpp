// The proxy's event list as data.
#include "bridge/proxy_events.h"

#include "runtime/text.h"

namespace xal {

const ProxyEventEntry* FindProxyEvent(int32_t dispid) {
  for (const ProxyEventEntry& e : kProxyEvents)
    if (e.dispid == dispid) return &e;
  return nullptr;
}

std::vector<std::string> ProxyEventParams(const ProxyEventEntry& event) {
  const std::string_view list(event.params);
  std::vector<std::string> names;
  for (const std::string& n : Split(list.substr(1, list.size() - 2), ","))
    if (!Trim(n).empty()) names.push_back(Trim(n));
  return names;
}

}  // namespace xal
