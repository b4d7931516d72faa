#include "tests/foundation/foundation_fixture.h"

#include "foundation/common.h"

#include <cerrno>
#include <filesystem>
#include <sys/statvfs.h>

namespace cimple {

class Host_Queries_Test : public Foundation_Test {};

namespace {

int answers;
bool root_answers;

int read_only_root(const char* path, struct statvfs* out) {
    EXPECT_EQ(path, std::string(host_root()) + "/");
    ++answers;
    if (!root_answers) {
        errno = EIO;
        return -1;
    }
    *out = {};
    out->f_flag = ST_RDONLY | ST_NOSUID;
    return 0;
}

} // namespace

TEST_F(Host_Queries_Test, ReadOnlyRootIsAskedUntilItAnswersOnce) {
    VLN_Common::replace_statvfs(read_only_root);
    answers = 0;
    root_answers = false;
    EXPECT_FALSE(VLN_Common::IsReadOnlyFS());
    EXPECT_FALSE(VLN_Common::IsReadOnlyFS());
    EXPECT_EQ(answers, 2);
    root_answers = true;
    EXPECT_TRUE(VLN_Common::IsReadOnlyFS());
    EXPECT_TRUE(VLN_Common::IsReadOnlyFS());
    EXPECT_EQ(answers, 3);
}

TEST_F(Host_Queries_Test, OperatingSystem) {
    std::string name;
    std::string distribution;
    EXPECT_EQ(VLN_Common::getOSInformation(name, distribution), 32769);
    EXPECT_EQ(name, "Unknown");
    EXPECT_EQ(distribution, "Unknown");

    write(Host_File::KERNEL_VERSION, "Linux version 5.4.0 (gcc) #1 SMP\nsecond line\n");
    EXPECT_EQ(VLN_Common::getOSInformation(name, distribution), 32769);
    EXPECT_EQ(name, "Linux version 5.4.0 (gcc) #1 SMP");
    EXPECT_EQ(distribution, "Unknown");

    write(Host_File::DISTRIBUTION, "Some Linux \\n \\l\n\nKernel \\r\n");
    EXPECT_EQ(VLN_Common::getOSInformation(name, distribution), 0);
    EXPECT_EQ(distribution, "Some Linux \\n \\l\n\nKernel \\r\n") << "whole, escapes and all";

    write(Host_File::KERNEL_VERSION, std::string(1000, 'v'));
    write(Host_File::DISTRIBUTION, "");
    EXPECT_EQ(VLN_Common::getOSInformation(name, distribution), 0);
    EXPECT_EQ(name, std::string(256, 'v'));
    EXPECT_EQ(distribution, "");

    std::filesystem::remove(host_path(Host_File::DISTRIBUTION));
    std::filesystem::create_directory(host_path(Host_File::DISTRIBUTION));
    EXPECT_EQ(VLN_Common::getOSInformation(name, distribution), 32769);
    EXPECT_EQ(distribution, "Unknown");
}

} // namespace cimple
