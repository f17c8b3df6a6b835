#pragma once

// From a tree of values to text, of whatever notation. The walk knows the order of things, a writer
// the text of each:
//
//     struct: OpenStruct (OpenField value CloseField)* CloseStruct
//     list:   OpenList (OpenItem value CloseItem)* CloseList
//     else:   Bool, Int or String; Other for a null value, one of no known kind, and one whose
//             class does not fit its kind
//
// Each is told its level. A writer holds two constants: by how many levels the value of a field,
// and an item, is deeper than the struct or list around it.
//
// What is open stands on a stack of the walk's own and not on that of the thread, so that only
// memory bounds how deep values are nested.

#include <zelmar/metaobj/MetaList.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <variant>
#include <vector>

namespace MetaObj {

/// How the walk goes on behind `OpenField` and `OpenList`.
enum class Walk {
    Into,  ///< to the value of the field, to the items of the list
    Past,  ///< neither value nor items: the writer has dealt with them; a list is not closed
    Out,   ///< of a field only: as Past, and the struct ends with this field
};

/// The fields of a struct, all of them, in the order of their names.
class AllFields {
public:
    explicit AllFields(const MetaStruct& value)
        : _next(value.GetFields().begin()), _end(value.GetFields().end()) {}

    [[nodiscard]] bool AtEnd() const { return _next == _end; }
    void Advance() { ++_next; }
    [[nodiscard]] const std::string& Name() const { return _next->first; }
    [[nodiscard]] const std::shared_ptr<MetaObject>* Value() const { return &_next->second.value; }

private:
    std::map<std::string, MetaStruct::Field>::const_iterator _next, _end;
};

template <class Writer>
class ValueWalk {
public:
    explicit ValueWalk(Writer& writer) : _writer(writer) {}

    void Run(const MetaObject* value, int level) {
        Enter(value, level);
        while (!_open.empty()) {
            std::visit([this](auto& place) { Continue(place); }, _open.back());
        }
    }

private:
    using Fields = decltype(std::declval<Writer&>().FieldsOf(std::declval<const MetaStruct&>()));

    struct OpenStruct {
        Fields fields;
        int level;
        bool inField = false;
    };
    struct OpenList {
        const MetaList& list;
        int level;
        uint32_t next = 0;
    };

    void Enter(const MetaObject* value, int level) {
        if (const auto* text = MetaCast<MetaString>(value)) {
            _writer.String(text->GetValue(), level);
        } else if (const auto* number = MetaCast<MetaInt>(value)) {
            _writer.Int(number->GetValue(), level);
        } else if (const auto* truth = MetaCast<MetaBool>(value)) {
            _writer.Bool(truth->GetValue(), level);
        } else if (const auto* structure = MetaCast<MetaStruct>(value)) {
            _writer.OpenStruct(*structure, level);
            _open.emplace_back(OpenStruct{_writer.FieldsOf(*structure), level});
        } else if (const auto* list = MetaCast<MetaList>(value)) {
            if (_writer.OpenList(*list, level) == Walk::Into) {
                _open.emplace_back(OpenList{*list, level});
            }
        } else {
            _writer.Other(value);
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
        const bool atEnd = place.fields.AtEnd();
        const Walk walk = atEnd ? Walk::Out : _writer.OpenField(place.fields, level);
        if (walk == Walk::Out) {
            _open.pop_back();
            _writer.CloseStruct(level);
        } else if (walk == Walk::Into) {
            Enter(place.fields.Value()->get(), level + Writer::fieldDepth);
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

}  // namespace MetaObj
