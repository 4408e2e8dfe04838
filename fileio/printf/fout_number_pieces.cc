#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/printf_argument_source.h"

namespace Orvandeil::FileIO {

template <class T>
void foutFormatPieceForInteger<T>::printByType(TcodnStream* out, printfArgumentSource* source) {
    printAs<T>(out, source);
}

template <class T>
Printability foutFormatPieceForInteger<T>::decidePrintMode(printfArgumentSource* source) const {
    return source->checkPrintabilityByType<T>();
}

template class foutFormatPieceForInteger<long>;
template class foutFormatPieceForInteger<unsigned long>;

void foutFormatPieceForDouble::printByType(TcodnStream* out, printfArgumentSource* source) {
    printAs<double>(out, source);
}

Printability foutFormatPieceForDouble::decidePrintMode(printfArgumentSource* source) const {
    return source->checkPrintabilityByType<double>();
}

}  // namespace Orvandeil::FileIO
