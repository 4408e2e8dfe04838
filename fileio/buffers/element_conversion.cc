#include "fileio/buffers/element_conversion.h"

#include "fileio/buffers/convert_element.h"
#include "fileio/buffers/host_array.h"
#include "fileio/buffers/output_buffer.h"
#include "fileio/buffers/vector_unit.h"
#include "fileio/host/data_sizes.h"

#include <algorithm>
#include <array>
#include <cstring>
#include <utility>

namespace Orvandeil::FileIO {
namespace {

using detail::ElementOf;

struct TypeEntry {
    std::size_t typeCode;
    vxClassID classID;
    std::size_t bytes;
};

constexpr std::array<TypeEntry, 12> types = {{
    {1, vxLOGICAL_CLASS, 1},
    {2, vxCHAR_CLASS, 2},
    {3, vxINT8_CLASS, 1},
    {4, vxINT16_CLASS, 2},
    {5, vxINT32_CLASS, 4},
    {6, vxINT64_CLASS, 8},
    {7, vxUINT8_CLASS, 1},
    {8, vxUINT16_CLASS, 2},
    {9, vxUINT32_CLASS, 4},
    {10, vxUINT64_CLASS, 8},
    {11, vxSINGLE_CLASS, 4},
    {12, vxDOUBLE_CLASS, 8},
}};

constexpr TypeEntry unknownType = {0, vxUNKNOWN_CLASS, 0};
constexpr TypeEntry classWithoutElements = {0, vxUNKNOWN_CLASS, 1};

template <class Key>
const TypeEntry& findType(Key TypeEntry::*key, Key wanted, const TypeEntry& fallback) {
    const auto* found = std::find_if(types.begin(), types.end(),
                                     [=](const TypeEntry& entry) { return entry.*key == wanted; });
    return found == types.end() ? fallback : *found;
}

// Converts a run of `count` elements and returns the place behind the last one written.
using ConvertRun = void* (*)(void* target, const void* source, std::size_t count);

// The loop for one pair of classes. That the blocks do not overlap lets it be vectorised.
template <class To, class From>
[[gnu::always_inline]] inline void* convertElements(void* target, const void* source,
                                                    std::size_t count) {
    char* __restrict to = static_cast<char*>(target);
    const char* __restrict from = static_cast<const char*>(source);
    if constexpr (std::is_same_v<To, From>) {
        if (count != 0) std::memcpy(to, from, count * sizeof(To));
    } else {
        for (std::size_t i = 0; i < count; ++i) {
            const To element = detail::convertElement<To>(detail::loadElement<From>(from, i));
            std::memcpy(to + i * sizeof element, &element, sizeof element);
        }
    }
    return to + count * sizeof(To);
}

// The loops for one kind of processor each.
struct AnyProcessor {
    template <class To, class From>
    static void* run(void* target, const void* source, std::size_t count) {
        return convertElements<To, From>(target, source, count);
    }
};
#ifdef FILEIO_VECTOR_UNITS
struct Avx2Processor {
    template <class To, class From>
    FILEIO_FOR_AVX2 static void* run(void* target, const void* source, std::size_t count) {
        return convertElements<To, From>(target, source, count);
    }
};
struct Avx512Processor {
    template <class To, class From>
    FILEIO_FOR_AVX512 static void* run(void* target, const void* source, std::size_t count) {
        return convertElements<To, From>(target, source, count);
    }
};
#endif

constexpr std::size_t classCount = detail::lastElementClass - detail::firstElementClass + 1;

constexpr std::size_t classIndex(int classID) {
    return static_cast<std::size_t>(classID - detail::firstElementClass);
}

template <class Processor, std::size_t target, std::size_t source>
consteval ConvertRun runOf() {
    using To = typename ElementOf<detail::firstElementClass + static_cast<int>(target)>::type;
    using From = typename ElementOf<detail::firstElementClass + static_cast<int>(source)>::type;
    if constexpr (std::is_void_v<To> || std::is_void_v<From>) {
        return nullptr;
    } else {
        return &Processor::template run<To, From>;
    }
}

using RunsFromClass = std::array<ConvertRun, classCount>;

using Runs = std::array<RunsFromClass, classCount>;

template <class Processor, std::size_t target, std::size_t... sources>
consteval RunsFromClass runsInto(std::index_sequence<sources...>) {
    return {runOf<Processor, target, sources>()...};
}

template <class Processor, std::size_t... targets>
consteval Runs makeRuns(std::index_sequence<targets...>) {
    return {runsInto<Processor, targets>(std::make_index_sequence<classCount>())...};
}

// By target class, then by source class.
template <class Processor>
constexpr Runs runsOn = makeRuns<Processor>(std::make_index_sequence<classCount>());

const Runs& runsFor([[maybe_unused]] std::size_t count) {
#ifdef FILEIO_VECTOR_UNITS
    constexpr std::size_t leastForVectors = 16;
    if (count >= leastForVectors && detail::hasAvx512) return runsOn<Avx512Processor>;
    if (count >= leastForVectors && detail::hasAvx2) return runsOn<Avx2Processor>;
#endif
    return runsOn<AnyProcessor>;
}

ConvertRun findRun(vxClassID target, vxClassID source, std::size_t count) {
    const std::size_t to = classIndex(target);
    const std::size_t from = classIndex(source);
    return to < classCount && from < classCount ? runsFor(count)[to][from] : nullptr;
}

}  // namespace

std::size_t fiPkGetSizeFromClassID(vxClassID classID) {
    return findType(&TypeEntry::classID, classID, classWithoutElements).bytes;
}

std::size_t fiPkGetSizeFromType(std::size_t typeCode) {
    return findType(&TypeEntry::typeCode, typeCode, unknownType).bytes;
}

vxClassID fiPkGetClassIDFromType(std::size_t typeCode) {
    return findType(&TypeEntry::typeCode, typeCode, unknownType).classID;
}

bool fiNeedsByteFlip(vxClassID classID, int machineFormat) {
    return classID != vxCHAR_CLASS && vxDataSizeNative() % 5 != machineFormat % 5;
}

vxArray* fiPkCreateNumericMatrix(std::size_t m, std::size_t n, vxClassID classID,
                                 vxComplexity complexity) {
    const bool empty = m == 0 || n == 0;
    return vxCreateNumericMatrix(empty ? 0 : m, empty ? 0 : n, classID, complexity);
}

double fiPkScalar2Real(const vxArray* array, double fallback) {
    if (vxArrayClassID(array) != vxDOUBLE_CLASS || detail::elementCount(array) == 0) {
        return fallback;
    }
    return vxArrayFirstAsDouble(array);
}

vxArray* fiPkString2DoubleRowMatrix(const char* text) {
    OutputBuffer row(vxDOUBLE_CLASS, 0, 0, 0);
    row.AppendData(vxUINT8_CLASS, text, std::strlen(text));
    return row.TransferArray();
}

void* AssignToVoidBuffer(vxClassID targetClass, void* target, vxClassID sourceClass,
                         const void* source, std::size_t count) {
    const ConvertRun run = findRun(targetClass, sourceClass, count);
    return run == nullptr ? nullptr : run(target, source, count);
}

void* AssignToVoidBuffer(vxClassID targetClass, void* target, const VxData& source,
                         std::size_t count) {
    return AssignToVoidBuffer(targetClass, target, source.getClassID(), source.getElements(),
                              count);
}

}  // namespace Orvandeil::FileIO
