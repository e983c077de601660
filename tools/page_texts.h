// The style and the script of the page that `tevpf report` writes: report/page.css and page.js. The
// build makes page_texts.cpp of them.
#pragma once

#include <string_view>

namespace tool {

extern const std::string_view kPageStyle, kPageScript;
extern const std::string_view kPageStyleHash, kPageScriptHash;  // SHA-256 in base64

}  // namespace tool
