// Verilog by the program yosys: what happens if the program is missing, fails, is killed, does not
// end, or writes too much. A script replaces it.
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include "read_design.h"
#include "watch.h"

namespace {

using namespace booleq;

constexpr char kVerilog[] = "module m(input a, output y); assign y = a; endmodule\n";
constexpr char kJson[] =
    R"({"modules": {"m": {"cells": {"u": {"type": "$lut", "parameters": {"LUT": "1000",
"WIDTH": 2}, "connections": {"A": [2, 3], "Y": [4]}}}}}})";

class YosysProcess : public testing::Test {
  protected:
    void SetUp() override
    {
        std::string folder = testing::TempDir() + "yosys_test.XXXXXX";
        ASSERT_NE(mkdtemp(folder.data()), nullptr);
        m_folder = folder;
        std::filesystem::create_directory(m_folder / "temporary");
        m_path = std::getenv("PATH");
        setenv("PATH", (m_folder.string() + ":/usr/bin:/bin").c_str(), 1);
        setenv("TMPDIR", (m_folder / "temporary").c_str(), 1);
    }

    void TearDown() override
    {
        SetWatch(nullptr);
        setenv("PATH", m_path.c_str(), 1);
        unsetenv("TMPDIR");
        EXPECT_TRUE(std::filesystem::is_empty(m_folder / "temporary")) << "files are left";
        std::filesystem::remove_all(m_folder);
    }

    // Installs the commands that run as yosys, with the text as /dev/fd/3 and the netlist as
    // /dev/fd/4.
    void Install(const std::string& commands)
    {
        const std::filesystem::path program = m_folder / "yosys";
        std::ofstream(program) << "#!/bin/sh\necho $$ >" << (m_folder / "process").string() << "\n"
                               << commands << "\n";
        chmod(program.c_str(), 0755);
    }

    // The fault; empty if the text is read.
    std::string FaultOf(const std::string& text, double seconds = 60)
    {
        ReadOptions options;
        options.yosysSeconds = seconds;
        std::string fault;
        const bool isRead = ReadDesignText(text, "test", options, m_design, fault);
        EXPECT_EQ(isRead, fault.empty());
        return fault;
    }

    bool IsRunning() const
    {
        pid_t process = 0;
        std::ifstream(m_folder / "process") >> process;
        EXPECT_GT(process, 0);
        if (kill(process, 0) != 0)
            return false;
        std::string status; // "12 (sleep) S ...": Z has ended, but was not waited for
        std::ifstream stream("/proc/" + std::to_string(process) + "/stat");
        std::getline(stream, status);
        return status.find(") Z ") == std::string::npos;
    }

    std::filesystem::path m_folder;
    std::string m_path;
    Design m_design;
};

TEST_F(YosysProcess, WhatItWritesIsRead)
{
    Install("grep -q 'assign y = a' /dev/fd/3 || exit 1\ncat >/dev/fd/4 <<'END'\n" +
            std::string(kJson) + "\nEND");
    EXPECT_EQ(FaultOf(kVerilog), "");
    EXPECT_EQ(m_design.format, "Verilog");
    ASSERT_EQ(m_design.tables.size(), 1u);
    EXPECT_EQ(Path(m_design, m_design.tables[0].name), "u");
}

TEST_F(YosysProcess, WithoutItTheMessageSaysWhatToDo)
{
    setenv("PATH", m_folder.c_str(), 1);
    const std::string fault = FaultOf(kVerilog);
    EXPECT_NE(fault.find("the program yosys, which is not installed"), std::string::npos) << fault;
    EXPECT_NE(fault.find("apt-get install yosys"), std::string::npos) << fault;
}

TEST_F(YosysProcess, AProgramThatCannotRunIsNamed)
{
    Install("exit 0");
    chmod((m_folder / "yosys").c_str(), 0644);
    setenv("PATH", m_folder.c_str(), 1);
    const std::string fault = FaultOf(kVerilog);
    EXPECT_NE(fault.find("yosys"), std::string::npos) << fault;
}

TEST_F(YosysProcess, ItsReasonHasTheLineOfTheText)
{
    Install("echo 'Warning: something'; echo '/dev/fd/3:3: ERROR: syntax error'; exit 1");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys does not read it: line 3: syntax error");
    Install("echo 'ERROR: Module m is not there.' >&2; exit 1");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys does not read it: Module m is not there.");
    Install("exit 3");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys does not read it: it gave no reason");
}

TEST_F(YosysProcess, OneThatIsKilledIsSaid)
{
    Install("kill -9 $$");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys was ended by a signal: Killed");
}

TEST_F(YosysProcess, OneThatWritesNothingIsSaid)
{
    Install("exit 0");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys wrote no netlist");
}

TEST_F(YosysProcess, AnythingElseThanANetlistIsRefused)
{
    Install("echo nonsense >/dev/fd/4");
    EXPECT_NE(FaultOf(kVerilog), "");
    Install("head -c 100000 /dev/urandom >/dev/fd/4");
    EXPECT_NE(FaultOf(kVerilog), "");
}

TEST_F(YosysProcess, WhatDoesNotEndIsEnded)
{
    Install("sleep 100 & sleep 100");
    EXPECT_EQ(FaultOf(kVerilog, 1), "test: yosys did not read the Verilog text within 1 second");
    EXPECT_FALSE(IsRunning());
}

// The files are sparse, so they take no space.
TEST_F(YosysProcess, OutputThatIsTooLongEndsIt)
{
    Install("truncate -s 5000000000 /dev/fd/4; exec sleep 100");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys wrote more than 4,294,967,000 bytes");
    EXPECT_FALSE(IsRunning());
    Install("truncate -s 5000000000 /dev/fd/1; exec sleep 100");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys wrote more than 4,294,967,000 bytes");
    Install("truncate -s 5000000000 /dev/fd/4");
    EXPECT_EQ(FaultOf(kVerilog), "test: yosys wrote more than 4,294,967,000 bytes");
}

// If this process is killed, yosys is killed too, and no file is left.
TEST_F(YosysProcess, ItEndsWithUs)
{
    Install("exec sleep 100");
    const pid_t own = fork();
    ASSERT_GE(own, 0);
    if (own == 0) {
        FaultOf(kVerilog);
        _exit(0);
    }
    for (int tries = 0; tries < 1000 && !std::filesystem::exists(m_folder / "process"); ++tries)
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    EXPECT_TRUE(IsRunning());
    kill(own, SIGKILL);
    waitpid(own, nullptr, 0);
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
#if defined(__linux__)
    EXPECT_FALSE(IsRunning());
#endif
}

struct Ended {};

TEST_F(YosysProcess, AWatcherEndsIt)
{
    Install("exec sleep 100");
    SetWatch([] {
        static const auto start = std::chrono::steady_clock::now();
        if (std::chrono::steady_clock::now() - start > std::chrono::milliseconds(500))
            throw Ended();
    });
    EXPECT_THROW(FaultOf(kVerilog), Ended);
    EXPECT_FALSE(IsRunning());
}

} // namespace
