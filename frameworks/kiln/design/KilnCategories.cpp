//===- frameworks/kiln/design/KilnCategories.cpp - Categories of Kiln's properties ===//
#include "frameworks/kiln/design/KilnCategories.h"

#include "core/DesignIntfClasses.h"
#include "platform/Classes.h"

namespace formkit {

namespace {
struct TCategoryNames {
  const TResString& Category;
  std::vector<String> Names;
};
} // namespace

void RegisterKilnCategories() {
  const TCategoryNames Assignments[] = {
      {sLayoutCategoryName,
       {"Left", "Top", "Width", "Height", "Align", "ClientWidth", "ClientHeight", "MinSize", "ResizeStyle",
        "ButtonWidth", "ButtonHeight", "BorderWidth", "Scaled", "PixelsPerInch", "Size", "OnCanResize", "OnMoved"}},
      {sVisualCategoryName,
       {"Color", "Font", "Visible", "Caption", "BorderStyle", "BevelInner", "BevelOuter", "BevelWidth", "Shape",
        "Brush", "Pen", "Transparent", "Picture", "ShowCaptions", "ScrollBars", "Style", "WordWrap", "SimplePanel",
        "Panels", "Checked", "State", "AllowGrayed", "ImageIndex", "GroupIndex", "RadioItem", "ParentFont", "OnPaint",
        "OnShow", "OnHide"}},
      {sInputCategoryName,
       {"Enabled", "ReadOnly", "TabOrder", "TabStop", "KeyOptions", "ShortCut", "Default", "Cancel", "MaxLength",
        "OnKeyDown", "OnKeyPress", "OnChange", "OnSelectionChange", "OnStringsChange"}},
      {sMouseCategoryName, {"Cursor", "OnClick", "OnDblClick", "OnMouseDown", "OnMouseMove", "OnMouseUp"}},
      {sHelpCategoryName, {"Hint", "ShowHint", "HelpContext", "HelpKeyword", "HelpType"}},
      {sLocalizableCategoryName,
       {"Caption", "Text", "Hint", "Lines", "Strings", "Title", "Filter", "SimpleText", "Font", "Width", "Height"}},
      {sLinkageCategoryName, {"FocusControl", "ActiveControl", "PopupMenu", "Action"}},
      {sActionCategoryName, {"Category", "OnExecute", "OnUpdate"}},
      {sDataCategoryName, {"Text", "Lines", "Strings", "Date", "FileName", "DefaultExt"}},
      {sBehaviorCategoryName, {"ModalResult", "Interval", "Options", "Sorted", "OnTimer", "OnClose"}},
  };
  for (const TCategoryNames& A : Assignments)
    RegisterPropertiesInCategory(LoadResString(A.Category), TComponent::StaticClass(), A.Names);
}

} // namespace formkit
