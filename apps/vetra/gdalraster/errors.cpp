#include "gdalraster/errors.h"

#include <cpl_error.h>

#include <algorithm>
#include <mutex>

namespace vetra::tool {

namespace {

struct Messages {
    std::mutex oMutex;
    std::string sFailure;
    std::string sWhat;  // what its thread could not do
    std::vector<std::string> oWarnings;
};

// Never destroyed: GDAL may report while the process ends.
Messages& GetMessages() {
    static Messages* const poMessages = new Messages;
    return *poMessages;
}

thread_local std::string sActivity;

// Damage that a driver reports as a warning, filling up with invented pixels.
bool TellsOfMissingPixels(const std::string& sMessage) {
    return sMessage.find("Premature end of") != std::string::npos;
}

// The mutex must be held.
void AddWarning(std::vector<std::string>& oWarnings, const std::string& sWarning) {
    if (std::find(oWarnings.begin(), oWarnings.end(), sWarning) == oWarnings.end()) {
        oWarnings.push_back(sWarning);
    }
}

void CPL_STDCALL Keep(CPLErr eClass, CPLErrorNum nNumber, const char* pszMessage) {
    if (eClass == CE_Debug) {
        CPLDefaultErrorHandler(eClass, nNumber, pszMessage);
        return;
    }
    const std::string sMessage = OneLine(pszMessage);
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    if (eClass >= CE_Failure || TellsOfMissingPixels(sMessage)) {
        if (oMessages.sFailure.empty()) {
            oMessages.sFailure = sMessage;
            oMessages.sWhat = sActivity;
        }
        return;
    }
    AddWarning(oMessages.oWarnings, sMessage);
}

}  // namespace

std::string OneLine(const std::string& sText) {
    std::string sLine;
    for (const char c : sText) {
        if (static_cast<unsigned char>(c) > ' ' && c != '\x7f') {
            sLine += c;
        } else if (!sLine.empty() && sLine.back() != ' ') {
            sLine += ' ';
        }
    }
    if (!sLine.empty() && sLine.back() == ' ') {
        sLine.pop_back();
    }
    return sLine;
}

// The process-wide handler, because a handler that is pushed serves its own thread only.
void GdalMessages::Collect() { CPLSetErrorHandler(Keep); }

void GdalMessages::Attribute(const std::string& sWhat) { sActivity = sWhat; }

void GdalMessages::ForgetFailures() {
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    oMessages.sFailure.clear();
}

std::string GdalMessages::GetFailure() {
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    return oMessages.sFailure;
}

void GdalMessages::Demote(const std::string& sWhat) {
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    if (!oMessages.sFailure.empty()) {
        AddWarning(oMessages.oWarnings, sWhat + ": " + oMessages.sFailure);
        oMessages.sFailure.clear();
    }
}

void GdalMessages::ThrowIfFailed(const std::string& sWhat) {
    if (!GetFailure().empty()) {
        Throw(sWhat);
    }
}

void GdalMessages::Throw(const std::string& sWhat) {
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    if (oMessages.sFailure.empty()) {
        throw RunError(sWhat);
    }
    throw RunError((oMessages.sWhat.empty() ? sWhat : oMessages.sWhat) + ": " + oMessages.sFailure);
}

std::vector<std::string> GdalMessages::GetWarnings() {
    Messages& oMessages = GetMessages();
    const std::lock_guard<std::mutex> oLock(oMessages.oMutex);
    return oMessages.oWarnings;
}

}  // namespace vetra::tool
