#pragma once

#include "fileio/host/message_id.h"
#include "fileio/host/text.h"

#include <exception>
#include <string>

#include <boost/exception/exception.hpp>

FILEIO_API std::u16string vxMessageText(const foundation::core::except::BaseMsgID& id);

namespace foundation::core::except {

// What every raised identifier offers, whatever its type. clone_base is a non-virtual base on
// purpose: boost::current_exception() then keeps the exact dynamic type instead of wrapping it.
class FILEIO_API IMsgIDException : public boost::exception_detail::clone_base,
                                   public boost::exception {
public:
    // A copy of the whole exception on the heap, and a throw of such a copy, both of the most
    // derived type.
    const boost::exception_detail::clone_base* clone() const override = 0;
    [[noreturn]] void rethrow() const override = 0;
    ~IMsgIDException() noexcept override = default;

    // The message text in the host's narrow encoding.
    virtual const char* what() const noexcept = 0;
    // The identifier that the error is raised under.
    virtual std::string GetID() const = 0;
    // The identifier object carried, arguments included.
    virtual const BaseMsgID& GetBaseMsgIDObj() const = 0;

    std::string get_error_id() const { return GetID(); }
};

template <class Id, class Standard>
class Exception;

// The error that raises identifier class `Id`. Copies share Boost's error-info container.
template <class Id>
class FILEIO_API Exception<Id, std::exception> : public IMsgIDException, public std::exception {
public:
    explicit Exception(const Id& identifier) : Exception(identifier, identifier.GetIdentifier()) {}
    Exception(const Id& identifier, std::string raisedUnder)
        : id(identifier), raisedAs(std::move(raisedUnder)), text(narrowMessage(identifier)) {}

    const boost::exception_detail::clone_base* clone() const override {
        return new Exception(*this);
    }
    [[noreturn]] void rethrow() const override { throw Exception(*this); }
    ~Exception() noexcept override = default;

    const char* what() const noexcept override { return text.c_str(); }
    std::string GetID() const override { return raisedAs; }
    const Id& GetBaseMsgIDObj() const override { return id; }

private:
    static std::string narrowMessage(const BaseMsgID& identifier) {
        const std::u16string message = vxMessageText(identifier);
        return vxTextToNarrow(message.data(), message.size());
    }

    Id id;
    std::string raisedAs;
    std::string text;
};

}  // namespace foundation::core::except
