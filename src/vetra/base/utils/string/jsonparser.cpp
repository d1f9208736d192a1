#include "vetra/base/utils/string/jsonparser.h"

#include <utility>

#include "vetra/base/utils/string/jsonreader.h"
#include "vetra/base/utils/string/stringutils.h"

namespace vetra {

/// Walks trees without calls within calls: a stack would limit their depth.
class JsonTree {
 public:
    /// Copies what is below a container into an empty one of the same class.
    static void Copy(const JsonNode& oFrom, JsonNode& oTo) {
        std::vector<std::pair<const JsonNode*, JsonNode*>> vpoLeft{{&oFrom, &oTo}};
        const auto fnCopy = [&vpoLeft](const JsonNode* poNode) {
            std::unique_ptr<JsonNode> poCopy = CopyAlone(poNode);
            if (IsContainer(poNode)) {
                vpoLeft.emplace_back(poNode, poCopy.get());
            }
            return poCopy;
        };
        while (!vpoLeft.empty()) {
            const auto [poFrom, poTo] = vpoLeft.back();
            vpoLeft.pop_back();
            if (poFrom->GetType() == eJNT_LIST) {
                for (const auto& poChild : AsList(*poFrom).mvpoChildren) {
                    AsList(*poTo).mvpoChildren.push_back(fnCopy(poChild.get()));
                }
                continue;
            }
            auto& oPairs = AsMap(*poTo).mmpoPairs;
            for (const auto& [sId, poPair] : AsMap(*poFrom).mmpoPairs) {
                std::unique_ptr<JsonPair> poCopy(new JsonPair);
                poCopy->msId = sId;
                poCopy->mpoNode = fnCopy(poPair->mpoNode.get());
                oPairs.emplace_hint(oPairs.end(), sId, std::move(poCopy));
            }
        }
    }

    static std::unique_ptr<JsonNode> CopyOf(const JsonNode* poNode) {
        std::unique_ptr<JsonNode> poCopy = CopyAlone(poNode);
        if (IsContainer(poNode)) {
            Copy(*poNode, *poCopy);
        }
        return poCopy;
    }

    /// Frees the containers below one. The list of those to free goes through themselves: freeing
    /// takes no memory, so that it can't fail.
    static void Free(JsonNode& oRoot) noexcept {
        JsonNode* poFirst = nullptr;
        Detach(oRoot, poFirst);
        while (poFirst != nullptr) {
            const std::unique_ptr<JsonNode> poNode(poFirst);
            poFirst = NextToFree(*poNode);
            Detach(*poNode, poFirst);
        }
    }

 private:
    static JsonList& AsList(JsonNode& oNode) { return static_cast<JsonList&>(oNode); }
    static JsonMap& AsMap(JsonNode& oNode) { return static_cast<JsonMap&>(oNode); }
    static const JsonList& AsList(const JsonNode& oNode) {
        return static_cast<const JsonList&>(oNode);
    }
    static const JsonMap& AsMap(const JsonNode& oNode) {
        return static_cast<const JsonMap&>(oNode);
    }

    static bool IsContainer(const JsonNode* poNode) {
        return poNode != nullptr &&
               (poNode->GetType() == eJNT_LIST || poNode->GetType() == eJNT_MAP);
    }

    /// A copy of a value, or an empty container of the same class; null for null.
    static std::unique_ptr<JsonNode> CopyAlone(const JsonNode* poNode) {
        if (poNode == nullptr) {
            return nullptr;
        }
        switch (poNode->GetType()) {
            case eJNT_LIST:
                return std::unique_ptr<JsonNode>(new JsonList);
            case eJNT_MAP:
                return std::unique_ptr<JsonNode>(new JsonMap);
            default:
                return std::make_unique<JsonValue>(static_cast<const JsonValue&>(*poNode));
        }
    }

    static JsonNode*& NextToFree(JsonNode& oNode) {
        return oNode.GetType() == eJNT_LIST ? AsList(oNode).mpoNextToFree
                                            : AsMap(oNode).mpoNextToFree;
    }

    /// Puts the containers right below one at the front of the list, and frees the values.
    static void Detach(JsonNode& oNode, JsonNode*& poFirst) {
        const auto fnDetach = [&poFirst](std::unique_ptr<JsonNode>& poChild) {
            if (IsContainer(poChild.get())) {
                NextToFree(*poChild) = poFirst;
                poFirst = poChild.release();
            } else {
                poChild.reset();
            }
        };
        if (oNode.GetType() == eJNT_LIST) {
            for (auto& poChild : AsList(oNode).mvpoChildren) {
                fnDetach(poChild);
            }
        } else {
            for (auto& oEntry : AsMap(oNode).mmpoPairs) {
                fnDetach(oEntry.second->mpoNode);
            }
        }
    }
};

}  // namespace vetra

JsonNode::~JsonNode() = default;
JsonNodeType JsonNode::GetType() const { return eJNT_NODE; }

JsonValue::JsonValue() = default;
JsonValue::JsonValue(std::string text) { vetra::JsonReader(text).Read(*this); }
JsonNodeType JsonValue::GetType() const { return eJNT_VALUE; }
std::string JsonValue::GetValue() const { return msValue; }

JsonPair::JsonPair() = default;
JsonPair::JsonPair(std::string text) { vetra::JsonReader(text).Read(*this); }
JsonPair::JsonPair(const JsonPair& oOther)
    : msId(oOther.msId), mpoNode(vetra::JsonTree::CopyOf(oOther.mpoNode.get())) {}
JsonPair::JsonPair(JsonPair&& oOther) noexcept = default;
JsonPair& JsonPair::operator=(JsonPair oOther) noexcept {
    msId.swap(oOther.msId);
    mpoNode.swap(oOther.mpoNode);
    return *this;
}
JsonPair::~JsonPair() = default;
std::string JsonPair::GetId() const { return msId; }
JsonNode* JsonPair::GetNode() const { return mpoNode.get(); }

JsonMap::JsonMap() = default;
JsonMap::JsonMap(std::string text) { vetra::JsonReader(text).Read(*this); }
JsonMap::JsonMap(const JsonMap& oOther) : JsonMap() { vetra::JsonTree::Copy(oOther, *this); }
JsonMap::JsonMap(JsonMap&& oOther) noexcept : mmpoPairs(std::move(oOther.mmpoPairs)) {}
JsonMap& JsonMap::operator=(JsonMap oOther) noexcept {
    mmpoPairs.swap(oOther.mmpoPairs);
    return *this;
}
JsonMap::~JsonMap() { vetra::JsonTree::Free(*this); }
JsonNodeType JsonMap::GetType() const { return eJNT_MAP; }

JsonNode* JsonMap::GetNode(std::string id) const {
    const auto itFound = mmpoPairs.find(id);
    return itFound == mmpoPairs.end() ? nullptr : itFound->second->GetNode();
}

bool JsonMap::GetPairs(std::vector<JsonPair*>* pairs) const {
    if (pairs == nullptr) {
        return false;
    }
    pairs->clear();
    for (const auto& oEntry : mmpoPairs) {
        pairs->push_back(oEntry.second.get());
    }
    return true;
}

JsonList::JsonList() = default;
JsonList::JsonList(std::string text) { vetra::JsonReader(text).Read(*this); }
JsonList::JsonList(const JsonList& oOther) : JsonList() { vetra::JsonTree::Copy(oOther, *this); }
JsonList::JsonList(JsonList&& oOther) noexcept : mvpoChildren(std::move(oOther.mvpoChildren)) {}
JsonList& JsonList::operator=(JsonList oOther) noexcept {
    mvpoChildren.swap(oOther.mvpoChildren);
    return *this;
}
JsonList::~JsonList() { vetra::JsonTree::Free(*this); }
JsonNodeType JsonList::GetType() const { return eJNT_LIST; }

bool JsonList::GetChildren(std::vector<JsonNode*>* children) const {
    if (children == nullptr) {
        return false;
    }
    children->clear();
    for (const auto& poChild : mvpoChildren) {
        children->push_back(poChild.get());
    }
    return true;
}

JsonParser::JsonParser(std::string text)
    : mpoRoot(std::make_unique<JsonMap>(TrimWhitespace(text))) {}
JsonParser::JsonParser(const JsonParser& oOther)
    : mpoRoot(oOther.mpoRoot == nullptr ? nullptr : std::make_unique<JsonMap>(*oOther.mpoRoot)) {}
JsonParser::JsonParser(JsonParser&& oOther) noexcept = default;
JsonParser& JsonParser::operator=(JsonParser oOther) noexcept {
    mpoRoot.swap(oOther.mpoRoot);
    return *this;
}
JsonParser::~JsonParser() = default;
JsonMap* JsonParser::GetRoot() const { return mpoRoot.get(); }
