// How the library words its failures.
//
//  - A refusal of the model (a name taken, a value out of range, an unknown
//    object): HostCtlException whose message is a short sentence saying what
//    and why ("Portgroup pg1 already exists"), and whose detailed message
//    starts with the operation's name and adds where or why
//    ("AddPortGroup: Portgroup pg1 already exists on this host"). These
//    texts never name the database file.
//  - A database failure: the message names the database file and SQLite's
//    own text; the detailed message adds the operation that was running.
#pragma once

#include <string>

#include "hostctl/exception.h"

namespace TarnCtl::Detail {

// A refusal: message `message`, detailed message
// "<operation>: <message>" followed by " <where>" when `where` is not empty.
HostCtl::Lib::HostCtlException Refusal(const std::string& operation, const std::string& message,
                                       const std::string& where = "");

// A refusal of the operation that is running (Call::Running()).
HostCtl::Lib::HostCtlException Refused(const std::string& message, const std::string& where = "");

// A database failure on the file at `path`, with SQLite's text `cause`.
HostCtl::Lib::HostCtlException DatabaseError(const std::string& path, const std::string& cause);

}  // namespace TarnCtl::Detail
