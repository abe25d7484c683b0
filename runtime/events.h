// Events. An event interface is a C++ class with one virtual function per event, in dispatch-id
// order, whose default body does nothing: a sink overrides what it answers, and an event nobody
// answers leaves its by-reference arguments at their start values. A source raises each event to
// every connected sink in turn, synchronously; a later sink sees what an earlier one answered.
// Script hosts connect a GenericSink, which receives (dispid, name, args) and answers by writing
// into args.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "runtime/binding.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

class GenericSink : public Object {
 public:
  // `args` are in the event's parameter order; writing into a by-ref position answers the event.
  virtual void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) = 0;
};

// The connected sinks of one event interface. The source owns its sinks; Disconnect/Clear drop them.
template <class Sink>
class EventSource {
 public:
  uint32_t Connect(std::shared_ptr<Sink> sink) {
    sinks_.push_back({nextCookie_, std::move(sink)});
    return nextCookie_++;
  }
  void Disconnect(uint32_t cookie) {
    std::erase_if(sinks_, [&](const Entry& e) { return e.cookie == cookie; });
  }
  void Clear() { sinks_.clear(); }
  size_t Count() const { return sinks_.size(); }

  // Calls `fn` on every sink. The list is copied first, so a handler may connect or disconnect
  // sinks (or drop the source's last reference to a sink) without disturbing this raise.
  template <class... P, class... A>
  void Raise(void (Sink::*fn)(P...), A&&... args) {
    if (sinks_.empty()) return;
    auto snapshot = sinks_;
    for (auto& e : snapshot) ((*e.sink).*fn)(args...);
  }

 private:
  struct Entry {
    uint32_t cookie;
    std::shared_ptr<Sink> sink;
  };
  std::vector<Entry> sinks_;
  uint32_t nextCookie_ = 1;
};

namespace internal {
template <class T>
void WriteBackEventArg(T& target, const Variant& v) {
  if constexpr (!std::is_const_v<T>) target = ArgConv<std::remove_cv_t<T>>::From(v);
}
}  // namespace internal

// Used by an interface's generic adapter: packs the event's arguments into Variants, hands them to
// the generic sink, and copies the answers back into the by-ref (non-const reference) arguments.
template <class... A>
void ForwardEvent(GenericSink& sink, int32_t dispid, const char* name, A&... args) {
  std::array<Variant, sizeof...(A)> packed{ArgConv<std::remove_cv_t<A>>::To(args)...};
  sink.OnEvent(dispid, name, packed);
  size_t i = 0;
  (internal::WriteBackEventArg(args, packed[i++]), ...);
}

// Describes an event interface for the type library from the sink class's member pointers.
template <class Sink>
class EventBuilder {
 public:
  explicit EventBuilder(std::string name) : info_(TypeRegistry::Instance().AddEventInterface(std::move(name))) {}
  template <auto M>
  EventBuilder& Event(std::string name, int32_t dispid, std::vector<Param> params = {}) {
    EventMemberInfo e;
    e.name = std::move(name);
    e.dispid = dispid;
    e.params = Describe(M);
    if (params.size() != e.params.size())
      throw std::logic_error("event table of " + info_.name + "." + e.name + ": parameter count differs");
    for (size_t i = 0; i < params.size(); ++i) e.params[i].name = params[i].name;
    info_.members.push_back(std::move(e));
    return *this;
  }
  const EventInterfaceInfo& info() const { return info_; }

 private:
  template <class... P>
  static std::vector<ParamInfo> Describe(void (Sink::*)(P...)) {
    return {DescribeParam<P>()...};
  }
  EventInterfaceInfo& info_;
};

// Wires a source class's event interface into its member table, so a generic sink can be
// connected to any of its objects by name. `Adapter` implements Sink over a GenericSink;
// `Source::Events()` returns the class's EventSource<Sink>.
template <class Source, class Sink, class Adapter>
void RegisterEventSource(ClassInfo& cls, const EventInterfaceInfo& events) {
  cls.SetEvents(
      &events,
      [](Object& src, std::shared_ptr<GenericSink> g) -> uint32_t {
        return static_cast<Source&>(src).Events().Connect(std::make_shared<Adapter>(std::move(g)));
      },
      [](Object& src, uint32_t cookie) { static_cast<Source&>(src).Events().Disconnect(cookie); });
}

}  // namespace xal
