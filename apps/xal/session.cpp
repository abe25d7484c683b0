// The JSON-lines protocol of `xal session`.
#include "apps/xal/session.h"

#include <iostream>

#include "apps/xal/call_args.h"
#include "host/connection.h"
#include "host/document_session.h"
#include "runtime/dispatch.h"
#include "runtime/events.h"
#include "runtime/text.h"

namespace xal::app {

// Records every event of one advised object and answers it from the request's "answers".
struct Session::Sink : GenericSink {
  Session* session;
  int64_t source;
  Json answers;

  void OnEvent(int32_t dispid, const std::string& name, std::span<Variant> args) override {
    for (auto it = answers.begin(); it != answers.end(); ++it) {
      if (!TextEquals(it.key(), name)) continue;
      for (auto a = it->begin(); a != it->end(); ++a) {
        size_t pos = std::stoul(a.key());
        if (pos < args.size()) args[pos] = FromJson(*a, session->handles_);
      }
    }
    Json packed = Json::array();
    for (const auto& v : args) packed.push_back(ToJson(v, session->handles_));
    session->pendingEvents_.push_back({{"source", source}, {"name", name}, {"dispid", dispid}, {"args", packed}});
  }
};

Session::Session() {
  handles_.toHandle = [this](const ObjectRef& o) { return HandleOf(o); };
  handles_.fromHandle = [this](const Json& h) { return ObjectOf(h); };
}

Session::~Session() {
  // Sinks refer back to this session: disconnect them before the objects may outlive it.
  for (auto& [handle, cookie] : connections_) {
    auto it = objects_.find(handle);
    if (it != objects_.end()) ClassOf(*it->second)->DisconnectGeneric(*it->second, cookie);
  }
}

Json Session::HandleOf(const ObjectRef& obj) {
  auto it = handleByObject_.find(obj.get());
  if (it != handleByObject_.end()) return it->second;
  int64_t h = nextHandle_++;
  objects_[h] = obj;
  handleByObject_[obj.get()] = h;
  return h;
}

ObjectRef Session::ObjectOf(const Json& handle) const {
  if (handle.is_null()) return nullptr;
  if (!handle.is_number_integer()) Raise(kErrTypeMismatch, "Type mismatch: an object handle is a number");
  auto it = objects_.find(handle.get<int64_t>());
  if (it == objects_.end()) Raise(kErrObjectNotSet, "Object variable or With block variable not set: no handle " + handle.dump());
  return it->second;
}

Json Session::Call(const Json& req) {
  ObjectRef target = ObjectOf(req.at("call"));
  const MemberKind kind = ParseMemberKind(req.value("kind", "method"));
  std::vector<Variant> args;
  if (req.contains("args"))
    for (const auto& a : req["args"]) args.push_back(FromJson(a, handles_));
  Variant result = req["member"].is_number_integer()
                       ? Invoke(target, req["member"].get<int32_t>(), kind, args)
                       : Invoke(target, req.at("member").get<std::string>(), kind, args);
  // Report by-ref parameters: positions the member table marks as by reference.
  Json byref = Json::object();
  const MemberInfo* m = req["member"].is_number_integer() ? ClassOf(*target)->FindById(req["member"].get<int32_t>(), kind)
                                                          : ClassOf(*target)->Find(req["member"].get<std::string>(), kind);
  if (m)
    for (size_t i = 0; i < args.size() && i < m->params.size(); ++i)
      if (m->params[i].byRef) byref[std::to_string(i)] = ToJson(args[i], handles_);
  return {{"result", ToJson(result, handles_)}, {"byref", byref}};
}

Json Session::Advise(const Json& req) {
  int64_t h = req.at("advise").get<int64_t>();
  ObjectRef target = ObjectOf(h);
  auto sink = std::make_shared<Sink>();
  sink->session = this;
  sink->source = h;
  sink->answers = req.value("answers", Json::object());
  uint32_t cookie = ClassOf(*target)->ConnectGeneric(*target, sink);
  connections_.emplace_back(h, cookie);
  return {{"result", ToJson(Variant(static_cast<int32_t>(cookie)), handles_)}};
}

Json Session::Unadvise(const Json& req) {
  int64_t h = req.at("unadvise").get<int64_t>();
  uint32_t cookie = req.at("cookie").get<uint32_t>();
  ObjectRef target = ObjectOf(h);
  ClassOf(*target)->DisconnectGeneric(*target, cookie);
  std::erase(connections_, std::make_pair(h, cookie));
  return {{"result", ToJson(Variant(), handles_)}};
}

Json Session::Dispatch(const Json& req) {
  if (!req.is_object()) Raise(kErrInvalidCall, "Invalid procedure call or argument: a request is a JSON object");
  if (req.contains("new")) return {{"result", ToJson(Variant(CreateObject(req["new"].get<std::string>())), handles_)}};
  if (req.contains("call")) return Call(req);
  if (req.contains("open")) {
    // A database of the reference host: kind 1 the file database, 2 the server dialect.
    auto conn = host::HostConnection::Open(req["open"].get<std::string>(), req.value("kind", 1), req.value("user", 1));
    return {{"result", ToJson(Variant(ObjectRef(conn)), handles_)}};
  }
  if (req.contains("document")) {
    auto conn = std::dynamic_pointer_cast<host::HostConnection>(ObjectOf(req.at("connection")));
    if (!conn) Raise(kErrTypeMismatch, "Type mismatch: \"connection\" must be a connection handle");
    auto doc = host::DocumentSession::Open(conn, req["document"].get<std::string>(), req.value("docid", 0));
    return {{"result", ToJson(Variant(ObjectRef(doc)), handles_)}};
  }
  if (req.contains("advise")) return Advise(req);
  if (req.contains("unadvise")) return Unadvise(req);
  if (req.contains("release")) {
    ObjectRef obj = ObjectOf(req["release"]);
    int64_t h = req["release"].get<int64_t>();
    std::erase_if(connections_, [&](const auto& c) {
      if (c.first != h) return false;
      ClassOf(*obj)->DisconnectGeneric(*obj, c.second);
      return true;
    });
    handleByObject_.erase(obj.get());
    objects_.erase(h);
    return {{"result", ToJson(Variant(), handles_)}};
  }
  Raise(kErrInvalidCall, "Invalid procedure call or argument: unknown request");
}

std::string Session::Handle(std::string_view line) {
  Json answer = Json::object();
  Json id;
  pendingEvents_ = Json::array();
  try {
    Json req = Json::parse(line);
    if (req.is_object() && req.contains("id")) id = req["id"];
    answer = Dispatch(req);
  } catch (const VbError& e) {
    answer = {{"error", {{"number", e.number()}, {"description", e.description()}}}};
  } catch (const Json::exception& e) {
    answer = {{"error", {{"number", int(kErrInvalidCall)}, {"description", std::string("Invalid request: ") + e.what()}}}};
  } catch (const std::exception& e) {
    answer = {{"error", {{"number", int(kErrInternal)}, {"description", std::string("Internal error: ") + e.what()}}}};
  }
  Json out = {{"id", id}};
  for (auto it = answer.begin(); it != answer.end(); ++it) out[it.key()] = it.value();
  if (!pendingEvents_.empty()) out["events"] = pendingEvents_;
  return out.dump(-1, ' ', false, Json::error_handler_t::replace);
}

int RunSession() {
  Session session;
  std::string line;
  while (std::getline(std::cin, line)) {
    if (line.empty() || line == "\r") continue;
    std::cout << session.Handle(line) << '\n' << std::flush;
  }
  return 0;
}

}  // namespace xal::app
