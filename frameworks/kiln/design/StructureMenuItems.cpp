//===- frameworks/kiln/design/StructureMenuItems.cpp - The view's menu on Kiln items ===//
#include "frameworks/kiln/design/StructureMenuItems.h"

#include "platform/ScopeGuard.h"

namespace formkit {
namespace StructureViewAPI {

FK_IMPLEMENT(TStructureNodeMenuItem, "StructureViewAPI") {}
FK_IMPLEMENT(TStructureMenuItem, "StructureViewAPI") {}

using detail::Shielded;

//===----------------------------------------------------------------------===//
// TStructureNodeMenuItem
//===----------------------------------------------------------------------===//

void TStructureNodeMenuItem::DeleteItem(int AIndex) {
  RunIgnoringExceptions([&] {
    if (!FMenuItem) return;
    TMenuItem* Item = FMenuItem->Items(AIndex);
    FMenuItem->Delete(AIndex);
    Item->Destroy();
  });
}

String TStructureNodeMenuItem::Get_Caption() {
  return Shielded(String(), [this] { return FMenuItem ? FMenuItem->Caption() : String(); });
}

TOTABool TStructureNodeMenuItem::Get_Checked() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FMenuItem && FMenuItem->Checked()); });
}

int TStructureNodeMenuItem::Get_Count() {
  return Shielded(0, [this] { return FMenuItem ? FMenuItem->Count() : 0; });
}

TOTABool TStructureNodeMenuItem::Get_Enabled() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FMenuItem && FMenuItem->Enabled()); });
}

int TStructureNodeMenuItem::Get_GroupIndex() {
  return Shielded(0, [this] { return FMenuItem ? FMenuItem->GroupIndex() : 0; });
}

int TStructureNodeMenuItem::Get_ImageIndex() {
  return Shielded(-1, [this] { return FMenuItem ? FMenuItem->ImageIndex() : -1; });
}

IPtr<IOTAStructureNodeMenuItem> TStructureNodeMenuItem::Get_Item(int AIndex) {
  return Shielded(IPtr<IOTAStructureNodeMenuItem>(), [&] {
    if (!FMenuItem || AIndex < 0 || AIndex >= FMenuItem->Count()) return IPtr<IOTAStructureNodeMenuItem>();
    TMenuItem* Item = FMenuItem->Items(AIndex);
    if (!dynamic_cast<TStructureMenuItem*>(Item)) Item = TStructureMenuItem::Replace(Item, true);
    return NodeMenuItemOf(Item);
  });
}

String TStructureNodeMenuItem::Get_Name() {
  return Shielded(String(), [this] { return FMenuItem ? FMenuItem->Name() : String(); });
}

TOTABool TStructureNodeMenuItem::Get_RadioItem() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FMenuItem && FMenuItem->RadioItem()); });
}

int TStructureNodeMenuItem::Get_ShortCut() {
  return Shielded(0, [this] { return FMenuItem ? FMenuItem->ShortCut() : 0; });
}

TOTABool TStructureNodeMenuItem::Get_Visible() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FMenuItem && FMenuItem->Visible()); });
}

void TStructureNodeMenuItem::InsertItem(int AIndex, const IPtr<IOTAStructureNodeMenuItem>& AItem) {
  RunIgnoringExceptions([&] {
    if (!FMenuItem || !AItem) return;
    TStructureMenuItem* Item = TStructureMenuItem::FedFrom(FMenuItem->Owner(), AItem);
    auto Undo = OnFailure([&]() noexcept { Item->Destroy(); });
    FMenuItem->Insert(AIndex, Item);
  });
}

void TStructureNodeMenuItem::Invoke() {
  RunIgnoringExceptions([this] {
    if (FMenuItem) FMenuItem->Click();
  });
}

TComponent* TStructureNodeMenuItem::GetAction() {
  return Shielded(static_cast<TComponent*>(nullptr), [this]() -> TComponent* {
    return FMenuItem ? FMenuItem->Action() : nullptr;
  });
}

//===----------------------------------------------------------------------===//
// TStructureMenuItem
//===----------------------------------------------------------------------===//

TStructureMenuItem* TStructureMenuItem::Replace(TMenuItem* AItem, bool AFree) {
  auto* Item = CreateComponentOf<TStructureMenuItem>(AItem->Owner());
  Item->FStructureNodeMenuItem = NewAs<IOTAStructureNodeMenuItem, TStructureNodeMenuItem>(Item);
  if (AItem->Action()) {
    Item->SetAction(AItem->Action());
  } else {
    Item->SetCaption(AItem->Caption());
    Item->SetShortCut(AItem->ShortCut());
    Item->SetVisible(AItem->Visible());
    Item->SetEnabled(AItem->Enabled());
    Item->SetChecked(AItem->Checked());
    Item->SetImageIndex(AItem->ImageIndex());
  }
  Item->OnClick = AItem->OnClick;
  for (int I = AItem->Count() - 1; I >= 0; --I) Item->Insert(0, AItem->Items(I));
  if (TMenuItem* Parent = AItem->ParentItem()) Parent->Insert(Parent->IndexOf(AItem), Item);
  if (AFree) {
    String Name = AItem->Name();
    AItem->Destroy();
    Item->SetName(Name);
  }
  return Item;
}

TStructureMenuItem* TStructureMenuItem::FedFrom(TComponent* AOwner, const IPtr<IOTAStructureNodeMenuItem>& AItem) {
  auto* Item = CreateComponentOf<TStructureMenuItem>(AOwner);
  auto Undo = OnFailure([&]() noexcept { Item->Destroy(); });
  Item->SetStructureNodeMenuItem(AItem);
  return Item;
}

void TStructureMenuItem::SetStructureNodeMenuItem(const IPtr<IOTAStructureNodeMenuItem>& AItem) {
  FStructureNodeMenuItem = AItem;
  if (!AItem) return;
  SetCaption(AItem->Get_Caption());
  SetVisible(AItem->Get_Visible() != OTAFalse);
  SetEnabled(AItem->Get_Enabled() != OTAFalse);
  SetImageIndex(AItem->Get_ImageIndex());
  SetShortCut(AItem->Get_ShortCut());
  // A name that is no identifier, or that the owner holds already, is not taken: the
  // entry is shown unnamed rather than not at all.
  String Name = AItem->Get_Name();
  if (IsValidIdent(Name) && (!Owner() || !Owner()->FindComponent(Name))) SetName(Name);
  if (auto WithAction = QueryAs<IOTAStructureNodeMenuItem290>(AItem))
    if (auto* Action = dynamic_cast<TAction*>(WithAction->GetAction())) SetAction(Action);
  for (int I = 0, N = AItem->Get_Count(); I < N; ++I) {
    TStructureMenuItem* Sub = FedFrom(Owner(), AItem->Get_Item(I));
    Add(Sub);
  }
}

void TStructureMenuItem::Click() {
  IPtr<IInternalStructureMenuItem> Own = QueryAs<IInternalStructureMenuItem>(FStructureNodeMenuItem);
  if (FStructureNodeMenuItem && !(Own && Own->GetMenuItem() == this)) FStructureNodeMenuItem->Invoke();
  else inherited::Click();
}

void TStructureMenuItem::BeforeDestruction() {
  FStructureNodeMenuItem = nullptr;
  inherited::BeforeDestruction();
}

} // namespace StructureViewAPI

IPtr<IOTAStructureNodeMenuItem> StructureViewAPI::NodeMenuItemOf(TMenuItem* AItem) {
  if (!AItem) return nullptr;
  return NewAs<IOTAStructureNodeMenuItem, TStructureNodeMenuItem>(AItem);
}

} // namespace formkit
