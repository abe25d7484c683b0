// CmdStat: what a document script's command handler receives. It passes status messages and
// command requests on to the document proxy it is given, and swallows every error of doing so
// (a missing Doc included): a command handler must never fail because of its status object.
#pragma once

#include <string>

#include "bridge/proxy.h"

namespace xal {

class CmdStat : public Object {
 public:
  Ref<XALSBEproxy> Doc() const { return doc_; }
  void SetDoc(const Ref<XALSBEproxy>& doc) { doc_ = doc; }
  // MsgType is accepted and not used.
  void Message(const std::string& Msg, int32_t MsgType);
  void Execute(const std::string& Cmd, const Variant& Param);
  void Post(const std::string& Cmd);

 private:
  Ref<XALSBEproxy> doc_;
};

}  // namespace xal
