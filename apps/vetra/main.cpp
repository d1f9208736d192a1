#include <CLI/CLI.hpp>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <new>
#include <string>
#include <vector>

#include "gdalraster/errors.h"
#include "kernelcommand.h"
#include "methodscommand.h"
#include "rasterjob/interrupt.h"
#include "resamplecommand.h"
#include "vetra/base/utils/string/stringutils.h"
#include "vetra/faultcore/exceptions.h"
#include "vetra/version.h"
#include "warpcommand.h"

namespace {

using namespace vetra::tool;

enum ExitCode : int { eEC_OK = 0, eEC_FAILED = 1, eEC_USAGE = 2 };

int Report(const std::string& sError, ExitCode eCode) {
    std::fprintf(stderr, "vetra: error: %s\n", OneLine(sError).c_str());
    return eCode;
}

// The parser would take whatever follows the first number of --scale and --res for the second one.
// A number that stands alone is given as both.
std::vector<std::string> CompletePairs(int nArgs, char** papszArgs) {
    std::vector<std::string> oArgs;
    for (int n = 1; n < nArgs; ++n) {
        const std::string sArg = papszArgs[n];
        const std::string sName = sArg.substr(0, sArg.find('='));
        if ((sName != "--scale" && sName != "--res") || (sName == sArg && n + 1 == nArgs)) {
            oArgs.push_back(sArg);
            continue;
        }
        const std::string sFirst = sName == sArg ? papszArgs[++n] : sArg.substr(sName.size() + 1);
        const bool bSecond = n + 1 < nArgs && IsNumeric(papszArgs[n + 1]);
        const std::string sSecond = bSecond ? papszArgs[++n] : sFirst;
        oArgs.insert(oArgs.end(), {sName, sFirst, sSecond});
    }
    // The parser takes arguments from the end.
    return {oArgs.rbegin(), oArgs.rend()};
}

int Run(int nArgs, char** papszArgs) {
    CLI::App oApp("Resamples raster images.", "vetra");
    oApp.set_version_flag("--version", "vetra " VETRA_VERSION);
    oApp.require_subcommand(1);
    AddResampleCommand(oApp);
    AddWarpCommand(oApp);
    AddMethodsCommand(oApp);
    AddKernelCommand(oApp);
    try {
        oApp.parse(CompletePairs(nArgs, papszArgs));
    } catch (const CLI::Success& oHelp) {
        return oApp.exit(oHelp);
    } catch (const CLI::ParseError& oError) {
        return Report(oError.what(), eEC_USAGE);
    } catch (const UsageError& oError) {
        return Report(oError.what(), eEC_USAGE);
    } catch (const RunError& oError) {
        return Report(oError.what(), eEC_FAILED);
    } catch (const vetra::Exception& oError) {
        // Without the place in the source code, which `what()` ends with.
        return Report(oError.GetMessage(), eEC_FAILED);
    } catch (const std::bad_alloc&) {
        return Report("not enough memory", eEC_FAILED);
    } catch (const std::exception& oError) {
        return Report(oError.what(), eEC_FAILED);
    }
    return eEC_OK;
}

}  // namespace

int main(int nArgs, char** papszArgs) {
    CatchSignals();
    GdalMessages::Collect();
    try {
        return Run(nArgs, papszArgs);
    } catch (const Interrupted& oInterrupted) {
        Report("interrupted", eEC_FAILED);
        EndBySignal(oInterrupted.nSignal);
    }
}
