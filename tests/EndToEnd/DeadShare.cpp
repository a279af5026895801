// A share that does not answer: preloaded into the host, it keeps whoever asks for a file beneath the folder that
// SUBJECT_STORE_DEAD_SHARE names, as long as there is a file of that name with ".dead" at its end.

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <dlfcn.h>
#include <string>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace
{

void WaitFor(const char* path)
{
  const char* const share = std::getenv("SUBJECT_STORE_DEAD_SHARE");
  if (share == nullptr || path == nullptr || std::strncmp(path, share, std::strlen(share)) != 0)
    return;
  const std::string marker = std::string(share) + ".dead";
  while (syscall(SYS_access, marker.c_str(), F_OK) == 0)
  {
    const timespec pause{0, 20'000'000};
    nanosleep(&pause, nullptr);
  }
}

template <class Function>
Function* Next(const char* name)
{
  return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

}

extern "C" int stat(const char* __restrict path, struct stat* __restrict result) noexcept
{
  WaitFor(path);
  return Next<int(const char*, struct stat*)>("stat")(path, result);
}

extern "C" int stat64(const char* __restrict path, struct stat64* __restrict result) noexcept
{
  WaitFor(path);
  return Next<int(const char*, struct stat64*)>("stat64")(path, result);
}

extern "C" std::FILE* fopen(const char* __restrict path, const char* __restrict mode)
{
  WaitFor(path);
  return Next<std::FILE*(const char*, const char*)>("fopen")(path, mode);
}

extern "C" std::FILE* fopen64(const char* __restrict path, const char* __restrict mode)
{
  WaitFor(path);
  return Next<std::FILE*(const char*, const char*)>("fopen64")(path, mode);
}
