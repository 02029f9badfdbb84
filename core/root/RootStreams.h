//===- core/root/RootStreams.h - Streams lent to the host, and the clipboard ===//
//
// The host reads a module's form file through `IDatedStream`. `TDatedStreamAdapter`
// carries any framework stream with the module's stamp; `TRootStream` lends the
// module's cached image without a copy and gives it back when it goes, unless the
// module changed in between.
//
// Example:
//   IPtr<IDatedStream> S = Root->FormFileOpen();   // a TRootStream
//   S->Read(Buffer, Size);                          // the module's bytes
//   S = nullptr;                                    // the image goes back to the module
//
// `TDesignClipboard` is the platform's clipboard as the design core uses it:
// component streams go there under "Tessel Components", with their text.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

namespace formkit {

class TComponentRoot;

/// A framework stream as a host's dated stream. Frees the stream with itself when it
/// owns it.
class FK_API TDatedStreamAdapter : public TInterfacedObject, public IDatedStream {
  FK_CLASS(TDatedStreamAdapter, TInterfacedObject)
  FK_INTERFACES(IDatedStream)
  TDatedStreamAdapter() = default;
  TDatedStreamAdapter(TStream* Stream, int ModifyTime, TStreamOwnership Ownership)
      : FStream(Stream), FOwnership(Ownership), FDate(ModifyTime) {}
  void BeforeDestruction() override;

  [[nodiscard]] std::int64_t Read(void* Buffer, std::int64_t Count) override;
  [[nodiscard]] std::int64_t Write(const void* Buffer, std::int64_t Count) override;
  std::int64_t Seek(std::int64_t Offset, int Origin) override;
  /// Through the stream's `SetSize64`.
  void SetSize(std::int64_t NewSize) override;
  int GetModifyTime() override { return FDate; }
  void SetModifyTime(int Time) override { FDate = Time; }
  TStream* Stream() const noexcept { return FStream; }

protected:
  TStream* FStream = nullptr;
  TStreamOwnership FOwnership = soReference;
  int FDate = -1;
};

/// A read-only view of a module's stream. Holds the module counted while it lives.
class FK_API TRootStream final : public TDatedStreamAdapter {
  FK_CLASS(TRootStream, TDatedStreamAdapter)
  TRootStream() = default;
  /// Borrows the module's image (`GetRootStream`), or copies the stream of a dormant one.
  explicit TRootStream(TComponentRoot* Root);
  /// Gives the image back to the module when the module is as it was; frees it otherwise.
  void BeforeDestruction() override;
  /// The view is read-only: writes nothing and returns 0.
  [[nodiscard]] std::int64_t Write(const void*, std::int64_t) override { return 0; }

private:
  TComponentRoot* FRoot = nullptr; // kept alive by FRootRef
  IPtr<IInterface> FRootRef;
};

/// The clipboard format of component streams.
inline constexpr const char* CF_COMPONENTS_NAME = "Tessel Components";
/// Registered beside it; nothing is put under it.
inline constexpr const char* CF_COMPONENT_NAME = "Tessel Component";

/// The platform's clipboard, by format name; the framework's root supplies it. Data put
/// between `Open` and `Close` stays side by side; the design core opens it only for
/// the length of one copy or paste.
class FK_API TDesignClipboard {
public:
  virtual void Open() = 0;
  virtual void Close() = 0;
  /// Whether data of the named format is there.
  [[nodiscard]] virtual bool HasFormat(const String& FormatName) = 0;
  /// Replaces the data of the named format.
  virtual void SetBytes(const String& FormatName, const std::vector<std::uint8_t>& Bytes) = 0;
  /// The data of the named format; empty when there is none.
  [[nodiscard]] virtual std::vector<std::uint8_t> GetBytes(const String& FormatName) = 0;
  /// Plain text, the platform's text format.
  [[nodiscard]] virtual bool HasText() = 0;
  virtual void SetText(const String& Text) = 0;
  [[nodiscard]] virtual String GetText() = 0;

protected:
  ~TDesignClipboard() = default;
};

} // namespace formkit
