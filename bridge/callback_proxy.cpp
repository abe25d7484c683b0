// XALCBProxy: each callback raises the event of the same name and returns its answer.
#include "bridge/callback_proxy.h"

namespace xal {

Variant XALCBProxy::CallBack(int32_t callerID, const std::string& sCommand, const std::string& sMessage,
                             const Variant& vParam) {
  Variant result;
  events_.Raise(&XALCBProxyEvents::CallBack, callerID, sCommand, sMessage, vParam, result);
  return result;
}

bool XALCBProxy::Notify(int32_t callerID, int32_t eNotify, const std::string& sMessage, const Variant& vParam) {
  bool result = false;
  events_.Raise(&XALCBProxyEvents::Notify, callerID, eNotify, sMessage, vParam, result);
  return result;
}

int32_t XALCBProxy::MsgBox(int32_t callerID, const std::string& Prompt, int32_t Buttons, const std::string& Title,
                           const std::string& Helpfile, int32_t Context) {
  int32_t result = 0;
  events_.Raise(&XALCBProxyEvents::MsgBox, callerID, Prompt, Buttons, Title, Helpfile, Context, result);
  return result;
}

bool XALCBProxy::InputBox(int32_t callerID, Ref<ParamList>& Params, int32_t Buttons, const std::string& Title) {
  bool result = false;
  events_.Raise(&XALCBProxyEvents::InputBox, callerID, Params, Buttons, Title, result);
  return result;
}

}  // namespace xal
