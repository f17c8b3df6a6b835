#include <zelmar/autocli/formatters/FieldText.h>
#include <zelmar/autocli/formatters/SimpleFormatter.h>
#include <zelmar/autocli/formatters/ValueWriter.h>

#include <boost/algorithm/string/replace.hpp>
#include <optional>
#include <span>

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;
using MetaObj::Walk;

namespace AutoCli {

namespace {

// The field that a heading names: of all pairs of percent signs with a name between them, the last.
std::string TagIn(const std::string& heading) {
    const size_t close = heading.rfind('%');
    if (close == std::string::npos || close < 2) {
        return "";
    }
    const size_t open = heading.rfind('%', close - 2);
    return open == std::string::npos ? "" : heading.substr(open + 1, close - open - 1);
}

// What the parameters say about structs of one type.
struct Style {
    Style(const std::string& typeName, const FormatParameters& parameters) {
        if (const std::string key = "header:" + typeName; parameters.HasParameter(key)) {
            heading = parameters.GetParameter(key);
        }
        for (const std::string& key : {"fields:" + typeName, std::string("fields")}) {
            if (!fields && parameters.HasParameter(key)) {
                fields = parameters.GetParameterAsList(key);
            }
        }
    }

    std::optional<std::string> heading;              // none: the name of the type
    std::optional<std::vector<std::string>> fields;  // none: all of them
};

std::string HeadingOf(const MetaStruct& value, const Style& style) {
    std::string heading = style.heading.value_or(value.GetTypeName());
    if (const std::string name = style.heading ? TagIn(heading) : ""; !name.empty()) {
        if (const auto field = value.GetField(name)) {
            boost::algorithm::replace_all(heading, "%" + name + "%", field->ToString());
        }
    }
    return heading;
}

// The fields of a struct that are to be printed: all of them, or those that are named, which need
// not be there.
class ChosenFields {
public:
    ChosenFields(const MetaStruct& value, const Style& style)
        : _struct(value), _field(value.GetFields().begin()) {
        if (style.fields) {
            _names = *style.fields;
            Find();
        }
    }

    [[nodiscard]] bool AtEnd() const {
        return _names ? _names->empty() : _field == _struct.GetFields().end();
    }
    void Advance() {
        if (_names) {
            _names = _names->subspan(1);
            Find();
        } else {
            ++_field;
        }
    }

    [[nodiscard]] const std::string& TypeName() const { return _struct.GetTypeName(); }
    [[nodiscard]] const std::string& Name() const {
        return _names ? _names->front() : _field->first;
    }
    /// Null when the struct has no such field.
    [[nodiscard]] const std::shared_ptr<MetaObject>* Value() const {
        return _field == _struct.GetFields().end() ? nullptr : &_field->second.value;
    }

private:
    void Find() {
        if (!AtEnd()) {
            _field = _struct.GetFields().find(Name());
        }
    }

    const MetaStruct& _struct;
    std::map<std::string, MetaStruct::Field>::const_iterator _field;
    std::optional<std::span<const std::string>> _names;  // those that are still to come
};

// All names of a struct take the same room.
struct AlignedFields : ChosenFields {
    size_t nameWidth = 0;  // 0 when they are not aligned
};

class SimpleWriter : public ValueWriter {
public:
    static constexpr int fieldDepth = 2;
    static constexpr int itemDepth = 1;

    SimpleWriter(TextWriter& text, FormatParameters& parameters)
        : ValueWriter(text),
          _parameters(parameters),
          _fieldText(parameters),
          _aligns(parameters.GetParameter("align-fields") == "true") {}

    void Bool(bool value, int /*level*/) { WriteLine(value ? "true" : "false"); }
    void Int(long value, int /*level*/) {
        _text.AppendNumber(value);
        _text.EndLine();
    }
    void String(const std::string& value, int /*level*/) { WriteLine(value); }

    void OpenStruct(const MetaStruct& value, int level) {
        if (const std::string heading = HeadingOf(value, StyleOf(value)); heading != "<NONE>") {
            _text.AppendIndent(level);
            WriteLine(heading, ":");
        }
    }
    AlignedFields FieldsOf(const MetaStruct& value) {
        const ChosenFields fields(value, StyleOf(value));
        return {fields, _aligns ? LongestName(fields) : 0};
    }
    Walk OpenField(const AlignedFields& field, int level) {
        const auto* value = field.Value();
        if (!value) {
            WriteLine("Error getting field ", field.Name());
            return Walk::Out;
        }
        const std::string& name = field.Name();
        _text.AppendIndent(level);
        _text.Append("   ", name);
        _text.AppendBlanks(PaddingOf(field));
        _text.Append(": ");
        switch ((*value)->GetType()) {
            case MetaType::Struct:
                _text.EndLine();
                return Walk::Into;
            case MetaType::List:
                return Walk::Into;
            default:
                WriteLine(_fieldText.Of(field.TypeName(), name, *value));
                return Walk::Past;
        }
    }

    Walk OpenList(const MetaList& value, int /*level*/) {
        if (value.GetListType() == MetaType::Struct) {
            return Walk::Into;
        }
        WriteScalars(value);
        return Walk::Past;
    }
    void OpenItem(int /*level*/) { _text.EndLine(); }
    void CloseList(int /*level*/) { _text.EndLine(); }

    void Other(const MetaObject* value) {
        if (const auto complaint = ComplaintAbout(value); !complaint.empty()) {
            WriteLine(complaint);
        }
    }

private:
    const Style& StyleOf(const MetaStruct& value) {
        const std::string& typeName = value.GetTypeName();
        const auto style = _styles.find(typeName);
        return style != _styles.end()
                   ? style->second
                   : _styles.try_emplace(typeName, typeName, _parameters).first->second;
    }

    size_t LongestName(ChosenFields fields) const {
        size_t width = 0;
        for (; !fields.AtEnd(); fields.Advance()) {
            width = std::max(width, _text.WidthOf(fields.Name()));
        }
        return width;
    }

    size_t PaddingOf(const AlignedFields& field) const {
        return field.nameWidth > 0 ? field.nameWidth - _text.WidthOf(field.Name()) : 0;
    }

    // What ToString of the list gives, without a copy of it all.
    void WriteScalars(const MetaList& value) {
        std::string_view separator;
        for (const auto& item : value.GetObjects()) {
            _text.Append(separator, item->ToString());
            separator = ", ";
        }
        _text.EndLine();
    }

    const FormatParameters& _parameters;
    FieldText _fieldText;
    const bool _aligns;
    std::map<std::string, Style> _styles;  // by the name of the type
};

}  // namespace

SimpleFormatter::SimpleFormatter() : Formatter("simple") {
    _description =
        "Print a representation of any item to the screen. This can be any type, but this formatter"
        " excels at printing structs and lists of structs.";
    _params = {
        {"header:<TypeName>",
         "When printing a struct type, prefix the output of the struct with the given text string"
         " and then indent all the struct fields below this text.  The TypeName value can be"
         " determined from the raw or xml output for a command.  For this field a special variable"
         " substitution is available in the value of this format paramter.  If the value contains"
         " a string %<Field>% then this formatter will do token substitution and replace the value"
         " of %<Field>% with the given value of the field in <TypeName>.  Note this can only be a"
         " scalar type (int, bool, string) and must exactly match one of the fields in the struct"
         " <TypeName>.  Example: 'header:ScsiDeviceList' = 'SCSI Device %Device Name%' will result"
         " in a header of 'SCSI Device naa.XXXX'.  Note only one %<Field>% tag is supported.  To"
         " disable the display of the header the special value <NONE> can be used"},
        {"fields:<TypeName>",
         "When printing a struct use the set of fields given in this parameter.  This allows the"
         " ordering and filtering of the fields printed for a given struct. If no ':<TypeName>' is"
         " given then then all structs encounted in the output will attempt to use these fields. "
         " This provides a reasonable default and compatible output with other formatters"},
        {"units:<TypeName>.<FieldName>",
         "When printing a struct use the given 'units' value as a suffix for a given field.  For"
         " example specifying \"units:ScsiDeviceList:Size\" = \"Mb\" would append the string 'Mb'"
         " to the end of a field"},
        {"printf:<TypeName>.<FieldName>",
         "When printing a struct use the given 'printf' formatting string for printing the value. "
         " This uses standard printf syntax to print a given field.  For example specifying"
         " \"units:ScsiDeviceList.Size\" = \"Mb\" would append the string 'Mb' to the end of a"
         " field"},
        {"align-fields",
         "When printing a struct left align all of the fields values so they all start at the same"
         " column"},
    };
}

bool SimpleFormatter::Format(const std::shared_ptr<CallSpec::Output>& output,
                             FormatParameters& parameters, DisplayContext& context,
                             std::ostream& stream) {
    const auto root = output->GetRootObject();
    const bool isList = root && root->GetType() == MetaType::List;
    TextWriter text(stream, context);
    WriteValue<SimpleWriter>(text, root.get(), isList ? -1 : 0, parameters);
    text.Finish();
    return true;
}

void SimpleFormatter::Format(const std::shared_ptr<MetaObject>& value, FormatParameters& parameters,
                             std::ostream& stream, int level) const {
    TextWriter text(stream);
    WriteValue<SimpleWriter>(text, value.get(), level, parameters);
    text.Finish();
}

void SimpleFormatter::FormatStruct(const std::shared_ptr<MetaStruct>& value,
                                   FormatParameters& parameters, std::ostream& stream,
                                   int level) const {
    if (value) {
        Format(value, parameters, stream, level);
    } else {
        stream << "Error reading a struct from output." << std::endl;
    }
}

void SimpleFormatter::FormatList(const std::shared_ptr<MetaList>& value,
                                 FormatParameters& parameters, std::ostream& stream,
                                 int level) const {
    if (value) {
        Format(value, parameters, stream, level);
    } else {
        stream << "Error reading a List" << std::endl;
    }
}

}  // namespace AutoCli
