// Looking for a text without making a `StringBase` of it takes C++20, which applications need not have.
#include <tarvik/NameSequence.h>

bool NameSequence::contains(std::string_view name) const { return m_index.find(name) != m_index.end(); }
