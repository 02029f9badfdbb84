//===- fuzz/support/StreamChecks.h - What every form stream must satisfy ---===//
//
// The checks the form fuzz targets share. Bad input may only end in `EReadError`;
// everything else a target finds (a failed check here, a crash, a leak, another
// exception) is a fault of the library. The checks:
//
//   - component data as the writer makes it converts to text and back to the
//     same bytes, and the same through a resource header;
//   - any input that converts (binary to text, or text to binary, with or
//     without a resource header) converts back exactly;
//   - a tree that was read writes, reads back and writes the same bytes again;
//   - a read that fails frees what it created and never what it found.
//
// Example:
//   CheckConversions(Input, Size);
//   TBytes Data;
//   if (!ComponentData(Input, Size, Data)) return 0;   // not form data at all
//   CheckRootRead(Data, NewForm, true);                // reads, round-trips, frees
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Filer.h"

#include <cstdint>
#include <functional>
#include <string_view>
#include <vector>

namespace formkit::fuzzing {

using TBytes = std::vector<std::uint8_t>;

/// Reports a broken promise of the library (and the error that came with it, if any) and
/// aborts, so that libFuzzer keeps the input.
[[noreturn]] FK_API void Finding(const char* What, const String& Detail = {});
/// `Finding(What)` unless `Condition` holds.
inline void Require(bool Condition, const char* What) {
  if (!Condition) Finding(What);
}

/// An FNV-1a hash of the input: targets pick their variant from it, so that every input
/// always runs the same way and a mutation can move it to another variant.
[[nodiscard]] FK_API std::uint32_t InputHash(const std::uint8_t* Data, std::size_t Size) noexcept;

/// The bytes of a memory stream.
[[nodiscard]] FK_API TBytes BytesOf(TMemoryStream* Stream);
/// Component data (signature onward) of `Root`, written against `Ancestor` when given.
[[nodiscard]] FK_API TBytes WriteRoot(TComponent* Root, TComponent* Ancestor = nullptr);
/// Component data as text; raises `EReadError` for data that does not convert.
[[nodiscard]] FK_API String DataToText(const TBytes& Data);
/// Text as component data; raises `EParserError` for text that does not convert.
[[nodiscard]] FK_API TBytes TextToData(std::string_view Text);
/// Text as component data behind a resource header naming `Name` (the root's class when
/// empty).
[[nodiscard]] FK_API TBytes TextToResource(std::string_view Text, const String& Name = {});
/// A resource-headed stream as text.
[[nodiscard]] FK_API String ResourceToText(const TBytes& Resource);

/// The component data an input holds: binary data (its resource header dropped) or text
/// converted to binary data. False when it holds none: the header or the text is
/// malformed, or the input is neither.
[[nodiscard]] FK_API bool ComponentData(const std::uint8_t* Data, std::size_t Size, TBytes& Out);

/// The components of `Root` at the paths `Names`, each behind the signature, and the end
/// of the list: what `ReadComponents` reads (what a clipboard holds).
[[nodiscard]] FK_API TBytes WriteComponents(TComponent* Root, std::initializer_list<const char*> Names);

/// The components an input holds as `ReadComponents` reads them (what a clipboard holds):
/// binary data as it is, each behind its signature up to the end of the list; or each
/// object of a text converted, and the end of the list added. False for malformed text.
[[nodiscard]] FK_API bool ComponentListData(const std::uint8_t* Data, std::size_t Size, TBytes& Out);

/// Data as the writer made it converts to text and back to the same bytes, and through
/// a resource header to the same text. Cost: four conversions.
FK_API void CheckCanonicalConversions(const TBytes& Canonical);
/// Whatever part of arbitrary input converts (binary to text, text to binary, resource to
/// text) converts back to the same text and the same bytes; a conversion that fails
/// raises `EReadError` and leaves its output empty.
FK_API void CheckConversions(const std::uint8_t* Data, std::size_t Size);

/// Makes an empty root of the class that a round trip reads into.
using TNewRoot = std::function<TComponent*()>;
/// Reads component data into the root `NewRoot` makes (null: created from the data's
/// class); the caller owns the result. Raises `EReadError` and frees the root on failure.
[[nodiscard]] FK_API TComponent* ReadRoot(const TBytes& Data, const TNewRoot& NewRoot);
/// Writes `Root` (against `Ancestor`), reads that into a root `NewRoot` makes (and, for a
/// descendant, that `NewRoot` gives the ancestor's components), writes it again and
/// requires the same bytes; the written data must convert exactly too. Returns the bytes.
FK_API TBytes CheckRoundTrip(TComponent* Root, const TNewRoot& NewRoot, TComponent* Ancestor = nullptr);

/// Reads `Data` as a root into the root `NewRoot` makes (or, when null, one the reader
/// creates from the data's class), going on past every error when `Skip`. A read may fail
/// with `EReadError` only (anything else passes on), and then every component the root
/// owned before must still be its own; a tree that reads must round-trip
/// (`CheckRoundTrip`, against `Ancestor` when given). Frees what it made.
FK_API void CheckRootRead(const TBytes& Data, const TNewRoot& NewRoot, bool Skip, TComponent* Ancestor = nullptr);
/// Reads `List` (see `ComponentListData`) into `Host` under `Parent` as a paste does, going
/// on past every error when `Skip`. Each component read must be owned by `Host`; when the
/// read fails, every component `Host` owned before must still be its own; when it
/// succeeds, `Host` must round-trip through a root that `NewRoot` makes.
FK_API void CheckPaste(const TBytes& List, TComponent* Host, TComponent* Parent, bool Skip, const TNewRoot& NewRoot);

/// An `OnError` handler that offers to go on after every error, so that the reader skips
/// the property or component at fault and reads the rest.
class FK_API TSkipErrors : public TObject {
  FK_CLASS(TSkipErrors, TObject)
  /// The errors offered so far.
  int Count = 0;
  void Skip(TReader* Reader, const String& Message, bool& Handled);
  /// Makes `Reader` offer its errors to this handler.
  void Attach(TReader* Reader);
};

} // namespace formkit::fuzzing
