//===- tests/desktop/DesignWindowClipboardTest.cpp - Components over the clipboard ===//
//
// A design window copies components of one Kiln module and pastes them into
// another through the clipboard of the module's framework, as the design core
// puts components there.
//
//===----------------------------------------------------------------------===//
#include "core/DesignIntfClasses.h"
#include "desktop/DesignWindows.h"
#include "tests/frameworks/kiln/design/KilnDesignFixture.h"

using namespace formkit;
using namespace formkit::fakes;

namespace {

/// A window that names what it pastes in its own way when asked to.
class TPasteWindow : public TDesignWindow {
  FK_CLASS(TPasteWindow, TDesignWindow)
public:
  String UniqueName(TComponent* AComponent) override {
    return OwnNames ? "Pasted" + std::to_string(++Named) : TDesignWindow::UniqueName(AComponent);
  }
  bool OwnNames = false;
  int Named = 0;
};
FK_IMPLEMENT(TPasteWindow, "DesktopTest") {}

class DesignWindowClipboard : public KilnDesignFixture {
protected:
  TPasteWindow* Window = nullptr;

  void SetUp() override {
    KilnDesignFixture::SetUp();
    Clipboard()->Clear();
    Window = CreateComponentOf<TPasteWindow>(nullptr);
  }
  void TearDown() override {
    FreeAndNil(Window);
    KilnDesignFixture::TearDown();
  }

  static IPtr<IDesignerSelections> SelectionOf(std::initializer_list<TPersistent*> Items) {
    IPtr<IDesignerSelections> S = InterfaceOf<IDesignerSelections>(New<TDesignerSelections>().Get());
    for (TPersistent* P : Items) S->Add(P);
    return S;
  }
  static IPtr<IDesignerSelections> EmptySelection() { return SelectionOf({}); }

  /// A control of class `T` named `Name` in `Root`'s module, standing in `Parent`.
  template <class T> static T* Put(const IPtr<IRoot>& Root, TWinControl* Parent, const String& Name, TRect R) {
    auto* C = CreateComponentOf<T>(Root->GetRoot());
    C->SetName(Name);
    C->SetParent(Parent);
    C->SetBoundsRect(R);
    return C;
  }
};

TEST_F(DesignWindowClipboard, CopiesFromOneModuleAndPastesIntoAnotherUnderTheGivenOwnerAndParent) {
  IPtr<IRoot> Source = NewForm("Form1");
  IPtr<IRoot> Target = NewForm("Form2");
  auto* Form1 = static_cast<TWinControl*>(Source->GetRoot());
  auto* Form2 = static_cast<TWinControl*>(Target->GetRoot());
  auto* Panel = Put<TPanel>(Source, Form1, "Panel1", Rect(8, 8, 200, 100));
  auto* Button = Put<TButton>(Source, Panel, "Button1", Rect(4, 4, 79, 29));
  Button->SetCaption("Go");
  auto* Edit = Put<TEdit>(Source, Form1, "Edit1", Rect(8, 120, 129, 141));
  auto* Host = Put<TPanel>(Target, Form2, "Host", Rect(0, 0, 300, 300));
  auto* Taken = Put<TButton>(Target, Form2, "Button1", Rect(0, 0, 10, 10)); // a name Form2 uses already

  Window->SetDesigner(Source->GetDesigner());
  EXPECT_FALSE(Window->ClipboardComponents()) << "an empty clipboard";
  Window->CopyComponents(Form1, SelectionOf({Panel, Edit, Form1->Font()}));
  EXPECT_TRUE(Window->ClipboardComponents());
  EXPECT_TRUE(Clipboard()->HasFormat(RegisterClipboardFormat("Tessel Components")));
  String Text = Clipboard()->AsText();
  EXPECT_EQ(Text.rfind("object Panel1: TPanel", 0), 0u) << Text;
  EXPECT_NE(Text.find("object Button1: TButton"), String::npos) << "children travel with their parent";
  EXPECT_NE(Text.find("object Edit1: TEdit"), String::npos);

  // Pasted by a window of the other module into a panel of it.
  Window->SetDesigner(Target->GetDesigner());
  IPtr<IDesignerSelections> Pasted = EmptySelection();
  Window->PasteComponents(Form2, Host, Pasted);
  ASSERT_EQ(Pasted->GetCount(), 2) << "the components read, their children aside";
  auto* NewPanel = dynamic_cast<TPanel*>(Pasted->Get(0));
  auto* NewEdit = dynamic_cast<TEdit*>(Pasted->Get(1));
  ASSERT_NE(NewPanel, nullptr);
  ASSERT_NE(NewEdit, nullptr);
  EXPECT_EQ(NewPanel->Owner(), Form2);
  EXPECT_EQ(NewPanel->Parent(), Host);
  EXPECT_EQ(NewEdit->Parent(), Host);
  EXPECT_EQ(NewPanel->Name(), "Panel1");
  EXPECT_EQ(NewEdit->Name(), "Edit1");
  EXPECT_EQ(NewPanel->BoundsRect(), Rect(8, 8, 200, 100));
  ASSERT_EQ(NewPanel->ControlCount(), 1);
  auto* NewButton = dynamic_cast<TButton*>(NewPanel->Controls(0));
  ASSERT_NE(NewButton, nullptr);
  EXPECT_EQ(NewButton->Owner(), Form2);
  EXPECT_EQ(NewButton->Caption(), "Go");
  EXPECT_NE(NewButton->Name(), "Button1") << "Form2 has a Button1: the pasted one gets a name of its own";
  EXPECT_EQ(Form2->FindComponent(NewButton->Name()), NewButton);
  EXPECT_EQ(Form2->FindComponent("Button1"), Taken);

  // A second paste finds every name taken; a window may name things its own way.
  Window->OwnNames = true;
  IPtr<IDesignerSelections> Again = EmptySelection();
  Window->PasteComponents(Form2, Form2, Again);
  ASSERT_EQ(Again->GetCount(), 2);
  EXPECT_EQ(static_cast<TComponent*>(Again->Get(0))->Name(), "Pasted1");
  EXPECT_EQ(static_cast<TComponent*>(Again->Get(1))->Name(), "Pasted3") << "the panel's button was named in between";
  EXPECT_EQ(static_cast<TControl*>(Again->Get(0))->Parent(), Form2);
}

TEST_F(DesignWindowClipboard, TextIsTakenOnlyWhenItMayBeAComponentStream) {
  IPtr<IRoot> Target = NewForm("Form1");
  auto* Form1 = static_cast<TWinControl*>(Target->GetRoot());
  Window->SetDesigner(Target->GetDesigner());

  Clipboard()->SetAsText("hello, world");
  EXPECT_FALSE(Window->ClipboardComponents());
  IPtr<IDesignerSelections> Pasted = EmptySelection();
  Window->PasteComponents(Form1, Form1, Pasted);
  EXPECT_EQ(Pasted->GetCount(), 0) << "text that is no stream reads nothing";
  EXPECT_EQ(Form1->ComponentCount(), 0);

  Clipboard()->SetAsText(" \r\n\tobject Label7: TLabel\n  Left = 16\n  Top = 24\n  Caption = \"Typed\"\nend\n");
  EXPECT_TRUE(Window->ClipboardComponents()) << "blanks before the word do not count";
  Window->PasteComponents(Form1, Form1, Pasted);
  ASSERT_EQ(Pasted->GetCount(), 1);
  auto* Label = dynamic_cast<TLabel*>(Pasted->Get(0));
  ASSERT_NE(Label, nullptr);
  EXPECT_EQ(Label->Name(), "Label7");
  EXPECT_EQ(Label->Caption(), "Typed");
  EXPECT_EQ(Label->Parent(), Form1);

  Clipboard()->SetAsText("INLINE Frame1: TFrame\nend\n");
  EXPECT_TRUE(Window->ClipboardComponents()) << "either word, in any case";
  Clipboard()->SetAsText("x object Label7: TLabel\nend\n");
  EXPECT_FALSE(Window->ClipboardComponents()) << "anything before the word refuses it";

  // Text that looks like a stream and is not one: the reader's error passes out.
  Clipboard()->SetAsText("object Broken: TLabel\n  Left = \n");
  EXPECT_TRUE(Window->ClipboardComponents());
  EXPECT_ANY_THROW(Window->PasteComponents(Form1, Form1, Pasted));
  EXPECT_EQ(Form1->FindComponent("Broken"), nullptr);
}

TEST_F(DesignWindowClipboard, AWindowWithoutAModuleHasNoClipboard) {
  IPtr<IRoot> Source = NewForm("Form1");
  auto* Form1 = static_cast<TWinControl*>(Source->GetRoot());
  auto* Button = Put<TButton>(Source, Form1, "Button1", Rect(0, 0, 75, 25));
  Clipboard()->SetAsText("object Label1: TLabel\nend\n");
  EXPECT_FALSE(Window->ClipboardComponents()) << "the failure is swallowed";
  try {
    Window->CopyComponents(Form1, SelectionOf({Button}));
    ADD_FAILURE() << "copied without a module";
  } catch (const EInvalidOperation& E) {
    EXPECT_EQ(E.Message(), "The window serves no module on design, so it has no clipboard");
  }
  EXPECT_EQ(Clipboard()->AsText(), "object Label1: TLabel\nend\n") << "the clipboard stays as it was";
  IPtr<IDesignerSelections> Pasted = EmptySelection();
  EXPECT_THROW(Window->PasteComponents(Form1, Form1, Pasted), EInvalidOperation);
  EXPECT_EQ(Pasted->GetCount(), 0);
}

} // namespace
