// CmdStat: forwarding to the document proxy with every error swallowed, a missing Doc (error 91)
// included.
#include "bridge/cmd_stat.h"

#include "runtime/trap.h"

namespace xal {

void CmdStat::Message(const std::string& Msg, int32_t) {
  TryStep([&] {
    Require(doc_).StatusMsg(Msg);
  });
}

void CmdStat::Execute(const std::string& Cmd, const Variant& Param) {
  TryStep([&] {
    Require(doc_).CmdExecute(Cmd, Param);
  });
}

void CmdStat::Post(const std::string& Cmd) {
  TryStep([&] {
    Require(doc_).CmdPost(Cmd);
  });
}

}  // namespace xal
