#pragma once

#include <memory>
#include <ostream>
#include <streambuf>

/// A stream in front of another one: what is written gathers in blocks of 64 KiB, whatever flushes
/// stand in between, and reaches the target's buffer block by block and at the end. A flush that
/// was asked for is made up for at the end, once.
///
/// It begins with the target's format and state. At the end the target is told of the state, with
/// its badbit set when a block could not be written; nothing else of the target is touched, so that
/// several threads may each have one in front of `std::cout`.
class BlockOutput : public std::ostream {
public:
    explicit BlockOutput(std::ostream& target);
    ~BlockOutput() override;

private:
    class Blocks : public std::streambuf {
    public:
        explicit Blocks(std::streambuf* target);
        /// Writes what is left. False when that cannot be done.
        bool Finish();

    protected:
        int_type overflow(int_type c) override;
        int sync() override;

    private:
        bool Drain();

        std::streambuf* const _target;
        const std::unique_ptr<char[]> _block;
        bool _flushWanted = false;
    };

    std::ostream& _target;
    Blocks _blocks;
};
