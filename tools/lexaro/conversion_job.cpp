// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/conversion_job.hpp"

#include <vector>

#include "tools/lexaro/conversion.hpp"

namespace lx::tool {

FileResult convert_file(InputFile& input, OutputFile& output, const ConversionSettings& settings, Progress& progress) {
  FileResult result;
  result.name = plain_name(input.path());
  std::optional<Verifier> verifier;
  if (settings.verify) verifier.emplace(settings.from, settings.to);

  Conversion conversion(
      settings.from, settings.to, settings.options,
      [&](std::string_view converted) {
        output.write(converted);
        if (verifier) verifier->check(converted);
      },
      [&](const LXConversionProblem& problem) { result.problems.add(problem); });

  std::vector<char> buffer(kBufferSize);
  while (const std::size_t count = input.read(buffer)) {
    const std::string_view piece(buffer.data(), count);
    if (verifier) verifier->expect(piece);
    conversion.convert(piece);
    progress.advance(count);
  }
  conversion.finish();

  result.counts = conversion.counts();
  if (verifier) {
    verifier->finish();
    result.verified = true;
    result.difference = verifier->difference();
  }
  return result;
}

}  // namespace lx::tool
