// Work for several threads, whose results come out in the order in which the work went in.
// Tasks share nothing but what they are given; Take rethrows a task's exception.
#ifndef BOOLEQ_WORK_QUEUE_H
#define BOOLEQ_WORK_QUEUE_H

#include <cassert>
#include <condition_variable>
#include <deque>
#include <functional>
#include <future>
#include <mutex>
#include <thread>
#include <vector>

namespace booleq {

// One thread adds and takes; the queue's own threads work.
// Invariant: m_waiting has the tasks that no thread has begun; each has its future in m_results.
template <class Result>
class WorkQueue {
  public:
    WorkQueue(unsigned int numThreads, size_t maxTasks) : m_max_tasks(maxTasks)
    {
        assert(numThreads > 0);
        assert(maxTasks > 0);
        for (unsigned int thread = 0; thread < numThreads; ++thread)
            m_threads.emplace_back([this] { Work(); });
    }

    // Tasks that have not begun are dropped.
    ~WorkQueue()
    {
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_is_over = true;
            m_waiting.clear();
        }
        m_changed.notify_all();
        for (std::thread& thread : m_threads)
            thread.join();
    }
    WorkQueue(const WorkQueue&) = delete;
    WorkQueue& operator=(const WorkQueue&) = delete;

    bool IsEmpty() const { return m_results.empty(); }
    bool IsFull() const { return m_results.size() >= m_max_tasks; }

    // Requires: not full.
    void Add(std::function<Result()> task)
    {
        assert(!IsFull());
        std::packaged_task<Result()> packaged(std::move(task));
        m_results.push_back(packaged.get_future());
        {
            const std::lock_guard<std::mutex> lock(m_mutex);
            m_waiting.push_back(std::move(packaged));
        }
        m_changed.notify_one();
    }

    // The result of the oldest task; waits for it.
    // Requires: not empty.  Fails: what the task threw.
    Result Take()
    {
        assert(!IsEmpty());
        std::future<Result> result = std::move(m_results.front());
        m_results.pop_front();
        return result.get();
    }

  private:
    void Work()
    {
        for (;;) {
            std::packaged_task<Result()> task;
            {
                std::unique_lock<std::mutex> lock(m_mutex);
                m_changed.wait(lock, [this] { return m_is_over || !m_waiting.empty(); });
                if (m_waiting.empty())
                    return;
                task = std::move(m_waiting.front());
                m_waiting.pop_front();
            }
            task();
        }
    }

    size_t m_max_tasks;
    std::deque<std::future<Result>> m_results; // used only by the adding thread
    std::mutex m_mutex;                        // guards what follows
    std::condition_variable m_changed;
    std::deque<std::packaged_task<Result()>> m_waiting;
    bool m_is_over = false;
    std::vector<std::thread> m_threads; // last, because they use the others
};

} // namespace booleq

#endif
