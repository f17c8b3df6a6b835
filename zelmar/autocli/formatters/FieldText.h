#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

#include <string_view>

namespace AutoCli {

/// The texts of the fields of one document: what `AutoCli_FormatField` gives, without a string made
/// for each where the parameters have nothing to say about any field.
class FieldText {
public:
    explicit FieldText(FormatParameters& parameters);

    /// Lives until the next call, or as long as `value`, which is not null.
    std::string_view Of(const std::string& typeName, const std::string& fieldName,
                        const std::shared_ptr<MetaObj::MetaObject>& value);

private:
    FormatParameters& _parameters;
    const bool _hasFormats;
    std::string _made;
};

/// What `GetSubField` finds, where it stands in the struct; null when there is none.
const std::shared_ptr<MetaObj::MetaObject>* FindSubField(const MetaObj::MetaStruct& structure,
                                                         const std::string& path);

}  // namespace AutoCli
