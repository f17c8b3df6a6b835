// What an extension process printed, up to values, and these through all formatters.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/Dispatcher.h>
#include <zelmar/autocli/extension/XmlOutput.h>
#include <zelmar/callspec/Output.h>

#include <cstdint>
#include <cstdlib>
#include <sstream>

#include "Silence.h"

namespace {

void Print(const std::shared_ptr<MetaObj::MetaObject>& value) {
    static AutoCli::Dispatcher dispatcher;
    for (const auto& formatter : dispatcher.GetFormatters()) {
        const auto output = CallSpec::Output::New();
        output->SetRootObject(value);
        AutoCli::FormatParameters parameters;
        AutoCli::DisplayContext context;
        std::ostringstream text;
        try {
            formatter->Format(output, parameters, context, text);
        } catch (const Zelmar::ZelmarException&) {
            // Some formatters take values of a certain shape only.
        }
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    SilenceXml();
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    try {
        const auto value = AutoCli::XmlUtil_ParseXmlOutput(text);
        // Whatever was read has the shape that it declares.
        if (value && !value->IsSameStructure(value, nullptr)) {
            std::abort();
        }
        if (value) {
            Print(value);
        }
    } catch (const Zelmar::ZelmarException&) {
        // Nearly every input is wrong somewhere, and said to be.
    }
    return 0;
}
