//===- tests/surface/SurfaceFixture.h - An engine on a test surface -------===//
#pragma once

#include "tests/fakes/TestSurface.h"

#include <gtest/gtest.h>

#include <ostream>

namespace formkit {
inline void PrintTo(const TRect& R, std::ostream* OS) {
  *OS << "(" << R.Left << ", " << R.Top << ", " << R.Right << ", " << R.Bottom << ")";
}
inline void PrintTo(const TPoint& P, std::ostream* OS) { *OS << "(" << P.X << ", " << P.Y << ")"; }
} // namespace formkit

namespace formkit::fakes {

/// A gesture engine on a fresh test surface with a form of 640 by 480 and grid 8.
class SurfaceTest : public ::testing::Test {
protected:
  void SetUp() override {
    DragChangeCounter() = 0;
    S = New<TTestSurface>();
    Tools = New<TTestTools>();
    D = New<TDesigner>(IPtr<IDesignSurface>(S), nullptr, IPtr<ITools>(Tools));
  }
  void TearDown() override { D->Close(); }

  void Press(TTestControl* C, int X, int Y, TShiftState Shift = {}, TMoveAffects Affects = {},
             bool DoubleClick = false, bool NoDrag = false) {
    S->Listener->MouseDown(S->ItemOf(C ? C : S->Root), Shift, X, Y, DoubleClick, Affects, NoDrag);
  }
  void Move(int X, int Y) { S->Listener->MouseMove(X, Y); }
  void Release(int X, int Y) { S->Listener->MouseUp(X, Y); }
  void Drag(TTestControl* C, TPoint From, TPoint To, TShiftState Shift = {}, TMoveAffects Affects = {}) {
    Press(C, From.X, From.Y, Shift, Affects);
    Move(To.X, To.Y);
    Release(To.X, To.Y);
  }
  void Key(TDesignKeyCode K, TShiftState Shift = {}, bool Up = false) { S->Listener->Key(K, Shift, 0, Up); }
  void SelectOnly(TTestControl* C) { D->Select(S->ItemOf(C), false); }
  /// The names of the selected items, anchor first.
  std::vector<String> Selected() {
    std::vector<String> R;
    IPtr<ISelections> Sel = D->GetSelections();
    for (int I = 0; I < Sel->GetCount(); ++I) R.push_back(TTestSurface::NameOf(Sel->GetItems(I)));
    return R;
  }

  IPtr<TTestSurface> S;
  IPtr<TTestTools> Tools;
  IPtr<TDesigner> D;
};

} // namespace formkit::fakes
