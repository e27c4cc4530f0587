// SPDX-License-Identifier: MIT
// Which channel numbers each band has, and what they stand for: the tables of 3GPP TS 36.104
// (E-UTRA), 25.104 and 25.102 (UTRA in FDD and TDD mode), 45.005 (GSM), 38.104 (5G) and 3GPP2
// C.S0057 (CDMA2000), downlink only.
#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string_view>

namespace kestro {

/// For bands that no packet names by a number.
inline constexpr std::uint32_t kNoBandNumber = 0xFFFFFFFF;

/// The channels `first` to `last` of a band, evenly spaced.
struct BandRow {
  std::string_view name;
  std::uint32_t number;  ///< as packets name the band
  std::uint32_t first;
  std::uint32_t last;
  std::uint32_t firstKHz;  ///< the downlink frequency of `first`
  std::uint32_t stepKHz;
};

/// A part of 5G's global raster.
struct RasterRow {
  std::uint32_t first;
  std::uint32_t last;
  std::uint32_t firstKHz;
  std::uint32_t stepKHz;
};

inline constexpr BandRow kEUTRARows[] = {
    {"1", 1, 0, 599, 2110000, 100},         {"2", 2, 600, 1199, 1930000, 100},
    {"3", 3, 1200, 1949, 1805000, 100},     {"4", 4, 1950, 2399, 2110000, 100},
    {"5", 5, 2400, 2649, 869000, 100},      {"6", 6, 2650, 2749, 875000, 100},
    {"7", 7, 2750, 3449, 2620000, 100},     {"8", 8, 3450, 3799, 925000, 100},
    {"9", 9, 3800, 4149, 1844900, 100},     {"10", 10, 4150, 4749, 2110000, 100},
    {"11", 11, 4750, 4949, 1475900, 100},   {"12", 12, 5010, 5179, 729000, 100},
    {"13", 13, 5180, 5279, 746000, 100},    {"14", 14, 5280, 5379, 758000, 100},
    {"17", 17, 5730, 5849, 734000, 100},    {"18", 18, 5850, 5999, 860000, 100},
    {"19", 19, 6000, 6149, 875000, 100},    {"20", 20, 6150, 6449, 791000, 100},
    {"21", 21, 6450, 6599, 1495900, 100},   {"22", 22, 6600, 7399, 3510000, 100},
    {"23", 23, 7500, 7699, 2180000, 100},   {"24", 24, 7700, 8039, 1525000, 100},
    {"25", 25, 8040, 8689, 1930000, 100},   {"26", 26, 8690, 9039, 859000, 100},
    {"27", 27, 9040, 9209, 852000, 100},    {"28", 28, 9210, 9659, 758000, 100},
    {"29", 29, 9660, 9769, 717000, 100},    {"30", 30, 9770, 9869, 2350000, 100},
    {"31", 31, 9870, 9919, 462500, 100},    {"32", 32, 9920, 10359, 1452000, 100},
    {"33", 33, 36000, 36199, 1900000, 100}, {"34", 34, 36200, 36349, 2010000, 100},
    {"35", 35, 36350, 36949, 1850000, 100}, {"36", 36, 36950, 37549, 1930000, 100},
    {"37", 37, 37550, 37749, 1910000, 100}, {"38", 38, 37750, 38249, 2570000, 100},
    {"39", 39, 38250, 38649, 1880000, 100}, {"40", 40, 38650, 39649, 2300000, 100},
    {"41", 41, 39650, 41589, 2496000, 100}, {"42", 42, 41590, 43589, 3400000, 100},
    {"43", 43, 43590, 45589, 3600000, 100}, {"44", 44, 45590, 46589, 703000, 100},
    {"45", 45, 46590, 46789, 1447000, 100}, {"46", 46, 46790, 54539, 5150000, 100},
    {"47", 47, 54540, 55239, 5855000, 100}, {"48", 48, 55240, 56739, 3550000, 100},
    {"49", 49, 56740, 58239, 3550000, 100}, {"50", 50, 58240, 59089, 1432000, 100},
    {"51", 51, 59090, 59139, 1427000, 100}, {"52", 52, 59140, 60139, 3300000, 100},
    {"65", 65, 65536, 66435, 2110000, 100}, {"66", 66, 66436, 67335, 2110000, 100},
    {"67", 67, 67336, 67535, 738000, 100},  {"68", 68, 67536, 67835, 753000, 100},
    {"69", 69, 67836, 68335, 2570000, 100}, {"70", 70, 68336, 68585, 1995000, 100},
    {"71", 71, 68586, 68935, 617000, 100},  {"72", 72, 68936, 68985, 461000, 100},
    {"73", 73, 68986, 69035, 460000, 100},  {"74", 74, 69036, 69465, 1475000, 100},
    {"75", 75, 69466, 70315, 1432000, 100}, {"76", 76, 70316, 70365, 1427000, 100},
    {"85", 85, 70366, 70545, 728000, 100},
};

inline constexpr BandRow kUTRAFDDRows[] = {
    {"I", 1, 10562, 10838, 2112400, 200},  {"II", 2, 9662, 9938, 1932400, 200},
    {"III", 3, 1162, 1513, 1807400, 200},  {"IV", 4, 1537, 1738, 2112400, 200},
    {"V", 5, 4357, 4458, 871400, 200},     {"VI", 6, 4387, 4413, 877400, 200},
    {"VII", 7, 2237, 2563, 2622400, 200},  {"VIII", 8, 2937, 3088, 927400, 200},
    {"IX", 9, 9237, 9387, 1847400, 200},   {"X", 10, 3112, 3388, 2112400, 200},
    {"XI", 11, 3712, 3787, 1478400, 200},  {"XII", 12, 3842, 3903, 731400, 200},
    {"XIII", 13, 4017, 4043, 748400, 200}, {"XIV", 14, 4117, 4143, 760400, 200},
    {"XIX", 19, 712, 763, 877400, 200},    {"XX", 20, 4512, 4638, 793400, 200},
    {"XXI", 21, 862, 912, 1498400, 200},   {"XXII", 22, 4662, 5038, 3512400, 200},
    {"XXV", 25, 5112, 5413, 1932400, 200}, {"XXVI", 26, 5762, 5913, 861400, 200},
};

inline constexpr BandRow kUTRATDDRows[] = {
    {"a low", kNoBandNumber, 9500, 9600, 1900000, 200},
    {"a high", kNoBandNumber, 10050, 10125, 2010000, 200},
    {"b low", kNoBandNumber, 9250, 9550, 1850000, 200},
    {"b high", kNoBandNumber, 9650, 9950, 1930000, 200},
    {"c", kNoBandNumber, 9550, 9650, 1910000, 200},
    {"d", kNoBandNumber, 12850, 13100, 2570000, 200},
    {"e", kNoBandNumber, 11500, 12000, 2300000, 200},
    {"f", kNoBandNumber, 9400, 9600, 1880000, 200},
};

inline constexpr BandRow kGSMRows[] = {
    {"GSM 450", kNoBandNumber, 259, 293, 460600, 200},
    {"GSM 480", kNoBandNumber, 306, 340, 489000, 200},
    {"GSM 850", kNoBandNumber, 128, 251, 869200, 200},
    {"P-GSM 900", kNoBandNumber, 1, 124, 935200, 200},
    {"E-GSM 900", kNoBandNumber, 975, 1023, 925200, 200},
    {"E-GSM 900", kNoBandNumber, 0, 0, 935000, 200},
    {"DCS 1800", 0, 512, 885, 1805200, 200},
    {"PCS 1900", 1, 512, 810, 1930200, 200},
};

inline constexpr BandRow kCDMA2000Rows[] = {
    {"0", 0, 1, 799, 870030, 30},     {"0", 0, 991, 1023, 869040, 30},
    {"1", 1, 0, 1199, 1930000, 50},   {"4", 4, 0, 599, 1840000, 50},
    {"6", 6, 0, 1199, 2110000, 50},   {"8", 8, 0, 1499, 1805000, 50},
    {"9", 9, 0, 699, 925000, 50},     {"13", 13, 0, 1399, 2620000, 50},
    {"14", 14, 0, 1299, 1930000, 50}, {"15", 15, 0, 899, 2110000, 50},
};

inline constexpr RasterRow kNRRaster[] = {
    {0, 599999, 0, 5},
    {600000, 2016666, 3000000, 15},
    {2016667, 3279165, 24250080, 60},
};

/// 5G's bands; where a channel lies, the raster says.
struct NRBandRow {
  std::string_view name;
  std::uint32_t number;
  std::uint32_t first;
  std::uint32_t last;
};

inline constexpr NRBandRow kNRRows[] = {
    {"n1", 1, 422000, 434000},       {"n2", 2, 386000, 398000},
    {"n3", 3, 361000, 376000},       {"n5", 5, 173800, 178800},
    {"n7", 7, 524000, 538000},       {"n8", 8, 185000, 192000},
    {"n12", 12, 145800, 149200},     {"n20", 20, 158200, 164200},
    {"n25", 25, 386000, 399000},     {"n28", 28, 151600, 160600},
    {"n34", 34, 402000, 405000},     {"n38", 38, 514000, 524000},
    {"n39", 39, 376000, 384000},     {"n40", 40, 460000, 480000},
    {"n41", 41, 499200, 537999},     {"n50", 50, 286400, 303400},
    {"n51", 51, 285400, 286400},     {"n66", 66, 422000, 440000},
    {"n70", 70, 399000, 404000},     {"n71", 71, 123400, 130400},
    {"n74", 74, 295000, 303600},     {"n75", 75, 286400, 303400},
    {"n76", 76, 285400, 286400},     {"n77", 77, 620000, 680000},
    {"n78", 78, 620000, 653333},     {"n79", 79, 693334, 733333},
    {"n257", 257, 2054166, 2104165}, {"n258", 258, 2016667, 2070832},
    {"n260", 260, 2229166, 2279165}, {"n261", 261, 2070833, 2084999},
};

// --- What holds for every table ------------------------------------------------------------------

/// Every row has channels, at frequencies that a phone has (400 MHz to 6 GHz).
template <std::size_t kCount>
constexpr bool areBands(const BandRow (&rows)[kCount]) {
  for (const BandRow& row : rows) {
    if (row.first > row.last || row.stepKHz == 0) return false;
    const std::uint32_t lastKHz = row.firstKHz + (row.last - row.first) * row.stepKHz;
    if (row.firstKHz < 400'000 || lastKHz > 6'000'000 || row.name.empty()) return false;
  }
  return true;
}

/// No channel has two bands.
template <std::size_t kCount>
constexpr bool areApart(const BandRow (&rows)[kCount]) {
  for (std::size_t i = 1; i < kCount; ++i) {
    if (rows[i].first <= rows[i - 1].last) return false;
  }
  return true;
}

/// Channel numbers are the frequency itself, so that bands that share one agree on it.
template <std::size_t kCount>
constexpr bool areTimes5(const BandRow (&rows)[kCount]) {
  for (const BandRow& row : rows) {
    if (row.stepKHz != 200 || row.firstKHz != row.first * 200) return false;
  }
  return true;
}

/// The raster is without gaps, each part begins where the one before would go on (5G's third one
/// 75 kHz later, as the standard has it), and every band lies within one part.
constexpr bool isRaster() {
  for (std::size_t i = 1; i < std::size(kNRRaster); ++i) {
    const RasterRow& before = kNRRaster[i - 1];
    if (kNRRaster[i].first != before.last + 1) return false;
    const std::uint32_t next =
        before.firstKHz + (kNRRaster[i].first - before.first) * before.stepKHz;
    if (kNRRaster[i].firstKHz < next || kNRRaster[i].firstKHz - next > 75) return false;
  }
  for (const NRBandRow& band : kNRRows) {
    bool isWithin = false;
    for (const RasterRow& part : kNRRaster) {
      isWithin = isWithin ||
                 (part.first <= band.first && band.first <= band.last && band.last <= part.last);
    }
    if (!isWithin) return false;
  }
  return true;
}

static_assert(areBands(kEUTRARows) && areApart(kEUTRARows));
static_assert(areBands(kUTRAFDDRows));
static_assert(areBands(kUTRATDDRows) && areTimes5(kUTRATDDRows));
static_assert(areBands(kGSMRows));
static_assert(areBands(kCDMA2000Rows));
static_assert(isRaster());

}  // namespace kestro
