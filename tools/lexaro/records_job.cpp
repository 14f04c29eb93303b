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

Message byte_count(uint64_t bytes) { return bytes == 1 ? message("1 byte") : message("{0} bytes", bytes); }

Message describe_sizes(const RecordSettings& settings, const RecordFaults& faults, uint64_t file_size) {
  if (faults.count() == 0) return {};
  const RecordFaults::Fault& first = faults.first().front();
  const Message bytes = byte_count(first.length);
  if (settings.input.format == RecordFormat::kFixed) {
    return message("{0} bytes are no multiple of the record length {1}: record {2}, the last one, has only {3}",
                   file_size, settings.longest, first.place.record, bytes);
  }
  if (faults.count() == 1) {
    return message("1 record is longer than {0} bytes (record {1} at byte {2}: {3})", settings.longest,
                   first.place.record, first.place.offset, bytes);
  }
  return message("{0} records are longer than {1} bytes (first record {2} at byte {3}: {4})", faults.count(),
                 settings.longest, first.place.record, first.place.offset, bytes);
}

Message describe_missing(const RecordRange& range, uint64_t records_in_file, uint64_t done) {
  const Message records = records_in_file == 1 ? message("1 record") : message("{0} records", records_in_file);
  if (done == 0) {
    return message("the file has {0}: --range {1}:{2} took none of them", records, range.first, range.count);
  }
  return message("the file has {0}: --range {1}:{2} took {3} of them", records, range.first, range.count, done);
}

}  // namespace

RecordResult convert_records(InputFile& input, OutputFile& output, const RecordSettings& settings, Progress& progress) {
  RecordResult result;
  result.name = plain_name(input.path());
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
