#pragma once

#include <memory>
#include <ostream>
#include <streambuf>

/// Wraps the buffer of a stream for as long as this lives: what is written gathers in blocks of
/// 64 KiB, whatever flushes stand in between, and reaches the stream's own buffer block by block
/// and at the end. A flush that was asked for is made up for at the end, once. The stream's flags
/// and state stay its own throughout; a block that cannot be written sets its badbit.
class BlockOutput : public std::streambuf {
public:
    explicit BlockOutput(std::ostream& stream);
    BlockOutput(const BlockOutput&) = delete;
    BlockOutput& operator=(const BlockOutput&) = delete;
    ~BlockOutput() override;

protected:
    int_type overflow(int_type c) override;
    int sync() override;

private:
    bool Drain();

    std::ostream& _stream;
    std::streambuf* const _target;
    const std::unique_ptr<char[]> _block;
    bool _flushWanted = false;
};
