#pragma once

#include <zelmar/metaobj/MetaObject.h>

#include <concepts>
#include <type_traits>

// The three scalar values. They never change once made, so the factories hand out shared instances
// of the most frequent ones: both booleans, the integers from -1 to 20, and the empty string cost
// no allocation. The shared instances exist from the loading of the library until its unloading.

namespace MetaObj {

class ZELMAR_EXPORT MetaBool final : public MetaObject {
public:
    static constexpr MetaType kind = MetaType::Bool;

    MetaBool(bool value, FactoryFlag flag) : MetaObject(kind, flag), _value(value) {}

    static const std::shared_ptr<MetaBool>& New();
    static const std::shared_ptr<MetaBool>& New(bool value);

    [[nodiscard]] bool GetValue() const { return _value; }

    /// "true" or "false".
    [[nodiscard]] std::string ToString() const override;

    /// Builds the shared instances; the library calls it while it loads.
    static bool Init();
    static bool _sInitialized;

private:
    const bool _value;
};

/// Refuses, while it is compiled, a type with values that no `MetaInt` can hold.
template <std::integral Integer>
constexpr long FitInteger(Integer value) {
    static_assert(
        sizeof value < sizeof(long) || (sizeof value == sizeof(long) && std::is_signed_v<Integer>),
        "A MetaInt holds a signed number of 64 bits: make sure that the value fits, and "
        "cast it to long");
    return static_cast<long>(value);
}

class ZELMAR_EXPORT MetaInt final : public MetaObject {
public:
    static constexpr MetaType kind = MetaType::Int;

    MetaInt(long value, FactoryFlag flag) : MetaObject(kind, flag), _value(value) {}

    /// The instance for 0.
    static const std::shared_ptr<MetaInt>& New();
    static std::shared_ptr<MetaInt> New(long value);
    /// For the other types of integers, as far as all their values fit.
    template <std::integral Integer>
    static std::shared_ptr<MetaInt> New(Integer value) {
        return New(FitInteger(value));
    }

    [[nodiscard]] long GetValue() const { return _value; }

    /// Decimal, with a minus sign when negative.
    [[nodiscard]] std::string ToString() const override;

    static bool Init();
    static bool _sInitialized;

private:
    const long _value;
};

/// A text is a string of bytes; no encoding is enforced but by `NewUtf8WithEscapes`.
class ZELMAR_EXPORT MetaString final : public MetaObject {
public:
    static constexpr MetaType kind = MetaType::String;

    MetaString(std::string&& value, FactoryFlag flag)
        : MetaObject(kind, flag), _value(std::move(value)) {}

    /// The instance for the empty string.
    static const std::shared_ptr<MetaString>& New();
    /// `value` is zero-terminated and not null.
    static std::shared_ptr<MetaString> New(const char* value);
    static std::shared_ptr<MetaString> New(const std::string& value);
    static std::shared_ptr<MetaString> New(std::string&& value);

    /// For text of unknown origin: valid UTF-8 is taken as it is; otherwise each byte that belongs
    /// to no valid sequence becomes the four characters `\xHH` with lower-case digits. The text is
    /// read as zero-terminated when it has to be escaped.
    static std::shared_ptr<MetaString> NewUtf8WithEscapes(std::string&& value);

    [[nodiscard]] const std::string& GetValue() const { return _value; }

    [[nodiscard]] std::string ToString() const override;

    static bool Init();
    static bool _sInitialized;

private:
    const std::string _value;
};

}  // namespace MetaObj
