// What an extension process printed, up to values.

#include <zelmar/ZelmarException.h>
#include <zelmar/autocli/extension/XmlOutput.h>

#include <cstdint>
#include <cstdlib>
#include <string_view>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
    try {
        const auto value = AutoCli::XmlUtil_ParseXmlOutput(text);
        // Whatever was read has the shape that it declares.
        if (value && !value->IsSameStructure(value, nullptr)) {
            std::abort();
        }
    } catch (const Zelmar::ZelmarException&) {
        // Nearly every input is wrong somewhere, and said to be.
    }
    return 0;
}
