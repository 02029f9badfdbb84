//===- core/ToolUtils.h - Notifier lists and small tool helpers ----------===//
//
// `TOTAClass` is the base of the objects that hand notifiers out to add-ins:
// it keeps them in an interface list whose indexes are the handles, and tells
// each one `Destroyed` when it goes. `AddToList` and `ForEach` are the two
// walks over such a list, both under the list's lock. The platform-name
// comparisons and the device artwork decoder are exported for hosts; this
// library does not call them.
//
// Example:
//   int Handle = AddToList(Notifiers, InterfaceOf<IInterface>(Watcher.Get()));
//   ForEach(Notifiers, [](const IPtr<IInterface>& Item, const IPtr<IInterface>&) {
//     if (auto N = QueryAs<IOTANotifier>(Item)) N->Modified();
//   });
//   Notifiers->Put(Handle, nullptr);   // the handle is taken again by the next add
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Lists.h"

#include <functional>

namespace formkit {

class TStream;

FK_RESOURCESTRING(sDanglingReferenceCount, "Instance of Class %s has dangling reference count of %d");

//===----------------------------------------------------------------------===//
// Notifier lists
//===----------------------------------------------------------------------===//

/// What `ForEach` calls for each entry: the entry and the caller's parameter.
using TOTAForEachProc = std::function<void(const IPtr<IInterface>& Item, const IPtr<IInterface>& Param)>;

/// Puts `Item` into the first empty entry of `List`, or appends it; the result is its
/// index. Handles of removed entries are thus used again, lowest first. Linear.
[[nodiscard]] FK_API int AddToList(const IPtr<IInterfaceList>& List, const IPtr<IInterface>& Item);

/// Calls `Proc` with each entry that is not empty, in index order, holding the list's
/// lock for the whole walk (re-entrant, so `Proc` may empty its own entry). The count is
/// taken once at the start. Nothing happens for a null list or an empty `Proc`.
FK_API void ForEach(const IPtr<IInterfaceList>& List, const TOTAForEachProc& Proc,
                    const IPtr<IInterface>& Param = nullptr);

/// The base of objects that hand out notifiers. It holds a reference on itself, so it
/// lives until it is freed explicitly (`Destroy`); a descendant that wants to live by
/// its counted references calls `DropOwnReference` in its constructor.
class FK_API TOTAClass : public TInterfacedObject {
  FK_CLASS(TOTAClass, TInterfacedObject)

  TOTAClass();
  /// Tells every notifier `Destroyed`, then raises `Exception` "Instance of Class %s has
  /// dangling reference count of %d" when references other than its own are still out
  /// (the object then stays alive).
  void BeforeDestruction() override;

  /// `Destroyed` on `Item` when it is an `IOTANotifier`; a `ForEach` procedure.
  static void NotifyDestroyed(const IPtr<IInterface>& Item, const IPtr<IInterface>& Param);
  /// The object itself.
  TOTAClass* GetInstance() noexcept { return this; }
  /// The notifiers; an index is the handle given out for the entry.
  const IPtr<IInterfaceList>& NotifyList() const noexcept { return FNotifyList; }

protected:
  IPtr<IInterfaceList> FNotifyList;
};

//===----------------------------------------------------------------------===//
// Platforms and device artwork
//===----------------------------------------------------------------------===//

/// True when a package built for platform `A` serves platform `B`: "OSX64" serves the
/// Apple desktop and device platforms, "Win64" serves "Win64x", and every platform
/// serves itself. Exact comparison.
[[nodiscard]] FK_API bool PlatformMatch(const String& A, const String& B);
/// As `PlatformMatch`, without the Apple rule: SDKs are per platform there.
[[nodiscard]] FK_API bool SDKPlatformMatch(const String& A, const String& B);

/// The byte that device artwork is masked with.
inline constexpr std::uint8_t DeviceArtWorkMask = 0x5A;

/// Reads the whole of `Source` from its position, unmasks every byte with
/// `DeviceArtWorkMask`, writes the result to `Target` and rewinds `Target`. Neither
/// stream is owned. Masking twice gives the original back.
FK_API void DecryptDeviceArtWork(TStream* Source, TStream* Target);

} // namespace formkit
