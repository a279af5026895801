#pragma once

#include <compare>
#include <cstddef>
#include <functional>
#include <ostream>

namespace NMX
{

/// Policy of ITypedId: the value zero means that there is no such thing.
struct IInvalidIdValueZero
{
  static constexpr unsigned value = 0;
};

/// A number that identifies something of one sort, told apart at compile time by `Tag`. Prints as the number.
template <class Representation, class Tag, class InvalidValue = IInvalidIdValueZero>
class ITypedId
{
public:
  using RepresentationType = Representation;

  constexpr ITypedId() = default;
  constexpr explicit ITypedId(Representation value) : m_value(value) {}

  [[nodiscard]] constexpr Representation Value() const { return m_value; }
  [[nodiscard]] constexpr bool Valid() const { return m_value != Representation{InvalidValue::value}; }

  friend constexpr auto operator<=>(ITypedId, ITypedId) = default;
  friend std::ostream& operator<<(std::ostream& out, ITypedId id) { return out << id.m_value; }

private:
  Representation m_value{InvalidValue::value};
};

struct ISubjectStoreTag;
struct VICalibrationSessionTag;

/// Identifies a subject for ever: ids are handed out by the store and never used again.
using TSubjectStoreId = ITypedId<unsigned long long, ISubjectStoreTag, IInvalidIdValueZero>;

/// Identifies one run of a subject calibration.
using TCalibrationSessionId = ITypedId<unsigned int, VICalibrationSessionTag, IInvalidIdValueZero>;

}

template <class Representation, class Tag, class InvalidValue>
struct std::hash<NMX::ITypedId<Representation, Tag, InvalidValue>>
{
  std::size_t operator()(NMX::ITypedId<Representation, Tag, InvalidValue> id) const noexcept
  {
    return std::hash<Representation>{}(id.Value());
  }
};
