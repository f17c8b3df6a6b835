// What goes through values within values. They may be nested deeper than the stack of a thread
// reaches, so each of these keeps what it still has to do on a stack of its own.

#include <zelmar/metaobj/MetaList.h>

#include <array>
#include <memory_resource>
#include <string_view>
#include <variant>

namespace MetaObj {

namespace {

class StructureComparison {
public:
    explicit StructureComparison(std::vector<std::string>* errors) : _errors(errors) {
        _open.reserve(ordinaryDepth);
    }

    bool Compare(const MetaObject& expected, const std::shared_ptr<MetaObject>& other) {
        bool same = Enter(expected, other);
        while (same && !_open.empty()) {
            same = Continue();
        }
        for (; !_open.empty(); _open.pop_back()) {  // what lies around a difference differs too
            Refuse(ComplaintAbout(_open.back()));
        }
        return same;
    }

private:
    struct Open {
        const MetaStruct* expected;  // null for a list, of which only the declaration is compared
        const MetaStruct* input;
        std::map<std::string, MetaStruct::Field>::const_iterator next;
        bool sameCount;
    };

    bool Refuse(std::string reason) {
        if (_errors) {
            _errors->push_back(std::move(reason));
        }
        return false;
    }

    static std::string ComplaintAbout(const Open& place) {
        return place.expected ? "Type mismatch on field: " + std::prev(place.next)->first
                              : "List type mismatch list and input";
    }

    bool Enter(const MetaObject& expected, const std::shared_ptr<MetaObject>& other) {
        if (const auto* structure = MetaCast<MetaStruct>(&expected)) {
            return EnterStruct(*structure, other.get());
        }
        if (const auto* list = MetaCast<MetaList>(&expected)) {
            return EnterList(*list, other.get());
        }
        return expected.IsSameStructure(other, _errors);
    }

    bool EnterStruct(const MetaStruct& expected, const MetaObject* other) {
        if (!other) {
            return Refuse("Invalid NULL input to MetaStruct validation.");
        }
        if (other->GetType() != MetaType::Struct) {
            return Refuse("Type Mismatch in MetaStruct Validation: Expected type Struct got type " +
                          MetaTypeString(other->GetType()));
        }
        const auto* input = MetaCast<MetaStruct>(other);
        if (!input) {
            return Refuse("Unable to cast to MetaStruct, runtime error?");
        }
        if (input->GetTypeName() != expected.GetTypeName()) {
            Refuse("Type names do not match.");  // which alone makes no difference
        }
        const auto& fields = expected.GetFields();
        const bool sameCount = input->GetFields().size() == fields.size();
        if (!sameCount) {
            Refuse("Mismatch on number of fields set in struct. Expected " +
                   std::to_string(fields.size()) + " found " +
                   std::to_string(input->GetFields().size()));
        }
        // The fields are looked at even when their count is wrong: the missing one is worth naming.
        _open.push_back({&expected, input, fields.begin(), sameCount});
        return true;
    }

    bool EnterList(const MetaList& expected, const MetaObject* other) {
        if (!other) {
            return Refuse("Mismatch on structure, NULL comparison");
        }
        if (other->GetType() != MetaType::List) {
            return Refuse("Type mismatch!  Was expecting a List, but got a " +
                          MetaTypeString(other->GetType()));
        }
        const auto* input = MetaCast<MetaList>(other);
        if (!input || input->GetListType() != expected.GetListType()) {
            return Refuse("Mismatch on list type");
        }
        const MetaStruct* structure = expected.GetListStructure().get();
        if (!structure || !input->GetListStructure()) {
            return true;
        }
        _open.push_back({nullptr, nullptr, {}, true});
        return EnterStruct(*structure, input->GetListStructure().get());
    }

    // Goes on behind the part that was found to be the same, up to the next one within this.
    bool Continue() {
        Open& place = _open.back();
        if (place.expected) {
            const auto& inputs = place.input->GetFields();
            while (place.next != place.expected->GetFields().end()) {
                const auto& [name, field] = *place.next++;
                const auto input = inputs.find(name);
                if (input == inputs.end()) {
                    _open.pop_back();
                    return Refuse("Missing field in input: " + name);
                }
                const std::shared_ptr<MetaObject>& value = input->second.value;
                const MetaType type = field.value->GetType();
                if (type != value->GetType()) {
                    return false;
                }
                if (type == MetaType::Struct || type == MetaType::List) {
                    return Enter(*field.value, value);
                }
            }
        }
        const bool same = place.sameCount;
        _open.pop_back();
        return same;
    }

    std::vector<std::string>* const _errors;
    // Comparing is a part of adding each item to a list: at an ordinary depth it allocates nothing.
    static constexpr size_t ordinaryDepth = 8;
    alignas(Open) std::array<std::byte, ordinaryDepth * sizeof(Open)> _room;
    std::pmr::monotonic_buffer_resource _memory{_room.data(), _room.size()};
    std::pmr::vector<Open> _open{&_memory};
};

}  // namespace

bool MetaObject::CompareStructure(const MetaObject& expected,
                                  const std::shared_ptr<MetaObject>& other,
                                  std::vector<std::string>* errors) {
    return StructureComparison(errors).Compare(expected, other);
}

std::string MetaObject::NestedText(const MetaObject& value) {
    std::string text;
    std::vector<std::variant<const MetaObject*, std::string_view>> waiting = {&value};
    while (!waiting.empty()) {
        const auto next = waiting.back();
        waiting.pop_back();
        if (const auto* piece = std::get_if<std::string_view>(&next)) {
            text += *piece;
            continue;
        }
        const MetaObject* object = std::get<const MetaObject*>(next);
        if (const auto* structure = MetaCast<MetaStruct>(object)) {
            text += '{';
            waiting.emplace_back("}");
            const auto& fields = structure->GetFields();
            for (auto field = fields.rbegin(); field != fields.rend(); ++field) {
                waiting.insert(waiting.end(), {"', ", field->second.value.get(), "' => '",
                                               std::string_view(field->first), "'"});
            }
        } else if (const auto* list = MetaCast<MetaList>(object)) {
            const auto& items = list->GetObjects();
            for (auto item = items.rbegin(); item != items.rend(); ++item) {
                waiting.insert(waiting.end(), {item->get(), ", "});
            }
            if (!items.empty()) {
                waiting.pop_back();  // no separator in front of the first
            }
        } else {
            text += object->ToString();
        }
    }
    return text;
}

void MetaObject::Release(std::shared_ptr<MetaObject>&& value) {
    const bool isNested =
        value && (value->_type == MetaType::Struct || value->_type == MetaType::List);
    if (!isNested) {
        return;
    }
    thread_local std::vector<std::shared_ptr<MetaObject>>* waiting = nullptr;
    if (waiting) {
        waiting->push_back(std::move(value));
        return;
    }
    std::vector<std::shared_ptr<MetaObject>> values;
    waiting = &values;
    value.reset();
    while (!values.empty()) {
        const auto next = std::move(values.back());
        values.pop_back();
    }
    waiting = nullptr;
}

}  // namespace MetaObj
