//===- tests/host/StructurePrintTest.cpp - A module's structure tree as text ===//
//
// The structure tree of an example module printed through its sprigs, with and
// without class names, a subtree printed from its own depth, and the refusal to
// print a module no tree follows.
//
//===----------------------------------------------------------------------===//
#include "host/DesignHost.h"
#include "host/StructurePrint.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace formkit;

namespace {

String Example(const String& File) { return String(FK_EXAMPLES_DIR) + "/" + File; }

TEST(StructurePrintTest, TheTreeFollowsTheDesignerAndPrintsItsCaptionsIndented) {
  InitializeStructureTree();
  TDesignSession Session;
  InitDesignNotification();
  IPtr<IRoot> Form1 = Session.Open(Example("Form1.kfm"));
  std::ostringstream Out;
  PrintStructure(Form1, Out);
  EXPECT_TRUE(Out.str().starts_with("Form1\n  Panel1\n    CheckBox1\n    Edit1\n    Label1\n  Frame11\n")) << Out.str();
  EXPECT_FALSE(GShowClassNameInTreeView);

  // With class names, and again after the class names are off: the global is restored.
  Out.str("");
  PrintStructure(Form1, Out, true);
  EXPECT_TRUE(Out.str().starts_with("Form1 (TForm1)\n  Panel1 (TPanel)\n")) << Out.str();
  EXPECT_FALSE(GShowClassNameInTreeView);

  // A subtree from its own depth.
  TRootSprig* Tree = nullptr;
  ASSERT_TRUE(RootSprigList()->FindRoot(Form1->GetDesigner(), Tree));
  Out.str("");
  PrintSprigTree(Tree->Find("Panel1"), Out, 1);
  EXPECT_EQ(Out.str(), "  Panel1\n    CheckBox1\n    Edit1\n    Label1\n");
}

TEST(StructurePrintTest, AModuleNoTreeFollowsIsRefused) {
  InitializeStructureTree();
  TDesignSession Session; // no listener of the designers: no tree
  IPtr<IRoot> Form1 = Session.Open(Example("Form1.kfm"));
  std::ostringstream Out;
  try {
    PrintStructure(Form1, Out);
    FAIL() << "printed a module without a tree";
  } catch (const EHostError& E) {
    EXPECT_STREQ(E.what(), "No structure tree follows module Form1");
  }
  EXPECT_EQ(Out.str(), "");
}

} // namespace
