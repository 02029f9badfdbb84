//===- core/ToolUtils.cpp - Notifier lists and small tool helpers --------===//
#include "core/ToolUtils.h"

#include "core/ToolServices.h"
#include "platform/ScopeGuard.h"
#include "platform/Streams.h"

#include <vector>

namespace formkit {

FK_IMPLEMENT(TOTAClass, "ToolUtils") {}

//===----------------------------------------------------------------------===//
// Notifier lists
//===----------------------------------------------------------------------===//

int AddToList(const IPtr<IInterfaceList>& List, const IPtr<IInterface>& Item) {
  List->Lock();
  auto Unlock = Finally([&]() noexcept { List->Unlock(); });
  for (int I = 0, N = List->GetCount(); I < N; ++I)
    if (!List->Get(I)) {
      List->Put(I, Item);
      return I;
    }
  return List->Add(Item);
}

void ForEach(const IPtr<IInterfaceList>& List, const TOTAForEachProc& Proc, const IPtr<IInterface>& Param) {
  if (!List || !Proc) return;
  List->Lock();
  auto Unlock = Finally([&]() noexcept { List->Unlock(); });
  for (int I = 0, N = List->GetCount(); I < N; ++I)
    if (IPtr<IInterface> Item = List->Get(I)) Proc(Item, Param);
}

//===----------------------------------------------------------------------===//
// TOTAClass
//===----------------------------------------------------------------------===//

TOTAClass::TOTAClass() : FNotifyList(NewAs<IInterfaceList, TInterfaceList>()) { ObjAddRef(); }

void TOTAClass::NotifyDestroyed(const IPtr<IInterface>& Item, const IPtr<IInterface>&) {
  if (auto Notifier = QueryAs<IOTANotifier>(Item)) Notifier->Destroyed();
}

void TOTAClass::BeforeDestruction() {
  ForEach(FNotifyList, &TOTAClass::NotifyDestroyed);
  // Released to zero, the count stands at the destroying bias.
  auto Count = [this] { return RefCount() >= DestroyingBias ? RefCount() - DestroyingBias : RefCount(); };
  if (Count() == 1) DropOwnReference();
  if (int Left = Count(); Left != 0) throw Exception(sDanglingReferenceCount, ClassName(), Left - 1);
  inherited::BeforeDestruction();
}

//===----------------------------------------------------------------------===//
// Platforms and device artwork
//===----------------------------------------------------------------------===//

bool SDKPlatformMatch(const String& A, const String& B) {
  if (A == "Win64") return B == "Win64" || B == "Win64x";
  return A == B;
}

bool PlatformMatch(const String& A, const String& B) {
  if (A == "OSX64")
    return B == "OSX32" || B == "OSX64" || B == "OSXARM64" || B == "iOSSimARM64" || B == "iOSDevice32" ||
           B == "iOSDevice64";
  return SDKPlatformMatch(A, B);
}

void DecryptDeviceArtWork(TStream* Source, TStream* Target) {
  std::vector<std::uint8_t> Buffer(static_cast<std::size_t>(Source->Size() - Source->Position()));
  Source->ReadBuffer(Buffer.data(), static_cast<std::int64_t>(Buffer.size()));
  for (std::uint8_t& Byte : Buffer) Byte ^= DeviceArtWorkMask;
  Target->WriteBuffer(Buffer.data(), static_cast<std::int64_t>(Buffer.size()));
  Target->SetPosition(0);
}

} // namespace formkit
