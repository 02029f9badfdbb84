//===- tree/StructureMenus.h - Menu entries the structure view is handed -===//
//
// The entries a structure context puts into the view's popup come from the
// host's menu layer (`IMenuItem`), built by the module's designer as its local
// menu and by the sprig under the mouse. `TreeIntf::TStructureMenuItem` shows
// one such item to the view as an `IOTAStructureNodeMenuItem`: reads go to the
// item, invoking clicks it inside the view's update bracket. Like every
// host-facing operation here, none lets an exception out.
//
// Example:
//   IPtr<IOTAStructureNodeMenuItem> Entry = TreeIntf::WrapMenuItem(Popup->GetItems()->GetItem(0));
//   AMenu->InsertItem(0, Entry);     // the view shows it; choosing it clicks the item
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignMenus.h"
#include "tree/StructureViewAPI.h"

namespace formkit::TreeIntf {

/// A menu layer's item as the view's menu entry. Holds the item by a counted reference.
class FK_API TStructureMenuItem : public TInterfacedObject, public IOTAStructureNodeMenuItem290 {
  FK_CLASS(TStructureMenuItem, TInterfacedObject)
  FK_INTERFACES(IOTAStructureNodeMenuItem290)
  TStructureMenuItem() = default;
  explicit TStructureMenuItem(IPtr<IMenuItem> AItem) : FItem(std::move(AItem)) {}

  /// Nothing: the entries belong to the menu layer.
  void DeleteItem(int) override {}
  String Get_Caption() override;
  TOTABool Get_Checked() override;
  int Get_Count() override;
  TOTABool Get_Enabled() override;
  int Get_GroupIndex() override;
  /// -1: the menu layer's pictures are not the view's.
  int Get_ImageIndex() override { return -1; }
  /// The sub-item, in a new adapter; null outside the sub-items.
  IPtr<IOTAStructureNodeMenuItem> Get_Item(int AIndex) override;
  String Get_Name() override;
  TOTABool Get_RadioItem() override;
  int Get_ShortCut() override;
  TOTABool Get_Visible() override;
  /// Nothing: the entries belong to the menu layer.
  void InsertItem(int, const IPtr<IOTAStructureNodeMenuItem>&) override {}
  /// Clicks the item when it can be clicked (`IMenuItem2`) and the view exists, inside
  /// the view's update bracket, which closes also when the click fails.
  void Invoke() override;
  /// The item's action when it is an `IMenuItem290`; null otherwise.
  TComponent* GetAction() override;

  const IPtr<IMenuItem>& Item() const noexcept { return FItem; }

private:
  IPtr<IMenuItem> FItem;
};

/// `AItem` as the view's entry; null for null.
FK_API IPtr<IOTAStructureNodeMenuItem> WrapMenuItem(const IPtr<IMenuItem>& AItem);

} // namespace formkit::TreeIntf
