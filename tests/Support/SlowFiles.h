#pragma once

#include "HostInterface/NMX/FileWork.h"

#include <condition_variable>
#include <filesystem>
#include <map>
#include <mutex>
#include <set>
#include <string>

/// Files that answer when the test says so, and how often each was looked at. There is one world of files, as a look
/// gets nothing but a path; it is emptied, and lets go of everybody, when a test ends.
class SlowFiles
{
public:
  SlowFiles() = default;
  SlowFiles(const SlowFiles&) = delete;
  SlowFiles& operator=(const SlowFiles&) = delete;
  ~SlowFiles()
  {
    World& world = TheWorld();
    std::unique_lock lock(world.mutex);
    world.dead.clear();
    world.changed.notify_all();
    world.changed.wait(lock, [&] { return world.looking == 0; });
    world.looks.clear();
  }

  /// From now on nobody who looks at the file comes back.
  void Kill(const std::string& file) const
  {
    const std::lock_guard lock(TheWorld().mutex);
    TheWorld().dead.insert(file);
  }

  void Revive(const std::string& file) const
  {
    const std::lock_guard lock(TheWorld().mutex);
    TheWorld().dead.erase(file);
    TheWorld().changed.notify_all();
  }

  /// Waits until so many look at files that do not answer.
  void WaitUntilLooking(int count) const
  {
    std::unique_lock lock(TheWorld().mutex);
    TheWorld().changed.wait(lock, [&] { return TheWorld().looking == count; });
  }

  [[nodiscard]] int Looks(const std::string& file) const
  {
    const std::lock_guard lock(TheWorld().mutex);
    return TheWorld().looks[file];
  }

  /// What the tests look for: the text of a file is its name.
  static std::string Text(const std::filesystem::path& file)
  {
    World& world = TheWorld();
    std::unique_lock lock(world.mutex);
    ++world.looks[file.string()];
    ++world.looking;
    world.changed.notify_all();
    world.changed.wait(lock, [&] { return !world.dead.contains(file.string()); });
    --world.looking;
    world.changed.notify_all();
    return file.string();
  }

private:
  struct World
  {
    std::mutex mutex;
    std::condition_variable changed;
    std::set<std::string> dead;
    std::map<std::string, int> looks;
    int looking = 0;
  };

  static World& TheWorld()
  {
    static World& world = *new World; // a thread may hang in it when the program ends
    return world;
  }
};
