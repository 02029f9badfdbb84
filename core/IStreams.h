//===- core/IStreams.h - Host streams over the library's streams ---------===//
//
// Two adapters between a host's `IStream` and this library's `TStream`, as the
// form editor hands content to add-ins and takes it from them:
// `TIMemoryStream` shows a memory stream as an `IStream`, and `TVirtualStream`
// shows an `IStream` as a `TStream`.
//
// Example:
//   IPtr<IStream> Content = NewAs<IStream, TIMemoryStream>(RootStream);  // not owned
//   TVirtualStream Back(Content);
//   Back.CopyFrom(SomeOther, 0);
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Streams.h"

namespace formkit {

/// A memory stream shown to a host as an `IStream`. Frees the stream only when it owns
/// it; the form editor hands out the root's stream unowned.
class FK_API TIMemoryStream : public TStreamAdapter {
  FK_CLASS(TIMemoryStream, TStreamAdapter)

  explicit TIMemoryStream(TMemoryStream* Stream, TStreamOwnership Ownership = soReference)
      : TStreamAdapter(Stream, Ownership) {}
  TMemoryStream* MemoryStream() const noexcept { return static_cast<TMemoryStream*>(FStream); }
};

/// A host's `IStream` as a `TStream`, held counted; the size is found by seeking.
class FK_API TVirtualStream : public TOleStream {
  FK_CLASS(TVirtualStream, TOleStream)

  explicit TVirtualStream(IPtr<IStream> Stream) : TOleStream(std::move(Stream)) {}
};

} // namespace formkit
