//===- host/StudioServer.cpp - The studio over HTTP ------------------------===//
//
// Puts `TStudio` behind cpp-httplib on the loopback interface. One worker thread
// serves every request in turn, because the engine is driven from one thread at a
// time; the command stops the server on SIGINT and SIGTERM and closes the
// session before it ends.
//
//===----------------------------------------------------------------------===//
#include "host/Studio.h"

#include "host/DesignHost.h"
#include "platform/FormatSettings.h"
#include "platform/ScopeGuard.h"

#include <atomic>
#include <csignal>
#include <httplib.h>
#include <mutex>
#include <ostream>

namespace formkit {

namespace {

/// The server `ServeStudio` runs now; null between runs.
std::atomic<httplib::Server*> GRunning{nullptr};

TStudioRequest RequestOf(const httplib::Request& In) {
  // A HEAD asks what a GET would answer; the server leaves out the body.
  TStudioRequest Request{In.method == "HEAD" ? String("GET") : In.method, In.path, In.body, {}};
  for (const auto& [Key, Value] : In.params) Request.Query.emplace(Key, Value);
  return Request;
}

void Answer(httplib::Response& Out, const TStudioReply& Reply) {
  Out.status = Reply.Status;
  Out.set_content(Reply.Body, Reply.ContentType.c_str());
  // The page is served to this machine only, and never from a cache of an older engine.
  Out.set_header("Cache-Control", "no-store");
}

void StopOnSignal(int) { StopStudio(); }

} // namespace

void ServeStudio(TStudio& Studio, int Port, const std::function<void(int Port)>& Listening) {
  httplib::Server Server;
  Server.new_task_queue = [] { return new httplib::ThreadPool(1); };
  std::mutex OneAtATime;
  auto Handler = [&](const httplib::Request& In, httplib::Response& Out) {
    std::lock_guard<std::mutex> Lock(OneAtATime);
    Answer(Out, Studio.Handle(RequestOf(In)));
  };
  Server.Get(".*", Handler);
  Server.Post(".*", Handler);
  int Bound = Port == 0 ? Server.bind_to_any_port("127.0.0.1") : (Server.bind_to_port("127.0.0.1", Port) ? Port : -1);
  if (Bound < 0) throw EHostError(sStudioCannotListen, Port);
  GRunning.store(&Server);
  auto Forget = Finally([]() noexcept { GRunning.store(nullptr); });
  if (Listening) Listening(Bound);
  Server.listen_after_bind();
}

void StopStudio() noexcept {
  if (httplib::Server* Server = GRunning.load()) Server->stop();
}

void RunStudioCommand(const std::vector<String>& Args, std::ostream& Out) {
  String Dir = ".";
  int Port = 8080;
  bool DirGiven = false;
  for (std::size_t I = 0; I < Args.size(); ++I) {
    if (Args[I] == "--port") {
      String Given = I + 1 < Args.size() ? Args[++I] : String();
      if (!TryStrToInt(Given, Port) || Port < 0 || Port > 65535) throw EStudioUsageError(sStudioBadPort, Given);
    } else if (Args[I].rfind("--", 0) == 0 || DirGiven) {
      throw EStudioUsageError(sStudioUnknownOption, Args[I]);
    } else {
      Dir = Args[I];
      DirGiven = true;
    }
  }
  TStudio Studio(Dir);
  auto Before = std::signal(SIGINT, StopOnSignal);
  auto BeforeTerm = std::signal(SIGTERM, StopOnSignal);
  auto Restore = Finally([=]() noexcept {
    std::signal(SIGINT, Before);
    std::signal(SIGTERM, BeforeTerm);
  });
  ServeStudio(Studio, Port, [&](int Bound) {
    Out << "formkit studio: serving " << Studio.Directory().string() << " at http://127.0.0.1:" << Bound << "/"
        << std::endl;
  });
}

} // namespace formkit
