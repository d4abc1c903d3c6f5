#include "calling/comparison.hpp"

#include "calling/comparable.hpp"

namespace talutil::calling {

namespace {

std::string words(const Ending& ending) {
  std::string text(ending.error.empty() ? ending.result : ending.error);
  if (!ending.arguments.empty()) text += " and " + std::string(ending.arguments);
  return text;
}

}  // namespace

Comparison::Process& Comparison::process(std::uint32_t number) {
  Process& process = processes_[number];
  if (process.caller == nullptr) {
    process.library = start_();
    process.caller = std::make_unique<Caller>(*process.library);
  }
  return process;
}

std::string Comparison::repeat(std::string_view line) {
  const RecordedLine record = read_recorded_line(line);
  Process& process = this->process(record.process);
  if (!record.create.empty()) {
    process.caller->create_as(object_number_in(record.ending.result), from_utf8(record.create));
    return {};
  }
  if (record.release != 0) {
    process.caller->release(record.release);
    return {};
  }
  std::string_view reason = why_not_comparable(record);
  if (reason.empty() && record.on != 0 && !process.caller->has(record.on)) reason = "an object of unknown origin";
  if (!reason.empty()) {
    ++skipped_[std::string(reason)];
    process.has_skipped = true;
    process.certain.clear();
    return {};
  }
  if (takes_recorded_setting(process, record)) {
    ++skipped_["a setting that a skipped call may have changed"];
    return {};
  }
  return compare(process, line, record);
}

bool Comparison::takes_recorded_setting(Process& process, const RecordedLine& record) {
  if (!process.has_skipped || record.on != 0 || !is_changed_by_members(record.member)) return false;
  const bool was_uncertain = process.certain.insert(record.member).second;
  const bool is_read = record.args.empty() && !record.ending.result.empty();
  if (!was_uncertain || !is_read) return false;
  std::string put = "{\"call\": \"" + record.member + "\", \"args\": [";
  put += record.ending.result;
  put += "]}";
  std::string unused;
  process.caller->answer(put, 0, unused);
  return true;
}

std::string Comparison::compare(const Process& process, std::string_view line, const RecordedLine& record) {
  std::string answer;
  process.caller->answer(line, 0, answer);
  const RecordedLine now = read_recorded_line(answer);
  ++compared_;
  if (same_ending(record.ending, now.ending)) return {};
  ++different_;
  return record.member + std::string(record.args) + ": recorded " + words(record.ending) + ", now " + words(now.ending);
}

}  // namespace talutil::calling
