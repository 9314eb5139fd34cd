// Splits statements by the schema.
#include "lsp/Statement.h"

#include "model/RecordSplitter.h"

namespace lsp {

std::size_t firstItem(schema::File kind, const AcdLines::Line& line) {
    const bool isMode = kind == schema::File::BASE &&
                        schema::shapeOf(kind, line.name) == schema::Shape::RECORDS &&
                        schema::firstListed(kind, line.name) == 1;
    return isMode && line.kind == AcdLines::Kind::APPEND ? 1 : 0;
}

Statement::Statement(const AcdLines& file, const AcdLines::Line& line, schema::File kind) {
    m_value.assign(file, line, splitter::FIELDS);
    m_value.split(kind, line.name, schema::shapeOf(kind, line.name));
    std::size_t item = firstItem(kind, line);
    for (const lint::Item& record : m_value.items) {
        for (std::size_t field = 0; field < record.fields.size(); ++field) {
            const std::string_view name = record.fields.front().text;
            m_fields.push_back(
                {record.fields[field], schema::contentOf(kind, line.name, {item, field, name}), name});
        }
        ++item;
    }
}

} // namespace lsp
