#include <zelmar/internal/platform/Textrun.h>
#include <zelmar/metaobj/MetaScalars.h>

#include <array>
#include <cstdlib>

namespace MetaObj {

namespace {

constexpr long firstSharedInt = -1;
constexpr long lastSharedInt = 20;
using SharedInts = std::array<std::shared_ptr<MetaInt>, lastSharedInt - firstSharedInt + 1>;

SharedInts MakeSharedInts() {
    SharedInts ints;
    for (long value = firstSharedInt; value <= lastSharedInt; ++value) {
        ints[static_cast<size_t>(value - firstSharedInt)] =
            std::make_shared<MetaInt>(value, MetaObject::FactoryFlag());
    }
    return ints;
}

// Built on first use and not as plain globals, so that an initialiser of another source that runs
// earlier can already make values.
const SharedInts& GetSharedInts() {
    static const SharedInts ints = MakeSharedInts();
    return ints;
}

}  // namespace

bool MetaBool::_sInitialized = MetaBool::Init();
bool MetaInt::_sInitialized = MetaInt::Init();
bool MetaString::_sInitialized = MetaString::Init();

const std::shared_ptr<MetaBool>& MetaBool::New() {
    return New(false);
}

const std::shared_ptr<MetaBool>& MetaBool::New(bool value) {
    static const std::array<std::shared_ptr<MetaBool>, 2> values = {
        std::make_shared<MetaBool>(false, FactoryFlag()),
        std::make_shared<MetaBool>(true, FactoryFlag())};
    return values[value ? 1 : 0];
}

std::string MetaBool::ToString() const {
    return _value ? "true" : "false";
}

bool MetaBool::Init() {
    New();
    return true;
}

const std::shared_ptr<MetaInt>& MetaInt::New() {
    return GetSharedInts()[-firstSharedInt];
}

std::shared_ptr<MetaInt> MetaInt::New(long value) {
    if (value >= firstSharedInt && value <= lastSharedInt) {
        return GetSharedInts()[static_cast<size_t>(value - firstSharedInt)];
    }
    return std::make_shared<MetaInt>(value, FactoryFlag());
}

std::string MetaInt::ToString() const {
    return std::to_string(_value);
}

bool MetaInt::Init() {
    New();
    return true;
}

const std::shared_ptr<MetaString>& MetaString::New() {
    static const auto empty = std::make_shared<MetaString>(std::string(), FactoryFlag());
    return empty;
}

std::shared_ptr<MetaString> MetaString::New(const char* value) {
    return New(std::string(value));
}

std::shared_ptr<MetaString> MetaString::New(const std::string& value) {
    return New(std::string(value));
}

std::shared_ptr<MetaString> MetaString::New(std::string&& value) {
    return value.empty() ? New() : std::make_shared<MetaString>(std::move(value), FactoryFlag());
}

std::shared_ptr<MetaString> MetaString::NewUtf8WithEscapes(std::string&& value) {
    constexpr int wholeText = -1;
    constexpr int utf8 = 0;
    if (!value.empty() && !Textrun_IsBufferValid(value.c_str(), wholeText, utf8)) {
        const std::unique_ptr<char, decltype(&std::free)> escaped(
            Textrun_EscapeBuffer(value.c_str(), wholeText, utf8), &std::free);
        return New(escaped.get());
    }
    return New(std::move(value));
}

std::string MetaString::ToString() const {
    return _value;
}

bool MetaString::Init() {
    New();
    return true;
}

}  // namespace MetaObj
