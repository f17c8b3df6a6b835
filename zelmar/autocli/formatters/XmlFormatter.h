#pragma once

#include <zelmar/autocli/formatters/Formatter.h>

namespace AutoCli {

/// "xml": the value in an XML document, for programs and stylesheets.
///
/// The parameter "stylesheet" gives the document a reference to one, as it stands. All parameters
/// of the call, whatever their keys, are listed in the document as meta data. An output without a
/// value leaves the element `root` empty. Only memory bounds how deep values are nested.
///
/// The document is for readers outside: extension commands print another dialect.
class ZELMAR_EXPORT XmlFormatter : public Formatter {
public:
    XmlFormatter();

    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;

    /// Writes the element of one value, which is not null, indented by three blanks for each
    /// level.
    void Format(const std::shared_ptr<MetaObj::MetaObject>& value, std::ostream& stream,
                int level) const;
};

/// The text with `&`, `<`, `>`, `%` and both quotes as XML references; all other bytes pass.
ZELMAR_EXPORT std::string SantizeString(std::string text);

}  // namespace AutoCli
