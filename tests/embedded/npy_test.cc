#include "embedded/npy/npy_file.h"
#include "embedded/services/element_types.h"
#include "embedded/services/messages.h"
#include "fileio/host/exception.h"

#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <string_view>
#include <thread>
#include <unistd.h>

#include <gtest/gtest.h>

namespace Orvandeil::FileIO::embedded {
namespace {

// A file that lives as long as the object.
class ScratchFile {
public:
    explicit ScratchFile(const std::string& content = "")
        : path(std::filesystem::temp_directory_path() / "fileio-npy-XXXXXX") {
        close(mkstemp(path.data()));
        std::ofstream(path, std::ios::binary) << content;
    }
    ~ScratchFile() { std::filesystem::remove(path); }
    ScratchFile(const ScratchFile&) = delete;
    ScratchFile& operator=(const ScratchFile&) = delete;

    std::string content() const {
        std::ostringstream all;
        all << std::ifstream(path, std::ios::binary).rdbuf();
        return all.str();
    }

    std::string path;
};

std::string npyText(int version, std::string_view header, std::string_view data) {
    std::string text = "\x93NUMPY";
    text += {static_cast<char>(version), '\0'};
    for (unsigned i = 0; i < (version == 1 ? 2u : 4u); ++i)
        text += static_cast<char>(header.size() >> 8 * i & 0xFF);
    return text.append(header).append(data);
}

std::string dictionary(std::string_view type, bool isFortranOrder, std::string_view shape) {
    std::ostringstream text;
    text << "{'descr': '" << type << "', 'fortran_order': " << (isFortranOrder ? "True" : "False")
         << ", 'shape': " << shape << ", }  \n";
    return text.str();
}

ArrayPtr readText(const std::string& content) {
    return npyRead(ScratchFile(content).path);
}

template <class T>
std::string listed(const void* values, std::size_t count) {
    std::ostringstream text;
    for (std::size_t i = 0; i < count; ++i)
        text << ' ' << +static_cast<const T*>(values)[i];
    return text.str();
}

std::string listed(vxClassID classID, const void* values, std::size_t count) {
    return withElementType(
        classID, [&]<class T>(ElementType<T>) { return listed<T>(values, count); },
        [] { return std::string(" not numeric"); });
}

// "int8 2x3: 1 2 3 4 5 6 + i 7 …" in column-major order.
std::string shown(const vxArray& array) {
    std::string text = vxArrayClassName(&array);
    for (std::size_t i = 0; i < vxArrayDimensionCount(&array); ++i)
        text += (i == 0 ? ' ' : 'x') + std::to_string(vxArrayDimensions(&array)[i]);
    const vxClassID classID = vxArrayClassID(&array);
    text += ':' + listed(classID, vxArrayData(&array), elementCount(array));
    if (vxArrayIsComplex(&array)) {
        text += " + i" + listed(classID, imaginaryData(array), elementCount(array));
    }
    return text;
}

template <class Action>
std::string errorOf(Action action) {
    try {
        action();
    } catch (const foundation::core::except::IMsgIDException& error) {
        EXPECT_EQ(std::string(error.what()).find('\n'), std::string::npos) << error.what();
        return error.GetID();
    }
    return "";
}

TEST(Npy, ReadsEveryTypeInBothByteOrdersAndAllVersions) {
    using namespace std::string_view_literals;
    const struct {
        int line;
        const char* type;
        std::string_view data;  // two elements
        const char* expected;
    } rows[] = {
        {__LINE__, "|b1", "\0\x02"sv, "logical 2x1: 0 1"},
        {__LINE__, "|i1", "\x80\x7F"sv, "int8 2x1: -128 127"},
        {__LINE__, "<i2", "\x01\x02\xFE\xFF"sv, "int16 2x1: 513 -2"},
        {__LINE__, ">i2", "\x01\x02\xFF\xFE"sv, "int16 2x1: 258 -2"},
        {__LINE__, ">u2", "\x01\x02\xFF\xFE"sv, "uint16 2x1: 258 65534"},
        {__LINE__, "=i4", "\1\0\0\0\xFF\xFF\xFF\xFF"sv, "int32 2x1: 1 -1"},
        {__LINE__, ">u4", "\0\0\0\1\xFF\xFF\xFF\xFF"sv, "uint32 2x1: 1 4294967295"},
        {__LINE__, ">i8", "\0\0\0\0\0\0\0\1\x80\0\0\0\0\0\0\0"sv,
         "int64 2x1: 1 -9223372036854775808"},
        {__LINE__, "<u8", "\1\0\0\0\0\0\0\0\xFF\xFF\xFF\xFF\xFF\xFF\xFF\xFF"sv,
         "uint64 2x1: 1 18446744073709551615"},
        {__LINE__, "<f4", "\0\0\x80\x3F\0\0\x20\xC0"sv, "single 2x1: 1 -2.5"},
        {__LINE__, ">f4", "\x3F\x80\0\0\xC0\x20\0\0"sv, "single 2x1: 1 -2.5"},
        {__LINE__, ">f8", "\x3F\xF0\0\0\0\0\0\0\xC0\4\0\0\0\0\0\0"sv, "double 2x1: 1 -2.5"},
        {__LINE__, ">c8", "\x3F\x80\0\0\xC0\x20\0\0\0\0\0\0\x40\0\0\0"sv,
         "single 2x1: 1 0 + i -2.5 2"},
        {__LINE__, "<c16",
         "\0\0\0\0\0\0\xF0\x3F\0\0\0\0\0\0\4\xC0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x40"sv,
         "double 2x1: 1 0 + i -2.5 2"},
    };
    for (const auto& row : rows) {
        for (const int version : {1, 2, 3}) {
            const std::string header = dictionary(row.type, false, "(2,)");
            EXPECT_EQ(shown(*readText(npyText(version, header, row.data))), row.expected)
                << row.line << ", version " << version;
        }
    }
}

// Every shape of up to four lengths from 0 to 3; the data are their own index in C order.
TEST(Npy, PutsCOrderIntoColumns) {
    for (unsigned code = 0; code < 4 * 4 * 4 * 4; ++code) {
        const Dimensions shape = {code & 3, code >> 2 & 3, code >> 4 & 3, code >> 6};
        std::string text = "(";
        std::size_t count = 1;
        for (const std::size_t length : shape) {
            text += std::to_string(length) + ", ";
            count *= length;
        }
        std::string data;
        for (std::size_t i = 0; i < count; ++i)
            data += static_cast<char>(i);
        const ArrayPtr array = readText(npyText(1, dictionary("|u1", false, text + ')'), data));
        ASSERT_EQ(elementCount(*array), count);
        for (std::size_t i = 0; i < count; ++i) {
            std::size_t rest = i;
            std::size_t cIndex = 0;
            std::size_t stride = count;
            for (const std::size_t length : shape) {
                stride /= length;
                cIndex += rest % length * stride;
                rest /= length;
            }
            ASSERT_EQ(static_cast<const std::uint8_t*>(vxArrayData(array.get()))[i], cIndex)
                << text;
        }
    }
}

TEST(Npy, ReadsShapesAsWritten) {
    const struct {
        int line;
        std::string header;
        const char* expected;
    } rows[] = {
        {__LINE__, dictionary("|u1", false, "()"), "uint8 1x1: 1"},
        {__LINE__, dictionary("|u1", true, "(6,)"), "uint8 6x1: 1 2 3 4 5 6"},
        {__LINE__, dictionary("|u1", false, "(0,)"), "uint8 0x1:"},
        {__LINE__, dictionary("|u1", false, "(2L, 3L)"), "uint8 2x3: 1 4 2 5 3 6"},
        {__LINE__, dictionary("|u1", true, "(2,3)"), "uint8 2x3: 1 2 3 4 5 6"},
        {__LINE__, dictionary("|u1", false, "( 1, 3 , 2, )"), "uint8 1x3x2: 1 3 5 2 4 6"},
        {__LINE__, R"({"shape":(2,),"fortran_order":False,"descr":"|u1"})", "uint8 2x1: 1 2"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(shown(*readText(npyText(1, row.header, "\1\2\3\4\5\6"))), row.expected)
            << row.line;
    }
}

TEST(Npy, RefusesHostileHeaders) {
    constexpr char bad[] = "KESTRA:npy:badHeader";
    constexpr char unsupported[] = "KESTRA:npy:unsupportedType";
    constexpr char truncated[] = "KESTRA:npy:truncated";
    const std::string rest = ", 'fortran_order': False, 'shape': (2,)}";
    std::string manyLengths = "(";
    for (int i = 0; i < 65; ++i)
        manyLengths += "1,";
    manyLengths += ')';
    const struct {
        int line;
        std::string header;
        const char* identifier;
    } rows[] = {
        {__LINE__, "{}", bad},
        {__LINE__, "{'descr': '<f8'" + rest.substr(0, rest.size() - 1), bad},
        {__LINE__, "{'descr': '<f8", bad},
        {__LINE__, "{'descr' '<f8'" + rest, bad},
        {__LINE__, "{'fortran_order': False, 'shape': (2,)}", bad},
        {__LINE__, "{'descr': '<f8', 'descr': '<f8'" + rest, bad},
        {__LINE__, "{'descr': '<f8', 'more': 1" + rest, bad},
        {__LINE__, "{'descr': '<f8', 'fortran_order': 1, 'shape': (2,)}", bad},
        {__LINE__, dictionary("<f8", false, "(2)"), bad},
        {__LINE__, dictionary("<f8", false, "(-1,)"), bad},
        {__LINE__, dictionary("<f8", false, "((2,),)"), bad},
        {__LINE__, dictionary("<f8", false, "(99999999999999999999,)"), bad},
        {__LINE__, dictionary("<f8", false, "(1152921504606846976,)"), bad},  // 2^63 bytes
        {__LINE__, dictionary("<f8", false, "(4294967296, 0, 4294967296)"), bad},
        {__LINE__, dictionary("<f8", false, manyLengths), bad},
        {__LINE__, dictionary("<f8", false, "(281474976710655,)"), truncated},
        {__LINE__, dictionary("<U3", false, "(2,)"), unsupported},
        {__LINE__, dictionary("<f2", false, "(2,)"), unsupported},
        {__LINE__, dictionary("<<f8", false, "(2,)"), unsupported},
        {__LINE__, dictionary("<f8\n\x1B[2J", false, "(2,)"), unsupported},
        {__LINE__, "{'descr': " + std::string(100000, '[') + rest, unsupported},
    };
    for (const auto& row : rows) {
        const std::string content = npyText(2, row.header, std::string(8, 'x'));
        EXPECT_EQ(errorOf([&] { readText(content); }), row.identifier) << row.line;
    }
    const std::string magic = "\x93NUMPY";
    for (const std::string& beginning :
         {std::string("GIF89a, not it"), magic + '\4' + std::string(64, '\0'),
          magic + "\1\1" + std::string(64, '\0'), magic + '\2' + '\0' + "\xFF\xFF\xFF\xFF"}) {
        EXPECT_EQ(errorOf([&] { readText(beginning); }), bad) << beginning;
    }
    const std::string whole = npyText(1, dictionary("<i2", false, "(3,)"), "abcdef");
    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_EQ(errorOf([&] { readText(whole.substr(0, length)); }), truncated) << length;
    }
}

TEST(Npy, WritesWhatItReads) {
    for (int code = vxLOGICAL_CLASS; code <= vxUINT64_CLASS; ++code) {
        const auto classID = static_cast<vxClassID>(code);
        const std::size_t size = elementBytes(classID);
        if (size == 0) continue;
        for (const vxComplexity complexity : {vxREAL, vxCOMPLEX}) {
            const bool isFloating = classID == vxDOUBLE_CLASS || classID == vxSINGLE_CLASS;
            const ArrayPtr array = makeNumeric(classID, {2, 3, 2}, complexity);
            for (std::size_t i = 0; i < 12 * size; ++i) {
                const auto byte = static_cast<unsigned char>(size == 1 ? i % 2 : i + 3);
                static_cast<unsigned char*>(realData(*array))[i] = byte;
                if (complexity == vxREAL) continue;
                static_cast<unsigned char*>(imaginaryData(*array))[i] = byte ^ 1;
            }
            const ScratchFile file;
            const std::string error = errorOf([&] { npyWrite(file.path, *array); });
            const bool expected = complexity == vxREAL || isFloating;
            EXPECT_EQ(error, expected ? "" : "KESTRA:npy:unsupportedClass") << code;
            if (!expected) continue;
            std::string text = shown(*array);
            if (classID == vxCHAR_CLASS) text.replace(0, 4, "uint16");
            EXPECT_EQ(shown(*npyRead(file.path)), text);
        }
    }
    const ScratchFile file;
    npyWrite(file.path, *makeDoubles(1, 2, {1, 2}));
    EXPECT_EQ(file.content().substr(0, 128),
              std::string("\x93NUMPY\1\0\x76\0", 10) +
                  "{'descr': '<f8', 'fortran_order': True, 'shape': (1, 2), }" +
                  std::string(59, ' ') + '\n');
    EXPECT_EQ(file.content().size(), 128u + 16u);
}

TEST(Npy, TellsWhatTheSystemRefuses) {
    const std::string folder = std::filesystem::temp_directory_path();
    EXPECT_EQ(errorOf([&] { npyRead(folder + "/no such file"); }), "KESTRA:npy:cannotRead");
    EXPECT_EQ(errorOf([&] { npyRead(folder); }), "KESTRA:npy:cannotRead");
    EXPECT_EQ(errorOf([&] { npyWrite(folder, *makeScalar(1)); }), "KESTRA:npy:cannotWrite");
    EXPECT_EQ(errorOf([] { npyWrite("/dev/full", *makeScalar(1)); }), "KESTRA:npy:cannotWrite");
    EXPECT_EQ(errorOf([] { npyWrite("/dev/null", *makeString(u"text")); }),
              "KESTRA:npy:unsupportedClass");
    for (const char* key : {"cannotRead", "cannotWrite", "badHeader", "unsupportedType",
                            "unsupportedClass", "truncated"}) {
        EXPECT_NE(catalogSentence(std::string("KESTRA:npy:") + key), "") << key;
    }
}

TEST(Npy, ReadsPipes) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    std::thread writer([out = ends[1]] {
        const std::string text =
            npyText(1, dictionary("|u1", false, "(300000,)"), std::string(300000, 'x'));
        for (std::size_t done = 0; done < text.size();)
            done += static_cast<std::size_t>(write(out, text.data() + done, text.size() - done));
        close(out);
    });
    const ArrayPtr array = npyRead("/dev/fd/" + std::to_string(ends[0]));
    writer.join();
    close(ends[0]);
    EXPECT_EQ(std::string(static_cast<const char*>(vxArrayData(array.get())), elementCount(*array)),
              std::string(300000, 'x'));
}

}  // namespace
}  // namespace Orvandeil::FileIO::embedded
