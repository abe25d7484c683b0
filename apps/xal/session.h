// `xal session`: JSON lines in, one JSON answer line per request. The session keeps the objects it
// created or received under numeric handles until they are released.
//   {"id":1,"new":"XALProbe"}                          -> {"id":1,"result":{"object":1}}
//   {"id":2,"call":1,"member":"Add","args":[2,3],"kind":"method"}
//        -> {"id":2,"result":{"type":"Long","value":5},"byref":{}}
//   {"id":3,"release":1}                               -> {"id":3,"result":{"type":"Empty"}}
//   {"id":4,"advise":1,"answers":{"Question":{"1":"yes"}}}
//        connects a sink to the object's events; each event raised while a later request runs is
//        answered from "answers" (event name -> argument position -> value) and reported in that
//        request's answer as "events":[{"source":1,"name":"Question","dispid":2,"args":[…]}].
//        The result is the connection's cookie; {"id":5,"unadvise":1,"cookie":C} disconnects.
//   {"id":6,"open":"demo.db","kind":1}                 -> a connection of the reference host (kind 1
//        the file database, 2 the server dialect; "user" sets the user id, 1 by default)
//   {"id":7,"document":"SDInvoice","connection":H,"docid":0}
//        -> a document session: a new document (docid 0) or a stored one, with its proxy, header
//        and rows; its events are answered by the session's policy and recorded in its transcript.
//   Failures: {"id":…,"error":{"number":438,"description":"…"}}.
#pragma once

#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "apps/xal/json_values.h"
#include "runtime/object.h"

namespace xal::app {

class Session {
 public:
  Session();
  ~Session();
  // One request line in, one answer line out (no trailing newline).
  std::string Handle(std::string_view line);
  size_t LiveHandles() const { return objects_.size(); }

 private:
  Json Dispatch(const Json& req);
  Json HandleOf(const ObjectRef& obj);
  ObjectRef ObjectOf(const Json& handle) const;
  Json Call(const Json& req);
  Json Advise(const Json& req);
  Json Unadvise(const Json& req);

  struct Sink;
  HandleMap handles_;
  std::map<int64_t, ObjectRef> objects_;
  std::unordered_map<const Object*, int64_t> handleByObject_;
  int64_t nextHandle_ = 1;
  Json pendingEvents_ = Json::array();
  std::vector<std::pair<int64_t, uint32_t>> connections_;  // (handle, cookie) for cleanup
};

// Runs a session over stdin/stdout until end of input; returns the process exit code.
int RunSession();

}  // namespace xal::app
