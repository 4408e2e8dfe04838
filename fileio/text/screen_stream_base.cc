#include "fileio/text/screen_stream_base.h"

#include "fileio/errors/identifiers.h"
#include "fileio/host/messages.h"

namespace Orvandeil::FileIO {
namespace {

[[noreturn]] void refuse() {
    vxErrMsgId(KESTRA::legacy_two_part::notimplemented_vx());
}

}  // namespace

// In this encoding text is written as code units, without a converter.
screenStreamBase::screenStreamBase(std::FILE* standardFile, FilePermission& openedWith)
    : fileStream(standardFile, "UTF-16", openedWith, u"<unknown>") {}

screenStreamBase::~screenStreamBase() = default;

int screenStreamBase::getPosition(long& position) {
    position = -1;
    return 0;
}

int screenStreamBase::setPosition(long) {
    return -1;
}

bool screenStreamBase::EndOfData() {
    return false;
}

bool screenStreamBase::needsBufferSize() {
    return true;
}

bool screenStreamBase::isFileOpen() const {
    return true;
}

bool screenStreamBase::isScreen() const {
    return true;
}

void screenStreamBase::clearError() {
    errorCode = 0;
}

unsigned long screenStreamBase::GetNElements(unsigned long, char*, unsigned long) {
    refuse();
}

unsigned long screenStreamBase::PutNElements(unsigned long, const void*, unsigned long) {
    refuse();
}

int screenStreamBase::print(const char*, std::va_list) {
    refuse();
}

bool screenStreamBase::Rewind(unsigned long) {
    refuse();
}

void screenStreamBase::setBufferSize(unsigned long) {
    refuse();
}

unsigned long screenStreamBase::scanOctal(long, int&, bool&) {
    refuse();
}

unsigned long screenStreamBase::scanHex(long, int&, bool&) {
    refuse();
}

unsigned long screenStreamBase::scanUnsignedInteger(long, int&, bool&) {
    refuse();
}

long screenStreamBase::scanInteger(long, int&) {
    refuse();
}

long screenStreamBase::scanIntegerCouldBeHex(long, int&) {
    refuse();
}

double screenStreamBase::scanFloat(long, int&) {
    refuse();
}

bool screenStreamBase::getFileSize(long&) {
    refuse();
}

int screenStreamBase::flush() {
    refuse();
}

int screenStreamBase::getByte() {
    refuse();
}

}  // namespace Orvandeil::FileIO
