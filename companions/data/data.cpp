// companions/data/data.cpp -- the shared data areas and the default tolerance set.
#include <cstdint>
#include "companions/data/data_api.h"

namespace {
constexpr double kDefault = 1e-6;
}  // namespace

extern "C" {

// Default set at shift 0: see data_api.h. Slots 1..20 of the set are toler[0..19].
alignas(16) double toler[ORVQ7DATA_TOLER_SIZE] = {
    kDefault, kDefault, kDefault, 1e-10,    kDefault,  // k = 1..5
    kDefault, kDefault, kDefault, kDefault, kDefault,  // k = 6..10
    kDefault, 1e-8,     kDefault, kDefault, kDefault,  // k = 11..15
    kDefault, kDefault, kDefault, kDefault, kDefault,  // k = 16..20
};
alignas(16) std::int64_t decale[ORVQ7DATA_DECALE_SIZE] = {0, 0, 0, 0, 0, 0, 0, 0};
alignas(16) std::int32_t data[ORVQ7DATA_DATA_SIZE] = {};
alignas(16) double dynar[ORVQ7DATA_DYNAR_SIZE] = {};
alignas(16) double utili1[ORVQ7DATA_UTILI1_SIZE] = {};
alignas(16) double utili2[ORVQ7DATA_UTILI_SIZE] = {};
alignas(16) double utili4[ORVQ7DATA_UTILI_SIZE] = {};
alignas(16) double utili5[ORVQ7DATA_UTILI_SIZE] = {};
alignas(16) double gmacer[ORVQ7DATA_GMACER_SIZE] = {};

}  // extern "C"
