#pragma once

#include "benchmarks/context.h"

#include <charconv>
#include <cstdint>
#include <cstdio>
#include <iomanip>
#include <ostream>
#include <vector>

#include <fmt/compile.h>

// The formats of the print jobs, each as every contender says it. `values` are the elements that
// one pass over the format takes; calls get the arguments as their own types want them.
namespace bench {

inline constexpr std::size_t mostCharacters = 64;  // of one pass, with room to spare

inline char* put(char* out, char character) {
    *out = character;
    return out + 1;
}

// As "%g" and "%.15g".
inline char* putGeneral(char* out, double value, int precision) {
    return std::to_chars(out, out + mostCharacters, value, std::chars_format::general, precision)
        .ptr;
}

inline char* putFixed(char* out, double value, int width, int precision) {
    char digits[mostCharacters];
    const char* end =
        std::to_chars(digits, std::end(digits), value, std::chars_format::fixed, precision).ptr;
    for (std::ptrdiff_t used = end - digits; used < width; ++used)
        *out++ = ' ';
    return std::copy(static_cast<const char*>(digits), end, out);
}

struct IntFormat {
    static constexpr char name[] = "int";
    static constexpr char16_t text[] = u"%d\n";
    static constexpr std::size_t values = 1;
    static auto data(std::size_t count) { return integers(count, -1000000, 1000000); }
    static constexpr auto compiled() { return FMT_COMPILE("{}\n"); }
    static constexpr char runtime[] = "{}\n";
    template <class Call>
    static auto arguments(const double* v, Call call) {
        return call(static_cast<int>(v[0]));
    }
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%d\n", static_cast<int>(v[0]));
    }
    static void prepare(std::ostream&) {}
    static void stream(std::ostream& out, const double* v) {
        out << static_cast<int>(v[0]) << '\n';
    }
    static char* chars(char* out, const double* v) {
        return put(std::to_chars(out, out + mostCharacters, static_cast<int>(v[0])).ptr, '\n');
    }
};

struct HexFormat {
    static constexpr char name[] = "hex";
    static constexpr char16_t text[] = u"%x ";
    static constexpr std::size_t values = 1;
    static auto data(std::size_t count) { return integers(count, 0, 0xFFFFFFFF); }
    static constexpr auto compiled() { return FMT_COMPILE("{:x} "); }
    static constexpr char runtime[] = "{:x} ";
    template <class Call>
    static auto arguments(const double* v, Call call) {
        return call(static_cast<std::uint32_t>(v[0]));
    }
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%x ", static_cast<std::uint32_t>(v[0]));
    }
    static void prepare(std::ostream& out) { out << std::hex; }
    static void stream(std::ostream& out, const double* v) {
        out << static_cast<std::uint32_t>(v[0]) << ' ';
    }
    static char* chars(char* out, const double* v) {
        const auto value = static_cast<std::uint32_t>(v[0]);
        return put(std::to_chars(out, out + mostCharacters, value, 16).ptr, ' ');
    }
};

struct RealFormat {
    static constexpr std::size_t values = 1;
    static auto data(std::size_t count) { return reals(count, -1000, 1000); }
    template <class Call>
    static auto arguments(const double* v, Call call) {
        return call(v[0]);
    }
};

struct GFormat : RealFormat {
    static constexpr char name[] = "g";
    static constexpr char16_t text[] = u"%g\n";
    static constexpr auto compiled() { return FMT_COMPILE("{:g}\n"); }
    static constexpr char runtime[] = "{:g}\n";
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%g\n", v[0]);
    }
    static void prepare(std::ostream&) {}
    static void stream(std::ostream& out, const double* v) { out << v[0] << '\n'; }
    static char* chars(char* out, const double* v) { return put(putGeneral(out, v[0], 6), '\n'); }
};

struct FifteenFormat : RealFormat {
    static constexpr char name[] = "15g";
    static constexpr char16_t text[] = u"%.15g,";
    static constexpr auto compiled() { return FMT_COMPILE("{:.15g},"); }
    static constexpr char runtime[] = "{:.15g},";
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%.15g,", v[0]);
    }
    static void prepare(std::ostream& out) { out << std::setprecision(15); }
    static void stream(std::ostream& out, const double* v) { out << v[0] << ','; }
    static char* chars(char* out, const double* v) { return put(putGeneral(out, v[0], 15), ','); }
};

struct FixedFormat : RealFormat {
    static constexpr char name[] = "fixed";
    static constexpr char16_t text[] = u"%8.3f ";
    static constexpr auto compiled() { return FMT_COMPILE("{:8.3f} "); }
    static constexpr char runtime[] = "{:8.3f} ";
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%8.3f ", v[0]);
    }
    static void prepare(std::ostream& out) { out << std::fixed << std::setprecision(3); }
    static void stream(std::ostream& out, const double* v) { out << std::setw(8) << v[0] << ' '; }
    static char* chars(char* out, const double* v) { return put(putFixed(out, v[0], 8, 3), ' '); }
};

struct MixedFormat {
    static constexpr char name[] = "mixed";
    static constexpr char16_t text[] = u"%d,%.3f,%g\n";
    static constexpr std::size_t values = 3;
    static std::vector<double> data(std::size_t count) {
        std::vector<double> all = reals(count, -1000, 1000);
        const std::vector<double> whole = integers(count, -1000000, 1000000);
        for (std::size_t i = 0; i < count; i += values)
            all[i] = whole[i];
        return all;
    }
    static constexpr auto compiled() { return FMT_COMPILE("{},{:.3f},{:g}\n"); }
    static constexpr char runtime[] = "{},{:.3f},{:g}\n";
    template <class Call>
    static auto arguments(const double* v, Call call) {
        return call(static_cast<int>(v[0]), v[1], v[2]);
    }
    template <class Call>
    static int c(const double* v, Call call) {
        return call("%d,%.3f,%g\n", static_cast<int>(v[0]), v[1], v[2]);
    }
    static void prepare(std::ostream&) {}
    static void stream(std::ostream& out, const double* v) {
        out << static_cast<int>(v[0]) << ',' << std::fixed << std::setprecision(3) << v[1] << ','
            << std::defaultfloat << std::setprecision(6) << v[2] << '\n';
    }
    static char* chars(char* out, const double* v) {
        out = put(std::to_chars(out, out + mostCharacters, static_cast<int>(v[0])).ptr, ',');
        return put(putGeneral(put(putFixed(out, v[1], 0, 3), ','), v[2], 6), '\n');
    }
};

}  // namespace bench
