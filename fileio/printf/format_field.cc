#include "fileio/printf/format_field.h"

#include "fileio/errors/code_list.h"
#include "fileio/printf/printf_argument_source.h"

namespace Orvandeil::FileIO {
namespace {

double takeNumber(printfArgumentSource* source, int emptyArgumentCode) {
    try {
        source->prepareCurrentArgument(false);
    } catch (int failure) {
        throw failure == code::EmptyArg ? emptyArgumentCode : failure;
    }
    return source->getCurrentArgumentAs<double>();
}

}  // namespace

void FormatField::setup(printfArgumentSource* source) {
    if (!isFromArgument()) return;
    if (kind == FieldNumberedArgument) source->setCurrentArgument(static_cast<std::size_t>(value));
    const long number = validator->validate(takeNumber(source, validator->emptyArgumentCode()));
    negative = number < 0;
    effective = negative ? -number : number;
}

}  // namespace Orvandeil::FileIO
