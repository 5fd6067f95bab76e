#include "catalog/NodeIndex.h"

#include <algorithm>

namespace Brindle::Data::XmlAccess {

void NodeIndex::Add(pugi::xml_node node, pugi::xml_attribute attribute) {
    auto [it, inserted] = m_entries.try_emplace(attribute.value(), Entry{{node, attribute}, {}});
    if (!inserted)
        it->second.others.push_back({node, attribute});
}

void NodeIndex::Remove(pugi::xml_node node, pugi::xml_attribute attribute) {
    const auto it = m_entries.find(attribute.value());
    if (it == m_entries.end())
        return;
    Entry& entry = it->second;
    const Holder gone{node, attribute};
    if (entry.holder == gone) {
        if (entry.others.empty()) {
            m_entries.erase(it);
            return;
        }
        // The key points into the leaving attribute: re-key on the one that takes its place.
        auto handle = m_entries.extract(it);
        handle.mapped().holder = handle.mapped().others.back();
        handle.mapped().others.pop_back();
        handle.key() = handle.mapped().holder.attribute.value();
        m_entries.insert(std::move(handle));
        return;
    }
    const auto other = std::find(entry.others.begin(), entry.others.end(), gone);
    if (other != entry.others.end())
        entry.others.erase(other);
}

pugi::xml_node NodeIndex::First(std::string_view value) const {
    const auto it = m_entries.find(value);
    if (it == m_entries.end())
        return {};
    pugi::xml_node first = it->second.holder.node;
    for (const Holder& other : it->second.others) {
        if (Precedes(other.node, first))
            first = other.node;
    }
    return first;
}

bool NodeIndex::Precedes(pugi::xml_node a, pugi::xml_node b) {
    if (a == b)
        return false;
    std::vector<pugi::xml_node> pathA;
    std::vector<pugi::xml_node> pathB;
    for (pugi::xml_node n = a; n; n = n.parent())
        pathA.push_back(n);
    for (pugi::xml_node n = b; n; n = n.parent())
        pathB.push_back(n);
    auto ia = pathA.rbegin();
    auto ib = pathB.rbegin();
    while (ia != pathA.rend() && ib != pathB.rend() && *ia == *ib) {
        ++ia;
        ++ib;
    }
    if (ia == pathA.rend())
        return true; // a is an ancestor of b
    if (ib == pathB.rend())
        return false;
    // Two siblings: walk forward from both at once, so the cost is their distance.
    const pugi::xml_node siblingA = *ia;
    const pugi::xml_node siblingB = *ib;
    pugi::xml_node fromA = siblingA;
    pugi::xml_node fromB = siblingB;
    for (;;) {
        fromA = fromA.next_sibling();
        if (fromA == siblingB)
            return true;
        if (!fromA)
            return false;
        fromB = fromB.next_sibling();
        if (fromB == siblingA)
            return false;
        if (!fromB)
            return true;
    }
}

} // namespace Brindle::Data::XmlAccess
