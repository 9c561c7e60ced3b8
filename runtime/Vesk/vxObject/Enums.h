// The bases of `$enum class`: a value that knows its labels. It converts to its number, so it compares, switches and
// indexes like a plain enumeration. EnumBase counts its labels from 0; the refined form has numbers of its own.

@import "Vesk/vxObject/Archive.h"

namespace vesk {

template <typename N>
using EnabledArrayOf = decltype(N::enabledArray());
template <typename N>
using ValueArrayOf = decltype(N::valueArray());

template <typename N>
class EnumBase {
 public:
  EnumBase(int value) : m_value(value) {}
  operator int() const { return m_value; }

  // The position of the value among the labels, -1 for a number without one.
  ssize_t Index() const {
    if constexpr (!Detects<ValueArrayOf, N>) return m_value >= 0 && m_value < N::LEN ? m_value : -1;
    for (ssize_t i = 0; i < N::LEN; ++i) {
      if (ValueAt(i) == m_value) return i;
    }
    return -1;
  }
  static int ValueAt(ssize_t index) {
    if constexpr (Detects<ValueArrayOf, N>) return N::valueArray()[index];
    return static_cast<int>(index);
  }
  static bool IsEnabled(ssize_t index) {
    if constexpr (Detects<EnabledArrayOf, N>) return N::enabledArray()[index];
    return true;
  }
  // Null for a number without a label.
  ConstStringZ Label() const { return Index() < 0 ? nullptr : N::stringArray()[Index()]; }

  void Serialise(Archive& ar) const { SerialiseVariableLengthUint(ar, static_cast<uint32>(m_value)); }
  void Deserialise(InputArchive& ar) {
    const EnumBase value(static_cast<int32>(ReadCompact(ar)));
    if (N::LEN > 0 && value.Index() < 0 && !ar.m_limits.m_anyEnumNumber) {
      FailArchive("number without a label in an enumeration");
    }
    m_value = value.m_value;
  }
  friend xostream& operator<<(xostream& os, N const& value) {
    if (ConstStringZ label = value.Label()) return os << label;
    return os << value.m_value;
  }

 private:
  int32 m_value;
};

template <typename N>
class EnumBaseForRefinedLabels : public EnumBase<N> {
 public:
  EnumBaseForRefinedLabels(int value) : EnumBase<N>(value) {}
};

}  // namespace vesk
