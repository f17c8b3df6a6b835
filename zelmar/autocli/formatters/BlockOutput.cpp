#include <zelmar/autocli/formatters/BlockOutput.h>

namespace {

constexpr std::streamsize blockSize = std::streamsize{64} * 1024;

// Setting a stream's buffer clears its state, which is put back. A stream that is told to throw
// does so only behind the change, and its owner will hear of the state with the next write.
void ReplaceBuffer(std::ostream& stream, std::streambuf* buffer, std::ios_base::iostate more) {
    const auto state = stream.rdstate() | more;
    try {
        stream.rdbuf(buffer);
        stream.setstate(state);
    } catch (const std::ios_base::failure&) {
    }
}

}  // namespace

BlockOutput::BlockOutput(std::ostream& stream)
    : _stream(stream),
      _target(stream.rdbuf()),
      _block(std::make_unique_for_overwrite<char[]>(blockSize)) {
    setp(_block.get(), _block.get() + blockSize);
    ReplaceBuffer(_stream, this, std::ios_base::goodbit);
}

BlockOutput::~BlockOutput() {
    bool written = false;
    try {
        written = Drain() && (!_flushWanted || _target->pubsync() == 0);
    } catch (...) {
        // A buffer that throws has not written either. Nothing may leave a destructor.
    }
    ReplaceBuffer(_stream, _target, written ? std::ios_base::goodbit : std::ios_base::badbit);
}

BlockOutput::int_type BlockOutput::overflow(int_type c) {
    if (!Drain()) {
        return traits_type::eof();
    }
    return traits_type::eq_int_type(c, traits_type::eof()) ? traits_type::not_eof(c)
                                                           : sputc(traits_type::to_char_type(c));
}

int BlockOutput::sync() {
    _flushWanted = true;
    return 0;
}

bool BlockOutput::Drain() {
    const std::streamsize size = pptr() - pbase();
    setp(_block.get(), _block.get() + blockSize);
    return _target && (size == 0 || _target->sputn(_block.get(), size) == size);
}
