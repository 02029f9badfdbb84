//===- core/root/RootNames.h - Events of a module for its host and its pastes ===//
//
// What a module on design hands its host so that the host can rewrite source
// code without type information (`TCompInfo`, the events of one object), and
// the state of one paste: the components renamed on the way in (`TRenames`) and
// the handlers met in the pasted text (`TEvents`), whose final names are settled
// after the read.
//
// Example:
//   IPtr<ICompInfo> Info = NewAs<ICompInfo, TCompInfo>(Root, Button);
//   Info->GetEventName(0);      // "OnClick"
//   Info->GetEventValue(0);     // "Button1Click", when the handler is the module's
//
//   TRenames Renames;
//   Renames.Add("Button1", "Button3");
//   String Name = "button1";
//   Renames.Rename(Name);       // Name is "Button3"
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/ComponentDesignerIntf.h"

#include <vector>

namespace formkit {

/// The events of one object of a module, for the host. Keeps the module alive while it
/// lives; does not own the object, which must outlive it (the host keeps it for the call
/// that hands it over).
class FK_API TCompInfo : public TInterfacedObject, public ICompInfo {
  FK_CLASS(TCompInfo, TInterfacedObject)
  FK_INTERFACES(ICompInfo)

  TCompInfo() = default;
  /// Reads the event properties of `Instance`, sorted by name. Cost: the class's
  /// properties.
  TCompInfo(const IPtr<IInternalRoot>& Root, TPersistent* Instance);

  void ClearEvent(int Index) override;
  String GetClassName() override { return FInstance->ClassName(); }
  String GetQualifiedClassName() override { return FInstance->QualifiedClassName(); }
  int GetEventCount() override { return static_cast<int>(FList.size()); }
  PPropInfo GetEventInfo(int Index) override;
  IPtr<IEventInfo> GetIEventInfo(int Index) override;
  String GetEventName(int Index) override { return GetEventInfo(Index)->Name; }
  String GetEventValue(int Index) override;
  IPtr<IDesignObject> GetComponentHandle() override;
  String GetNamePath() override { return FInstance->GetNamePath(); }
  /// Works the sub-objects out at the first call. Cost: the class's properties.
  int GetSubInfoCount() override;
  IPtr<ICompInfo> GetSubInfo(int Index) override;

private:
  void InitSubList();
  IPtr<IInternalRoot> FRoot;
  TPersistent* FInstance = nullptr;
  std::vector<PPropInfo> FList;
  /// The class-typed properties that lead to objects with events of their own.
  std::vector<PPropInfo> FSubList;
  /// -1 until `InitSubList` ran.
  int FSubCount = -1;
};

/// One component renamed while a paste was read.
struct FK_API TRenameItem {
  String Source;
  String Target;
};

/// The renames of one paste, in the order they were made.
class FK_API TRenames {
public:
  void Add(const String& Source, const String& Target) { FList.push_back({Source, Target}); }
  /// Replaces `Name` by the target of the first rename whose source is `Name` without
  /// regard to case; leaves it when none is. Cost: the renames.
  void Rename(String& Name) const;
  int GetCount() const noexcept { return static_cast<int>(FList.size()); }
  /// Raises `EListError` for a bad index.
  const TRenameItem& GetItems(int Index) const;
  void Clear() noexcept { FList.clear(); }

private:
  std::vector<TRenameItem> FList;
};

/// One handler met while a paste was read.
struct FK_API TEventItem {
  TEventItem(void* AValue, const String& AName) : Value(AValue), Name(AName), OriginalName(AName), NewValue(AValue) {}
  /// The temporary method code the pasted events hold.
  void* Value;
  /// The name the handler will get.
  String Name;
  /// The name in the pasted text.
  String OriginalName;
  /// The code the events should finally hold.
  void* NewValue;
};

/// The handlers of one paste, one item per distinct name.
class FK_API TEvents {
public:
  void Add(void* Value, const String& Name) { FList.emplace_back(Value, Name); }
  int GetCount() const noexcept { return static_cast<int>(FList.size()); }
  /// Raises `EListError` for a bad index.
  TEventItem& GetItems(int Index);
  /// The item whose original name is `Name` without regard to case, or null.
  TEventItem* Find(const String& Name);
  void Clear() noexcept { FList.clear(); }

private:
  std::vector<TEventItem> FList;
};

} // namespace formkit
