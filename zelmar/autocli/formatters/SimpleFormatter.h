#pragma once

#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/metaobj/MetaList.h>

namespace AutoCli {

/// "simple": any value as indented text, for people. A struct is a heading and a line for each
/// field, a list of structs is blocks with an empty line in front of each, a list of scalars stands
/// on one line.
///
/// It reads "fields:<TypeName>" and "fields", "header:<TypeName>" and "align-fields", and for the
/// fields what `AutoCli_FormatField` reads. Only memory bounds how deep values are nested.
class ZELMAR_EXPORT SimpleFormatter : public Formatter {
public:
    SimpleFormatter();

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;

    /// Writes one value. Structs are indented by three blanks for each level above 0; the items of
    /// a list stand one level deeper than it. Nothing is written for a null value or one of no
    /// known kind.
    void Format(const std::shared_ptr<MetaObj::MetaObject>& value, FormatParameters& parameters,
                std::ostream& stream, int level) const;

    /// The same for one class. Null gives the line "Error reading a struct from output." and
    /// "Error reading a List".
    void FormatStruct(const std::shared_ptr<MetaObj::MetaStruct>& value,
                      FormatParameters& parameters, std::ostream& stream, int level) const;
    void FormatList(const std::shared_ptr<MetaObj::MetaList>& value, FormatParameters& parameters,
                    std::ostream& stream, int level) const;
};

}  // namespace AutoCli
