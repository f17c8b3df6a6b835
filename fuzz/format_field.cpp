// A printf format, up to the first line feed, and behind that a value: as text, as its length in
// bytes and as a truth.

#include <zelmar/autocli/formatters/Formatter.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <cstring>

using MetaObj::MetaBool;
using MetaObj::MetaInt;
using MetaObj::MetaObject;
using MetaObj::MetaString;

namespace {

long NumberOf(const std::string& bytes) {
    long number = 0;
    std::memcpy(&number, bytes.data(), std::min(bytes.size(), sizeof number));
    return number;
}

// The result fits the buffer that the format and the value are given, or tells of a failure.
void Check(const std::string& format, const std::shared_ptr<MetaObject>& value) {
    AutoCli::FormatParameters parameters;
    parameters.SetParameter("printf:T.F", format);
    const std::string text = AutoCli::AutoCli_FormatField("T", "F", value, parameters);
    if (text.size() > format.size() + value->ToString().size() + 64 &&
        !text.starts_with(
            "Error while handling formatting parameter printf:T.F.  Unable to format field: ")) {
        std::abort();
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string bytes(reinterpret_cast<const char*>(data), size);
    const size_t end = std::min(bytes.find('\n'), size);
    const std::string format = bytes.substr(0, end);
    const std::string value = bytes.substr(std::min(end + 1, size));
    Check(format, MetaString::New(value));
    Check(format, MetaInt::New(NumberOf(value)));
    Check(format, MetaBool::New(value.empty()));
    return 0;
}
