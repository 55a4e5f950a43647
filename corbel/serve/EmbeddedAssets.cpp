#include "corbel/serve/EmbeddedAssets.h"

#include <algorithm>

namespace corbel {

const EmbeddedAsset* findAsset(std::string_view name) {
    const auto assets = embeddedAssets();
    const auto found = std::ranges::find_if(
        assets, [name](const EmbeddedAsset& asset) { return asset.name == name; });
    return found == assets.end() ? nullptr : &*found;
}

const char* assetContentType(std::string_view name) {
    static constexpr std::pair<std::string_view, const char*> kTypes[] = {
        {".html", "text/html; charset=utf-8"},
        {".js", "text/javascript; charset=utf-8"},
        {".css", "text/css; charset=utf-8"},
        {".svg", "image/svg+xml"},
        {".png", "image/png"},
        {".json", "application/json; charset=utf-8"},
        {".ico", "image/x-icon"},
    };
    for (const auto& [extension, type] : kTypes) {
        if (name.ends_with(extension)) {
            return type;
        }
    }
    return "application/octet-stream";
}

}  // namespace corbel
