#include "module/runtime/system/File_Lock.h"
#include "tests/support/Temp_Folder.h"

#include <chrono>
#include <csignal>
#include <fcntl.h>
#include <gtest/gtest.h>
#include <pthread.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <thread>
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

TEST(File_Lock, CreatesTheFileWithMode0600)
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

TEST(File_Lock, KeepsOtherProcessesOut)
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

/// A process that holds the lock until it is told to give it back; before it does it writes the file "done".
class Holder
{
public:
    explicit Holder(const Temp_Folder& folder)
    {
        EXPECT_EQ(pipe(_ready), 0);
        EXPECT_EQ(pipe(_release), 0);
        _child = fork();
        if (_child == 0)
            hold(folder);
        char byte;
        EXPECT_EQ(read(_ready[0], &byte, 1), 1);
    }
    ~Holder()
    {
        waitpid(_child, nullptr, 0);
        for (const int fd : {_ready[0], _ready[1], _release[0], _release[1]})
            close(fd);
    }
    Holder(const Holder&) = delete;
    Holder& operator=(const Holder&) = delete;

    void release() { EXPECT_EQ(write(_release[1], "x", 1), 1); }

private:
    [[noreturn]] void hold(const Temp_Folder& folder)
    {
        File_Lock lock(folder.path("lock").c_str());
        lock.lock();
        char byte = 'x';
        if (write(_ready[1], &byte, 1) == 1 && read(_release[0], &byte, 1) == 1)
            folder.write("done", "x");
        lock.unlock();
        _exit(0);
    }

    int _ready[2];
    int _release[2];
    pid_t _child;
};

TEST(File_Lock, WaitsForAnotherProcess)
{
    Temp_Folder folder;
    Holder holder(folder);
    std::thread releasing([&] {
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
        holder.release();
    });
    File_Lock lock(folder.path("lock").c_str());
    EXPECT_EQ(lock.lock(), 0);
    EXPECT_EQ(folder.read("done"), "x") << "the child still held the lock";
    releasing.join();
}

TEST(File_Lock, GoesOnWaitingAfterASignal)
{
    Temp_Folder folder;
    Holder holder(folder);
    // Without SA_RESTART: the wait ends with each.
    struct sigaction noted = {}, old;
    noted.sa_handler = [](int) {};
    ASSERT_EQ(sigaction(SIGUSR1, &noted, &old), 0);
    std::thread signalling([&, waiter = pthread_self()] {
        for (int i = 0; i < 50; i++) {
            pthread_kill(waiter, SIGUSR1);
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        holder.release();
    });
    File_Lock lock(folder.path("lock").c_str());
    EXPECT_EQ(lock.lock(), 0);
    EXPECT_EQ(folder.read("done"), "x") << "the child still held the lock";
    signalling.join();
    sigaction(SIGUSR1, &old, nullptr);
}

TEST(File_Lock, IsNotTakenForWhatIsNoRegularFile)
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

TEST(File_Lock, APathThatCannotBeOpenedIsNotOkay)
{
    File_Lock lock("/nonexistent/folder/lock");
    EXPECT_FALSE(lock.okay());
    EXPECT_EQ(lock.lock(), -1);
    EXPECT_EQ(lock.unlock(), -1);
}
