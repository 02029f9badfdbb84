//===- tree/StructureMenus.cpp - Menu entries the structure view is handed ===//
#include "tree/StructureMenus.h"

#include "platform/ScopeGuard.h"

namespace formkit::TreeIntf {

FK_IMPLEMENT(TStructureMenuItem, "TreeIntf") {}

using detail::Shielded;

String TStructureMenuItem::Get_Caption() {
  return Shielded(String(), [this] { return FItem ? FItem->GetCaption() : String(); });
}

TOTABool TStructureMenuItem::Get_Checked() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FItem && FItem->GetChecked()); });
}

int TStructureMenuItem::Get_Count() {
  return Shielded(0, [this] { return FItem ? FItem->GetCount() : 0; });
}

TOTABool TStructureMenuItem::Get_Enabled() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FItem && FItem->GetEnabled()); });
}

int TStructureMenuItem::Get_GroupIndex() {
  return Shielded(0, [this] { return FItem ? FItem->GetGroupIndex() : 0; });
}

IPtr<IOTAStructureNodeMenuItem> TStructureMenuItem::Get_Item(int AIndex) {
  return Shielded(IPtr<IOTAStructureNodeMenuItem>(), [&] {
    if (!FItem || AIndex < 0 || AIndex >= FItem->GetCount()) return IPtr<IOTAStructureNodeMenuItem>();
    return WrapMenuItem(FItem->GetItem(AIndex));
  });
}

String TStructureMenuItem::Get_Name() {
  return Shielded(String(), [this] { return FItem ? FItem->GetName() : String(); });
}

TOTABool TStructureMenuItem::Get_RadioItem() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FItem && FItem->GetRadioItem()); });
}

int TStructureMenuItem::Get_ShortCut() {
  return Shielded(0, [this] { return FItem ? FItem->GetShortCut() : 0; });
}

TOTABool TStructureMenuItem::Get_Visible() {
  return Shielded(OTAFalse, [this] { return ToOTABool(FItem && FItem->GetVisible()); });
}

void TStructureMenuItem::Invoke() {
  RunIgnoringExceptions([this] {
    IPtr<IMenuItem2> Clickable = QueryAs<IMenuItem2>(FItem);
    IPtr<IOTAStructureView> View = IDEService<IOTAStructureView>();
    if (!Clickable || !View) return;
    IPtr<IOTAStructureView290> Bracket = QueryAs<IOTAStructureView290>(View);
    if (Bracket) Bracket->BeginUpdate();
    auto End = Finally([&]() noexcept {
      if (Bracket) RunIgnoringExceptions([&] { Bracket->EndUpdate(); });
    });
    Clickable->Click();
  });
}

TComponent* TStructureMenuItem::GetAction() {
  return Shielded(static_cast<TComponent*>(nullptr), [this]() -> TComponent* {
    IPtr<IMenuItem290> WithAction = QueryAs<IMenuItem290>(FItem);
    return WithAction ? WithAction->GetAction() : nullptr;
  });
}

IPtr<IOTAStructureNodeMenuItem> WrapMenuItem(const IPtr<IMenuItem>& AItem) {
  if (!AItem) return nullptr;
  return NewAs<IOTAStructureNodeMenuItem, TStructureMenuItem>(AItem);
}

} // namespace formkit::TreeIntf
