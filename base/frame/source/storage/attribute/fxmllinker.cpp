#include "storage/attribute/fxmllinker.h"

#include <algorithm>
#include <unordered_map>

/// Walks from object to object along the references, depth first, so that those which lead back to an object on the
/// way from the start are known: these close a circle.
class FXmlLinker::Walk
{
public:
    explicit Walk(std::vector<Link>& sortedLinks);

    void start(FXmlInstance* instance);

private:
    enum class State
    {
        kUnvisited,
        kOnTheWay,
        kDone
    };
    struct Node
    {
        size_t nextLink = 0;
        size_t endLink = 0;
        State state = State::kUnvisited;
    };

    void follow(Link& link);

    std::vector<Link>& links;
    std::unordered_map<FXmlInstance*, Node> nodes;
    std::vector<Node*> way;
};

FXmlLinker::Walk::Walk(std::vector<Link>& sortedLinks) : links(sortedLinks)
{
    for (size_t i = 0; i < links.size(); i++)
    {
        Node& node = nodes[links[i].holder];
        if (node.endLink == 0)
            node.nextLink = i;
        node.endLink = i + 1;
    }
}

void FXmlLinker::Walk::start(FXmlInstance* instance)
{
    Node& first = nodes[instance];
    if (first.state != State::kUnvisited)
        return;
    first.state = State::kOnTheWay;
    way.push_back(&first);
    while (!way.empty())
    {
        Node& node = *way.back();
        if (node.nextLink < node.endLink)
        {
            follow(links[node.nextLink++]);
            continue;
        }
        node.state = State::kDone;
        way.pop_back();
    }
}

void FXmlLinker::Walk::follow(Link& link)
{
    if (!link.target)
        return;
    Node& node = nodes[link.target];
    link.reference->setTarget(link.target, node.state != State::kOnTheWay);
    if (node.state != State::kUnvisited)
        return;
    node.state = State::kOnTheWay;
    way.push_back(&node);
}

void FXmlLinker::addInstance(FXmlInstance* instance)
{
    instances.push_back(instance);
    byID.emplace(instance->getID(), instance);
}

void FXmlLinker::addReference(FXmlReference* reference, FXmlInstance* holder)
{
    links.push_back({reference, holder, nullptr});
}

FXmlInstance* FXmlLinker::lookup(uint64 id) const
{
    const auto found = byID.find(id);
    return found == byID.end() ? nullptr : found->second;
}

void FXmlLinker::link()
{
    for (Link& link : links)
        link.target = lookup(link.reference->getID());
    const auto byHolder = [](const Link& a, const Link& b) { return std::less<>()(a.holder, b.holder); };
    std::stable_sort(links.begin(), links.end(), byHolder);
    Walk walk(links);
    // What stands in the tree itself comes first: the references that lead away from there count, so that a circle
    // is held by the tree.
    for (FXmlInstance* root : roots)
        walk.start(root);
    walk.start(nullptr);
    for (const Link& link : links)
        walk.start(link.holder);
}
