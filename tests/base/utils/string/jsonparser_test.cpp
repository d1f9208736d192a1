#include "vetra/base/utils/string/jsonparser.h"

#include <gtest/gtest.h>
#include <malloc.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstddef>
#include <ctime>
#include <functional>
#include <iterator>
#include <memory>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "tests/base/utils/string/literaljson.h"

namespace vetra::tests::literal {
namespace {

std::string Repeat(const std::string& s, std::size_t nTimes) {
    std::string sResult;
    sResult.reserve(s.size() * nTimes);
    while (nTimes-- > 0) {
        sResult += s;
    }
    return sResult;
}

// Every constructor against its literal reading.
void Compare(const std::string& sText) {
    EXPECT_EQ(ReadDocument(sText), ReadLiterally(sText)) << sText;
    EXPECT_EQ(Outcome([&] {
                  JsonList oList(sText);
                  return Describe(&oList);
              }),
              Outcome([&] { return List(sText); }))
        << sText;
    EXPECT_EQ(Outcome([&] {
                  const JsonPair oPair(sText);
                  return oPair.GetId() + '=' + Describe(oPair.GetNode());
              }),
              Outcome([&] {
                  const auto [sId, sNode] = Pair(sText);
                  return sId + '=' + sNode;
              }))
        << sText;
}

const char* const kDocuments[] = {
    "{}",
    "{ }",
    R"({"a":1,})",
    R"({"a":})",
    R"({"a":[1,2})",
    R"({"":1})",
    R"({"a:b":1})",
    R"({"a":"b:c"})",
    R"({"a"})",
    R"({"a":1,"a":2})",
    R"({"a":1,"a":[2})",
    "{a:1}",
    R"({x"a":1})",
    R"({x:1 ,"a":2})",
    R"({"a":"x\"y"})",
    R"({"a":"x{y"})",
    R"({"a":"x{y}"} ignored})",
    "{\"a\":\n[1,2]}",
    "{\"a\":\t[1]}",
    R"({"a": null,"b":NULL ,"c":"null","d":5,"e":",","f":"})",
    R"({"b":{"c":[[1],{"d":[]}]}"e":{}})",
    "",
    " \t",
    "[1]",
    "{",
    R"({x:["[:"[:"]:"]})",
};

TEST(Json, LiteralCases) {
    for (const char* pszText : kDocuments) {
        Compare(pszText);
        Compare(std::string("[") + pszText + ']');
        Compare(std::string(R"("key" : )") + pszText);
    }
    const std::pair<const char*, const char*> aoLists[] = {
        {"[]", "[]"},
        {"[ ]", "[]"},
        {"[1,2,]", "[1:1 1:2 ]"},
        {R"(["a" "b"])", "[1:a 1:b ]"},
        {"[1,,2]", "[1:1 2:,2 ]"},
        {"[1] x]", "[1:1 ]"},
        {"[[1,2]", "[[1:1 1:2 ] ]"},
        {R"(["x\"y"])", "[2:x\\ 2:y\" ]"},
        {R"([null Null,"null"])", "[9:null Null 4:null ]"},
    };
    for (const auto& [pszText, pszTree] : aoLists) {
        JsonList oList{std::string(pszText)};
        EXPECT_EQ(Describe(&oList), pszTree);
        Compare(pszText);
    }
    EXPECT_EQ(ReadDocument(" [1]"), "fails in JsonMap::JsonMap");
    EXPECT_EQ(ReadDocument(R"({"a":[1,2})"), "fails in JsonList::JsonList");
    EXPECT_EQ(ReadDocument(R"({"a:b":1})"), "fails in JsonPair::JsonPair");
    EXPECT_EQ(ReadDocument("{a:1}"), "fails with out_of_range");
    EXPECT_EQ(ReadDocument(R"({x"a":1})"), "{1:a=1:1 }");
}

TEST(Json, MutatedTexts) {
    const char* const apszPieces[] = {"{",  "}",  "[", "]", "\"",    ":",      ",",    "\\", " ",
                                      "\n", "\t", "a", "1", "\"a\"", "\"b\":", "null", "{}", "[]"};
    std::mt19937 oRandom(1);
    const auto fnBelow = [&](std::size_t n) { return static_cast<std::size_t>(oRandom() % n); };
    const auto fnPiece = [&] { return apszPieces[fnBelow(std::size(apszPieces))]; };
    for (int nText = 0; nText < 40000; ++nText) {
        std::string sText = "{";
        if (nText % 2 == 0) {
            sText = kDocuments[fnBelow(std::size(kDocuments))];
            for (std::size_t n = 1 + fnBelow(6); n > 0; --n) {
                const std::size_t nAt = fnBelow(sText.size() + 1);
                sText.replace(nAt, fnBelow(3), fnBelow(4) == 0 ? "" : fnPiece());
            }
        } else {
            for (std::size_t n = fnBelow(40); n > 0; --n) {
                sText += fnPiece();
            }
            sText += '}';
        }
        Compare(sText);
        if (HasFailure()) {
            return;
        }
    }
}

double Seconds(const std::function<void()>& fnWork) {
    const std::clock_t nStart = std::clock();
    fnWork();
    return static_cast<double>(std::clock() - nStart) / CLOCKS_PER_SEC;
}

// Far above what a sanitizer on a slow machine needs, far below what anything quadratic does.
constexpr double kManySeconds = 30.0;

TEST(Json, TimeIsLinear) {
    constexpr std::size_t kEntries = 500'000;
    std::string sMap = "{";
    for (std::size_t n = 0; n < kEntries; ++n) {
        sMap += '"' + std::to_string(n) + "\":1,";
    }
    const std::string sList = R"({"a":[)" + Repeat("12345678, ", kEntries) + "]}";
    EXPECT_LT(Seconds([&] {
                  std::vector<JsonPair*> vpoPairs;
                  const JsonParser oMap(sMap + '}');
                  oMap.GetRoot()->GetPairs(&vpoPairs);
                  EXPECT_EQ(vpoPairs.size(), kEntries);
              }),
              kManySeconds);
    EXPECT_LT(Seconds([&] {
                  std::vector<JsonNode*> vpoChildren;
                  const JsonParser oList(sList);
                  static_cast<JsonList*>(oList.GetRoot()->GetNode("a"))->GetChildren(&vpoChildren);
                  EXPECT_EQ(vpoChildren.size(), kEntries);
              }),
              kManySeconds);

    // Whatever is repeated, closed or not.
    const char* const apszPieces[] = {"{", "}", "[", "]", "\"", ":", ",", "\\", " ", "x", "\"a\":"};
    std::mt19937 oRandom(2);
    for (int nUnit = 0; nUnit < 100; ++nUnit) {
        std::string sUnit;
        for (auto n = 1 + oRandom() % 7; n > 0; --n) {
            sUnit += apszPieces[oRandom() % std::size(apszPieces)];
        }
        const std::string sText = (nUnit % 2 == 0 ? R"({"a":[)" : "{") +
                                  Repeat(sUnit, 200'000 / sUnit.size()) +
                                  (nUnit % 3 == 0 ? "}" : "]}");
        EXPECT_LT(Seconds([&] {
                      Outcome([&] {
                          JsonParser oParser(sText);
                          return std::string();
                      });
                  }),
                  2.0)
            << sUnit;
    }
}

constexpr std::size_t kDepth = 1'000'000;
const std::string kOpenLists = R"({"a":)" + std::string(kDepth, '[');

std::size_t DepthOf(JsonNode* poNode) {
    std::size_t nDepth = 0;
    for (;; ++nDepth) {
        std::vector<JsonNode*> vpoBelow;
        std::vector<JsonPair*> vpoPairs;
        if (poNode->GetType() == eJNT_LIST) {
            static_cast<JsonList*>(poNode)->GetChildren(&vpoBelow);
        } else if (poNode->GetType() == eJNT_MAP) {
            static_cast<JsonMap*>(poNode)->GetPairs(&vpoPairs);
        }
        if (vpoBelow.empty() && vpoPairs.empty()) {
            return nDepth;
        }
        poNode = vpoPairs.empty() ? vpoBelow.front() : vpoPairs.front()->GetNode();
    }
}

TEST(Json, DeepNesting) {
    for (const std::string& sText : {kOpenLists + std::string(kDepth, ']') + '}',
                                     Repeat(R"({"a":)", kDepth) + '1' + Repeat("}", kDepth),
                                     Repeat(R"({"a":)", kDepth) + '}'}) {
        EXPECT_LT(Seconds([&] {
                      const JsonParser oParser(sText);
                      const JsonParser oCopy(oParser);
                      EXPECT_EQ(DepthOf(oCopy.GetRoot()), kDepth);
                  }),
                  kManySeconds);
    }
    for (const std::string& sText :
         {kOpenLists, kOpenLists + '}', kOpenLists + std::string(kDepth / 2, ']') + '}',
          Repeat(R"({"a":)", kDepth), Repeat(R"({"a":[")", kDepth) + '}'}) {
        std::string sOutcome;
        EXPECT_LT(Seconds([&] { sOutcome = Outcome([&] { return JsonParser(sText), ""; }); }),
                  kManySeconds);
        EXPECT_EQ(sOutcome.rfind("fails in Json", 0), 0u) << sOutcome;
    }
}

// The most memory that a process of its own has while it reads a text, per byte of it.
double MemoryPerByte(const std::string& sText) {
    int anPipe[2];
    EXPECT_EQ(pipe(anPipe), 0);
    malloc_trim(0);
    const pid_t nChild = fork();
    if (nChild == 0) {
        const auto fnPeak = [] {
            rusage oUsage{};
            getrusage(RUSAGE_SELF, &oUsage);
            return oUsage.ru_maxrss;
        };
        const long nBefore = fnPeak();
        Outcome([&] { return JsonParser(sText), ""; });
        const long nGrown = fnPeak() - nBefore;
        _exit(write(anPipe[1], &nGrown, sizeof nGrown) == sizeof nGrown ? 0 : 1);
    }
    close(anPipe[1]);
    long nGrown = 0;
    EXPECT_EQ(read(anPipe[0], &nGrown, sizeof nGrown), ssize_t{sizeof nGrown});
    close(anPipe[0]);
    waitpid(nChild, nullptr, 0);
    return static_cast<double>(nGrown) * 1024.0 / static_cast<double>(sText.size());
}

TEST(Json, MemoryIsLinear) {
#if defined(__has_feature)
#if __has_feature(address_sanitizer)
    GTEST_SKIP() << "the sanitizer's own memory counts";
#endif
#endif
    for (const std::string& sText :
         {kOpenLists + std::string(kDepth, ']') + '}', kOpenLists + '}',
          Repeat(R"({"a":)", kDepth) + Repeat("}", kDepth), "{" + Repeat(R"("a":1)", kDepth) + '}',
          R"({"a":[)" + Repeat("1,", kDepth) + "]}"}) {
        const double dfMemory = MemoryPerByte(sText);
        EXPECT_LT(dfMemory, 200.0) << sText.substr(0, 20) << sText.size();
        EXPECT_GT(dfMemory, 1.0);
    }
}

TEST(Json, CopiesAreDeepAndMovesEmpty) {
    const std::string sText = R"({"a":[1,{"b":[null]}],"c":{"d":"e"}"x"})";
    auto poParser = std::make_unique<JsonParser>(sText);
    const std::string sTree = Describe(poParser->GetRoot());
    JsonParser oCopy(*poParser);
    JsonMap oMap(*poParser->GetRoot());
    JsonList oList(*static_cast<JsonList*>(oMap.GetNode("a")));
    std::vector<JsonPair*> vpoPairs;
    ASSERT_TRUE(poParser->GetRoot()->GetPairs(&vpoPairs));
    JsonPair oPair(*vpoPairs.back());
    poParser.reset();

    EXPECT_EQ(Describe(oCopy.GetRoot()), sTree);
    EXPECT_EQ(Describe(&oMap), sTree);
    EXPECT_EQ(Describe(&oList), Describe(oMap.GetNode("a")));
    EXPECT_EQ(Describe(oPair.GetNode()), Describe(oMap.GetNode("c")));
    EXPECT_EQ(oMap.GetNode(""), nullptr);

    // From a part of itself, and from itself.
    oMap = *static_cast<JsonMap*>(oMap.GetNode("c"));
    EXPECT_EQ(Describe(&oMap), "{1:d=1:e }");
    std::vector<JsonNode*> vpoChildren;
    ASSERT_TRUE(oList.GetChildren(&vpoChildren));
    JsonMap oInner(*static_cast<JsonMap*>(vpoChildren.back()));
    oList = *static_cast<JsonList*>(oInner.GetNode("b"));
    EXPECT_EQ(Describe(&oList), "[0: ]");
    const JsonList& oSame = oList;
    oList = oSame;
    EXPECT_EQ(Describe(&oList), "[0: ]");

    const JsonParser oMoved(std::move(oCopy));
    EXPECT_EQ(Describe(oMoved.GetRoot()), sTree);
    EXPECT_EQ(oCopy.GetRoot(), nullptr);
    EXPECT_EQ(JsonParser(oCopy).GetRoot(), nullptr);
    JsonMap oTaken(std::move(oMap));
    EXPECT_EQ(Describe(&oMap), "{}");
    oMap = std::move(oTaken);
    EXPECT_EQ(Describe(&oMap), "{1:d=1:e }");
    JsonPair oPairTaken(std::move(oPair));
    oPair = oPairTaken;
    EXPECT_EQ(Describe(oPair.GetNode()), Describe(oPairTaken.GetNode()));
    EXPECT_NE(oPair.GetNode(), oPairTaken.GetNode());
}

TEST(Json, Interface) {
    EXPECT_EQ(JsonNode().GetType(), 0);
    EXPECT_EQ(JsonValue(" NuLL ").GetType(), 1);
    EXPECT_EQ(JsonMap("{}").GetType(), 2);
    EXPECT_EQ(JsonList("[]").GetType(), 3);
    for (const char* pszText : {" NuLL ", "\"\"", ""}) {
        EXPECT_EQ(JsonValue(pszText).GetValue(), "") << pszText;
    }
    EXPECT_EQ(JsonValue("\"").GetValue(), "\"");
    EXPECT_EQ(JsonValue(R"(" \u0041\n ")").GetValue(), R"( \u0041\n )");

    const JsonMap oMap(R"({"b":1,"ab":2,"a":3,"A":4,"ÿ":5})");
    std::vector<JsonPair*> vpoPairs(7);
    ASSERT_TRUE(oMap.GetPairs(&vpoPairs));
    std::string sIds;
    for (const JsonPair* poPair : vpoPairs) {
        sIds += poPair->GetId() + ' ';
    }
    EXPECT_EQ(sIds, "A a ab b ÿ ");
    EXPECT_FALSE(oMap.GetPairs(nullptr));
    EXPECT_FALSE(JsonList("[1]").GetChildren(nullptr));
}

}  // namespace
}  // namespace vetra::tests::literal
