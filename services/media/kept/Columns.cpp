#include "services/media/kept/Columns.h"

#include <algorithm>

namespace quorl::media {

std::string ColumnWriter::bytes() const {
    std::vector<GVariant*> columns;
    std::ranges::transform(columns_, std::back_inserter(columns), &VariantPointer::get);
    const VariantPointer tuple(
        g_variant_ref_sink(g_variant_new_tuple(columns.data(), columns.size())));
    std::string bytes(g_variant_get_size(tuple.get()), '\0');
    g_variant_store(tuple.get(), bytes.data());
    return bytes;
}

ColumnReader::ColumnReader(const char* type, std::string_view bytes)
    : tuple_(g_variant_ref_sink(g_variant_new_from_data(G_VARIANT_TYPE(type), bytes.data(),
                                                        bytes.size(), FALSE, nullptr, nullptr))) {}

GVariant* ColumnReader::nextColumn(const char* type) {
    columns_.emplace_back(g_variant_get_child_value(tuple_.get(), columns_.size()));
    auto* const column = columns_.back().get();
    if (g_variant_type_equal(g_variant_type_element(g_variant_get_type(column)),
                             G_VARIANT_TYPE(type)) == FALSE) {
        throw WrongColumns();
    }
    return column;
}

TextList ColumnReader::nextTexts() {
    const auto text = nextText();
    TextList texts;
    texts.reserve(text.size());
    std::size_t begin = 0;
    for (const auto end : next<std::uint32_t>()) {
        if (end < begin || end > text.size()) {
            throw WrongColumns();
        }
        texts.add(text.substr(begin, end - begin));
        begin = end;
    }
    return texts;
}

} // namespace quorl::media
