//===- platform/Streams.cpp - Byte streams, adapters, resource header ----===//
#include "platform/Streams.h"

#include "platform/Classes.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <unistd.h>

namespace formkit {

namespace {
FK_RESOURCESTRING(SReadError, "Stream read error");
FK_RESOURCESTRING(SWriteError, "Stream write error");
FK_RESOURCESTRING(SInvalidImage, "Invalid stream format");
FK_RESOURCESTRING(SSetSizeError, "Stream size cannot be changed");
FK_RESOURCESTRING(SFCreateError, "Cannot create file \"%s\". %s");
FK_RESOURCESTRING(SFOpenError, "Cannot open file \"%s\". %s");
FK_RESOURCESTRING(SInvalidCount, "Invalid stream count %d");
FK_RESOURCESTRING(SResNameTooLong, "Resource name too long: %s");
} // namespace

//===----------------------------------------------------------------------===//
// TStream
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStream, "Classes") {}

void TStream::SetSize64(std::int64_t) { throw EStreamError(SSetSizeError); }

std::int64_t TStream::Size() {
  std::int64_t Pos = Seek(0, soCurrent);
  std::int64_t End = Seek(0, soEnd);
  Seek(Pos, soBeginning);
  return End;
}

void TStream::ReadBuffer(void* Buffer, std::int64_t Count) {
  if (Count < 0 || (Count != 0 && Read(Buffer, Count) != Count)) throw EReadError(SReadError);
}

void TStream::WriteBuffer(const void* Buffer, std::int64_t Count) {
  if (Count < 0 || (Count != 0 && Write(Buffer, Count) != Count)) throw EWriteError(SWriteError);
}

std::int64_t TStream::CopyFrom(TStream* Source, std::int64_t Count, std::int64_t BufferSize) {
  if (Count < 0) throw EStreamError(SInvalidCount, static_cast<long long>(Count));
  if (Count == 0) {
    Source->SetPosition(0);
    Count = Source->Size();
  }
  if (BufferSize <= 0) BufferSize = DefaultCopyBufferSize;
  std::vector<std::uint8_t> Buffer(static_cast<std::size_t>(std::min(Count, BufferSize)));
  std::int64_t Left = Count;
  while (Left > 0) {
    std::int64_t N = std::min(Left, BufferSize);
    Source->ReadBuffer(Buffer.data(), N);
    WriteBuffer(Buffer.data(), N);
    Left -= N;
  }
  return Count;
}

void TStream::WriteResourceHeader(const String& ResName, std::int64_t& FixupInfo) {
  if (ResName.size() > 255) throw EWriteError(SResNameTooLong, ResName);
  std::uint8_t Head[5] = {ResourceHeaderMagic[0], ResourceHeaderMagic[1], ResourceHeaderMagic[2],
                          ResourceHeaderMagic[3], static_cast<std::uint8_t>(ResName.size())};
  WriteBuffer(Head, sizeof Head);
  WriteBuffer(ResName.data(), static_cast<std::int64_t>(ResName.size()));
  FixupInfo = Position();
  const std::uint8_t Size[4] = {0, 0, 0, 0};
  WriteBuffer(Size, sizeof Size);
}

void TStream::FixupResourceHeader(std::int64_t FixupInfo) {
  std::int64_t End = Position();
  std::uint64_t DataSize = static_cast<std::uint64_t>(std::max<std::int64_t>(0, End - FixupInfo - 4));
  std::uint8_t Size[4];
  for (int I = 0; I < 4; ++I) Size[I] = static_cast<std::uint8_t>(DataSize >> (8 * I));
  SetPosition(FixupInfo);
  WriteBuffer(Size, sizeof Size);
  SetPosition(End);
}

String TStream::ReadResHeader() {
  std::uint8_t Head[5];
  if (Read(Head, sizeof Head) != sizeof Head || std::memcmp(Head, ResourceHeaderMagic, 4) != 0)
    throw EReadError(SInvalidImage);
  String Name(Head[4], '\0');
  if (!Name.empty() && Read(Name.data(), Head[4]) != Head[4]) throw EReadError(SInvalidImage);
  std::uint8_t Size[4];
  if (Read(Size, sizeof Size) != sizeof Size) throw EReadError(SInvalidImage);
  return Name;
}

//===----------------------------------------------------------------------===//
// Memory streams
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TMemoryStream, "Classes") {}
FK_IMPLEMENT(TBytesStream, "Classes") {}

std::int64_t TMemoryStream::Read(void* Buffer, std::int64_t Count) {
  std::int64_t Avail = static_cast<std::int64_t>(FData.size()) - FPosition;
  if (Count <= 0 || Avail <= 0) return 0;
  std::int64_t N = std::min(Count, Avail);
  std::memcpy(Buffer, FData.data() + FPosition, static_cast<std::size_t>(N));
  FPosition += N;
  return N;
}

std::int64_t TMemoryStream::Write(const void* Buffer, std::int64_t Count) {
  if (Count <= 0) return 0;
  std::size_t End = static_cast<std::size_t>(FPosition + Count);
  if (End > FData.size()) {
    // Grow geometrically ourselves: resize alone may grow to the exact size each time.
    if (End > FData.capacity()) FData.reserve(std::max(End, FData.capacity() * 2));
    FData.resize(End);
  }
  std::memcpy(FData.data() + FPosition, Buffer, static_cast<std::size_t>(Count));
  FPosition += Count;
  return Count;
}

std::int64_t TMemoryStream::Seek(std::int64_t Offset, TSeekOrigin Origin) {
  std::int64_t Base = Origin == soBeginning ? 0 : Origin == soCurrent ? FPosition : Size();
  std::int64_t NewPos = Base + Offset;
  if (NewPos < 0) throw EStreamError(SInvalidCount, static_cast<long long>(NewPos));
  FPosition = NewPos;
  return FPosition;
}

void TMemoryStream::SetSize64(std::int64_t NewSize) {
  if (NewSize < 0) throw EStreamError(SInvalidCount, static_cast<long long>(NewSize));
  FData.resize(static_cast<std::size_t>(NewSize));
  if (FPosition > NewSize) FPosition = NewSize;
}

void TMemoryStream::Clear() noexcept {
  FData.clear();
  FPosition = 0;
}

void TMemoryStream::LoadFromStream(TStream* Source) {
  Source->SetPosition(0);
  std::int64_t Count = Source->Size();
  std::vector<std::uint8_t> Data(static_cast<std::size_t>(Count));
  Source->ReadBuffer(Data.data(), Count);
  FData = std::move(Data);
  FPosition = 0;
}

void TMemoryStream::SaveToStream(TStream* Dest) {
  Dest->WriteBuffer(FData.data(), static_cast<std::int64_t>(FData.size()));
}

void TMemoryStream::LoadFromFile(const String& FileName) {
  TObjectGuard<TFileStream> File(new TFileStream(FileName, fmOpenRead));
  LoadFromStream(File.Get());
}

void TMemoryStream::SaveToFile(const String& FileName) {
  TObjectGuard<TFileStream> File(new TFileStream(FileName, fmCreate));
  SaveToStream(File.Get());
}

TBytesStream::TBytesStream(std::vector<std::uint8_t> Bytes) { FData = std::move(Bytes); }

TBytesStream::TBytesStream(const void* Data, std::size_t Count) {
  auto* P = static_cast<const std::uint8_t*>(Data);
  FData.assign(P, P + Count);
}

//===----------------------------------------------------------------------===//
// File streams
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TFileStream, "Classes") {}

TFileStream::TFileStream(const String& FileName, std::uint16_t Mode) : FFileName(FileName) {
  if (Mode == fmCreate) {
    FFile = std::fopen(FileName.c_str(), "w+b");
    if (!FFile) throw EFCreateError(SFCreateError, FileName, String(std::strerror(errno)));
    return;
  }
  const char* How = (Mode & 3) == fmOpenRead ? "rb" : "r+b";
  FFile = std::fopen(FileName.c_str(), How);
  if (!FFile) throw EFOpenError(SFOpenError, FileName, String(std::strerror(errno)));
}

std::int64_t TFileStream::Read(void* Buffer, std::int64_t Count) {
  if (Count <= 0) return 0;
  return static_cast<std::int64_t>(std::fread(Buffer, 1, static_cast<std::size_t>(Count), FFile));
}

std::int64_t TFileStream::Write(const void* Buffer, std::int64_t Count) {
  if (Count <= 0) return 0;
  return static_cast<std::int64_t>(std::fwrite(Buffer, 1, static_cast<std::size_t>(Count), FFile));
}

std::int64_t TFileStream::Seek(std::int64_t Offset, TSeekOrigin Origin) {
  int Whence = Origin == soBeginning ? SEEK_SET : Origin == soCurrent ? SEEK_CUR : SEEK_END;
  if (fseeko(FFile, static_cast<off_t>(Offset), Whence) != 0)
    throw EStreamError(SInvalidCount, static_cast<long long>(Offset));
  return static_cast<std::int64_t>(ftello(FFile));
}

void TFileStream::SetSize64(std::int64_t NewSize) {
  std::fflush(FFile);
  if (ftruncate(fileno(FFile), static_cast<off_t>(NewSize)) != 0) throw EStreamError(SSetSizeError);
  if (Position() > NewSize) SetPosition(NewSize);
}

void TFileStream::BeforeDestruction() {
  if (FFile) std::fclose(FFile);
  FFile = nullptr;
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// Host streams
//===----------------------------------------------------------------------===//

FK_IMPLEMENT(TStreamAdapter, "Classes") {}
FK_IMPLEMENT(TOleStream, "Classes") {}

TStreamAdapter::TStreamAdapter(TStream* Stream, TStreamOwnership Ownership)
    : FStream(Stream), FOwnership(Ownership) {}

std::int64_t TStreamAdapter::Read(void* Buffer, std::int64_t Count) { return FStream->Read(Buffer, Count); }

std::int64_t TStreamAdapter::Write(const void* Buffer, std::int64_t Count) {
  return FStream->Write(Buffer, Count);
}

std::int64_t TStreamAdapter::Seek(std::int64_t Offset, int Origin) {
  if (Origin < soBeginning || Origin > soEnd) throw EStreamError(SInvalidCount, Origin);
  return FStream->Seek(Offset, static_cast<TSeekOrigin>(Origin));
}

void TStreamAdapter::SetSize(std::int64_t NewSize) { FStream->SetSize64(NewSize); }

void TStreamAdapter::BeforeDestruction() {
  if (FOwnership == soOwned) FreeAndNil(FStream);
  inherited::BeforeDestruction();
}

TOleStream::TOleStream(IPtr<IStream> Stream) : FStream(std::move(Stream)) {}

std::int64_t TOleStream::Read(void* Buffer, std::int64_t Count) { return FStream->Read(Buffer, Count); }

std::int64_t TOleStream::Write(const void* Buffer, std::int64_t Count) {
  return FStream->Write(Buffer, Count);
}

std::int64_t TOleStream::Seek(std::int64_t Offset, TSeekOrigin Origin) {
  return FStream->Seek(Offset, static_cast<int>(Origin));
}

void TOleStream::SetSize64(std::int64_t NewSize) { FStream->SetSize(NewSize); }

void TOleStream::BeforeDestruction() {
  FStream = nullptr;
  inherited::BeforeDestruction();
}

} // namespace formkit
