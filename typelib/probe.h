// XALProbe: a small creatable class that exercises every path of the late-bound machinery — typed
// and Variant parameters, optional ones with and without defaults, by-reference results, a
// default member, object results and events with by-reference answers. Hosts and tests use it to
// check a binding before talking to the business classes.
#pragma once

#include <string>

#include "runtime/events.h"
#include "runtime/object.h"
#include "runtime/variant.h"

namespace xal {

// Events of XALProbe (interface "__XALProbe").
class ProbeEvents {
 public:
  virtual ~ProbeEvents() = default;
  // Raised by Add before it returns; setting Cancel makes Add return 0.
  virtual void Computed(const Variant& Result, bool& Cancel) {}
  // Raised by Ask; the answer (start value: Empty) is Ask's result.
  virtual void Question(const std::string& Prompt, Variant& Answer) {}
};

class XALProbe : public Object {
 public:
  int32_t Add(int32_t a, int32_t b);
  std::string Name() const { return name_; }
  void SetName(const std::string& name) { name_ = name; }
  // By-ref: appends `suffix` to `text` and returns the new length.
  int32_t Append(std::string& text, const std::string& suffix);
  // "TypeName:value" of whatever arrives, so a caller sees how an argument was converted.
  std::string Describe(const Variant& value);
  // One typed parameter of each kind, all optional without defaults: shows the zero values.
  std::string Typed(int16_t i, int32_t l, double d, Currency c, Date dt, bool b, const std::string& s);
  // Raises run-time error `number` (with `description` when given).
  void Fail(int32_t number, const std::string& description);
  Variant Ask(const std::string& prompt);
  // Object results and arguments.
  Ref<XALProbe> Child();
  bool SameAs(const Ref<XALProbe>& other);

  EventSource<ProbeEvents>& Events() { return events_; }

 private:
  std::string name_;
  Ref<XALProbe> child_;
  EventSource<ProbeEvents> events_;
};

}  // namespace xal
