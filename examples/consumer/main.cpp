// Opens a module, moves one of its controls by 8 pixels to the right and saves it:
//   move_button Form1.kfm Button1
#include <formkit/host/DesignHost.h>
#include <formkit/frameworks/kiln/KilnControls.h>

#include <iostream>

int main(int argc, char** argv) {
  if (argc != 3) {
    std::cerr << "usage: move_button FILE CONTROL\n";
    return 2;
  }
  try {
    formkit::TDesignSession Session;
    formkit::IPtr<formkit::IRoot> Form = Session.Open(argv[1]);
    auto* Control = dynamic_cast<formkit::TControl*>(Form->GetRoot()->FindComponent(argv[2]));
    if (!Control) throw formkit::EHostError("no control %s", argv[2]);
    Control->SetLeft(Control->Left() + 8);
    Session.RootOf(Form)->Modified();
    Session.Save(Form);
    std::cout << argv[2] << " now at " << Control->Left() << "\n";
    return 0;
  } catch (const formkit::Exception& E) {
    std::cerr << E.Message() << "\n";
    return 1;
  }
}
