//===- tools/PipeUtil.cpp - A pipe that collects what a child writes ------===//
#include "tools/PipeUtil.h"

#include "platform/TypInfoBuilder.h"

#include <cerrno>

#include <fcntl.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace formkit {

FK_IMPLEMENT(TPipe, "PipeUtil") {}

TPipe::TPipe() {
  int Ends[2];
  if (::pipe2(Ends, O_CLOEXEC) != 0) throw Exception(SUnableToCreatePipe);
  fRead = Ends[0];
  fWrite = Ends[1];
  // The parent only ever asks what is there; a read must not wait for more.
  if (::fcntl(fRead, F_SETFL, O_NONBLOCK) != 0) {
    CloseEnds();
    throw Exception(SUnableToCreatePipe);
  }
  // Best effort: the system may keep its own size, which changes only the pace of reads.
  (void)::fcntl(fWrite, F_SETPIPE_SZ, PipeBufferSize);
}

void TPipe::PartialRead() {
  if (!Buffer) Buffer = std::make_unique<std::uint8_t[]>(PipeBufferSize);
  if (!Stream) Stream.Reset(new TMemoryStream);
  for (;;) {
    int Available = 0;
    if (fRead < 0 || ::ioctl(fRead, FIONREAD, &Available) != 0 || Available <= 0) return;
    ssize_t Got = ::read(fRead, Buffer.get(), std::min(Available, PipeBufferSize));
    if (Got <= 0) return;
    Stream->WriteBuffer(Buffer.get(), Got);
  }
}

void TPipe::GetList(TStrings* AList) {
  PartialRead();
  Stream->SetPosition(0);
  if (AList) {
    const auto* Bytes = reinterpret_cast<const char*>(Stream->Memory());
    AList->SetText(std::string_view(Bytes, static_cast<std::size_t>(Stream->Size())));
  }
  Stream.Reset();
  Buffer.reset();
}

void TPipe::CloseEnds() noexcept {
  for (int* End : {&fRead, &fWrite})
    if (*End >= 0) ::close(std::exchange(*End, -1));
}

void TPipe::BeforeDestruction() {
  CloseEnds();
  inherited::BeforeDestruction();
}

} // namespace formkit
