// The default host's message manager with several threads: whole texts, one at a time, whatever a
// sink does. What must not be concurrent uses a plain variable here, so that the thread sanitizer
// sees it too.
#include <atomic>
#include <chrono>
#include <functional>
#include <future>
#include <memory>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include <port/Port_MsgManData.h>

namespace {

constexpr int kNumThreads = 4;
constexpr int kNumTexts = 1000;

void Issue(int line, const std::string& text)
{
    Port_MsgManData::createObject("Kq", "a file", line, "a revision")
        .issueStatus("%s", text.c_str());
}

// One letter for each thread; some texts are too long to be formatted in place.
std::string TextOf(int thread, int number)
{
    return std::string(number % 10 == 0 ? 700 : 1 + static_cast<size_t>(number % 40),
                       static_cast<char>('a' + thread));
}

template <class Work>
void InThreads(int numThreads, const Work& work)
{
    std::atomic<int> numReady{0};
    std::vector<std::thread> threads;
    for (int thread = 0; thread < numThreads; ++thread) {
        threads.emplace_back([&work, &numReady, numThreads, thread] {
            for (++numReady; numReady < numThreads;)
                std::this_thread::yield();
            work(thread);
        });
    }
    for (std::thread& thread : threads)
        thread.join();
}

class MessagesOfThreads : public testing::Test {
  protected:
    ~MessagesOfThreads() override { Port_MsgManData::setSink(Port_MsgManData::Sink()); }
};

TEST_F(MessagesOfThreads, ArriveWholeAndOneAtATime)
{
    // Not protected by anything: the host's lock must be enough.
    std::vector<int> numTexts(kNumThreads, 0);
    int numInside = 0;
    int numWrong = 0;
    Port_MsgManData::setSink(
        [&](const char* id, const char* file, int line, const char* revision, const char* text) {
            numWrong += ++numInside != 1;
            const int thread = line / kNumTexts;
            numWrong += std::string(id) + file + revision != "Kqa filea revision";
            numWrong += text != TextOf(thread, line % kNumTexts);
            // Texts must be in the order in which the thread issued them.
            numWrong += line % kNumTexts != numTexts[static_cast<size_t>(thread)]++;
            --numInside;
        });
    InThreads(kNumThreads, [](int thread) {
        for (int number = 0; number < kNumTexts; ++number)
            Issue(thread * kNumTexts + number, TextOf(thread, number));
    });
    EXPECT_EQ(0, numWrong);
    EXPECT_EQ(numTexts, std::vector<int>(kNumThreads, kNumTexts));
}

TEST_F(MessagesOfThreads, ReachStandardErrorWhole)
{
    testing::internal::CaptureStderr();
    InThreads(2, [](int thread) {
        for (int number = 0; number < kNumTexts; ++number)
            Issue(0, TextOf(thread, 700) + '\n');
    });
    const std::string all = testing::internal::GetCapturedStderr();
    EXPECT_EQ(all.size(), size_t(2 * kNumTexts * 701));
    size_t numMixed = 0;
    for (size_t begin = 0; begin + 701 <= all.size(); begin += 701) {
        const std::string line = all.substr(begin, 701);
        numMixed += line != TextOf(0, 700) + '\n' && line != TextOf(1, 700) + '\n';
    }
    EXPECT_EQ(0u, numMixed);
}

// Threads fill in reports at the same time; each report has its own thread's origin.
TEST_F(MessagesOfThreads, OriginsAreEachThreadsOwn)
{
    int numWrong = 0;
    Port_MsgManData::setSink([&](const char* id, const char*, int line, const char*, const char*) {
        numWrong += std::string(id) != (line % 2 == 0 ? "even" : "odd");
    });
    std::vector<const Port_MsgManData*> objects(2);
    InThreads(2, [&objects](int thread) {
        for (int number = 0; number < kNumTexts; ++number) {
            Port_MsgManData& object = Port_MsgManData::createObject(thread == 0 ? "even" : "odd",
                                                                    "", 2 * number + thread, "");
            std::this_thread::yield();
            object.issueStatus("text");
            objects[static_cast<size_t>(thread)] = &object;
        }
    });
    EXPECT_EQ(0, numWrong);
    EXPECT_NE(objects[0], objects[1]);
}

TEST_F(MessagesOfThreads, ASinkMayIssueMessagesItself)
{
    std::string log;
    Port_MsgManData::setSink(
        [&log](const char*, const char*, int line, const char*, const char* text) {
            log += '(' + std::string(text);
            if (line > 0)
                Issue(line - 1, text);
            log += ')';
        });
    InThreads(kNumThreads, [](int thread) {
        for (int number = 0; number < kNumTexts / 10; ++number)
            Issue(2, std::string(1, static_cast<char>('a' + thread)));
    });
    // Between the beginning and end of a sink come only the messages that it issues itself.
    ASSERT_EQ(log.size(), size_t(kNumThreads * kNumTexts / 10 * 9));
    for (size_t begin = 0; begin < log.size(); begin += 9) {
        const std::string name(1, log[begin + 1]);
        ASSERT_EQ(log.substr(begin, 9), '(' + name + '(' + name + '(' + name + ")))") << begin;
    }
}

TEST_F(MessagesOfThreads, ASinkMayReplaceItself)
{
    // Two sinks that install each other: each text reaches the sink whose turn it is.
    std::vector<int> sinks;
    Port_MsgManData::Sink toEven;
    const auto toOdd = [&](const char*, const char*, int, const char*, const char*) {
        Port_MsgManData::setSink(toEven);
        sinks.push_back(1);
    };
    toEven = [&sinks, toOdd](const char*, const char*, int, const char*, const char*) {
        Port_MsgManData::setSink(toOdd);
        sinks.push_back(0);
    };
    Port_MsgManData::setSink(toEven);
    InThreads(kNumThreads, [](int) {
        for (int number = 0; number < kNumTexts; ++number)
            Issue(0, "text");
    });
    Port_MsgManData::setSink(Port_MsgManData::Sink());
    ASSERT_EQ(sinks.size(), size_t(kNumThreads * kNumTexts));
    for (size_t number = 0; number < sinks.size(); ++number)
        ASSERT_EQ(sinks[number], static_cast<int>(number % 2)) << number;
}

TEST_F(MessagesOfThreads, AThrowingSinkReleasesTheLock)
{
    int numTexts = 0;
    Port_MsgManData::setSink([&numTexts](const char*, const char*, int, const char*, const char*) {
        ++numTexts;
        throw std::runtime_error("from the sink");
    });
    std::atomic<int> numCaught{0};
    InThreads(kNumThreads, [&numCaught](int) {
        for (int number = 0; number < kNumTexts / 10; ++number) {
            try {
                Issue(0, "text");
            } catch (const std::runtime_error&) {
                ++numCaught;
            }
        }
    });
    EXPECT_EQ(kNumThreads * kNumTexts / 10, numTexts);
    EXPECT_EQ(numTexts, numCaught);
}

// After a sink is exchanged, what it referred to may be destroyed: it no longer runs in any thread.
TEST_F(MessagesOfThreads, AreReportedWhileTheSinkIsExchanged)
{
    std::atomic<bool> isDone{false};
    std::atomic<int> numReceived{0};
    int numExchanged = 0;
    std::thread exchanger([&] {
        while (!isDone) {
            const std::unique_ptr<int> counter(new int(0));
            int* const received = counter.get();
            Port_MsgManData::setSink([received](const char*, const char*, int, const char*,
                                                const char*) { ++*received; });
            std::this_thread::yield();
            const auto count = [&numReceived](const char*, const char*, int, const char*,
                                              const char*) { ++numReceived; };
            EXPECT_TRUE(Port_MsgManData::setSink(count));
            numReceived += *counter;
            *counter = -1;
            ++numExchanged;
        }
    });
    Port_MsgManData::setSink(
        [&numReceived](const char*, const char*, int, const char*, const char*) { ++numReceived; });
    InThreads(kNumThreads - 1, [](int thread) {
        for (int number = 0; number < kNumTexts; ++number)
            Issue(0, TextOf(thread, number));
    });
    isDone = true;
    exchanger.join();
    EXPECT_LT(0, numExchanged);
    EXPECT_EQ((kNumThreads - 1) * kNumTexts, numReceived);
}

// The state of a sink; a report changes one half, then the other.
struct Halves {
    explicit Halves(std::atomic<int>& numTorn) : m_numTorn(&numTorn) {}
    Halves(const Halves& other) : m_numTorn(other.m_numTorn), m_first(other.m_first)
    {
        std::this_thread::yield();
        m_second = other.m_second;
        *m_numTorn += m_first != m_second;
    }
    ~Halves() = default;
    Halves& operator=(const Halves&) = delete;

    void Report()
    {
        ++m_first;
        std::this_thread::yield();
        ++m_second;
    }

    std::atomic<int>* m_numTorn;
    int m_first = 0;
    int m_second = 0;
};

// A sink is copied when it is returned to a caller, and never while it runs in another thread.
TEST_F(MessagesOfThreads, ASinkIsCopiedBetweenReports)
{
    std::atomic<int> numTorn{0};
    Port_MsgManData::setSink([halves = Halves(numTorn)](const char*, const char*, int, const char*,
                                                        const char*) mutable { halves.Report(); });
    const Port_MsgManData::Sink other = [](const char*, const char*, int, const char*,
                                           const char*) {};
    InThreads(2, [&other](int thread) {
        for (int number = 0; number < kNumTexts; ++number) {
            if (thread == 0)
                Issue(0, "text");
            else
                Port_MsgManData::setSink(Port_MsgManData::setSink(other));
        }
    });
    EXPECT_EQ(0, numTorn);
}

struct Fates {
    int numGone = 0;
    int numLocked = 0;
    std::vector<std::future<void>> reports;
};

// On destruction, finds out whether another thread can report.
struct Witness {
    explicit Witness(Fates& fates) : m_fates(&fates) {}
    ~Witness()
    {
        std::future<void> report =
            std::async(std::launch::async, [] { Issue(0, "from the witness"); });
        m_fates->numLocked +=
            report.wait_for(std::chrono::seconds(20)) != std::future_status::ready;
        m_fates->reports.push_back(std::move(report)); // waiting for it would never end
        ++m_fates->numGone;
    }
    Witness(const Witness&) = delete;
    Witness& operator=(const Witness&) = delete;
    Fates* m_fates;
};

Port_MsgManData::Sink HoldWitness(Fates& fates, std::function<void()> act)
{
    const std::shared_ptr<Witness> witness = std::make_shared<Witness>(fates);
    return [witness, act](const char*, const char*, int, const char*, const char*) { act(); };
}

void Ignore(const char*, const char*, int, const char*, const char*) {}

TEST_F(MessagesOfThreads, AReplacedSinkGoesWithoutTheLock)
{
    Fates fates;
    Port_MsgManData::setSink(HoldWitness(fates, [] {}));
    Port_MsgManData::setSink(Ignore);
    EXPECT_EQ(1, fates.numGone) << "replaced by somebody else";

    // It installs another sink, which is replaced in turn: two are destroyed after it has ended,
    // not before.
    int numGoneInside = 0;
    Port_MsgManData::setSink(HoldWitness(fates, [&] {
        Port_MsgManData::setSink(HoldWitness(fates, [] {}));
        Port_MsgManData::setSink(Ignore);
        numGoneInside = fates.numGone;
    }));
    Issue(0, "to the one that replaces itself");
    EXPECT_EQ(1, numGoneInside);
    EXPECT_EQ(3, fates.numGone);

    // The message of one sink is received by another, which ends before the first one does.
    Port_MsgManData::setSink(HoldWitness(fates, [&] {
        Port_MsgManData::setSink(HoldWitness(fates, [] { Port_MsgManData::setSink(Ignore); }));
        Issue(0, "to the second");
        numGoneInside = fates.numGone;
    }));
    Issue(0, "to the first");
    EXPECT_EQ(3, numGoneInside);
    EXPECT_EQ(5, fates.numGone);

    Port_MsgManData::setSink(HoldWitness(fates, [] {
        Port_MsgManData::setSink(Ignore);
        throw std::runtime_error("after it has replaced itself");
    }));
    EXPECT_THROW(Issue(0, "to the one that throws"), std::runtime_error);
    EXPECT_EQ(6, fates.numGone);
    EXPECT_EQ(0, fates.numLocked);
}

} // namespace
