//===- frameworks/kiln/design/StructureMenuItems.h - The view's menu on Kiln items ===//
//
// The other direction of the structure view's menus: the view's own popup is
// made of Kiln menu items, and a context that adds entries hands it
// `IOTAStructureNodeMenuItem`s. `StructureViewAPI::TStructureNodeMenuItem`
// shows a Kiln item as such an entry; `StructureViewAPI::TStructureMenuItem` is
// a Kiln item fed from an entry, which invokes the entry when it is clicked.
// An item that came from the view goes back to it; a plain one runs as a plain
// Kiln item, so that a click never comes back to itself.
//
// Example:
//   IPtr<IOTAStructureNodeMenuItem> Menu = StructureViewAPI::NodeMenuItemOf(Popup->Items());
//   Context->InitPopupMenu(Node, Menu);   // the context's entries become Kiln items
//   Popup->Items()->Items(0)->Click();    // invokes the context's first entry
//
//===----------------------------------------------------------------------===//
#pragma once

#include "frameworks/kiln/KilnActions.h"
#include "tree/StructureViewAPI.h"

namespace formkit {

/// What a view entry made over a Kiln item gives back: that item.
struct FK_API IInternalStructureMenuItem : IInterface {
  FK_INTERFACE(IInternalStructureMenuItem, IInterface, "{5C2F8A17-6D3E-4B90-A4C1-8E7D29F3B60A}")
  /// The Kiln item behind the entry; not owned.
  virtual TMenuItem* GetMenuItem() = 0;
};

namespace StructureViewAPI {

/// A Kiln item as a view entry. Does not own the item.
class FK_API TStructureNodeMenuItem : public TInterfacedObject,
                                      public IOTAStructureNodeMenuItem290,
                                      public IInternalStructureMenuItem {
  FK_CLASS(TStructureNodeMenuItem, TInterfacedObject)
  FK_INTERFACES(IOTAStructureNodeMenuItem290, IInternalStructureMenuItem)
  TStructureNodeMenuItem() = default;
  explicit TStructureNodeMenuItem(TMenuItem* AMenuItem) : FMenuItem(AMenuItem) {}

  /// Frees sub-item `AIndex`.
  void DeleteItem(int AIndex) override;
  String Get_Caption() override;
  TOTABool Get_Checked() override;
  int Get_Count() override;
  TOTABool Get_Enabled() override;
  int Get_GroupIndex() override;
  int Get_ImageIndex() override;
  /// The entry of sub-item `AIndex`, which is first turned into a `TStructureMenuItem`
  /// when it is a plain Kiln item; null outside the sub-items.
  IPtr<IOTAStructureNodeMenuItem> Get_Item(int AIndex) override;
  String Get_Name() override;
  TOTABool Get_RadioItem() override;
  int Get_ShortCut() override;
  TOTABool Get_Visible() override;
  /// A new `TStructureMenuItem` fed from `AItem`, put in at `AIndex`.
  void InsertItem(int AIndex, const IPtr<IOTAStructureNodeMenuItem>& AItem) override;
  /// Clicks the Kiln item.
  void Invoke() override;
  TComponent* GetAction() override;
  TMenuItem* GetMenuItem() override { return FMenuItem; }

private:
  TMenuItem* FMenuItem = nullptr; // not owned
};

/// A Kiln item fed from a view entry; owned like any item, by its owner.
class FK_API TStructureMenuItem : public TMenuItem {
  FK_CLASS(TStructureMenuItem, TMenuItem)

  /// Puts a new item in `AItem`'s place in its parent, owned by `AItem`'s owner, with
  /// `AItem`'s action (or its caption, short cut, visibility, enabling, check and picture)
  /// and its sub-items. With `AFree`, `AItem` is freed and the new item takes its name.
  [[nodiscard]] static TStructureMenuItem* Replace(TMenuItem* AItem, bool AFree);
  /// A new item owned by `AOwner`, fed from `AItem`.
  [[nodiscard]] static TStructureMenuItem* FedFrom(TComponent* AOwner, const IPtr<IOTAStructureNodeMenuItem>& AItem);

  /// Keeps `AItem`, takes its caption, visibility, enabling, picture, short cut, name and
  /// action, and makes one item a sub-entry, fed the same way.
  void SetStructureNodeMenuItem(const IPtr<IOTAStructureNodeMenuItem>& AItem);
  /// Invokes the entry it was fed from, unless that entry is its own; else the plain click.
  void Click() override;
  void BeforeDestruction() override;

private:
  /// The entry it was fed from, or its own entry when it replaced a plain item.
  IPtr<IOTAStructureNodeMenuItem> FStructureNodeMenuItem;
};

/// The entry over a Kiln item: the item's own when it is a `TStructureMenuItem`.
FK_API IPtr<IOTAStructureNodeMenuItem> NodeMenuItemOf(TMenuItem* AItem);

} // namespace StructureViewAPI
} // namespace formkit
