//===- tools/PipeUtil.h - A pipe that collects what a child writes --------===//
//
// `TPipe` is one anonymous pipe with a read buffer and a memory stream that
// gathers everything read. A child process writes into the write end; the
// parent drains the read end without ever blocking (`PartialRead`) and at the
// end turns what it gathered into lines (`GetList`).
//
// Example:
//   TObjectGuard<TPipe> Out(new TPipe);
//   ... start a child whose standard output is Out->WriteHandle() ...
//   Out->PartialRead();              // takes whatever is there, returns at once
//   Out->GetList(Output);            // the lines gathered so far replace Output's
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Lists.h"
#include "platform/Streams.h"

#include <memory>

namespace formkit {

/// The text of the exception `TPipe`'s constructor raises.
FK_RESOURCESTRING(SUnableToCreatePipe, "Unable to create inheritable pipe");

/// The size of a pipe's buffer in the system, and the most one read takes.
inline constexpr int PipeBufferSize = 32768;

/// One anonymous pipe and what was read from it. Both ends are closed on `exec`, so a
/// child gets only the end it is handed explicitly. The read end never blocks.
class FK_API TPipe : public TObject {
  FK_CLASS(TPipe, TObject)

  /// Makes the pipe. Raises `Exception` "Unable to create inheritable pipe" when the
  /// system refuses; nothing is left open then.
  TPipe();

  /// Reads whatever can be read without waiting, in pieces of at most `PipeBufferSize`
  /// bytes, and appends it to the stream. Allocates the buffer and the stream on first use.
  void PartialRead();
  /// `PartialRead`, then replaces `AList`'s lines (when it is not null) by the text of the
  /// bytes gathered, taken as UTF-8. Frees the stream and the buffer: the next read starts
  /// a new batch.
  void GetList(TStrings* AList);

  /// The end the parent reads; -1 once closed.
  int ReadHandle() const noexcept { return fRead; }
  /// The end a child writes.
  int WriteHandle() const noexcept { return fWrite; }

  void BeforeDestruction() override;

private:
  void CloseEnds() noexcept;
  /// The read buffer: allocated at the first read, released by `GetList`.
  std::unique_ptr<std::uint8_t[]> Buffer;
  /// All bytes read and not yet handed over.
  TObjectGuard<TMemoryStream> Stream;
  int fRead = -1;
  int fWrite = -1;
};

} // namespace formkit
