#pragma once

#include <optional>
#include <string>
#include <vector>

// Users and groups. A server is named with two leading backslashes; an empty name is the machine
// itself. The name of a group, of a member or of a user without a domain that needs more than 128
// bytes with its terminator comes as an empty text.

// The user that runs the tool, as domain, backslash, name; nothing if the system cannot tell.
// Windows: GetUserNameExA. POSIX: getpwuid of the effective user, the host name as the domain.
std::optional<std::string> DomainUserName();

// The same user without a domain. Windows: NetWkstaUserGetInfo. POSIX: the number of the user, for
// one without a name.
std::optional<std::string> WorkstationUserName();

// The local groups in the system's order; empty if they cannot be listed.
// Windows: NetLocalGroupEnum, level 1. POSIX: getgrent.
std::vector<std::string> ListLocalGroups(const std::string& server);

// The members of a local group, each with its domain; empty if they cannot be listed.
// Windows: NetLocalGroupGetMembers, level 2. POSIX: getgrent, and the users whose primary group it
// is; each once; both read once in a run.
std::vector<std::string> ListLocalGroupMembers(const std::string& server, const std::string& group);

// The global groups and the users of each, as the same calls for local ones. POSIX: none.
// Windows: NetGroupEnum, level 2; NetGroupGetUsers, level 0.
std::vector<std::string> ListGlobalGroups(const std::string& server);
std::vector<std::string> ListGlobalGroupMembers(const std::string& server,
                                                const std::string& group);
