#pragma once

#include "fixfiles/Document.h"
#include "platform/Path.h"

#include <string>
#include <unordered_map>

namespace dovrel {

// The category code of every item of a company, read once from its items
// file, for work over many documents: the items file is read once instead of
// once a document. A company without an items file has no categories.
class ItemCategories {
public:
    explicit ItemCategories(const Path& compDir);

    // Gives the document's lines the category codes of their items.
    void apply(Document& document) const;
    size_t size() const { return categories_.size(); }

private:
    std::unordered_map<std::string, std::string> categories_; // folded key -> code
};

} // namespace dovrel
