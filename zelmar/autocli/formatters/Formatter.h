#pragma once

#include <zelmar/Export.h>
#include <zelmar/autocli/formatters/FormatParameters.h>
#include <zelmar/callspec/Output.h>
#include <zelmar/metaobj/MetaStruct.h>

#include <cstdint>
#include <iosfwd>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace AutoCli {

/// A parameter that a formatter tells its users about.
struct ZELMAR_EXPORT FormatterParam {
    std::string name;  ///< the key, such as "units:<TypeName>.<FieldName>"
    std::string description;
    bool flag = false;
};

/// The terminal that is written to. As it is made it fits files and pipes: what is written there is
/// the same on every terminal and in every locale.
struct ZELMAR_EXPORT DisplayContext {
    uint16_t screenWidth = 0;   ///< columns; 0 when unknown
    uint16_t screenHeight = 0;  ///< rows; 0 when unknown
    std::string extra;
    /// Texts come through `AutoCli_ShowControls`, so that no value can steer the terminal.
    bool showControls = false;
    /// Cells, wrapped texts and aligned names are measured in columns, of which a character of
    /// UTF-8 takes none, one or two; otherwise in bytes.
    bool countColumns = false;
};

/// Turns the value of an output into text. A formatter keeps no state between calls, so that
/// several threads may use one, each with parameters, a context and a stream of its own. Its list
/// of parameters is documentation: parameters outside it are not refused.
class ZELMAR_EXPORT Formatter {
public:
    explicit Formatter(const std::string& name) : _name(name) {}
    virtual ~Formatter();

    /// Writes the value of `output` to `stream`. False when it stopped on an error that it wrote to
    /// the stream itself. May throw `ZelmarException`, before anything is written.
    virtual bool Format(const std::shared_ptr<CallSpec::Output>& output,
                        FormatParameters& parameters, DisplayContext& context,
                        std::ostream& stream) = 0;

    /// The name by which it is selected.
    [[nodiscard]] const std::string& GetName() const { return _name; }
    [[nodiscard]] const std::string& GetDescription() const { return _description; }
    [[nodiscard]] const std::vector<FormatterParam>& GetParams() const { return _params; }

protected:
    std::string _description;
    std::vector<FormatterParam> _params;

private:
    const std::string _name;
};

/// The text of one field: the value's own text, or what the parameter "printf:<type>.<field>" makes
/// of it, and behind it a blank and the value of "units:<type>.<field>". "NULL Object" for null.
///
/// A printf format holds at most one conversion: an integer conversion for Int and Bool, `s` for
/// String, with flags, decimal width and precision; a struct or list comes out empty. Any other
/// format gives "Error while handling formatting parameter <key>.  Unable to format field: " and
/// the system's text for an invalid argument, or for a value too large where a width or precision
/// is beyond an `int`. The formatted text is cut at the length of the format plus that of the value
/// plus 64 bytes.
ZELMAR_EXPORT std::string AutoCli_FormatField(const std::string& typeName,
                                              const std::string& fieldName,
                                              std::shared_ptr<MetaObj::MetaObject> value,
                                              FormatParameters& parameters);

/// The text with `\x1b` or `\u202e` in the place of each control character, which a terminal would
/// obey instead of showing it: C0 but line feed and tab, DEL, C1, U+2028, U+2029 and what turns the
/// direction of writing, U+202A to U+202E and U+2066 to U+2069. The text is read as UTF-8, whatever
/// the locale; a byte 80 to 9F that belongs to no character is shown too.
ZELMAR_EXPORT std::string AutoCli_ShowControls(std::string_view text);
/// The same where the error stream is a terminal; otherwise the text as it is.
ZELMAR_EXPORT std::string AutoCli_ErrorText(std::string_view text);

/// Three blanks for each level; none below level 1.
ZELMAR_EXPORT std::string GetIndent(int level);

/// The field at `path`, in which dots lead into nested structs; null when there is none. A segment
/// that is not found is passed over: the next one is looked up in the same struct.
ZELMAR_EXPORT std::shared_ptr<MetaObj::MetaObject> GetSubField(
    std::shared_ptr<MetaObj::MetaStruct> structure, const std::string& path);

}  // namespace AutoCli
