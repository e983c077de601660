// Packs records into their stored form. A table lists the fields in stored order; sizes, reader and
// writer follow from it. The stored form is little-endian, without padding, and independent of the
// size of a pointer.
#pragma once

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <utility>

#include "core/io/sink.h"

namespace tevpf {

static_assert(std::endian::native == std::endian::little,
              "libtevpf needs a little-endian machine: records are stored as they lie in memory");

struct Field {
  std::size_t place;  // in the record
  std::size_t bytes;
};

inline constexpr std::size_t kNowhere = SIZE_MAX;  // zero in the file, not part of the record

template <std::size_t N>
constexpr std::int32_t stored_size(const Field (&fields)[N]) noexcept {
  std::size_t bytes = 0;
  for (const Field& field : fields) bytes += field.bytes;
  return static_cast<std::int32_t>(bytes);
}

// The offset in the stored form of the field at offset `place` in the record.
template <std::size_t N>
constexpr std::size_t stored_place(const Field (&fields)[N], std::size_t place) noexcept {
  std::size_t bytes = 0;
  for (std::size_t i = 0; i < N && fields[i].place != place; ++i) bytes += fields[i].bytes;
  return bytes;
}

namespace stored_form {

// Merges fields that are also contiguous in the record. Unused entries at the end are empty.
template <const auto& Fields>
constexpr auto joined() noexcept {
  std::array<Field, std::size(Fields)> runs{};
  std::size_t last = 0;
  for (const Field& field : Fields) {
    Field& run = runs[last];
    const bool in_record = field.place != kNowhere && run.place != kNowhere;
    const bool goes_on = in_record && field.place == run.place + run.bytes;
    if (run.bytes == 0 || goes_on) {
      run = {run.bytes == 0 ? field.place : run.place, run.bytes + field.bytes};
    } else {
      runs[++last] = field;
    }
  }
  return runs;
}

template <const auto& Fields>
inline constexpr auto kRuns = joined<Fields>();

// Copies each run with a size that is known at compile time.
template <const auto& Fields, std::size_t... I>
void pack(const void* record, unsigned char* out, std::index_sequence<I...>) noexcept {
  const auto* from = static_cast<const unsigned char*>(record);
  ((Fields[I].place == kNowhere ? std::memset(out, 0, Fields[I].bytes)
                                : std::memcpy(out, from + Fields[I].place, Fields[I].bytes),
    out += Fields[I].bytes),
   ...);
}

template <const auto& Fields, std::size_t... I>
void unpack(const unsigned char* in, void* record, std::index_sequence<I...>) noexcept {
  auto* to = static_cast<unsigned char*>(record);
  ((Fields[I].place == kNowhere ? to : std::memcpy(to + Fields[I].place, in, Fields[I].bytes),
    in += Fields[I].bytes),
   ...);
}

}  // namespace stored_form

// Copy the fields of a record to their stored form, and back.
template <const auto& Fields>
void pack(const void* record, unsigned char* out) noexcept {
  stored_form::pack<stored_form::kRuns<Fields>>(record, out,
                                                std::make_index_sequence<std::size(Fields)>{});
}

template <const auto& Fields>
void unpack(const unsigned char* in, void* record) noexcept {
  stored_form::unpack<stored_form::kRuns<Fields>>(in, record,
                                                  std::make_index_sequence<std::size(Fields)>{});
}

// Writes the fields of a record.
template <const auto& Fields>
void put_fields(Sink& sink, const void* record) noexcept {
  pack<Fields>(record, sink.record(stored_size(Fields)));
}

}  // namespace tevpf
