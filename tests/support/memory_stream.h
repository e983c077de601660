// A stream whose bytes a test reads back: in memory, or in a temporary file where the system has none.
#pragma once

#include <cstdio>
#include <cstdlib>
#include <string>

class MemoryStream {
 public:
#ifdef _WIN32
  MemoryStream() : stream_(std::tmpfile()) {}
  ~MemoryStream() { std::fclose(stream_); }

  std::string bytes() {
    std::string all(static_cast<std::size_t>(std::ftell(stream_)), '\0');
    std::rewind(stream_);
    all.resize(std::fread(all.data(), 1, all.size(), stream_));
    return all;
  }
#else
  MemoryStream() : stream_(open_memstream(&bytes_, &size_)) {}
  ~MemoryStream() {
    std::fclose(stream_);
    std::free(bytes_);
  }

  std::string bytes() {
    std::fflush(stream_);
    return {bytes_, size_};
  }
#endif
  MemoryStream(const MemoryStream&) = delete;
  MemoryStream& operator=(const MemoryStream&) = delete;

  std::FILE* get() { return stream_; }

 private:
#ifndef _WIN32
  char* bytes_ = nullptr;
  std::size_t size_ = 0;
#endif
  std::FILE* stream_;
};
