#include <zelmar/autocli/formatters/FieldText.h>
#include <zelmar/metaobj/MetaScalars.h>

using MetaObj::MetaCast;
using MetaObj::MetaObject;
using MetaObj::MetaStruct;

namespace AutoCli {

namespace {

bool HasKeyWithPrefix(const FormatParameters& parameters, const std::string& prefix) {
    const auto key = parameters.GetParameters().lower_bound(prefix);
    return key != parameters.GetParameters().end() && key->first.starts_with(prefix);
}

}  // namespace

FieldText::FieldText(FormatParameters& parameters)
    : _parameters(parameters),
      _hasFormats(HasKeyWithPrefix(parameters, "printf:") ||
                  HasKeyWithPrefix(parameters, "units:")) {}

std::string_view FieldText::Of(const std::string& typeName, const std::string& fieldName,
                               const std::shared_ptr<MetaObject>& value) {
    if (_hasFormats) {
        _made = AutoCli_FormatField(typeName, fieldName, value, _parameters);
    } else if (const auto* text = MetaCast<MetaObj::MetaString>(value.get())) {
        return text->GetValue();
    } else {
        _made = value->ToString();
    }
    return _made;
}

const std::shared_ptr<MetaObject>* FindSubField(const MetaStruct& structure,
                                                const std::string& path) {
    const MetaStruct* place = &structure;
    size_t start = 0;
    while (true) {
        const size_t dot = path.find('.', start);
        const auto field = place->GetFields().find(path.substr(start, dot - start));
        const bool found = field != place->GetFields().end();
        if (dot == std::string::npos) {
            return found ? &field->second.value : nullptr;
        }
        if (found) {
            place = MetaCast<MetaStruct>(field->second.value.get());
            if (!place) {
                return nullptr;
            }
        }
        start = dot + 1;
    }
}

}  // namespace AutoCli
