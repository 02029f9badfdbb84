//===- host/FormRender.cpp - Pictures of a form: PNG and SVG --------------===//
#include "host/FormRender.h"

#include "host/FormPainter.h"
#include "platform/ScopeGuard.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fcntl.h>
#include <unistd.h>
#include <utility>

namespace formkit {

namespace {

bool EndsWithNoCase(const String& Text, std::string_view Suffix) {
  return Text.size() >= Suffix.size() && CompareText(Text.substr(Text.size() - Suffix.size()), Suffix) == 0;
}

[[noreturn]] void RaiseCannotWrite(const String& FileName, int Error) {
  throw ERenderError(sRenderCannotWrite, FileName, String(std::strerror(Error)));
}

/// Writes `Bytes` to a new file beside `FileName` and moves it over `FileName`; on any
/// failure the new file goes and `FileName` stays as it was.
void ReplaceFile(const String& FileName, const String& Bytes) {
  String Temp;
  int Fd = -1;
  for (int Attempt = 0; Fd < 0; ++Attempt) {
    Temp = FileName + "." + std::to_string(::getpid()) + "-" + std::to_string(Attempt) + ".part";
    Fd = ::open(Temp.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, 0666);
    if (Fd < 0 && (errno != EEXIST || Attempt >= 100)) RaiseCannotWrite(FileName, errno);
  }
  auto Remove = OnFailure([&]() noexcept { ::unlink(Temp.c_str()); });
  auto Close = Finally([&]() noexcept {
    if (Fd >= 0) ::close(Fd);
  });
  for (std::size_t Done = 0; Done < Bytes.size();) {
    ssize_t N = ::write(Fd, Bytes.data() + Done, Bytes.size() - Done);
    if (N < 0 && errno == EINTR) continue;
    if (N < 0) RaiseCannotWrite(FileName, errno);
    Done += static_cast<std::size_t>(N);
  }
  int Result = ::close(std::exchange(Fd, -1));
  if (Result != 0) RaiseCannotWrite(FileName, errno);
  if (std::rename(Temp.c_str(), FileName.c_str()) != 0) RaiseCannotWrite(FileName, errno);
}

/// Draws `Root` onto a new canvas of type `TCanvas` and gives what the canvas made.
template <class TCanvas> String Render(TComponent* Root, const std::vector<TComponent*>& Selection) {
  detail::CheckSelection(Root, Selection);
  TPoint Size = RenderSize(Root);
  TCanvas Canvas(Size.X, Size.Y);
  detail::PaintForm(Canvas, Root, Selection, Size);
  return Canvas.Finish();
}

} // namespace

TRenderFormat RenderFormatOf(const String& FileName) {
  if (EndsWithNoCase(FileName, ".png")) return rfPng;
  if (EndsWithNoCase(FileName, ".svg")) return rfSvg;
  throw ERenderError(sRenderUnknownFormat, FileName);
}

String RenderFormToPng(TComponent* Root, const std::vector<TComponent*>& Selection) {
  return Render<detail::TCairoCanvas>(Root, Selection);
}

String RenderFormToSvg(TComponent* Root, const std::vector<TComponent*>& Selection) {
  return Render<detail::TSvgCanvas>(Root, Selection);
}

void RenderFormToFile(TComponent* Root, const std::vector<TComponent*>& Selection, const String& FileName) {
  TRenderFormat Format = RenderFormatOf(FileName);
  ReplaceFile(FileName, Format == rfPng ? RenderFormToPng(Root, Selection) : RenderFormToSvg(Root, Selection));
}

} // namespace formkit
