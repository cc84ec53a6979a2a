#include "links/LinkHistory.h"

CLinkHistory::CLinkHistory(const CLinkHistory& other) {
    *this = other;
}

CLinkHistory& CLinkHistory::operator=(const CLinkHistory& other) {
    if (this == &other)
        return *this;
    m_snapshots.clear();
    for (const auto& snapshot : other.m_snapshots) {
        m_snapshots.push_back(std::make_unique<CLinkList>(*snapshot));
    }
    m_position = other.m_position;
    return *this;
}

void CLinkHistory::Push(const CLinkList& links) {
    m_snapshots.resize(static_cast<std::size_t>(m_position + 1));
    m_snapshots.push_back(std::make_unique<CLinkList>(links));
    m_position = Count() - 1;
}

bool CLinkHistory::Undo(CLinkList& links) {
    if (!CanUndo())
        return false;
    links = *m_snapshots[--m_position];
    return true;
}

bool CLinkHistory::Redo(CLinkList& links) {
    if (!CanRedo())
        return false;
    links = *m_snapshots[++m_position];
    return true;
}

void CLinkHistory::Clear() {
    m_snapshots.clear();
    m_position = -1;
}
