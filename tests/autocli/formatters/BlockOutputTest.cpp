#include <zelmar/autocli/formatters/BlockOutput.h>

#include <gtest/gtest.h>

#include <iomanip>
#include <sstream>
#include <stdexcept>
#include <string>

namespace {

// Counts what reaches it, and can be told to fail.
class Target : public std::stringbuf {
public:
    enum class Failure { None, Refuse, Throw };

    explicit Target(Failure failure = Failure::None) : _failure(failure) {}

    int writes = 0;
    int flushes = 0;

protected:
    std::streamsize xsputn(const char* text, std::streamsize size) override {
        ++writes;
        if (_failure == Failure::Throw) {
            throw std::runtime_error("no room");
        }
        return _failure == Failure::Refuse ? 0 : std::stringbuf::xsputn(text, size);
    }
    int sync() override {
        ++flushes;
        return 0;
    }

private:
    const Failure _failure;
};

TEST(BlockOutput, GathersFlushesAndMakesUpForThemOnce) {
    Target target;
    std::ostream stream(&target);
    std::string expected;
    {
        BlockOutput blocks(stream);
        for (int i = 0; i < 30'000; ++i) {
            blocks << i << std::endl;
            expected += std::to_string(i) + "\n";
        }
        EXPECT_EQ(target.flushes, 0);
    }
    EXPECT_EQ(target.str(), expected);
    EXPECT_EQ(target.writes, static_cast<int>(expected.size() / 65536 + 1));
    EXPECT_EQ(target.flushes, 1);
}

TEST(BlockOutput, DeliversTheLastBlockWhenTheWriterThrows) {
    std::ostringstream stream;
    try {
        BlockOutput blocks(stream);
        blocks << "almost";
        throw 1;
    } catch (int) {
        stream << " all";
    }
    EXPECT_EQ(stream.str(), "almost all");
}

TEST(BlockOutput, BeginsLikeTheTargetAndTellsItOfAFailure) {
    Target target;
    std::ostream stream(&target);
    stream << std::hex << std::setw(4);
    {
        BlockOutput blocks(stream);
        blocks << 255;
        blocks.setf(std::ios_base::left, std::ios_base::adjustfield);
        blocks.setstate(std::ios_base::failbit);
    }
    EXPECT_EQ(stream.rdstate(), std::ios_base::failbit);
    BlockOutput(stream) << "lost";
    stream.clear();
    stream << 16;
    EXPECT_EQ(target.str(), "  ff  10");
    EXPECT_EQ(target.flushes, 0);
}

TEST(BlockOutput, ABlockThatCannotBeWrittenSetsTheBadbit) {
    for (const auto failure : {Target::Failure::Refuse, Target::Failure::Throw}) {
        for (const size_t size : {size_t{1}, size_t{200'000}}) {
            for (const auto mask : {std::ios_base::goodbit, std::ios_base::badbit}) {
                Target target(failure);
                std::ostream stream(&target);
                stream.exceptions(mask);
                try {
                    BlockOutput blocks(stream);
                    blocks << std::string(size, 'x') << std::endl;
                } catch (const std::exception&) {
                    EXPECT_EQ(mask, std::ios_base::badbit);
                }
                EXPECT_TRUE(stream.bad());
            }
        }
    }
}

TEST(BlockOutput, AStreamWithoutABufferStaysBad) {
    std::ostream stream(nullptr);
    {
        BlockOutput blocks(stream);
        blocks << "lost" << std::endl;
    }
    EXPECT_TRUE(stream.bad());
}

}  // namespace
