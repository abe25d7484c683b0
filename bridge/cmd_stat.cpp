// CmdStat: forwarding to the document proxy with every error swallowed.
#include "bridge/cmd_stat.h"

namespace xal {

namespace {
template <class F>
void Swallow(F&& f) {
  try {
    f();
  } catch (const VbError&) {
  }
}
}  // namespace

void CmdStat::Message(const std::string& Msg, int32_t) {
  Swallow([&] {
    if (doc_) doc_->StatusMsg(Msg);
  });
}

void CmdStat::Execute(const std::string& Cmd, const Variant& Param) {
  Swallow([&] {
    if (doc_) doc_->CmdExecute(Cmd, Param);
  });
}

void CmdStat::Post(const std::string& Cmd) {
  Swallow([&] {
    if (doc_) doc_->CmdPost(Cmd);
  });
}

}  // namespace xal
