#pragma once

#include <string>
#include <vector>

#include "cli/entries.hpp"
#include "cli/session.hpp"

/// Calls of members with arguments as they are typed.
namespace talutil::cli {

/// Fails unless the member takes so many arguments.
void check_count(const Member& member, std::size_t count);

/// The slot that a call with so many arguments means: a property without one is read, else put.
[[nodiscard]] const Member& slot_for(const Entry& entry, std::size_t argument_count);

/// Calls a slot with arguments as typed. They hold afterwards what the member wrote back.
Variant call_slot(Session& session, const Member& member, const std::vector<std::string>& typed,
                  std::vector<Argument>& arguments);

/// Puts settings written as NAME=VALUE, in their order.
void put_settings(Session& session, const std::vector<std::string>& settings);

}  // namespace talutil::cli
