#include "runtime/File_Lock.h"
#include "tests/support/Temp_Folder.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

using namespace KPRV;

/// What a child process gets when it tries the lock without waiting. 0, or an errno.
static int try_in_child(const std::string& path)
{
    const pid_t child = fork();
    if (child == 0) {
        struct flock record = {};
        record.l_type = F_WRLCK;
        record.l_whence = SEEK_SET;
        const int fd = open(path.c_str(), O_WRONLY);
        _exit(fcntl(fd, F_SETLK, &record) == 0 ? 0 : errno);
    }
    int status = 0;
    waitpid(child, &status, 0);
    return WEXITSTATUS(status);
}

TEST(File_Lock, creates_the_file_with_mode_0600)
{
    Temp_Folder folder;
    const std::string path = folder.path("lock");
    const mode_t mask = umask(0);
    const File_Lock lock(path.c_str());
    umask(mask);
    EXPECT_TRUE(lock.okay());
    struct stat info;
    ASSERT_EQ(stat(path.c_str(), &info), 0);
    EXPECT_EQ(info.st_mode & 07777, 0600u);
    EXPECT_EQ(info.st_size, 0);
}

TEST(File_Lock, keeps_other_processes_out)
{
    Temp_Folder folder;
    const std::string path = folder.path("lock");
    File_Lock lock(path.c_str());
    EXPECT_EQ(try_in_child(path), 0);
    EXPECT_EQ(lock.lock(), 0);
    EXPECT_EQ(try_in_child(path), EAGAIN);
    EXPECT_EQ(lock.unlock(), 0);
    EXPECT_EQ(try_in_child(path), 0);
}

TEST(File_Lock, waits_for_another_process)
{
    Temp_Folder folder;
    const std::string path = folder.path("lock");
    int ready[2];
    ASSERT_EQ(pipe(ready), 0);
    const pid_t child = fork();
    if (child == 0) {
        File_Lock lock(path.c_str());
        lock.lock();
        (void)!write(ready[1], "x", 1);
        usleep(50000);
        folder.write("done", "x");
        lock.unlock();
        _exit(0);
    }
    char byte;
    ASSERT_EQ(read(ready[0], &byte, 1), 1);
    File_Lock lock(path.c_str());
    EXPECT_EQ(lock.lock(), 0);
    EXPECT_EQ(folder.read("done"), "x") << "the child still held the lock";
    int status;
    waitpid(child, &status, 0);
    close(ready[0]);
    close(ready[1]);
}

TEST(File_Lock, is_not_taken_for_what_is_no_regular_file)
{
    Temp_Folder folder;
    const std::string path = folder.path("lock");
    ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
    // With a reader, so that opening it would succeed at once.
    const int reader = open(path.c_str(), O_RDONLY | O_NONBLOCK);
    File_Lock lock(path.c_str());
    EXPECT_FALSE(lock.okay());
    EXPECT_EQ(lock.lock(), -1);
    close(reader);
}

TEST(File_Lock, a_path_that_cannot_be_opened_is_not_okay)
{
    File_Lock lock("/nonexistent/folder/lock");
    EXPECT_FALSE(lock.okay());
    EXPECT_EQ(lock.lock(), -1);
    EXPECT_EQ(lock.unlock(), -1);
}
