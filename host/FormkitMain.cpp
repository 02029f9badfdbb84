//===- host/FormkitMain.cpp - The formkit command's entry point -----------===//
#include "host/FormkitCommand.h"

#include <iostream>

int main(int argc, char** argv) {
  std::vector<formkit::String> Args(argv + 1, argv + argc);
  return formkit::RunFormkit(Args, std::cout, std::cerr);
}

// fontconfig, which cairo's text goes through, keeps a block of its configuration for the
// life of the process; a leak check of this program (in the sanitizer build) leaves it out.
extern "C" const char* __lsan_default_suppressions() { return "leak:libfontconfig.so\n"; }
