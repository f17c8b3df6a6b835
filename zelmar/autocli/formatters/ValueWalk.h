#pragma once

// From a tree of values to text. The walk knows the order of things, a writer the text of each:
//
//     struct: OpenStruct (OpenField value CloseField)* CloseStruct
//     list:   OpenList (OpenItem value CloseItem)* CloseList
//     else:   Bool, Int or String; Unreadable where a value's class does not fit its kind; Unknown
//             for a null value or one of no known kind
//
// A writer derives from ValueWriter, which says what it may leave out, and holds two constants: by
// how many levels the value of a field, and an item, is deeper than the struct or list around it.
//
// What is open stands on a stack of the walk's own and not on that of the thread, so that only
// memory bounds how deep values are nested.

#include <zelmar/autocli/formatters/TextWriter.h>
#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <array>
#include <variant>
#include <vector>

/// The fields of a struct, all of them, in the order of their names.
class AllFields {
public:
    explicit AllFields(const MetaObj::MetaStruct& value)
        : _next(value.GetFields().begin()), _end(value.GetFields().end()) {}

    [[nodiscard]] bool AtEnd() const { return _next == _end; }
    void Advance() { ++_next; }
    [[nodiscard]] const std::string& Name() const { return _next->first; }
    [[nodiscard]] const std::shared_ptr<MetaObj::MetaObject>& Value() const {
        return _next->second.value;
    }

private:
    std::map<std::string, MetaObj::MetaStruct::Field>::const_iterator _next, _end;
};

/// What most writers have in common.
class ValueWriter {
public:
    explicit ValueWriter(TextWriter& text) : _text(text) {}

    /// Which fields are walked, and in which order.
    static AllFields FieldsOf(const MetaObj::MetaStruct& value) { return AllFields(value); }

    void CloseField(bool /*isLast*/, int /*level*/) {}
    void CloseStruct(int /*level*/) {}
    void OpenItem(int /*level*/) {}
    void CloseItem(bool /*isLast*/) {}

    void Unreadable(MetaObj::MetaType kind) {
        static constexpr std::array<std::string_view, 5> texts = {
            "Error reading a int",                  // Int
            "Error reading a bool",                 // Bool
            "Error reading a string",               // String
            "Error reading a struct from output.",  // Struct
            "Error reading a List",                 // List
        };
        WriteLine(texts[static_cast<size_t>(kind)]);
    }
    void Unknown() { WriteLine("Unknown data type"); }

protected:
    template <class... Texts>
    void WriteLine(const Texts&... texts) {
        _text.Append(texts...);
        _text.EndLine();
    }

    TextWriter& _text;
};

template <class Writer>
class ValueWalk {
public:
    explicit ValueWalk(Writer& writer) : _writer(writer) {}

    void Walk(const MetaObj::MetaObject* value, int level) {
        Enter(value, level);
        while (!_open.empty()) {
            std::visit([this](auto& place) { Continue(place); }, _open.back());
        }
    }

private:
    using MetaType = MetaObj::MetaType;
    using Fields =
        decltype(std::declval<Writer&>().FieldsOf(std::declval<const MetaObj::MetaStruct&>()));

    struct OpenStruct {
        Fields fields;
        int level;
        bool inField = false;
    };
    struct OpenList {
        const MetaObj::MetaList& list;
        int level;
        uint32_t next = 0;
    };

    void Enter(const MetaObj::MetaObject* value, int level) {
        if (!value) {
            _writer.Unknown();
            return;
        }
        switch (value->GetType()) {
            case MetaType::Bool:
                return With<MetaObj::MetaBool>(
                    value, [&](auto& scalar) { _writer.Bool(scalar.GetValue(), level); });
            case MetaType::Int:
                return With<MetaObj::MetaInt>(
                    value, [&](auto& scalar) { _writer.Int(scalar.GetValue(), level); });
            case MetaType::String:
                return With<MetaObj::MetaString>(
                    value, [&](auto& scalar) { _writer.String(scalar.GetValue(), level); });
            case MetaType::Struct:
                return With<MetaObj::MetaStruct>(value,
                                                 [&](auto& structure) { Open(structure, level); });
            case MetaType::List:
                return With<MetaObj::MetaList>(value, [&](auto& list) { Open(list, level); });
        }
        _writer.Unknown();
    }

    template <class Value, class Use>
    void With(const MetaObj::MetaObject* object, Use use) {
        if (const auto* value = MetaObj::MetaCast<Value>(object)) {
            use(*value);
        } else {
            _writer.Unreadable(object->GetType());
        }
    }

    void Open(const MetaObj::MetaStruct& value, int level) {
        _writer.OpenStruct(value, level);
        _open.emplace_back(OpenStruct{_writer.FieldsOf(value), level});
    }

    void Open(const MetaObj::MetaList& value, int level) {
        if (_writer.OpenList(value, level)) {
            _open.emplace_back(OpenList{value, level});
        }
    }

    // Goes on behind the value that was entered last. Whatever opens or closes a place ends the
    // step, for the place may have moved with the stack.
    void Continue(OpenStruct& place) {
        const int level = place.level;
        if (place.inField) {
            place.fields.Advance();
            _writer.CloseField(place.fields.AtEnd(), level);
        }
        place.inField = true;
        if (place.fields.AtEnd()) {
            _open.pop_back();
            _writer.CloseStruct(level);
        } else if (_writer.OpenField(place.fields, level)) {
            Enter(place.fields.Value().get(), level + Writer::fieldDepth);
        }
    }

    void Continue(OpenList& place) {
        const auto& items = place.list.GetObjects();
        const int level = place.level;
        const bool atEnd = place.next == items.size();
        if (place.next > 0) {
            _writer.CloseItem(atEnd);
        }
        if (atEnd) {
            _open.pop_back();
            _writer.CloseList(level);
        } else {
            _writer.OpenItem(level);
            Enter(items[place.next++].get(), level + Writer::itemDepth);
        }
    }

    Writer& _writer;
    std::vector<std::variant<OpenStruct, OpenList>> _open;
};

/// Writes a value to `out` through a `Writer`, which is made from a `TextWriter` and `arguments`.
template <class Writer, class... Arguments>
void WriteValue(std::ostream& out, const MetaObj::MetaObject* value, int level,
                Arguments&&... arguments) {
    TextWriter text(out);
    Writer writer(text, std::forward<Arguments>(arguments)...);
    ValueWalk<Writer>(writer).Walk(value, level);
    text.Finish();
}
