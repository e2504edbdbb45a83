#include "storage/attribute/fxmllinker.h"

#include "foundation/object/classfactory.h"

#include <algorithm>
#include <unordered_map>

namespace
{
/// An object that is never made only has its stored form, in which references that close a circle don't count.
bool staysStored(const FXmlInstance* instance)
{
    const ClassFactory* factory = ClassFactory::instance(false);
    return instance && *instance->getClassName() && factory &&
           !factory->getMetaClassByName(instance->getClassName());
}
} // namespace

/// Walks from object to object along the references, depth first, so that those which lead back to an object on the
/// way from the start are known: these close a circle. Objects from each of which one comes to each other, by however
/// many references, are a circle too (a strongly connected component, found in Tarjan's way).
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
        FXmlInstance* instance = nullptr;
        /// In the order of the walk.
        size_t number = 0;
        /// The first object of the circle, as far as it is known.
        size_t circle = 0;
        bool isOpen = false;
        size_t nextLink = 0;
        size_t endLink = 0;
        State state = State::kUnvisited;
    };

    void enter(Node& node, FXmlInstance* instance);
    void leave(Node& node);
    void follow(Link& link);

    std::vector<Link>& links;
    std::unordered_map<FXmlInstance*, Node> nodes;
    std::vector<Node*> way;
    /// What was visited and may still belong to a circle with an object on the way.
    std::vector<Node*> open;
    size_t visited = 0;
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
    enter(first, instance);
    while (!way.empty())
    {
        Node& node = *way.back();
        if (node.nextLink < node.endLink)
        {
            follow(links[node.nextLink++]);
            continue;
        }
        leave(node);
    }
}

void FXmlLinker::Walk::enter(Node& node, FXmlInstance* instance)
{
    node.instance = instance;
    node.state = State::kOnTheWay;
    node.number = node.circle = visited++;
    node.isOpen = true;
    way.push_back(&node);
    open.push_back(&node);
}

void FXmlLinker::Walk::leave(Node& node)
{
    node.state = State::kDone;
    way.pop_back();
    if (!way.empty())
        way.back()->circle = std::min(way.back()->circle, node.circle);
    if (node.circle < node.number)
        return;
    while (open.back() != &node)
    {
        open.back()->isOpen = false;
        open.back()->instance->isInCircle = true;
        open.pop_back();
    }
    node.isOpen = false;
    open.pop_back();
}

void FXmlLinker::Walk::follow(Link& link)
{
    if (!link.target)
        return;
    Node& node = nodes[link.target];
    link.reference->setTarget(link.target, node.state != State::kOnTheWay);
    if (node.state == State::kUnvisited)
        return enter(node, link.target);
    if (node.isOpen && (node.state == State::kDone || !staysStored(link.holder)))
        way.back()->circle = std::min(way.back()->circle, node.number);
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
