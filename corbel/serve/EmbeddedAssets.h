#ifndef QV_CORBEL_SERVE_EMBEDDEDASSETS_H
#define QV_CORBEL_SERVE_EMBEDDEDASSETS_H

#include <cstddef>
#include <span>
#include <string_view>

namespace corbel {

// A file built into the program (corbel/explorer/*, Chart.js), by its file name.
struct EmbeddedAsset {
    const char* name;
    const unsigned char* data;
    std::size_t size;

    std::string_view bytes() const { return {reinterpret_cast<const char*>(data), size}; }
};

// Every embedded file; written at build time by EmbedAssets.cmake.
std::span<const EmbeddedAsset> embeddedAssets();

// The file of that name, or null.
const EmbeddedAsset* findAsset(std::string_view name);

// "text/html; charset=utf-8", "text/javascript; charset=utf-8", "text/css; charset=utf-8",
// ... by the name's extension.
const char* assetContentType(std::string_view name);

}  // namespace corbel

#endif
