#include <zelmar/autocli/formatters/SimpleFormatter.h>
#include <zelmar/internal/text/ValueWalk.h>

#include <boost/algorithm/string/replace.hpp>

using MetaObj::MetaList;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;
using MetaObj::MetaType;

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

std::string HeadingOf(const MetaStruct& value, const FormatParameters& parameters) {
    const std::string key = "header:" + value.GetTypeName();
    if (!parameters.HasParameter(key)) {
        return value.GetTypeName();
    }
    std::string heading = parameters.GetParameter(key);
    if (const std::string name = TagIn(heading); !name.empty()) {
        if (const auto field = value.GetField(name)) {
            boost::algorithm::replace_all(heading, "%" + name + "%", field->ToString());
        }
    }
    return heading;
}

std::vector<std::string> NamesFor(const MetaStruct& value, const FormatParameters& parameters) {
    for (const std::string& key : {"fields:" + value.GetTypeName(), std::string("fields")}) {
        if (parameters.HasParameter(key)) {
            return parameters.GetParameterAsList(key);
        }
    }
    return value.GetFieldNames();
}

// The fields of a struct that are to be printed, which need not all be there.
class ChosenFields {
public:
    ChosenFields(const MetaStruct& value, const FormatParameters& parameters)
        : _struct(value), _names(NamesFor(value, parameters)) {
        if (parameters.GetParameter("align-fields") == "true") {
            for (const std::string& name : _names) {
                _width = std::max(_width, name.size());
            }
        }
    }

    [[nodiscard]] bool AtEnd() const { return _next == _names.size(); }
    void Advance() { ++_next; }
    void LeaveOutTheRest() { _names.resize(_next + 1); }

    [[nodiscard]] const std::string& TypeName() const { return _struct.GetTypeName(); }
    [[nodiscard]] const std::string& Name() const { return _names[_next]; }
    [[nodiscard]] std::shared_ptr<MetaObject> Value() const { return _struct.GetField(Name()); }
    [[nodiscard]] size_t Padding() const { return _width > 0 ? _width - Name().size() : 0; }

private:
    const MetaStruct& _struct;
    std::vector<std::string> _names;
    size_t _next = 0;
    size_t _width = 0;  // of the longest name; 0 when names are not aligned
};

class SimpleWriter : public ValueWriter {
public:
    static constexpr int fieldDepth = 2;
    static constexpr int itemDepth = 1;

    SimpleWriter(TextWriter& text, FormatParameters& parameters)
        : ValueWriter(text), _parameters(parameters) {}

    void Bool(bool value, int /*level*/) { WriteLine(value ? "true" : "false"); }
    void Int(long value, int /*level*/) {
        _text.AppendNumber(value);
        _text.EndLine();
    }
    void String(const std::string& value, int /*level*/) { WriteLine(value); }

    void OpenStruct(const MetaStruct& value, int level) {
        if (const std::string heading = HeadingOf(value, _parameters); heading != "<NONE>") {
            _text.AppendIndent(level);
            WriteLine(heading, ":");
        }
    }
    [[nodiscard]] ChosenFields FieldsOf(const MetaStruct& value) const {
        return {value, _parameters};
    }
    bool OpenField(ChosenFields& field, int level) {
        const auto value = field.Value();
        if (!value) {
            WriteLine("Error getting field ", field.Name());
            field.LeaveOutTheRest();
            return false;
        }
        _text.AppendIndent(level);
        _text.Append("   ", field.Name());
        _text.AppendBlanks(field.Padding());
        _text.Append(": ");
        switch (value->GetType()) {
            case MetaType::Struct:
                _text.EndLine();
                return true;
            case MetaType::List:
                return true;
            default:
                WriteLine(AutoCli_FormatField(field.TypeName(), field.Name(), value, _parameters));
                return false;
        }
    }

    bool OpenList(const MetaList& value, int /*level*/) {
        if (value.GetListType() == MetaType::Struct) {
            return true;
        }
        WriteScalars(value);
        return false;
    }
    void OpenItem(int /*level*/) { _text.EndLine(); }
    void CloseList(int /*level*/) { _text.EndLine(); }

    void Unknown() {}

private:
    // What ToString of the list gives, without a copy of it all.
    void WriteScalars(const MetaList& value) {
        std::string_view separator;
        for (const auto& item : value.GetObjects()) {
            _text.Append(separator, item->ToString());
            separator = ", ";
        }
        _text.EndLine();
    }

    FormatParameters& _parameters;
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
                             FormatParameters& parameters, DisplayContext& /*context*/,
                             std::ostream& stream) {
    const auto root = output->GetRootObject();
    const bool isList = root && root->GetType() == MetaType::List;
    Format(root, parameters, stream, isList ? -1 : 0);
    return true;
}

void SimpleFormatter::Format(const std::shared_ptr<MetaObject>& value, FormatParameters& parameters,
                             std::ostream& stream, int level) const {
    WriteValue<SimpleWriter>(stream, value.get(), level, parameters);
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
