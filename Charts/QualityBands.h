#pragma once

#include <array>
#include <optional>
#include <string>
#include <string_view>

namespace ventrik
{

enum class Quality { Excellent, Good, Fair, Poor };

inline constexpr std::array<std::string_view, 4> qualityNames{"excellent", "good", "fair", "poor"};

/// From where on a value is excellent, good and fair, in its unit; below the last it is poor.
struct BandLimits {
    std::string_view name; ///< of the quantity, as limits are changed by it
    std::array<double, 3> from;

    Quality qualityOf(double value) const;
    bool operator==(const BandLimits&) const = default;
};

/// The table of limits: which values are told apart by quality, and where.
class QualityBands
{
  public:
    QualityBands();

    /// None for a value that has no bands. The name may be a path; a level in RSSI is GSM's where
    /// the name has the word GSM, and any other RSSI, which grows with the load, has no bands.
    std::optional<BandLimits> find(std::string_view name, std::string_view unit) const;

    /// Takes limits such as "RSRP=-80,-100,-110". Gives what is wrong with the text, in one line,
    /// and then changes nothing.
    std::optional<std::string> change(std::string_view text);

  private:
    std::array<BandLimits, 5> _limits;
};

} // namespace ventrik
