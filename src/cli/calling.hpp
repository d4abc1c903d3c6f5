#pragma once

#include <string>
#include <vector>

#include "cli/entries.hpp"
#include "cli/session.hpp"

/// Calls members with arguments as typed.
namespace talutil::cli {

/// Fails unless the member takes this number of arguments.
void check_count(const Member& member, std::size_t count);

/// The slot for a call with this number of arguments: a property without arguments is read, otherwise put.
[[nodiscard]] const Member& slot_for(const Entry& entry, std::size_t argument_count);

/// Calls a slot with arguments as typed. Afterwards `arguments` contains what the member wrote back.
Variant call_slot(Session& session, const Member& member, const std::vector<std::string>& typed,
                  std::vector<Argument>& arguments);

/// Puts settings written as NAME=VALUE, in order.
void put_settings(Session& session, const std::vector<std::string>& settings);

}  // namespace talutil::cli
