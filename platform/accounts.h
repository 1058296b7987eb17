#pragma once

#include <optional>
#include <string>
#include <vector>

// Users and groups. A server is named with two leading backslashes; an empty name is the machine
// itself. The name of a group, of a member or of a user without a domain that needs more than 128
// bytes with its terminator is returned as an empty text.
//
// All calls together wait at most ten seconds in a run. After that a user who is not known yet
// stays unknown, and the lists are empty. POSIX: a child process queries the name service once,
// and all functions below use its result: a list that was not complete by then is empty. The server
// is ignored.

// The user that runs the tool, as domain, backslash, name; nothing if the system does not know.
// Windows: GetUserNameExA, at most 1024 bytes. POSIX: getpwuid of the effective user, with the host
// name as the domain.
std::optional<std::string> DomainUserName();

// The same user without a domain; nothing if the system does not know.
// Windows: NetWkstaUserGetInfo. POSIX: the same as above; the number of a user without a name.
std::optional<std::string> WorkstationUserName();

// The names of the local groups in the system's order; empty if they cannot be listed.
// Windows: NetLocalGroupEnum, level 1. POSIX: getgrent; each name once.
std::vector<std::string> ListLocalGroups(const std::string& server);

// The members of a local group, each with its domain; empty if they cannot be listed.
// Windows: NetLocalGroupGetMembers, level 2. POSIX: the members that getgrent lists, then the users
// whose primary group it is (getpwent), each once; of all groups with that name.
std::vector<std::string> ListLocalGroupMembers(const std::string& server, const std::string& group);

// The global groups and the users of each, like the two calls above.
// Windows: NetGroupEnum, level 2; NetGroupGetUsers, level 0. POSIX: none.
std::vector<std::string> ListGlobalGroups(const std::string& server);
std::vector<std::string> ListGlobalGroupMembers(const std::string& server,
                                                const std::string& group);
