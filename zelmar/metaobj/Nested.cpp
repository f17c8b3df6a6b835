#include <zelmar/metaobj/Nested.h>
#include <zelmar/metaobj/ValueWalk.h>

#include <array>
#include <memory_resource>

namespace MetaObj {

namespace {

class StructureComparison {
public:
    explicit StructureComparison(std::vector<std::string>* errors) : _errors(errors) {
        _open.reserve(ordinaryDepth);
    }

    bool Compare(const MetaObject& expected, const std::shared_ptr<MetaObject>& other) {
        // Of the part that was looked at last, within the innermost pair that is still open.
        bool same = Enter(expected, other);
        while (!_open.empty()) {
            if (same) {
                same = LookOn();
            } else {  // what lies around a difference differs too
                Refuse(ComplaintAbout(_open.back()));
                _open.pop_back();
            }
        }
        return same;
    }

private:
    // Two structs, or two lists, of which only the declared structures are compared.
    struct Pair {
        const MetaStruct* expected;  // null for lists
        const MetaStruct* input;
        std::map<std::string, MetaStruct::Field>::const_iterator next;
    };

    bool Refuse(std::string reason) {
        if (_errors) {
            _errors->push_back(std::move(reason));
        }
        return false;
    }

    static std::string ComplaintAbout(const Pair& pair) {
        return pair.expected ? "Type mismatch on field: " + std::prev(pair.next)->first
                             : "List type mismatch list and input";
    }

    // A pair that has to be looked into is opened, and the same so far.
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
        if (!HaveSameCount(expected, *input)) {
            Refuse("Mismatch on number of fields set in struct. Expected " +
                   std::to_string(expected.GetFields().size()) + " found " +
                   std::to_string(input->GetFields().size()));
        }
        // The fields are looked at even when their count is wrong: the missing one is worth naming.
        _open.push_back({&expected, input, expected.GetFields().begin()});
        return true;
    }

    static bool HaveSameCount(const MetaStruct& expected, const MetaStruct& input) {
        return expected.GetFields().size() == input.GetFields().size();
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
        _open.push_back({nullptr, nullptr, {}});
        return EnterStruct(*structure, input->GetListStructure().get());
    }

    // Enters the next part of the innermost pair, or closes the pair behind the last.
    bool LookOn() {
        Pair& pair = _open.back();
        if (!pair.expected) {
            _open.pop_back();
            return true;
        }
        if (pair.next == pair.expected->GetFields().end()) {
            const bool same = HaveSameCount(*pair.expected, *pair.input);
            _open.pop_back();
            return same;
        }
        const auto& [name, field] = *pair.next++;
        const auto input = pair.input->GetFields().find(name);
        if (input == pair.input->GetFields().end()) {
            _open.pop_back();
            return Refuse("Missing field in input: " + name);
        }
        const std::shared_ptr<MetaObject>& value = input->second.value;
        return field.value->GetType() == value->GetType() && Enter(*field.value, value);
    }

    std::vector<std::string>* const _errors;
    // Comparing is a part of adding each item to a list: at an ordinary depth it allocates nothing.
    static constexpr size_t ordinaryDepth = 8;
    alignas(Pair) std::array<std::byte, ordinaryDepth * sizeof(Pair)> _room;
    std::pmr::monotonic_buffer_resource _memory{_room.data(), _room.size()};
    std::pmr::vector<Pair> _open{&_memory};
};

class PlainText {
public:
    static constexpr int fieldDepth = 0;
    static constexpr int itemDepth = 0;

    static AllFields FieldsOf(const MetaStruct& value) { return AllFields(value); }

    void Bool(bool value, int /*level*/) { _text += MetaBool::New(value)->ToString(); }
    void Int(long value, int /*level*/) { _text += std::to_string(value); }
    void String(const std::string& value, int /*level*/) { _text += value; }
    void Other(const MetaObject* value) { _text += value->ToString(); }

    void OpenStruct(const MetaStruct& /*value*/, int /*level*/) { _text += '{'; }
    Walk OpenField(const AllFields& field, int /*level*/) {
        ((_text += '\'') += field.Name()) += "' => '";
        return Walk::Into;
    }
    void CloseField(bool /*isLast*/, int /*level*/) { _text += "', "; }
    void CloseStruct(int /*level*/) { _text += '}'; }

    static Walk OpenList(const MetaList& /*value*/, int /*level*/) { return Walk::Into; }
    void OpenItem(int /*level*/) {}
    void CloseItem(bool isLast) { _text += isLast ? "" : ", "; }
    void CloseList(int /*level*/) {}

    std::string Take() { return std::move(_text); }

private:
    std::string _text;
};

}  // namespace

bool CompareStructure(const MetaObject& expected, const std::shared_ptr<MetaObject>& other,
                      std::vector<std::string>* errors) {
    return StructureComparison(errors).Compare(expected, other);
}

std::string NestedText(const MetaObject& value) {
    PlainText text;
    ValueWalk<PlainText>(text).Run(&value, 0);
    return text.Take();
}

}  // namespace MetaObj
