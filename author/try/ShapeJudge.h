#pragma once

#include <author/try/Judge.h>

#include <set>

namespace Author {

/// The judge behind `JudgeDocument`, told of a document piece by piece. It goes by the rules of the
/// engine's reader, to tell where that one reads something else than what was meant.
class ShapeJudge {
public:
    struct Attribute {
        std::string_view name, value;
    };
    using Attributes = std::vector<Attribute>;

    ShapeJudge(const MetaObj::MetaObject* declared, Faults& faults)
        : _declared(declared), _faults(faults) {}

    void Open(long line, std::string_view name, const Attributes& attributes);
    void Close();
    /// A run of text, which may arrive in pieces; `line` is where it ends.
    void Text(long line, std::string_view text);
    /// A node that parts a text in two: CDATA, a comment, an instruction, a reference.
    void Piece(long line, std::string_view content, bool isText);

    /// The name of the innermost element that is open; empty when there is none.
    [[nodiscard]] std::string_view Innermost() const;

private:
    enum class Role { Root, Field, List, Structure, Scalar, Dropped };

    struct Element {
        Role role;
        std::string name, place;
        long line;
        const MetaObj::MetaObject* expected = nullptr;  // null for any
        size_t values = 0;                              // of a root, a field and a list
        std::string itemName = {};                      // of a list: the element that fits its type
        std::set<std::string> fields = {};              // of a structure, those that count as given
        size_t pieces = 0;                              // of a scalar
        std::string content = {};                       // of the last of them
        bool isOpenText = false;                        // does more text belong to that piece?
    };

    void OpenField(long line, const Attributes& attributes);
    void OpenValue(long line, std::string_view name, const Attributes& attributes);
    void OpenList(Element element, const Attributes& attributes);
    void OpenStructure(Element element, const Attributes& attributes);
    void Drop(long line, std::string_view name);
    std::string PlaceOfNextValue(Element& around) const;
    const MetaObj::MetaObject* ExpectedIn(const Element& around) const;
    bool IsExpectedKind(const Element& around, const Element& value);
    void AddPiece(Element& scalar, std::string_view text, bool isText);
    void TellLacking(const Element& structure);
    void TellScalar(const Element& scalar);
    std::string TakeAttribute(const Element& element, const Attributes& attributes,
                              std::string_view wanted);
    void Tell(const Element& element, const std::string& text);

    const MetaObj::MetaObject* _declared;
    Faults& _faults;
    std::vector<Element> _open;
};

/// What is wrong with the content of `<int>` or `<bool>`: how the engine reads what is no such
/// value. Empty when it is one, and for `<string>`.
std::string ScalarFault(std::string_view name, const std::string& content);

/// A text in single quotes, on one line, and cut where it is long.
std::string Quoted(std::string_view text);

}  // namespace Author
