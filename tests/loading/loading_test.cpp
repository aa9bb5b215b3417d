// The library is loaded and unloaded with a plug-in, again and again: it is removed completely,
// leaves nothing behind, and reads the debug switch each time. Several threads do this as well.
// This program itself is not linked to the library.
#include <atomic>
#include <condition_variable>
#include <cstdlib>
#include <dlfcn.h>
#include <malloc.h>
#include <mutex>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

namespace {

const char kSwitch[] = "MAV_KQ_BOOL_EQUATION_DEBUG";

bool IsLoaded(const char* path)
{
    void* library = dlopen(path, RTLD_NOW | RTLD_NOLOAD);
    if (library)
        dlclose(library);
    return library != nullptr;
}

// The loader has a lock too, but the thread sanitizer does not know it. Without this one, it would
// mistake two lives of the library at the same address for one.
std::mutex s_loader;

class Plugin {
  public:
    Plugin() : m_plugin(nullptr)
    {
        const std::lock_guard<std::mutex> locked(s_loader);
        m_plugin = dlopen(KQ_TEST_PLUGIN, RTLD_NOW | RTLD_LOCAL);
        if (!m_plugin)
            ADD_FAILURE() << dlerror();
    }
    ~Plugin()
    {
        const std::lock_guard<std::mutex> locked(s_loader);
        if (m_plugin)
            dlclose(m_plugin);
    }
    Plugin(const Plugin&) = delete;
    Plugin& operator=(const Plugin&) = delete;

    bool Use(int round) const { return Find<bool (*)(int)>("KqTestUse")(round); }
    bool IsDebugMode() const { return Find<bool (*)()>("KqTestDebugMode")(); }

  private:
    template <class Function>
    Function Find(const char* name) const
    {
        return reinterpret_cast<Function>(dlsym(m_plugin, name));
    }

    void* m_plugin;
};

TEST(Loading, LoadedAndUnloadedManyTimes)
{
    size_t numBytes = 0;
    for (int round = 0; round < 100; ++round) {
        ASSERT_FALSE(IsLoaded(KQ_TEST_LIBRARY)) << round;
        {
            const Plugin plugin;
            ASSERT_TRUE(IsLoaded(KQ_TEST_LIBRARY));
            ASSERT_TRUE(IsLoaded(KQ_TEST_HOST_LIBRARY));
            EXPECT_TRUE(plugin.Use(round));
        }
        if (round == 20) // by now the loader has what it keeps
            numBytes = mallinfo2().uordblks;
    }
    EXPECT_FALSE(IsLoaded(KQ_TEST_LIBRARY));
    EXPECT_FALSE(IsLoaded(KQ_TEST_HOST_LIBRARY)) << "nothing in it is unique in the process";
    // Each life of the library that leaked its pool of names would cost a kilobyte.
    EXPECT_LE(mallinfo2().uordblks, numBytes + 80 * 100);
}

TEST(Loading, StaysWhileSomebodyHasIt)
{
    const Plugin first;
    {
        const Plugin second;
        EXPECT_TRUE(second.Use(1));
    }
    EXPECT_TRUE(IsLoaded(KQ_TEST_LIBRARY));
    EXPECT_TRUE(first.Use(2));
}

// Sometimes one thread holds the library, sometimes another, several or none.
TEST(LoadingThreads, LoadUseAndUnload)
{
    std::atomic<int> numWrong{0};
    std::vector<std::thread> threads;
    for (int thread = 0; thread < 4; ++thread) {
        threads.emplace_back([&numWrong, thread] {
            for (int round = 0; round < 50; ++round) {
                const Plugin plugin;
                numWrong += !plugin.Use(4 * round + thread);
            }
        });
    }
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(0, numWrong);
    EXPECT_FALSE(IsLoaded(KQ_TEST_LIBRARY));
    EXPECT_FALSE(IsLoaded(KQ_TEST_HOST_LIBRARY));
}

// A thread that has used the library continues, and ends after the library was unloaded. What was
// kept for the thread must not need the library's code then, and must not pile up while the thread
// lives.
TEST(LoadingThreads, OutliveTheLibrary)
{
    std::mutex lock;
    std::condition_variable changed;
    int numLoaded = 0; // odd while the library is loaded
    const Plugin* current = nullptr;
    std::atomic<int> numWrong{0};
    const int kNumRounds = 100;
    std::thread lasting([&] {
        std::unique_lock<std::mutex> locked(lock);
        for (int round = 0; round < kNumRounds; ++round) {
            changed.wait(locked, [&] { return numLoaded == 2 * round + 1; });
            numWrong += !current->Use(round);
            ++numLoaded;
            changed.notify_all();
        }
    });
    size_t numBytes = 0;
    for (int round = 0; round < kNumRounds; ++round) {
        std::thread brief;
        std::atomic<bool> mayEnd{false};
        {
            const Plugin plugin;
            std::unique_lock<std::mutex> locked(lock);
            current = &plugin;
            ++numLoaded;
            changed.notify_all();
            changed.wait(locked, [&] { return numLoaded == 2 * round + 2; });
            std::atomic<bool> hasUsed{false};
            brief = std::thread([&] {
                numWrong += !plugin.Use(round);
                hasUsed = true;
                while (!mayEnd)
                    std::this_thread::yield();
            });
            while (!hasUsed)
                std::this_thread::yield();
        }
        EXPECT_FALSE(IsLoaded(KQ_TEST_LIBRARY)) << round;
        mayEnd = true;
        brief.join();
        if (round == 20)
            numBytes = mallinfo2().uordblks;
    }
    lasting.join();
    EXPECT_EQ(0, numWrong);
    EXPECT_LE(mallinfo2().uordblks, numBytes + 80 * 100);
}

TEST(Loading, DebugSwitchIsReadWheneverTheLibraryIsLoaded)
{
    for (const char* value : {"", "0", "1", "no"}) {
        setenv(kSwitch, value, 1);
        const Plugin plugin;
        EXPECT_TRUE(plugin.IsDebugMode()) << "any value counts: '" << value << "'";
        unsetenv(kSwitch);
        EXPECT_TRUE(plugin.IsDebugMode()) << "never read again";
    }
    const Plugin plugin;
    EXPECT_FALSE(plugin.IsDebugMode());
    setenv(kSwitch, "1", 1);
    EXPECT_FALSE(plugin.IsDebugMode()) << "never read again";
    unsetenv(kSwitch);
}

} // namespace
