#include "fileio/host/messages.h"

#include "examples/own_host/own_host.h"

#include <boost/exception_ptr.hpp>

using foundation::core::except::BaseMsgID;
using foundation::core::except::IMsgIDException;

namespace own_host {

std::vector<std::string>& warnings() {
    static std::vector<std::string> issued;
    return issued;
}

}  // namespace own_host

std::u16string vxMessageText(const BaseMsgID& id) {
    std::string text = id.GetIdentifier();
    for (const std::string& argument : id.GetArguments())
        text += ' ' + argument;
    return vxTextFromNarrow(text.data(), text.size());
}

void vxErrorHandOff(const IMsgIDException&) {}  // this host has no error path but throw

void vxErrorByNumber(int number) {
    vxErrMsgId(BaseMsgID("OWN:legacy", std::to_string(number)));
}

void vxErrorRethrow(const boost::exception_ptr& error) {
    boost::rethrow_exception(error);
}

void vxWarningMsgId(const BaseMsgID& id) {
    own_host::warnings().push_back(id.GetIdentifier());
}
