// XALCBProxy: the host's callback interface turned into events. A server-side routine that needs
// to ask the user something calls IXALCallback on this object; whoever listens to its events
// ("__XALCBProxy") answers through the last, by-reference parameter. With nobody listening the
// calls return their start values: Empty, False, 0, False.
#pragma once

#include "bridge/host_model.h"
#include "runtime/events.h"

namespace xal {

// Events in interface order: CallBack (1), InputBox (2), MsgBox (3), Notify (4).
class XALCBProxyEvents {
 public:
  virtual ~XALCBProxyEvents() = default;
  virtual void CallBack(int32_t callerID, const std::string& sCommand, const std::string& sMessage,
                        const Variant& vParam, Variant& Result) {}
  virtual void InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title,
                        bool& Result) {}
  virtual void MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
                      const std::string& Helpfile, int32_t Context, int32_t& Result) {}
  virtual void Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam,
                      bool& Result) {}
};

class XALCBProxy : public IXALCallback {
 public:
  Variant CallBack(int32_t callerID, const std::string& sCommand, const std::string& sMessage,
                   const Variant& vParam) override;
  bool Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam) override;
  int32_t MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
                 const std::string& Helpfile, int32_t Context) override;
  bool InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title) override;

  EventSource<XALCBProxyEvents>& Events() { return events_; }

 private:
  EventSource<XALCBProxyEvents> events_;
};

}  // namespace xal
