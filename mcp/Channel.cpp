#include "Channel.h"

#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <climits>
#include <utility>

Descriptor& Descriptor::operator=(Descriptor&& other) noexcept {
    std::swap(_descriptor, other._descriptor);
    return *this;
}

Descriptor::~Descriptor() {
    if (_descriptor >= 0) {
        close(_descriptor);
    }
}

int Descriptor::Release() {
    return std::exchange(_descriptor, -1);
}

bool LineReader::Read(int descriptor) {
    std::array<char, 65536> block;
    const ssize_t count = read(descriptor, block.data(), block.size());
    if (count > 0) {
        Append({block.data(), static_cast<size_t>(count)});
        return true;
    }
    if (count < 0 && (errno == EINTR || errno == EAGAIN)) {
        return true;
    }
    if (!_open.empty()) {
        Append("\n");
    }
    return false;
}

std::string LineReader::TakeLine() {
    auto [line, wasCut] = std::move(_lines.front());
    _lines.pop_front();
    _wasCut = wasCut;
    return std::move(line);
}

void LineReader::Append(std::string_view text) {
    while (!text.empty()) {
        const size_t end = text.find('\n');
        const std::string_view piece = text.substr(0, end);
        const size_t room = _longest - _open.size();
        _openIsCut = _openIsCut || piece.size() > room;
        _open += piece.substr(0, room);
        if (end == std::string_view::npos) {
            return;
        }
        _lines.emplace_back(std::exchange(_open, {}), std::exchange(_openIsCut, false));
        text.remove_prefix(end + 1);
    }
}

void LineWriter::Add(std::string_view line) {
    _text.append(line).append("\n");
}

bool LineWriter::Write(int descriptor) {
    // A pipe that is ready takes this much at once.
    const size_t size = std::min<size_t>(Size(), PIPE_BUF);
    const ssize_t count = write(descriptor, _text.data() + _written, size);
    if (count < 0) {
        return errno == EINTR || errno == EAGAIN;
    }
    _written += static_cast<size_t>(count);
    if (_written == _text.size()) {
        _text.clear();
        _written = 0;
    }
    return true;
}
