// The library is loaded and unloaded with a plug-in, again and again: it goes completely, leaves
// nothing behind, and reads the debug switch each time. This program itself is not linked to it.
#include <cstdlib>
#include <dlfcn.h>
#include <malloc.h>

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

class Plugin {
  public:
    Plugin() : m_plugin(dlopen(KQ_TEST_PLUGIN, RTLD_NOW | RTLD_LOCAL))
    {
        if (!m_plugin)
            ADD_FAILURE() << dlerror();
    }
    ~Plugin()
    {
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
            EXPECT_TRUE(plugin.Use(round));
        }
        if (round == 20) // what the loader itself keeps is there by now
            numBytes = mallinfo2().uordblks;
    }
    EXPECT_FALSE(IsLoaded(KQ_TEST_LIBRARY));
    // A life of the library that left its pool of names behind would cost a kilobyte.
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
