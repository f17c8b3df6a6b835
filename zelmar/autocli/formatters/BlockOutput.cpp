#include <zelmar/autocli/formatters/BlockOutput.h>

namespace {

constexpr std::streamsize blockSize = std::streamsize{64} * 1024;

}  // namespace

BlockOutput::BlockOutput(std::ostream& target)
    : std::ostream(nullptr), _target(target), _blocks(target.rdbuf()) {
    rdbuf(&_blocks);
    copyfmt(target);
    setstate(target.rdstate());
}

BlockOutput::~BlockOutput() {
    try {
        _target.setstate(_blocks.Finish() ? rdstate() : rdstate() | badbit);
    } catch (const failure&) {
        // The state is set. Nothing may leave a destructor: the owner will hear with the next
        // write.
    }
}

BlockOutput::Blocks::Blocks(std::streambuf* target)
    : _target(target), _block(std::make_unique_for_overwrite<char[]>(blockSize)) {
    setp(_block.get(), _block.get() + blockSize);
}

bool BlockOutput::Blocks::Finish() {
    try {
        return Drain() && (!_flushWanted || _target->pubsync() == 0);
    } catch (...) {
        return false;  // a buffer that throws has not written either
    }
}

BlockOutput::Blocks::int_type BlockOutput::Blocks::overflow(int_type c) {
    if (!Drain()) {
        return traits_type::eof();
    }
    return traits_type::eq_int_type(c, traits_type::eof()) ? traits_type::not_eof(c)
                                                           : sputc(traits_type::to_char_type(c));
}

int BlockOutput::Blocks::sync() {
    _flushWanted = true;
    return 0;
}

bool BlockOutput::Blocks::Drain() {
    const std::streamsize size = pptr() - pbase();
    setp(_block.get(), _block.get() + blockSize);
    return _target && (size == 0 || _target->sputn(_block.get(), size) == size);
}
