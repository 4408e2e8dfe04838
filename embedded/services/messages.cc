#include "embedded/services/messages.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/text.h"

#include <algorithm>
#include <cstdio>

#include <boost/exception_ptr.hpp>

namespace Orvandeil::FileIO::embedded {
namespace {

using foundation::core::except::BaseMsgID;

WarningRecorder* recorder = nullptr;

// An identifier without a sentence still says what it is about.
std::string bareMessage(const BaseMsgID& id) {
    std::string text = id.GetIdentifier();
    const char* separator = ": ";
    for (const std::string& argument : id.GetArguments()) {
        text += separator + argument;
        separator = ", ";
    }
    return text;
}

// The index inside "{0}" to "{9}" at `place`, or -1.
int placeholderAt(std::string_view sentence, std::size_t place) {
    if (sentence.size() - place < 3 || sentence[place] != '{' || sentence[place + 2] != '}') {
        return -1;
    }
    const char digit = sentence[place + 1];
    return digit >= '0' && digit <= '9' ? digit - '0' : -1;
}

std::string filled(std::string_view sentence, const std::vector<std::string>& arguments) {
    std::string text;
    for (std::size_t i = 0; i < sentence.size(); ++i) {
        const int index = placeholderAt(sentence, i);
        if (index < 0) {
            text += sentence[i];
            continue;
        }
        const auto argument = static_cast<std::size_t>(index);
        if (argument < arguments.size()) text += arguments[argument];
        i += 2;
    }
    return text;
}

std::string narrowMessage(const BaseMsgID& id) {
    const std::string_view sentence = catalogSentence(id.GetIdentifier());
    return sentence.empty() ? bareMessage(id) : filled(sentence, id.GetArguments());
}

}  // namespace

WarningRecorder::WarningRecorder() : outer(recorder) {
    recorder = this;
}

WarningRecorder::~WarningRecorder() {
    recorder = outer;
}

std::vector<std::string> WarningRecorder::identifiers() const {
    std::vector<std::string> names;
    for (const BaseMsgID& id : recorded)
        names.push_back(id.GetIdentifier());
    return names;
}

}  // namespace Orvandeil::FileIO::embedded

using namespace Orvandeil::FileIO::embedded;
using foundation::core::except::BaseMsgID;
using foundation::core::except::IMsgIDException;

std::u16string vxMessageText(const BaseMsgID& id) {
    const std::string text = narrowMessage(id);
    return vxTextFromNarrow(text.data(), text.size());
}

void vxErrorHandOff(const IMsgIDException& error) {
    error.rethrow();
}

void vxErrorByNumber(int number) {
    constexpr int badMachineFormat = 34;
    if (number == badMachineFormat) vxErrMsgId(KESTRA::legacy_two_part::badmachformat_vx());
    vxErrMsgId(BaseMsgID("KESTRA:legacy", "error" + std::to_string(number)));
}

void vxErrorRethrow(const boost::exception_ptr& error) {
    boost::rethrow_exception(error);
}

void vxWarningMsgId(const BaseMsgID& id) {
    if (recorder != nullptr) {
        recorder->record(id);
        return;
    }
    std::string line = "fileio: warning: " + id.GetIdentifier() + ": " + narrowMessage(id);
    // Arguments may hold anything, and a warning is one line.
    std::ranges::replace_if(
        line, [](char c) { return static_cast<unsigned char>(c) < ' ' || c == '\x7F'; }, ' ');
    line += '\n';
    std::fputs(line.c_str(), stderr);
}
