#include <examples/plugins/host/Mounts.h>
#include <examples/plugins/host/Pattern.h>
#include <examples/plugins/host/Processes.h>
#include <examples/plugins/host/Users.h>

#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <fstream>
#include <sstream>

#include <gtest/gtest.h>

namespace Host {
namespace {

using std::chrono::milliseconds;

std::string Print(const Mount& mount) {
    std::string text = mount.source + "|" + mount.path + "|" + mount.type;
    for (const std::string& option : mount.options) {
        text += "|" + option;
    }
    return text;
}

TEST(HostMounts, EveryLineOfTheTableIsAMountWithItsNamesDecoded) {
    std::istringstream table(
        "/dev/sda1 / ext4 rw,relatime 0 0\n"
        " /mnt/no\\040source tmpfs ro 0 0\n"
        "//nas/share\\134x /mnt/tab\\011line\\012end cifs rw,user=\\\\1 0 0\n"
        "cut short");
    const auto mounts = ReadMounts(table);
    ASSERT_EQ(mounts.size(), 4U);
    EXPECT_EQ(Print(mounts[0]), "/dev/sda1|/|ext4|rw|relatime");
    EXPECT_EQ(Print(mounts[1]), "|/mnt/no source|tmpfs|ro");
    EXPECT_EQ(Print(mounts[2]), "//nas/share\\x|/mnt/tab\tline\nend|cifs|rw|user=\\\\1");
    EXPECT_EQ(Print(mounts[3]), "cut|short|");
    std::ifstream folder("/");
    EXPECT_TRUE(ReadMounts(folder).empty() && folder.bad());
}

// A file system of 10 MiB, but for one that is gone, one whose server never answers, and one that
// costs the asking process its life.
Capacity MeasureInTest(const char* path) {
    if (std::string_view(path) == "/stuck") {
        pause();
    }
    if (std::string_view(path) == "/deadly") {
        _exit(1);
    }
    return std::string_view(path) == "/gone" ? Capacity{.error = ENOENT} : Capacity{.size = 10};
}

TEST(HostMounts, AMountThatHangsOrFailsLeavesTheOthersTheirSizes) {
    std::vector<std::pair<long, int>> measured;
    std::vector<Mount> mounts(6);
    for (size_t i = 0; const char* path : {"/a", "/stuck", "/gone", "/deadly", "/stuck", "/b"}) {
        mounts[i++].path = path;
    }
    for (const Capacity& capacity : MeasureMounts(mounts, milliseconds(200), &MeasureInTest)) {
        measured.emplace_back(capacity.size, capacity.error);
    }
    EXPECT_EQ(measured,
              (std::vector<std::pair<long, int>>{
                  {10, 0}, {0, ETIMEDOUT}, {0, ENOENT}, {0, EPIPE}, {0, ETIMEDOUT}, {10, 0}}));
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1) << "a child is left";
}

TEST(HostMounts, SizesComeFromTheFileSystem) {
    EXPECT_GT(MeasureMount("/").size, 0);
    EXPECT_EQ(MeasureMount("/nosuch").error, ENOENT);
}

class HostProcesses : public testing::Test {
protected:
    ~HostProcesses() override { std::filesystem::remove_all(_table); }

    void AddFile(const std::string& name, const std::string& content) {
        std::filesystem::create_directories((_table / name).parent_path());
        std::ofstream(_table / name) << content;
    }

    std::string Print() const {
        std::ostringstream text;
        for (const Process& process : ReadProcesses(_table)) {
            text << process.number << "|" << process.parent << "|" << process.user << "|"
                 << process.state << "|" << process.memory << "|" << process.name << "|"
                 << process.command << "\n";
        }
        return text.str();
    }

private:
    std::string _template = testing::TempDir() + "host-XXXXXX";
    const std::filesystem::path _table = mkdtemp(_template.data());
};

TEST_F(HostProcesses, AreReadInTheOrderOfTheirNumbers) {
    AddFile("self/status", "Name:\tnot a number\nPid:\t1\nUid:\t0\t0\t0\t0\n");
    AddFile("10/status",
            "Name:\tsh: (x)\x1b\nState:\tS (sleeping)\nGroups:\t \nPid:\t10\nPPid:\t2\n"
            "Uid:\t1\t1000\t2\t3\nVmRSS:\t    1234 kB\n");
    AddFile("10/cmdline", std::string("sh\0-c\0echo a\nb\0", 15));
    AddFile("2/status", "Name:\tkthreadd\nState:\tI (idle)\nPid:\t2\nPPid:\t0\nUid:\t0\t0\t0\t0\n");
    AddFile("2/cmdline", "");
    AddFile("3/cmdline", "");  // it ended between the listing and the reading
    AddFile("4/status", "");
    EXPECT_EQ(Print(),
              "2|0|0|idle|0|kthreadd|[kthreadd]\n"
              "10|2|1000|sleeping|1234|sh: (x) |sh -c echo a b\n");
}

TEST(HostPattern, IsFoundAnywhereOrComplainsOfItself) {
    EXPECT_TRUE(Pattern("^ssh|d$").Matches("sshd-session"));
    EXPECT_FALSE(Pattern("^ssh$").Matches("sshd"));
    EXPECT_TRUE(Pattern("").Matches("anything"));
    EXPECT_EQ(Pattern("(a+)+$").Complaint(), "");
    EXPECT_FALSE(Pattern("(a+)+$").Matches(std::string(4000, 'a') + "b"));
    EXPECT_EQ(Pattern("(a").Complaint(), "Unmatched ( or \\(");
}

TEST(HostUsers, HaveANameOrANumber) {
    EXPECT_EQ(UserName(0), "root");
    EXPECT_EQ(FindUser("root"), 0U);
    EXPECT_EQ(UserName(3999999999), "3999999999");
    EXPECT_EQ(FindUser("3999999999"), 3999999999);
    EXPECT_EQ(FindUser("no such user"), std::nullopt);
    EXPECT_EQ(FindUser("1x"), std::nullopt);
    EXPECT_EQ(FindUser(""), std::nullopt);
}

}  // namespace
}  // namespace Host
