// The transcript of a document proxy's events: one line per event the event list logs, such as
// `MsgBox("Save?",4)->6`, `StatusMsg("")` or `GetObject("Nope")->Nothing`. Connected after the
// sink that answers, so the lines show the answers given.
#pragma once

#include <functional>
#include <span>
#include <string>

#include "bridge/proxy_events.h"
#include "runtime/events.h"

namespace xal::host {

// The line of one event with its arguments (in parameter order, answers filled in); "" when
// the event is not logged.
std::string ProxyEventLine(const ProxyEventEntry& event, std::span<const Variant> args);

class ProxyEventTranscript : public GenericSink {
 public:
  explicit ProxyEventTranscript(std::function<void(std::string)> record) : record_(std::move(record)) {}
  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override;

 private:
  std::function<void(std::string)> record_;
};

}  // namespace xal::host
