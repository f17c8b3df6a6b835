#pragma once

#include <zelmar/Export.h>

#include <map>
#include <string>
#include <vector>

namespace AutoCli {

/// The name of the formatter to use and the options that steer it. A command sets its defaults, and
/// the user's choice is laid over them. Nothing refuses an unknown key: it has no effect.
class ZELMAR_EXPORT FormatParameters {
public:
    FormatParameters() = default;
    FormatParameters(const FormatParameters&) = default;
    FormatParameters(FormatParameters&&) = default;
    FormatParameters& operator=(const FormatParameters&) = default;
    /// Takes over the parameters of `other` and leaves it without any; the names of the formatters
    /// change places.
    FormatParameters& operator=(FormatParameters&& other) noexcept;

    void SetFormatter(std::string name) { _formatter = std::move(name); }
    void SetFormatter(const char* name) { _formatter = name; }
    /// Empty when no formatter is chosen; then nothing is printed.
    [[nodiscard]] const std::string& GetFormatter() const { return _formatter; }

    void SetParameter(std::string key, std::string value);
    void SetParameter(const char* key, const char* value);
    /// Also true for a key that is set to the empty string.
    [[nodiscard]] bool HasParameter(const std::string& key) const;
    /// Empty for an absent key.
    [[nodiscard]] const std::string& GetParameter(const std::string& key) const;
    [[nodiscard]] const std::map<std::string, std::string>& GetParameters() const {
        return _parameters;
    }
    /// The value split at each comma, without trimming. A comma at the end adds no empty element.
    [[nodiscard]] std::vector<std::string> GetParameterAsList(const std::string& key) const;

    /// Lays `other` over this: its formatter if it names one, and each of its parameters.
    void OverrideValues(const FormatParameters& other);

private:
    std::string _formatter;
    std::map<std::string, std::string> _parameters;
};

}  // namespace AutoCli
