//===- tests/frameworks/kiln/MessagesTest.cpp - The message queue ---------===//
#include "tests/frameworks/kiln/KilnTestSupport.h"

using namespace formkit;
using namespace formkit::kilntest;

namespace {

/// A control that writes down the user messages it receives.
class TListener : public TButton {
  FK_CLASS(TListener, TButton)
  std::vector<String>* Log = nullptr;
  void WndProc(TMessage& M) override {
    if (M.Msg >= WM_USER && M.Msg < CM_BASE) {
      Log->push_back(Format("%s %d %d", Name(), static_cast<int>(M.Msg - WM_USER), static_cast<int>(M.WParam)));
      M.Result = M.WParam * 2;
      if (M.LParam == 1) PostMessage(this, WM_USER + 9, 0, 0); // posts while handling
      if (M.LParam == 2) throw EAbort("stop");
      return;
    }
    inherited::WndProc(M);
  }
};
FK_IMPLEMENT(TListener, "MessagesTest") {}

class KilnMessages : public KilnTest {
protected:
  std::vector<String> Log;
  TListener* Listen(TComponent* Owner, const String& Name) {
    auto* L = CreateComponentOf<TListener>(Owner);
    L->SetName(Name);
    L->Log = &Log;
    return L;
  }
};

TEST_F(KilnMessages, PostedMessagesArriveInOrder) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Listen(Form.P, "A");
  auto* B = Listen(Form.P, "B");
  PostMessage(A, WM_USER + 1, 10, 0);
  PostMessage(B, WM_USER + 2, 20, 1);
  PostMessage(A, WM_USER + 3, 30, 0);
  EXPECT_TRUE(Log.empty()) << "nothing is delivered before the queue is processed";
  EXPECT_EQ(PendingMessageCount(), 3);
  EXPECT_EQ(PendingMessageCount(A), 2);
  EXPECT_EQ(ProcessMessages(), 4);
  EXPECT_EQ(Log, (std::vector<String>{"A 1 10", "B 2 20", "A 3 30", "B 9 0"}));
  EXPECT_EQ(PendingMessageCount(), 0);
}

TEST_F(KilnMessages, SentMessagesArriveAtOnce) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Listen(Form.P, "A");
  PostMessage(A, WM_USER + 1, 1, 0);
  EXPECT_EQ(SendMessage(A, WM_USER + 2, 21, 0), 42);
  EXPECT_EQ(A->Perform(WM_USER + 3, 5), 10);
  EXPECT_EQ(Log, (std::vector<String>{"A 2 21", "A 3 5"}));
  EXPECT_TRUE(HandleMessage());
  EXPECT_FALSE(HandleMessage());
  EXPECT_THROW(SendMessage(nullptr, WM_USER, 0, 0), EInvalidOperation);
  EXPECT_THROW(PostMessage(nullptr, WM_USER, 0, 0), EInvalidOperation);
}

TEST_F(KilnMessages, MessagesOfADestroyedTargetAreDropped) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Listen(Form.P, "A");
  auto* B = Listen(Form.P, "B");
  PostMessage(A, WM_USER + 1, 0, 0);
  PostMessage(B, WM_USER + 2, 0, 0);
  PostMessage(A, WM_USER + 3, 0, 0);
  A->Destroy();
  EXPECT_EQ(PendingMessageCount(), 1);
  ProcessMessages();
  EXPECT_EQ(Log, (std::vector<String>{"B 2 0"}));
}

TEST_F(KilnMessages, AFailingHandlerLeavesTheRestQueued) {
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* A = Listen(Form.P, "A");
  PostMessage(A, WM_USER + 1, 0, 2);
  PostMessage(A, WM_USER + 2, 0, 0);
  EXPECT_THROW(ProcessMessages(), EAbort);
  EXPECT_EQ(PendingMessageCount(), 1);
  ProcessMessages();
  EXPECT_EQ(Log, (std::vector<String>{"A 1 0", "A 2 0"}));
}

TEST_F(KilnMessages, AReleasedFormGoesWhenTheQueueIsProcessed) {
  struct TSink : TObject {
    TCloseAction Answer = caFree;
    void Closing(TObject*, TCloseAction& Action) { Action = Answer; }
  } Sink;
  auto* Form = CreateComponentOf<TForm>(nullptr);
  Form->Show();
  EXPECT_EQ(Screen()->ActiveForm(), Form);
  Form->OnClose = TCloseEvent::Bind<&TSink::Closing>(&Sink);
  Sink.Answer = caNone;
  Form->Close();
  EXPECT_TRUE(Form->Visible());
  Sink.Answer = caFree;
  int Forms = Screen()->FormCount();
  Form->Close();
  EXPECT_EQ(Screen()->FormCount(), Forms) << "still there until the queue runs";
  ProcessMessages();
  EXPECT_EQ(Screen()->FormCount(), Forms - 1);
  EXPECT_EQ(Screen()->ActiveForm(), nullptr);
}

TEST_F(KilnMessages, TimersTickThroughTheQueue) {
  struct TSink : TObject {
    int Ticks = 0;
    void Tick(TObject*) { ++Ticks; }
  } Sink;
  TRootGuard<TForm> Form(CreateComponentOf<TForm>(nullptr));
  auto* T = Make<TTimer>(Form.P, nullptr, "Timer1");
  T->SetInterval(100);
  T->OnTimer = TNotifyEvent::Bind<&TSink::Tick>(&Sink);
  AdvanceTimers(250);
  EXPECT_EQ(Sink.Ticks, 0);
  ProcessMessages();
  EXPECT_EQ(Sink.Ticks, 2);
  AdvanceTimers(50);
  ProcessMessages();
  EXPECT_EQ(Sink.Ticks, 3) << "the half interval left over counts";
  T->SetEnabled(false);
  AdvanceTimers(1000);
  EXPECT_EQ(ProcessMessages(), 0);
  T->SetEnabled(true);
  AdvanceTimers(100);
  T->Destroy();
  EXPECT_EQ(ProcessMessages(), 0) << "a destroyed timer's tick is dropped";
  EXPECT_THROW(AdvanceTimers(-1), EInvalidOperation);
}

} // namespace
