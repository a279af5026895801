#include "HostInterface/NMX/FileThreads.h"

#include "HostInterface/NMX/GlobalLog.h"

#include <condition_variable>
#include <deque>
#include <list>
#include <mutex>
#include <system_error>
#include <thread>
#include <utility>

namespace NMX
{

using Clock = std::chrono::steady_clock;

namespace
{

void Tell(const FileThreads::Ended& ended, EFileEnd end) noexcept
{
  try
  {
    ended(end);
  }
  catch (...)
  {
    Log(systemLog, ESeverity::Critical, "The end of a job on a file could not be told.");
  }
}

}

struct FileThreads::State
{
  struct Request
  {
    Job job;
    Ended ended; ///< empty once the request has ended
    Clock::time_point deadline;
    bool begun = false;
    std::list<std::shared_ptr<Request>>::iterator place; ///< in `open`
  };

  std::mutex mutex;
  std::condition_variable work;
  std::condition_variable watch;
  std::deque<std::shared_ptr<Request>> waiting; ///< not begun, in the order of their deadlines
  std::list<std::shared_ptr<Request>> open;     ///< not ended, likewise
  std::size_t threads = 0;
  std::size_t idle = 0;  ///< of the threads
  std::size_t stuck = 0; ///< of the threads: their requests have timed out
  bool watched = false;
  bool closed = false;

  bool MakeThreads(const std::shared_ptr<State>& self) noexcept;
  void Add(Job job, Ended ended, Clock::time_point deadline);
  Ended End(Request& request);
  void Work();
  void RunOne(std::unique_lock<std::mutex>& lock);
  void Watch();
};

/// Starts what a further request needs; false when it would have no thread at all.
bool FileThreads::State::MakeThreads(const std::shared_ptr<State>& self) noexcept
{
  try
  {
    if (!watched)
      std::thread([self] { self->Watch(); }).detach();
    watched = true;
    if (waiting.size() >= idle && threads < maximumThreads)
    {
      std::thread([self] { self->Work(); }).detach();
      ++threads;
    }
  }
  catch (const std::exception& failure)
  {
    Log(systemLog, ESeverity::Error, "A thread for files cannot be started: %1%", failure.what());
  }
  return watched && threads != 0;
}

void FileThreads::State::Add(Job job, Ended ended, Clock::time_point deadline)
{
  const auto request = std::make_shared<Request>();
  waiting.push_back(request);
  try
  {
    request->place = open.insert(open.end(), request);
  }
  catch (...)
  {
    waiting.pop_back();
    throw;
  }
  request->job = std::move(job);
  request->ended = std::move(ended);
  request->deadline = deadline;
}

/// What is to be told of the end, by whoever ends the request, once the mutex is free.
FileThreads::Ended FileThreads::State::End(Request& request)
{
  open.erase(request.place);
  return std::exchange(request.ended, nullptr);
}

/// One of the threads.
void FileThreads::State::Work()
{
  std::unique_lock lock(mutex);
  for (;;)
  {
    ++idle;
    work.wait(lock, [this] { return closed || !waiting.empty(); });
    --idle;
    if (closed)
      return;
    RunOne(lock);
  }
}

void FileThreads::State::RunOne(std::unique_lock<std::mutex>& lock)
{
  const auto request = std::move(waiting.front());
  waiting.pop_front();
  request->begun = true;
  Job job = std::exchange(request->job, nullptr);
  lock.unlock();
  job();
  job = nullptr;
  lock.lock();
  if (!request->ended)
  {
    --stuck;
    return;
  }
  if (closed)
    return;
  Ended ended = End(*request);
  lock.unlock();
  Tell(ended, EFileEnd::Answered);
  ended = nullptr;
  lock.lock();
}

/// Ends the requests whose time is up.
void FileThreads::State::Watch()
{
  std::unique_lock lock(mutex);
  while (!closed)
  {
    if (open.empty())
    {
      watch.wait(lock);
      continue;
    }
    const auto request = open.front();
    if (Clock::now() < request->deadline)
    {
      watch.wait_until(lock, request->deadline);
      continue;
    }
    Ended ended = End(*request);
    if (request->begun)
      ++stuck;
    else
      waiting.pop_front(); // the first to wait is the first whose time is up
    lock.unlock();
    Tell(ended, EFileEnd::TimedOut);
    ended = nullptr;
    lock.lock();
  }
}

FileThreads& FileThreads::OfProgram()
{
  static FileThreads& threads = *new FileThreads(std::chrono::seconds(5));
  return threads;
}

FileThreads::FileThreads(std::chrono::milliseconds patience) : m_patience(patience), m_state(std::make_shared<State>())
{
}

FileThreads::~FileThreads()
{
  const std::lock_guard lock(m_state->mutex);
  m_state->closed = true;
  m_state->work.notify_all();
  m_state->watch.notify_all();
}

void FileThreads::Run(Job job, Ended ended)
{
  {
    const std::lock_guard lock(m_state->mutex);
    if (m_state->stuck < maximumThreads && m_state->waiting.size() < maximumWaiting && m_state->MakeThreads(m_state))
    {
      m_state->Add(std::move(job), std::move(ended), Clock::now() + m_patience);
      m_state->work.notify_one();
      m_state->watch.notify_one();
      return;
    }
  }
  Tell(ended, EFileEnd::Refused);
}

}
