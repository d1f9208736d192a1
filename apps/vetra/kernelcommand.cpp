#include "kernelcommand.h"

#include <cstdio>
#include <memory>
#include <string>

#include "gdalraster/errors.h"
#include "kernel/kernelplot.h"
#include "kernel/kernelweights.h"
#include "methods.h"
#include "rasterjob/targetfile.h"

namespace vetra::tool {

namespace {

struct KernelOptions {
    std::string sMethod;
    std::string sFile;
    std::string sPlot;
};

void Print(const std::string& sText) {
    if (std::fputs(sText.c_str(), stdout) < 0 || std::fflush(stdout) != 0) {
        throw RunError("can't write to the standard output");
    }
}

void RunKernel(const KernelOptions& oOptions) {
    const std::unique_ptr<utils::IRasterResampler> poResampler = MakeResampler(oOptions.sMethod);
    const bool bPlot = !oOptions.sPlot.empty();
    const bool bFile = !oOptions.sFile.empty();
    // All texts before the first file.
    std::string sWeights;
    if (bFile || !bPlot) {
        sWeights = ToKernelFileText(GetKernelWeights(*poResampler));
    }
    if (bPlot) {
        const std::string sPicture = DrawKernel(*poResampler, oOptions.sMethod);
        const std::filesystem::path oPlot = ResolveTarget(oOptions.sPlot);
        if (bFile && ResolveTarget(oOptions.sFile) == oPlot) {
            throw UsageError("-o and --plot name the same file");
        }
        WriteTextFile(oPlot, sPicture);
    }
    if (bFile) {
        WriteTextFile(ResolveTarget(oOptions.sFile), sWeights);
    } else if (!bPlot) {
        Print(sWeights);
    }
}

}  // namespace

void AddKernelCommand(CLI::App& oApp) {
    CLI::App* poCommand =
        oApp.add_subcommand("kernel", "Write the weights of a resampling method, or draw them.");
    const auto poOptions = std::make_shared<KernelOptions>();
    poCommand
        ->add_option("METHOD", poOptions->sMethod,
                     "The method, with its keys: NAME[,KEY=VALUE...]; vetra methods lists all")
        ->required()
        ->type_name("");
    poCommand
        ->add_option("-o,--output", poOptions->sFile,
                     "Write the weights to this kernel file; to the standard output by default")
        ->type_name("FILE");
    poCommand
        ->add_option("--plot", poOptions->sPlot,
                     "Draw the impulse response and the frequency response, with their figures,\n"
                     "as SVG; the weights are written only where -o says so")
        ->type_name("FILE");
    poCommand->footer(
        "The weights are for --method KERNEL,FILE=... of vetra resample: edit them as you like.\n"
        "They are those of every fraction p/64 of a position, and where an image's positions\n"
        "are such fractions a kernel gives what the method gives. Those of a squared method act\n"
        "on square roots: use them with SQKERNEL. MEDIAN has none; those of CPLXSAR are complex\n"
        "and can only be drawn.\n"
        "AVERAGE is written as the method places its window: from the nearest pixel on, to the\n"
        "right and down. vetra resample moves AVERAGE to lie around the position, but not a "
        "kernel.");
    poCommand->callback([poOptions] { RunKernel(*poOptions); });
}

}  // namespace vetra::tool
