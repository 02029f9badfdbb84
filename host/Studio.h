//===- host/Studio.h - A form designer in the browser ----------------------===//
//
// The studio serves the engine to a web page: one design session over the form
// files of a directory, driven by JSON requests that open and make modules, press
// and move the mouse on a module's surface, type keys, arm the palette, set
// properties through their editors, bind events, run the positioning and
// clipboard commands and save. Each answer carries the module's picture (the SVG
// `formkit render` draws), its structure tree and its source, so the page only
// redraws. `TStudio` answers requests without a network, one at a time;
// `ServeStudio` puts it behind an HTTP server on the loopback interface.
// host/studio/API.md lists the routes.
//
// Example:
//   TStudio Studio("examples");
//   TStudioReply Reply = Studio.Handle({"POST", "/api/open", R"({"file": "Form1.kfm"})"});
//   Reply = Studio.Handle({"POST", "/api/modules/Form1/create", R"({"class": "TButton", "x": 16, "y": 16})"});
//   ServeStudio(Studio, 8080, [](int Port) { std::cout << Port << "\n"; });
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/System.h"

#include <filesystem>
#include <functional>
#include <iosfwd>
#include <map>
#include <memory>
#include <vector>

namespace formkit {

FK_RESOURCESTRING(sStudioNotADirectory, "%s is not a directory");
FK_RESOURCESTRING(sStudioBadJson, "The request is not valid JSON: %s");
FK_RESOURCESTRING(sStudioNotAnObject, "The request must be a JSON object");
FK_RESOURCESTRING(sStudioField, "The request needs \"%s\" as %s");
FK_RESOURCESTRING(sStudioOutside, "%s lies outside %s");
FK_RESOURCESTRING(sStudioNotAFormFile, "%s is not a form file (.kfm)");
FK_RESOURCESTRING(sStudioNoFile, "File %s not found");
FK_RESOURCESTRING(sStudioNoRoute, "Not found: %s %s");
FK_RESOURCESTRING(sStudioUnknownCommand, "Unknown command '%s'");
FK_RESOURCESTRING(sStudioUnknownAction, "Unknown mouse action '%s'");
FK_RESOURCESTRING(sStudioCannotListen, "Cannot listen on 127.0.0.1:%d");
FK_RESOURCESTRING(sStudioBadPort, "'%s' is not a port (0 to 65535)");
FK_RESOURCESTRING(sStudioUnknownOption, "Unknown option '%s' of 'formkit studio'. Try 'formkit studio --help'.");

/// A usage error of the command: an unknown option, a missing or bad port.
FK_EXCEPTION(EStudioUsageError, Exception);

/// One request: its method, its path (without the query), its body and its query's
/// parameters.
struct TStudioRequest {
  String Method;
  String Path;
  String Body;
  std::map<String, String> Query;
};

/// One answer: an HTTP status, the content's type and the content.
struct TStudioReply {
  int Status = 200;
  String ContentType = "application/json";
  String Body;
};

namespace detail {
class TStudioSession;
} // namespace detail

/// The studio's request handler. Owns a design session (one at a time in a process):
/// the modules opened through it stay open until it is destroyed.
class FK_API TStudio {
public:
  /// Serves the form files of `Dir`. Raises `EHostError` `sStudioNotADirectory`.
  explicit TStudio(const String& Dir);
  ~TStudio();
  TStudio(const TStudio&) = delete;
  TStudio& operator=(const TStudio&) = delete;

  /// Answers `Request`; never raises. A failing request answers `{"error": message}`
  /// with its status (400, 403, 404 or 422) and leaves the modules and files as they were.
  [[nodiscard]] TStudioReply Handle(const TStudioRequest& Request);
  /// The directory served, absolute and without links.
  [[nodiscard]] const std::filesystem::path& Directory() const noexcept;

private:
  std::unique_ptr<detail::TStudioSession> FSession;
};

/// The page's files: "/" (the page), "/studio.js" and "/studio.css"; null for any other
/// path. The bytes are built into the program.
[[nodiscard]] FK_API const TStudioReply* StudioAsset(const String& Path);

/// Serves `Studio` over HTTP on 127.0.0.1:`Port` (0: a free port the system picks),
/// one request at a time, until `StopStudio` is called. `Listening` is told the port
/// once the server listens. Raises `EHostError` `sStudioCannotListen`.
FK_API void ServeStudio(TStudio& Studio, int Port, const std::function<void(int Port)>& Listening);
/// Ends the `ServeStudio` running now, from any thread or a signal handler's thread.
FK_API void StopStudio() noexcept;

/// `formkit studio [DIR] [--port N]`: serves DIR until the process is interrupted,
/// after printing "formkit studio: serving DIR at http://127.0.0.1:PORT/" on `Out`.
/// Raises `EStudioUsageError` for bad arguments, `EHostError` for a DIR that is no
/// directory or a port that is taken.
FK_API void RunStudioCommand(const std::vector<String>& Args, std::ostream& Out);

/// The command's help.
#define STUDIO_COMMAND_HELP                                                                        \
  "Serves a form designer to the browser, on 127.0.0.1 only: the modules of DIR (the current\n"   \
  "directory when not given) on their surfaces, the palette, the inspector, the structure\n"       \
  "tree and the source, all through this engine. --port N chooses the port (8080 when not\n"      \
  "given; 0 lets the system pick one). The address is printed; the server runs until it is\n"     \
  "interrupted.\n"

} // namespace formkit
