#ifndef VETRA_TESTS_SUPPORT_REFUSAL_H
#define VETRA_TESTS_SUPPORT_REFUSAL_H

#include <gtest/gtest.h>

#include <ostream>
#include <string>
#include <typeinfo>

#include "vetra/faultcore/exceptions.h"

namespace vetra::tests {

/// What a `ParameterException` carries, in the order of its constructor's arguments.
struct Refusal {
    std::string sArgument;
    int nType;
    std::string sGot;
    std::string sExpected;
    std::string sMessage;

    bool operator==(const Refusal&) const = default;
};

inline void PrintTo(const Refusal& oRefusal, std::ostream* poOut) {
    *poOut << '"' << oRefusal.sArgument << "\", " << oRefusal.nType << ", \"" << oRefusal.sGot
           << "\", \"" << oRefusal.sExpected << "\", \"" << oRefusal.sMessage << '"';
}

/// Expects the call to throw exactly this, with a location that is relative to the source
/// tree.
template <typename Function>
void ExpectRefusal(const Refusal& oExpected, Function fnCall) {
    try {
        fnCall();
        ADD_FAILURE() << "nothing was thrown instead of \"" << oExpected.sMessage << '"';
    } catch (const ParameterException& oCaught) {
        EXPECT_EQ((Refusal{oCaught.GetArgument(), oCaught.GetType(), oCaught.GetGot(),
                           oCaught.GetExpected(), oCaught.GetMessage()}),
                  oExpected);
        EXPECT_TRUE(typeid(oCaught) == typeid(ParameterException));
        EXPECT_NE(oCaught.GetFile().find("vetra/"), std::string::npos) << oCaught.GetFile();
        EXPECT_NE(oCaught.GetFile().front(), '/') << oCaught.GetFile();
        EXPECT_NE(oCaught.GetFunction(), "");
        EXPECT_NE(oCaught.GetLine(), 0u);
    }
}

}  // namespace vetra::tests

#endif  // VETRA_TESTS_SUPPORT_REFUSAL_H
