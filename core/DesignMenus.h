//===- core/DesignMenus.h - The host's menu layer ------------------------===//
//
// The interfaces through which local menus of the design surface and of the
// structure tree are built. The host's menu layer implements them; nothing in
// this library does. Operations join as their callers arrive.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "platform/Classes.h"
#include "platform/TypInfo.h"

namespace formkit {

FK_ENUM(TLocalMenuType, std::uint8_t, lmBase, lmModule, lmSelection, lmComponent)
FK_SET(TLocalMenuTypes, TLocalMenuType)

/// The local menus that a module offers by default.
inline constexpr TLocalMenuTypes CLocalMenusIf{lmBase, lmModule, lmSelection, lmComponent};

struct IMenuItem;

/// The collection side of a menu: its items, and the making of new ones.
struct FK_API IMenuItems : IInterface {
  FK_INTERFACE(IMenuItems, IInterface, "{4DE1A7A2-0EAD-5065-83A7-9DC3C5D2BF9E}")
  /// Adds an item that runs `Action`, a framework action the menu does not own, named
  /// `Name`; gives the new item.
  virtual IPtr<IMenuItem> AddItem(TComponent* Action, const String& Name) = 0;
  /// Adds a separator named `Name`.
  virtual IPtr<IMenuItem> AddLine(const String& Name) = 0;
  /// Inserts a separator at `Index`.
  virtual IPtr<IMenuItem> InsertLine(int Index, const String& Name) = 0;
  /// The number of items.
  virtual int GetCount() = 0;
  /// Item `Index`; the menu layer raises for an index outside its items.
  virtual IPtr<IMenuItem> GetItem(int Index) = 0;
  /// Inserts at `Index` (clamped to the items) an item captioned `Caption` and named
  /// `Name`, whose click calls `OnClick` with the menu layer's item object as sender, a
  /// `TComponent` whose `Tag` is `Tag`; gives the new item.
  virtual IPtr<IMenuItem> InsertItem(int Index, const String& Caption, const String& Name, const TNotifyEvent& OnClick,
                                     int Tag) = 0;
};
struct FK_API IMenu : IInterface {
  FK_INTERFACE(IMenu, IInterface, "{4214BC72-00B4-5F5F-989B-C21B9E916BF2}")
};
struct FK_API IMainMenu : IMenu {
  FK_INTERFACE(IMainMenu, IMenu, "{43102423-65E8-559C-A65D-2518F792E797}")
};
struct FK_API IPopupMenu : IMenu {
  FK_INTERFACE(IPopupMenu, IMenu, "{C004F6C0-3ACF-55D5-BDC0-744DC9DA8224}")
  /// The popup's entries, as the sub-items of one item that is not shown.
  virtual IPtr<IMenuItem> GetItems() = 0;
};
/// One item of a menu, with its own sub-items.
struct FK_API IMenuItem : IMenuItems {
  FK_INTERFACE(IMenuItem, IMenuItems, "{97256079-5A09-5E47-8DFC-D850DC2A2EFA}")
  virtual String GetCaption() = 0;
  virtual String GetName() = 0;
  virtual bool GetChecked() = 0;
  virtual bool GetEnabled() = 0;
  virtual bool GetVisible() = 0;
  /// Whether the item is a separator line.
  virtual bool GetIsLine() = 0;
  /// The action the item runs, or null; not owned.
  virtual TComponent* GetAction() = 0;
  /// The group of radio items the item belongs to; 0 for none.
  virtual int GetGroupIndex() = 0;
  /// Whether the item is checked as one of its group.
  virtual bool GetRadioItem() = 0;
  /// The key that chooses the item; 0 for none.
  virtual int GetShortCut() = 0;
};
/// An item that can be chosen from code.
struct FK_API IMenuItem2 : IMenuItem {
  FK_INTERFACE(IMenuItem2, IMenuItem, "{F5C3E3AF-99FE-57F7-8435-FCE6885C771F}")
  /// Chooses the item: runs its action or its click handler.
  virtual void Click() = 0;
};
struct FK_API IMenuItem290 : IMenuItem2 {
  FK_INTERFACE(IMenuItem290, IMenuItem2, "{CCAD6B9A-2FA1-5AC0-8083-BE3CA60693C0}")
};
struct FK_API IDesignLocalMenu140 : IInterface {
  FK_INTERFACE(IDesignLocalMenu140, IInterface, "{B5F0098E-D3A7-5C8D-9F98-BDEDD302101F}")
};
/// What a module's designer offers for its local menu; the host's menu layer answers it.
struct FK_API IDesignLocalMenu : IDesignLocalMenu140 {
  FK_INTERFACE(IDesignLocalMenu, IDesignLocalMenu140, "{7914F0B3-A657-5192-90A1-AE942B785FC2}")
  /// A new popup with the entries of the kinds in `Filter` (the module's, the selection's,
  /// the component's); the empty set gives only the base entries. Null when none.
  virtual IPtr<IPopupMenu> BuildLocalMenu(TLocalMenuTypes Filter) = 0;
};

} // namespace formkit
