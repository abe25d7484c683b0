// Type-library entries of the runtime's own classes: Collection and the binding probe.
#include "runtime/collection.h"
#include "runtime/events.h"
#include "typelib/probe.h"

namespace xal {
namespace {

// Lets a script host's generic sink receive XALProbe's events.
class ProbeEventsAdapter : public ProbeEvents {
 public:
  explicit ProbeEventsAdapter(std::shared_ptr<GenericSink> sink) : sink_(std::move(sink)) {}
  void Computed(const Variant& Result, bool& Cancel) override { ForwardEvent(*sink_, 1, "Computed", Result, Cancel); }
  void Question(const std::string& Prompt, Variant& Answer) override {
    ForwardEvent(*sink_, 2, "Question", Prompt, Answer);
  }

 private:
  std::shared_ptr<GenericSink> sink_;
};

void RegisterCollection() {
  ClassBuilder<Collection>("Collection").Creatable()
      .Method<&Collection::Add>("Add", {Param("Item"), Opt("Key"), Opt("Before"), Opt("After")})
      .Get<&Collection::Count>("Count")
      .Method<&Collection::Item>("Item", {Param("Index")}).Default()
      .Method<&Collection::Remove>("Remove", {Param("Index")})
      .Method<&Collection::NewEnum>("NewEnum").Hidden();
}

void RegisterProbe() {
  auto& events = EventBuilder<ProbeEvents>("__XALProbe")
                     .Event<&ProbeEvents::Computed>("Computed", 1, {Param("Result"), Param("Cancel")})
                     .Event<&ProbeEvents::Question>("Question", 2, {Param("Prompt"), Param("Answer")})
                     .info();
  ClassBuilder<XALProbe> b("XALProbe");
  b.Creatable()
      .Method<&XALProbe::Add>("Add", {Param("a"), Def("b", 1)})
      .Get<&XALProbe::Name>("Name").Default()
      .Put<&XALProbe::SetName>("Name", {Param("Value")})
      .Method<&XALProbe::Append>("Append", {Param("Text"), Def("Suffix", "!")})
      .Method<&XALProbe::Describe>("Describe", {Opt("Value")})
      .Method<&XALProbe::Typed>("Typed", {Opt("i"), Opt("l"), Opt("d"), Opt("c"), Opt("dt"), Opt("b"), Opt("s")})
      .Method<&XALProbe::Fail>("Fail", {Param("Number"), Opt("Description")})
      .Method<&XALProbe::Ask>("Ask", {Param("Prompt")})
      .Get<&XALProbe::Child>("Child")
      .Method<&XALProbe::SameAs>("SameAs", {Param("Other")});
  RegisterEventSource<XALProbe, ProbeEvents, ProbeEventsAdapter>(b.info(), events);
}

const bool kRegistered = (RegisterCollection(), RegisterProbe(), true);

}  // namespace
}  // namespace xal
