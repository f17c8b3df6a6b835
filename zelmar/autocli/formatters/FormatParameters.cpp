#include <zelmar/autocli/formatters/FormatParameters.h>
#include <zelmar/internal/Split.h>

namespace AutoCli {

FormatParameters& FormatParameters::operator=(FormatParameters&& other) noexcept {
    if (this != &other) {
        _formatter.swap(other._formatter);
        _parameters.clear();
        _parameters.swap(other._parameters);
    }
    return *this;
}

void FormatParameters::SetParameter(std::string key, std::string value) {
    _parameters.insert_or_assign(std::move(key), std::move(value));
}

void FormatParameters::SetParameter(const char* key, const char* value) {
    SetParameter(std::string(key), std::string(value));
}

bool FormatParameters::HasParameter(const std::string& key) const {
    return _parameters.contains(key);
}

const std::string& FormatParameters::GetParameter(const std::string& key) const {
    static const std::string none;
    const auto parameter = _parameters.find(key);
    return parameter == _parameters.end() ? none : parameter->second;
}

std::vector<std::string> FormatParameters::GetParameterAsList(const std::string& key) const {
    std::vector<std::string> elements;
    ForEachPiece(GetParameter(key), ',',
                 [&elements](std::string_view piece) { elements.emplace_back(piece); });
    return elements;
}

void FormatParameters::OverrideValues(const FormatParameters& other) {
    if (!other._formatter.empty()) {
        _formatter = other._formatter;
    }
    for (const auto& [key, value] : other._parameters) {
        _parameters.insert_or_assign(key, value);
    }
}

}  // namespace AutoCli
