#pragma once

#include <memory>
#include <utility>

namespace NMX
{

/// Base of everything that is handed around by shared pointer. Only MakeShared creates such objects;
/// `weak_from_this` is empty until it has returned.
class VShared : public std::enable_shared_from_this<VShared>
{
public:
  VShared(const VShared&) = delete;
  VShared& operator=(const VShared&) = delete;
  virtual ~VShared() = default;

protected:
  VShared() = default;

  /// A shared pointer to the object itself, as the class that calls.
  template <class T>
  [[nodiscard]] static std::shared_ptr<T> SharedSelf(T& self)
  {
    return std::static_pointer_cast<T>(static_cast<VShared&>(self).shared_from_this());
  }
};

}

namespace MakeSharedDetail
{

/// The class that is really allocated: nothing can derive from a shared class any further.
template <class T>
class VSharedFinal final : public T
{
public:
  template <class... Arguments>
  explicit VSharedFinal(Arguments&&... arguments) : T(std::forward<Arguments>(arguments)...)
  {
  }
};

}

namespace NMX
{

/// Creates a shared object of a class derived from VShared. The count block is allocated apart from the object, so
/// that a weak pointer that outlives the object does not keep the object's memory.
template <class T, class... Arguments>
[[nodiscard]] std::shared_ptr<T> MakeShared(Arguments&&... arguments)
{
  static_assert(std::is_base_of_v<VShared, T>);
  return std::shared_ptr<T>(new MakeSharedDetail::VSharedFinal<T>(std::forward<Arguments>(arguments)...));
}

}
