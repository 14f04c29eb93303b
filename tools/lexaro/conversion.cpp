// SPDX-License-Identifier: Apache-2.0
#include "tools/lexaro/conversion.hpp"

#include <new>
#include <stdexcept>
#include <utility>

namespace lx::tool {

Conversion::Conversion(const CodePage& from, const CodePage& to, uint32_t options, Sink sink, ProblemFn on_problem)
    : handle_(LXOpenConversion(to.locale.get(), from.locale.get(), 0)),
      sink_(std::move(sink)),
      on_problem_(std::move(on_problem)),
      buffer_(kBufferSize) {
  if (!handle_) throw std::bad_alloc();
  if (LXSetConversionOptions(handle_.get(), options, on_problem_ ? hear_problem : nullptr, this) != LX_OK) {
    throw std::logic_error("the library refuses the conversion's options");
  }
}

// The library is no place for an exception to pass through: it waits until the call is back.
void Conversion::hear_problem(void* context, const LXConversionProblem* problem) {
  auto* self = static_cast<Conversion*>(context);
  if (self->problem_failure_) return;
  try {
    self->on_problem_(*problem);
  } catch (...) {
    self->problem_failure_ = std::current_exception();
  }
}

template <class Call>
bool Conversion::step(Call call) {
  char* out = buffer_.data();
  auto room = static_cast<int32_t>(buffer_.size());
  const uint32_t status = call(&out, &room);
  if (problem_failure_) std::rethrow_exception(problem_failure_);
  const std::string_view converted(buffer_.data(), static_cast<std::size_t>(out - buffer_.data()));
  if (!converted.empty()) sink_(converted);
  if (status == LX_OK || status == LX_E_PARTIAL) return false;
  if (status != LX_E_FULL || converted.empty()) {
    throw std::logic_error("the conversion stopped: " + describe_status(status).english);
  }
  return true;
}

void Conversion::convert(std::string_view piece) {
  const char* in = piece.data();
  auto left = static_cast<int32_t>(piece.size());
  while (step([&](char** out, int32_t* room) { return LXConvertBuffer(handle_.get(), out, room, &in, &left, 0); })) {
  }
  if (left != 0) throw std::logic_error("the conversion left input behind");
}

void Conversion::finish() {
  while (step([&](char** out, int32_t* room) { return LXFinishConversion(handle_.get(), out, room); })) {
  }
}

LXConversionCounts Conversion::counts() const {
  LXConversionCounts counts{};
  LXGetConversionCounts(handle_.get(), &counts);
  return counts;
}

}  // namespace lx::tool
