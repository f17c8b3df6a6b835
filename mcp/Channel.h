#pragma once

#include <deque>
#include <string>
#include <string_view>

/// A descriptor of this process alone, closed with its owner.
class Descriptor {
public:
    explicit Descriptor(int descriptor = -1) : _descriptor(descriptor) {}
    Descriptor(Descriptor&& other) noexcept : _descriptor(other.Release()) {}
    Descriptor& operator=(Descriptor&& other) noexcept;
    ~Descriptor();

    [[nodiscard]] int Get() const { return _descriptor; }
    int Release();

private:
    int _descriptor;
};

/// Takes lines out of what arrives in pieces of any size.
class LineReader {
public:
    /// A line of more than `longest` bytes is cut there, and told by `WasCut`.
    explicit LineReader(size_t longest) : _longest(longest) {}

    /// Reads what is there, at most one block. False at the end and after an error: what stands
    /// behind the last line feed is a line, too.
    bool Read(int descriptor);

    [[nodiscard]] bool HasLine() const { return !_lines.empty(); }
    /// The next line without its end.
    std::string TakeLine();
    /// Was the line that was taken last longer than allowed?
    [[nodiscard]] bool WasCut() const { return _wasCut; }

private:
    void Append(std::string_view text);

    const size_t _longest;
    std::string _open;
    bool _openIsCut = false;
    std::deque<std::pair<std::string, bool>> _lines;
    bool _wasCut = false;
};

/// Messages on their way out, a line each. A write never waits for the reader.
class LineWriter {
public:
    void Add(std::string_view line);
    [[nodiscard]] size_t Size() const { return _text.size() - _written; }

    /// Writes some of it to a descriptor that is ready for writing. False after an error, with the
    /// reason in errno.
    bool Write(int descriptor);

private:
    std::string _text;
    size_t _written = 0;
};
