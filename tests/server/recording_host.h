// A connection and server that pass every call on to the reference host and record the SQL the
// component sends: statements run through Execute (with their options) and queries opened through
// the server (with their modes). Tests compare the recorded text with what the operation must
// send, and the SQLite database underneath shows what it did.
#pragma once

#include <string>
#include <vector>

#include "bridge/host_model.h"
#include "host/connection.h"
#include "forwarding_host.h"

namespace xal::server::testing {

struct SqlCall {
  std::string sql;
  int32_t number;  // Execute: the options; OpenQuery: the mode
  bool operator==(const SqlCall&) const = default;
};

inline void PrintTo(const SqlCall& c, std::ostream* os) { *os << "{\"" << c.sql << "\", " << c.number << "}"; }

class RecordingConnection;

class RecordingServer : public ForwardingServer {
 public:
  RecordingServer(Ref<XALServer> inner, RecordingConnection* owner);
  Ref<DataObject> OpenQuery(const std::string& sqlOrTable, int32_t mode, const std::string& filter,
                            const std::string& fields) override;

 private:
  RecordingConnection* recorder_;
};

class RecordingConnection : public ForwardingConnection {
 public:
  explicit RecordingConnection(Ref<host::HostConnection> inner) : ForwardingConnection(std::move(inner)) {}

  std::vector<SqlCall> executed;  // Execute(sql, options)
  std::vector<SqlCall> queried;   // OpenQuery(sql, mode)

  Variant Execute(const std::string& sql, int32_t options) override {
    executed.push_back({sql, options});
    return ForwardingConnection::Execute(sql, options);
  }

 protected:
  Ref<XALServer> MakeServer(Ref<XALServer> inner) override { return MakeRef<RecordingServer>(std::move(inner), this); }
};

inline RecordingServer::RecordingServer(Ref<XALServer> inner, RecordingConnection* owner)
    : ForwardingServer(std::move(inner), owner), recorder_(owner) {}

inline Ref<DataObject> RecordingServer::OpenQuery(const std::string& sqlOrTable, int32_t mode,
                                                  const std::string& filter, const std::string& fields) {
  recorder_->queried.push_back({sqlOrTable, mode});
  return ForwardingServer::OpenQuery(sqlOrTable, mode, filter, fields);
}

}  // namespace xal::server::testing
