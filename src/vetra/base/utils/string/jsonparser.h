#ifndef VETRA_BASE_UTILS_STRING_JSONPARSER_H
#define VETRA_BASE_UTILS_STRING_JSONPARSER_H

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "vetra/export.h"

/// \file
/// A reader of JSON-like text into a tree of text nodes. Nothing is converted: numbers and booleans
/// stay text, and so do backslash sequences. The language is not standard JSON:
///
///   - Commas between entries are optional where an entry ends by its own closer, and one behind
///     the last entry is allowed. What stands behind the bracket that ends the entries is ignored,
///     as long as the text ends with that bracket.
///   - An entry that doesn't begin with a bracket or a double quote ends ahead of the next comma or
///     closing bracket of its container; its first character is not looked at: [1,,2] holds "1" and
///     ",2".
///   - One that does ends where its bracket or quote closes. Brackets inside strings count: a pair
///     of them does no harm, one alone carries the entry to the end of its container. A backslash
///     protects the next character in the entries of a map, and is like any other in those of a
///     list.
///   - Only blanks are passed over between a colon and what follows as an opening bracket or quote;
///     behind a tab or line end the value is looked for as one without.
///   - The first colon of a pair ends its key, so a key can't hold one. Whatever stands ahead of
///     the first double quote of a pair is dropped: {x"a":1} is {"a":1}. When that quote stands
///     behind the value, the pair's text is empty: {x:1 ,"a":2} holds a pair without id and node,
///     and "a".
///   - Of pairs with the same id the first one counts.
///
/// Time and memory are linear in the length of the text, whatever its nesting, but for the
/// comparisons of ids; depth is not limited by the stack, in reading, copying or freeing.
///
/// Every node owns what is below it: pointers that are handed out live as long as the object they
/// came from. Copies are deep. A moved-from object is empty.

namespace vetra {
class JsonReader;
class JsonTree;
}  // namespace vetra

/// The class of a node.
enum JsonNodeType {
    eJNT_NODE = 0,   ///< a plain `JsonNode`
    eJNT_VALUE = 1,  ///< `JsonValue`
    eJNT_MAP = 2,    ///< `JsonMap`
    eJNT_LIST = 3    ///< `JsonList`
};

/// A node of a tree. `GetType` says which class to cast it to.
class VETRA_EXPORT JsonNode {
 public:
    /// A plain node, which holds nothing.
    JsonNode() = default;
    /// A copy.
    JsonNode(const JsonNode&) = default;
    /// A copy.
    JsonNode& operator=(const JsonNode&) = default;
    virtual ~JsonNode();

    /// The class of this node.
    virtual JsonNodeType GetType() const;
};

/// A string, number, boolean or null, as text.
class VETRA_EXPORT JsonValue : public JsonNode {
 public:
    /// The text, trimmed, without the double quotes around it; the empty text for null in any case
    /// of letters, unless in quotes.
    explicit JsonValue(std::string text);

    /// The class of this node.
    JsonNodeType GetType() const override;
    /// The text.
    std::string GetValue() const;

 private:
    friend class vetra::JsonReader;
    JsonValue();

    std::string msValue;
};

/// An id and its node.
class VETRA_EXPORT JsonPair {
 public:
    /// Reads an id in double quotes, a colon and a value. Without a colon id and node are empty.
    /// \throws vetra::Exception when the id is not in double quotes, or the value is malformed.
    explicit JsonPair(std::string text);
    /// A deep copy.
    JsonPair(const JsonPair& oOther);
    /// Takes over the nodes of the other one, which is empty then.
    JsonPair(JsonPair&& oOther) noexcept;
    /// Replaces the nodes; those of before are freed.
    JsonPair& operator=(JsonPair oOther) noexcept;
    virtual ~JsonPair();

    /// The id, without its quotes; empty for a text without a colon.
    std::string GetId() const;
    /// Null for a text without a colon.
    JsonNode* GetNode() const;

 private:
    friend class vetra::JsonReader;
    friend class vetra::JsonTree;
    JsonPair();

    std::string msId;
    std::unique_ptr<JsonNode> mpoNode;
};

/// Pairs in the order of their ids' bytes.
class VETRA_EXPORT JsonMap : public JsonNode {
 public:
    /// Reads pairs in braces; nothing may stand around them.
    /// \throws vetra::Exception with the message "Malformed JSON string" and, as its function, the
    ///         constructor that refused its part of the text.
    /// \throws std::out_of_range when no double quote is left where a pair should stand.
    explicit JsonMap(std::string text);
    /// A deep copy.
    JsonMap(const JsonMap& oOther);
    /// Takes over the nodes of the other one, which is empty then.
    JsonMap(JsonMap&& oOther) noexcept;
    /// Replaces the nodes; those of before are freed.
    JsonMap& operator=(JsonMap oOther) noexcept;
    ~JsonMap() override;

    /// The class of this node.
    JsonNodeType GetType() const override;

    /// The node of the pair with exactly this id; null when there is none.
    JsonNode* GetNode(std::string id) const;

    /// Replaces the contents of a vector by the pairs. Returns true; false for a null pointer.
    bool GetPairs(std::vector<JsonPair*>* pairs) const;

 private:
    friend class vetra::JsonReader;
    friend class vetra::JsonTree;
    JsonMap();

    std::map<std::string, std::unique_ptr<JsonPair>> mmpoPairs;
    JsonNode* mpoNextToFree = nullptr;
};

/// Nodes in the order of the text.
class VETRA_EXPORT JsonList : public JsonNode {
 public:
    /// Reads elements in square brackets; nothing may stand around them.
    /// \throws as `JsonMap::JsonMap`
    explicit JsonList(std::string text);
    /// A deep copy.
    JsonList(const JsonList& oOther);
    /// Takes over the nodes of the other one, which is empty then.
    JsonList(JsonList&& oOther) noexcept;
    /// Replaces the nodes; those of before are freed.
    JsonList& operator=(JsonList oOther) noexcept;
    ~JsonList() override;

    /// The class of this node.
    JsonNodeType GetType() const override;

    /// Replaces the contents of a vector by the children. Returns true; false for a null pointer.
    bool GetChildren(std::vector<JsonNode*>* children) const;

 private:
    friend class vetra::JsonReader;
    friend class vetra::JsonTree;
    JsonList();

    std::vector<std::unique_ptr<JsonNode>> mvpoChildren;
    JsonNode* mpoNextToFree = nullptr;
};

/// A document.
class VETRA_EXPORT JsonParser {
 public:
    /// Reads a document, whose root is a map; white space may stand around it.
    /// \throws as `JsonMap::JsonMap`
    explicit JsonParser(std::string text);
    /// A deep copy.
    JsonParser(const JsonParser& oOther);
    /// Takes over the nodes of the other one, which is empty then.
    JsonParser(JsonParser&& oOther) noexcept;
    /// Replaces the nodes; those of before are freed.
    JsonParser& operator=(JsonParser oOther) noexcept;
    virtual ~JsonParser();

    /// Null after a move.
    JsonMap* GetRoot() const;

 private:
    std::unique_ptr<JsonMap> mpoRoot;
};

#endif  // VETRA_BASE_UTILS_STRING_JSONPARSER_H
