// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/records_job.hpp"

#include <algorithm>

namespace lx::tool {
namespace {

// Translates the records as they come; returns how many of those wanted were not there.
class RecordsRun {
 public:
  RecordsRun(const RecordSettings& settings, RecordWriter& writer, RecordLog& log, uint64_t wanted)
      : settings_(settings), writer_(writer), log_(log), translator_(settings.translation, log), left_(wanted) {}

  // Many records in one go, where the code pages allow it.
  void run_blocks(FixedReader& reader) {
    if (!translator_.byte_for_byte()) return;
    Record block;
    while (left_ != 0 && reader.next_block(block, left_)) {
      translator_.translate_block(block, writer_);
      left_ -= block.data.size() / settings_.input.length;
    }
  }

  void run_records(RecordReader& reader) {
    const bool fixed = settings_.input.format == RecordFormat::kFixed;
    Record record;
    while (left_ != 0 && reader.next(record)) {
      --left_;
      const std::size_t length = record.data.size();
      if (length > settings_.longest || (fixed && length != settings_.longest)) {
        log_.wrong_length.add({record.number, 1, record.offset}, length);
      }
      writer_.write(translator_.translate(record), record.begins_block);
    }
  }

  uint64_t left() const { return left_; }

 private:
  const RecordSettings& settings_;
  RecordWriter& writer_;
  RecordLog& log_;
  RecordTranslator translator_;
  uint64_t left_;
};

std::string describe_sizes(const RecordSettings& settings, const RecordFaults& faults, uint64_t file_size) {
  if (faults.count() == 0) return "";
  const RecordFaults::Fault& first = faults.first().front();
  const std::string number = std::to_string(first.place.record);
  const std::string bytes = std::to_string(first.length) + (first.length == 1 ? " byte" : " bytes");
  const std::string length = std::to_string(settings.longest);
  if (settings.input.format == RecordFormat::kFixed) {
    return std::to_string(file_size) + " bytes are no multiple of the record length " + length + ": record " + number +
           ", the last one, has only " + bytes;
  }
  return std::to_string(faults.count()) + (faults.count() == 1 ? " record is" : " records are") + " longer than " +
         length + " bytes (" + (faults.count() == 1 ? "" : "first ") + "record " + number + " at byte " +
         std::to_string(first.place.offset) + ": " + bytes + ")";
}

std::string describe_missing(const RecordRange& range, uint64_t records_in_file, uint64_t done) {
  return "the file has " + std::to_string(records_in_file) + (records_in_file == 1 ? " record" : " records") +
         ": --range " + std::to_string(range.first) + ":" + std::to_string(range.count) + " took " +
         (done == 0 ? "none" : std::to_string(done)) + " of them";
}

}  // namespace

RecordResult convert_records(InputFile& input, OutputFile& output, const RecordSettings& settings, Progress& progress) {
  RecordResult result;
  result.name = input.name();
  const RecordRange range = settings.range.value_or(RecordRange{});
  const std::unique_ptr<RecordReader> reader = open_records(input, progress, settings.input);
  RecordWriter writer(output, settings.output, settings.line_end);
  RecordsRun run(settings, writer, result.log, range.count);

  reader->skip(range.first - 1);
  const uint64_t begin = reader->offset();
  if (auto* fixed = dynamic_cast<FixedReader*>(reader.get())) run.run_blocks(*fixed);
  run.run_records(*reader);
  writer.finish();

  RecordLog& log = result.log;
  log.records = range.count - run.left();
  log.counts.bytes_in = reader->offset() - begin;
  log.counts.bytes_out = writer.bytes();
  log.damage = reader->damage();
  result.size_fault = describe_sizes(settings, log.wrong_length, reader->offset());
  if (settings.range && run.left() != 0 && log.damage.empty()) {
    result.note = describe_missing(range, reader->records(), log.records);
  }
  return result;
}

std::optional<uint64_t> size_of_records(std::span<const std::string> files, const RecordSettings& settings) {
  const std::optional<uint64_t> size = total_size(files);
  if (!size || !settings.range || settings.input.format != RecordFormat::kFixed) return size;
  const uint64_t length = settings.input.length;
  const uint64_t records = *size / length + 1;
  const uint64_t skipped = std::min(settings.range->first - 1, records) * length;
  return std::min(*size - std::min(*size, skipped), std::min(settings.range->count, records) * length);
}

}  // namespace lx::tool
