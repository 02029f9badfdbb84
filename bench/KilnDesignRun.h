//===- bench/KilnDesignRun.h - The design core for a benchmark program -----===//
//
// The design core with the Kiln designer and a recording host, from the start of a
// benchmark program to its end, and the main function that runs the benchmarks
// between the two.
//
// Example:
//   int main(int argc, char** argv) { return bench::RunWithKilnDesigner(argc, argv); }
//   ... Run().Designer->CreateRoot(...) in a benchmark ...
//
//===----------------------------------------------------------------------===//
#pragma once

#include "core/DesignCore.h"
#include "core/Designers.h"
#include "frameworks/kiln/Kiln.h"
#include "frameworks/kiln/design/KilnDesign.h"
#include "tests/fakes/RecordingEnvironment.h"

#include <benchmark/benchmark.h>

#include <memory>

namespace formkit::bench {

/// The core, the Kiln designer and the host they answer to.
struct TKilnDesignRun {
  fakes::TCallLog Log;
  IPtr<fakes::TRecordingEnvironment> Env;
  IPtr<IComponentDesigner> Designer;

  TKilnDesignRun() {
    StartDesignCore();
    RegisterKilnDesignPackage();
    Env = New<fakes::TRecordingEnvironment>(&Log);
    InitializeDesigners(InterfaceOf<IDesignEnvironment>(Env.Get()));
    Designer = Designers()->DesignerFromExtension(".kfm");
  }
  ~TKilnDesignRun() {
    Designers()->UnregisterDesigner(Designer);
    Designer = nullptr;
    Env = nullptr;
    GetPPIForKilnDesignerForIItemFunc = nullptr;
    StopDesignCore();
    FinalizeKiln();
  }
  TKilnDesignRun(const TKilnDesignRun&) = delete;
  TKilnDesignRun& operator=(const TKilnDesignRun&) = delete;
};

/// The run of this program; valid inside the benchmarks.
inline std::unique_ptr<TKilnDesignRun>& CurrentRun() {
  static std::unique_ptr<TKilnDesignRun> Run;
  return Run;
}
inline TKilnDesignRun& Run() { return *CurrentRun(); }

/// Starts the run, runs the benchmarks the command line names, stops the run.
inline int RunWithKilnDesigner(int argc, char** argv) {
  CurrentRun() = std::make_unique<TKilnDesignRun>();
  benchmark::Initialize(&argc, argv);
  if (benchmark::ReportUnrecognizedArguments(argc, argv)) return 1;
  benchmark::RunSpecifiedBenchmarks();
  benchmark::Shutdown();
  CurrentRun().reset();
  return 0;
}

} // namespace formkit::bench
