//===- fuzz/module_open/ModuleOpenFuzz.cpp - Modules opened from the fuzzer ===//
//
// Opens each input as a form file through the Kiln designer, the way a host
// does (`CreateRootFromStream`), with an ancestor module "Form1" open beside it
// so that inherited streams find their ancestor. The user's answers to read
// errors and to lost inherited components come from the input's hash: go on,
// go on past all, cancel; delete, create, cancel.
//
// A failed open must raise an `Exception` and leave the designer's list of
// modules as it was; anything else is a finding. A module that opens is written
// back (`GetRootStream`), opened again from that image to the same image, and
// closed.
//
// Example:
//   build/test/fuzz/module_open/fk_fuzz_module_open -runs=100000 scratch/ fuzz/module_open/corpus/
//
//===----------------------------------------------------------------------===//
#include "core/DesignCore.h"
#include "core/Designers.h"
#include "core/root/ComponentRoot.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "tests/fakes/RecordingEnvironment.h"
#include "tests/fakes/RecordingModule.h"

#include <cstdlib>
#include <cstring>

using namespace formkit;
using namespace formkit::fakes;

namespace {

struct TSession {
  TCallLog Log;
  IPtr<TRecordingEnvironment> Env;
  IPtr<IComponentDesigner> Designer;
  IPtr<IRoot> Ancestor;
};
TSession* Session = nullptr;

TComponentRoot* RootOf(const IPtr<IRoot>& Root) {
  auto Internal = QueryAs<IInternalRoot>(Root);
  return Internal ? dynamic_cast<TComponentRoot*>(Internal->Implementor()) : nullptr;
}

/// The ancestor that inherited inputs name: a form with a button, a label and a panel.
IPtr<IRoot> OpenAncestor() {
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Form1.kfm", &Session->Log);
  IPtr<IRoot> Root = Session->Designer->CreateRoot(InterfaceOf<IDesignerModule>(Module.Get()), "Form1.kfm", false,
                                                   "Form1", "", "", nullptr, "");
  TComponentRoot* Form = RootOf(Root);
  TComponent* Panel = Form->CreateComponent(TPanel::StaticClass(), Root->GetRoot(), 8, 80, 185, 41);
  Form->CreateComponent(TButton::StaticClass(), Root->GetRoot(), 8, 8, 75, 25);
  Form->CreateComponent(TLabel::StaticClass(), Panel, 8, 8, 65, 17);
  return Root;
}

IPtr<IRoot> OpenFromBytes(const std::uint8_t* Data, std::size_t Size) {
  auto* Bytes = new TBytesStream(std::vector<std::uint8_t>(Data, Data + Size));
  IPtr<IDatedStream> Stream = NewAs<IDatedStream, TDatedStreamAdapter>(Bytes, 1, soOwned);
  IPtr<TRecordingModule> Module = New<TRecordingModule>("Fuzz.kfm", &Session->Log);
  Module->AncestorClassName = "TForm1";
  return Session->Designer->CreateRootFromStream(InterfaceOf<IDesignerModule>(Module.Get()), "Fuzz.kfm", "", Stream,
                                                 nullptr, "");
}

std::vector<std::uint8_t> ImageOf(const IPtr<IRoot>& Root) {
  TStream* Image = RootOf(Root)->GetRootStream();
  std::vector<std::uint8_t> Bytes(static_cast<std::size_t>(Image->Size()));
  Image->SetPosition(0);
  if (!Bytes.empty()) Image->ReadBuffer(Bytes.data(), static_cast<std::int64_t>(Bytes.size()));
  return Bytes;
}

[[noreturn]] void Finding(const char* What) {
  std::fprintf(stderr, "finding: %s\n", What);
  std::abort();
}

void Answer(std::uint32_t Hash) {
  static const TRootReadErrorResult Reads[] = {rerOK, rerIgnoreAll, rerCancel, rerOK};
  static const TRecoveryResult Recoveries[] = {rrDelete, rrCreate, rrCancel, rrDelete};
  TRootReadErrorResult Read = Reads[Hash & 3];
  TRecoveryResult Recovery = Recoveries[(Hash >> 2) & 3];
  TKilnRoot::ReadErrorAnswer = [Read](const String&) { return Read; };
  TKilnRoot::AncestorRecoveryAnswer = [Recovery](const String&, const String&, String&, const String&, bool) {
    return Recovery;
  };
}

std::uint32_t Hash(const std::uint8_t* Data, std::size_t Size) {
  std::uint32_t H = 2166136261u;
  for (std::size_t I = 0; I < Size; ++I) H = (H ^ Data[I]) * 16777619u;
  return H;
}

/// Closes the session at exit, so that what stays alive is a leak of a run.
void EndSession() {
  Session->Ancestor->Close();
  Session->Ancestor = nullptr;
  Designers()->UnregisterDesigner(Session->Designer);
  Session->Designer = nullptr;
  TKilnRoot::ReadErrorAnswer = nullptr;
  TKilnRoot::AncestorRecoveryAnswer = nullptr;
  StopDesignCore();
  FinalizeKiln();
  delete std::exchange(Session, nullptr);
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***) {
  StartDesignCore();
  RegisterKilnDesignPackage();
  Session = new TSession;
  Session->Env = New<TRecordingEnvironment>(&Session->Log);
  InitializeDesigners(InterfaceOf<IDesignEnvironment>(Session->Env.Get()));
  Session->Designer = Designers()->DesignerFromExtension(".kfm");
  Session->Ancestor = OpenAncestor();
  Session->Log.Clear();
  std::atexit(EndSession);
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* Data, std::size_t Size) {
  Answer(Hash(Data, Size));
  int Roots = Session->Designer->GetRootsCount();
  IPtr<IRoot> Root;
  try {
    Root = OpenFromBytes(Data, Size);
  } catch (const Exception&) {
    if (Session->Designer->GetRootsCount() != Roots) Finding("a failed open changed the designer's list");
  }
  if (Root) {
    try {
      std::vector<std::uint8_t> Image = ImageOf(Root);
      Root->Close();
      Root = nullptr;
      IPtr<IRoot> Again = OpenFromBytes(Image.data(), Image.size());
      if (ImageOf(Again) != Image) Finding("a written module reads back differently");
      Again->Close();
    } catch (const Exception&) {
      // A module that opened may still hold what cannot be written (a link to a module
      // that is not open): the refusal is an exception, the module is closed.
      if (Root) Root->Close();
    }
  }
  Session->Log.Clear();
  return 0;
}
