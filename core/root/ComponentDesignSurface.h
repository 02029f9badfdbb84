//===- core/root/ComponentDesignSurface.h - What a root asks of its surface ===//
//
// What a root needs of the items its framework's surface makes, and the pixels
// per inch of a parent item. The surface itself, as the root drives it
// (`IComponentDesignSurface`), is declared with its base in surface/Surface.h.
//
//===----------------------------------------------------------------------===//
#pragma once

#include "surface/Surface.h"

namespace formkit {

/// What the root needs of the items it made itself.
struct FK_API IInternalItem : IItem {
  FK_INTERFACE(IInternalItem, IItem, "{7ED7BF32-E349-11D3-AB4A-00C04FB17A72}")
  virtual IPtr<IItem> GetChildren(int Index) = 0;
  virtual int GetChildCount() = 0;
  virtual IPtr<IComponentEditor> GetEditor() = 0;
  virtual bool GetMarked() = 0;
  virtual void SetMarked(bool Value) = 0;
  virtual void SetParent(const IPtr<IItem>& Parent) = 0;
  virtual void Show() = 0;
  virtual void ZOrder(bool Front) = 0;
  virtual void FlipChildren() = 0;
};

/// The pixels per inch of a parent item; 96 when no framework sets it.
FK_API extern std::function<int(const IPtr<IItem>& Item)> GetPPIForKilnDesignerForIItemFunc;
/// The hook's value for `Item`, or 96 without a hook.
FK_API int PPIForItem(const IPtr<IItem>& Item);

} // namespace formkit
