//===- platform/Streams.h - Byte streams, adapters, resource header ------===//
//
// `TStream` is the byte stream under the reader and the writer: 64-bit
// positions and sizes, buffered copies, and the resource header that stands in
// front of a form stream and names the root's class. `TMemoryStream`,
// `TBytesStream` and `TFileStream` hold the bytes; `TStreamAdapter` shows a
// `TStream` to a host as an `IStream`, and `TOleStream` does the opposite.
//
// Example:
//   TObjectGuard<TMemoryStream> Mem(new TMemoryStream);
//   std::int64_t Fixup = 0;
//   Mem->WriteResourceHeader("TMainForm", Fixup);
//   ... write the form data ...
//   Mem->FixupResourceHeader(Fixup);
//   Mem->SetPosition(0);
//   String ClassName = Mem->ReadResHeader();   // "TMainForm"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Objects.h"

#include <cstdio>
#include <vector>

namespace formkit {

FK_EXCEPTION(EStreamError, Exception);
FK_EXCEPTION(EFileStreamError, EStreamError);
FK_EXCEPTION(EFCreateError, EFileStreamError);
FK_EXCEPTION(EFOpenError, EFileStreamError);

/// Where a seek counts from.
enum TSeekOrigin : std::uint8_t { soBeginning, soCurrent, soEnd };

/// The copy buffer the core uses for whole streams.
inline constexpr std::int64_t DefaultCopyBufferSize = 1048576;

/// The first four bytes of a resource header; no signature or text form starts with 0xFF.
inline constexpr std::uint8_t ResourceHeaderMagic[4] = {0xFF, 'R', 'H', 0x01};

//===----------------------------------------------------------------------===//
// TStream
//===----------------------------------------------------------------------===//

/// A stream of bytes with a position. Descendants implement `Read`, `Write`, `Seek`
/// and `SetSize64`; the rest is built on them.
class FK_API TStream : public TObject {
  FK_CLASS(TStream, TObject)

  /// Reads up to `Count` bytes; returns how many were read (0 at the end).
  [[nodiscard]] virtual std::int64_t Read(void* Buffer, std::int64_t Count) = 0;
  /// Writes up to `Count` bytes; returns how many were written.
  [[nodiscard]] virtual std::int64_t Write(const void* Buffer, std::int64_t Count) = 0;
  /// Moves the position; returns the new position.
  virtual std::int64_t Seek(std::int64_t Offset, TSeekOrigin Origin) = 0;
  /// Sets the size; the position is clipped to it. Raises `EStreamError` when the
  /// stream cannot change its size.
  virtual void SetSize64(std::int64_t NewSize);
  /// The size in bytes; by default found by seeking to the end and back.
  virtual std::int64_t Size();

  std::int64_t Position() { return Seek(0, soCurrent); }
  void SetPosition(std::int64_t Value) { Seek(Value, soBeginning); }
  void SetSize(std::int64_t NewSize) { SetSize64(NewSize); }

  /// Reads exactly `Count` bytes or raises `EReadError` "Stream read error".
  void ReadBuffer(void* Buffer, std::int64_t Count);
  /// Writes exactly `Count` bytes or raises `EWriteError` "Stream write error".
  void WriteBuffer(const void* Buffer, std::int64_t Count);
  /// Copies `Count` bytes from `Source`'s position through a buffer of `BufferSize`
  /// bytes; a `Count` of 0 copies the whole of `Source` from position 0. Returns the
  /// number of bytes copied. Raises `EReadError` when `Source` runs short.
  std::int64_t CopyFrom(TStream* Source, std::int64_t Count,
                        std::int64_t BufferSize = DefaultCopyBufferSize);

  /// Writes a resource header naming `ResName` (at most 255 bytes) whose size field is
  /// filled in later; `FixupInfo` receives what `FixupResourceHeader` needs.
  void WriteResourceHeader(const String& ResName, std::int64_t& FixupInfo);
  /// Fills the size field of the header written with `FixupInfo` with the number of
  /// bytes written after it; the position stays where it is.
  void FixupResourceHeader(std::int64_t FixupInfo);
  /// Reads a resource header and returns the name it carries; the stream stands at the
  /// first byte after it. Raises `EReadError` "Invalid stream format" for anything else.
  String ReadResHeader();
};

//===----------------------------------------------------------------------===//
// Memory streams
//===----------------------------------------------------------------------===//

/// A stream in memory that grows as it is written.
class FK_API TMemoryStream : public TStream {
  FK_CLASS(TMemoryStream, TStream)

  [[nodiscard]] std::int64_t Read(void* Buffer, std::int64_t Count) override;
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  std::int64_t Seek(std::int64_t Offset, TSeekOrigin Origin) override;
  void SetSize64(std::int64_t NewSize) override;
  std::int64_t Size() override { return static_cast<std::int64_t>(FData.size()); }

  /// The bytes; valid until the next write or size change.
  std::uint8_t* Memory() noexcept { return FData.data(); }
  const std::uint8_t* Memory() const noexcept { return FData.data(); }
  /// Empties the stream.
  void Clear() noexcept;
  /// Replaces the content with the whole of `Source`; the position goes to 0.
  void LoadFromStream(TStream* Source);
  /// Writes the whole content to `Dest` at its position.
  void SaveToStream(TStream* Dest);
  void LoadFromFile(const String& FileName);
  void SaveToFile(const String& FileName);

protected:
  std::vector<std::uint8_t> FData;
  std::int64_t FPosition = 0;
};

/// A memory stream over a byte vector that it is created with.
class FK_API TBytesStream : public TMemoryStream {
  FK_CLASS(TBytesStream, TMemoryStream)

  TBytesStream() = default;
  explicit TBytesStream(std::vector<std::uint8_t> Bytes);
  TBytesStream(const void* Data, std::size_t Count);
  /// The bytes, exactly `Size()` of them.
  const std::vector<std::uint8_t>& Bytes() const noexcept { return FData; }
};

//===----------------------------------------------------------------------===//
// File streams
//===----------------------------------------------------------------------===//

/// Open modes of `TFileStream`.
enum : std::uint16_t {
  fmOpenRead = 0x0000,
  fmOpenWrite = 0x0001,
  fmOpenReadWrite = 0x0002,
  /// Others may read and write the file meanwhile.
  fmShareDenyNone = 0x0040,
  fmCreate = 0xFF00,
};

/// A stream on a file. `fmCreate` creates or truncates; the others open an existing file.
/// Raises `EFCreateError` "Cannot create file \"%s\". %s" or `EFOpenError`
/// "Cannot open file \"%s\". %s".
class FK_API TFileStream : public TStream {
  FK_CLASS(TFileStream, TStream)

  TFileStream(const String& FileName, std::uint16_t Mode);
  [[nodiscard]] std::int64_t Read(void* Buffer, std::int64_t Count) override;
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  std::int64_t Seek(std::int64_t Offset, TSeekOrigin Origin) override;
  void SetSize64(std::int64_t NewSize) override;
  const String& FileName() const noexcept { return FFileName; }
  void BeforeDestruction() override;

private:
  String FFileName;
  std::FILE* FFile = nullptr;
};

//===----------------------------------------------------------------------===//
// Host streams
//===----------------------------------------------------------------------===//

/// A stream as a host sees it. Counts, offsets and sizes are 64-bit; `Origin` is
/// 0 (beginning), 1 (current) or 2 (end).
struct FK_API IStream : IInterface {
  FK_INTERFACE(IStream, IInterface, "{6F1C2B7A-3E4D-4C59-8A0B-2D7E91C4F513}")
  /// Reads up to `Count` bytes; returns how many were read.
  [[nodiscard]] virtual std::int64_t Read(void* Buffer, std::int64_t Count) = 0;
  /// Writes up to `Count` bytes; returns how many were written.
  [[nodiscard]] virtual std::int64_t Write(const void* Buffer, std::int64_t Count) = 0;
  /// Moves the position; returns the new one.
  virtual std::int64_t Seek(std::int64_t Offset, int Origin) = 0;
  virtual void SetSize(std::int64_t NewSize) = 0;
};

/// Whether an adapter frees the stream it wraps.
enum TStreamOwnership : std::uint8_t { soReference, soOwned };

/// A `TStream` shown as an `IStream`; frees the stream with itself when it owns it.
class FK_API TStreamAdapter : public TInterfacedObject, public IStream {
  FK_CLASS(TStreamAdapter, TInterfacedObject)
  FK_INTERFACES(IStream)

  TStreamAdapter(TStream* Stream, TStreamOwnership Ownership = soReference);
  [[nodiscard]] std::int64_t Read(void* Buffer, std::int64_t Count) override;
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  std::int64_t Seek(std::int64_t Offset, int Origin) override;
  /// Forwards to `SetSize64`.
  void SetSize(std::int64_t NewSize) override;
  TStream* Stream() const noexcept { return FStream; }
  TStreamOwnership Ownership() const noexcept { return FOwnership; }
  void BeforeDestruction() override;

protected:
  TStream* FStream = nullptr;
  TStreamOwnership FOwnership = soReference;
};

/// A `TStream` over a host's `IStream`, which it holds counted.
class FK_API TOleStream : public TStream {
  FK_CLASS(TOleStream, TStream)

  explicit TOleStream(IPtr<IStream> Stream);
  [[nodiscard]] std::int64_t Read(void* Buffer, std::int64_t Count) override;
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  std::int64_t Seek(std::int64_t Offset, TSeekOrigin Origin) override;
  void SetSize64(std::int64_t NewSize) override;
  const IPtr<IStream>& HostStream() const noexcept { return FStream; }
  void BeforeDestruction() override;

private:
  IPtr<IStream> FStream;
};

} // namespace formkit
