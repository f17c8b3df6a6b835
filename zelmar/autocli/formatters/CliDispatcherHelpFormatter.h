#pragma once

#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/metaobj/MetaList.h>

namespace AutoCli {

/// The page for a command line that stops at a namespace: how to go on, and what lies below. The
/// front end makes one on the spot; it is registered nowhere, so nobody can select it by its name
/// "clihelp". It reads a struct of the type `KelvashCommandPrint`, and no format parameters.
class ZELMAR_EXPORT CliDispatcherHelpFormatter : public Formatter {
public:
    CliDispatcherHelpFormatter();
    ~CliDispatcherHelpFormatter() override;

    /// Throws `ZelmarException`, before anything is written: "Error: Unexpected type for help
    /// output, formatter expected a struct with help data".
    bool Format(const std::shared_ptr<CallSpec::Output>& output, FormatParameters& parameters,
                DisplayContext& context, std::ostream& stream) override;

    /// The string field `key`, or the placeholder "<key>" and false.
    bool ExtractString(const std::string& key, std::shared_ptr<MetaObj::MetaStruct> structure,
                       std::string& result);

    /// The heading and table of the nodes of one type, "Namespace" or "Command". A null list gives
    /// "ERROR, list is bad" under the heading.
    bool HandleList(const std::string& type, std::shared_ptr<MetaObj::MetaList> list,
                    DisplayContext& context, std::ostream& stream);
};

}  // namespace AutoCli
