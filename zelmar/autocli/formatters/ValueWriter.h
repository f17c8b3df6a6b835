#pragma once

// From a tree of values to the text of a formatter: `ValueWalk` knows the order of things, and a
// writer derives from `ValueWriter`, which says what it may leave out.

#include <zelmar/autocli/formatters/TextWriter.h>
#include <zelmar/metaobj/ValueWalk.h>

#include <array>

/// What most writers have in common.
class ValueWriter {
public:
    explicit ValueWriter(TextWriter& text) : _text(text) {}

    /// Which fields are walked, and in which order.
    static MetaObj::AllFields FieldsOf(const MetaObj::MetaStruct& value) {
        return MetaObj::AllFields(value);
    }

    void CloseField(bool /*isLast*/, int /*level*/) {}
    void CloseStruct(int /*level*/) {}
    void OpenItem(int /*level*/) {}
    void CloseItem(bool /*isLast*/) {}

    void Other(const MetaObj::MetaObject* value) {
        const std::string_view complaint = ComplaintAbout(value);
        WriteLine(complaint.empty() ? "Unknown data type" : complaint);
    }

protected:
    /// What takes the place of a value whose class does not fit its kind; empty without a kind.
    static std::string_view ComplaintAbout(const MetaObj::MetaObject* value) {
        static constexpr std::array<std::string_view, 5> texts = {
            "Error reading a int",                  // Int
            "Error reading a bool",                 // Bool
            "Error reading a string",               // String
            "Error reading a struct from output.",  // Struct
            "Error reading a List",                 // List
        };
        const size_t kind = value ? static_cast<size_t>(value->GetType()) : texts.size();
        return kind < texts.size() ? texts[kind] : "";
    }

    template <class... Texts>
    void WriteLine(const Texts&... texts) {
        _text.Append(texts...);
        _text.EndLine();
    }

    TextWriter& _text;
};

/// Writes a value through a `Writer`, which is made from `text` and `arguments`.
template <class Writer, class... Arguments>
void WriteValue(TextWriter& text, const MetaObj::MetaObject* value, int level,
                Arguments&&... arguments) {
    Writer writer(text, std::forward<Arguments>(arguments)...);
    MetaObj::ValueWalk<Writer>(writer).Run(value, level);
}
