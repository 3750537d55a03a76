#include "default_platform/xml/DetachedNodes.h"

#include <utility>

DetachedNodes::Group DetachedNodes::NewGroup() {
  if (freeGroups_.empty()) {
    groups_.emplace_back();
    return static_cast<Group>(groups_.size() - 1);
  }
  const Group group = freeGroups_.back();
  freeGroups_.pop_back();
  return group;
}

void DetachedNodes::FreeGroup(Group inGroup) {
  GroupRecord& group = groups_[inGroup];
  group.handles = 0;
  group.nodes = 0;
  group.roots.clear();
  freeGroups_.push_back(inGroup);
}

void DetachedNodes::AddNode(Node inNode, Group inGroup) {
  Chunk& chunk = ChunkFor(inNode);
  ++chunk.used;
  chunk.entries[inNode & (kChunkSize - 1)] = Entry{inGroup, 0};
  ++groups_[inGroup].nodes;
}

void DetachedNodes::RemoveNode(Node inNode) {
  const Entry entry = EntryOf(inNode);
  groups_[entry.group].handles -= entry.handles;
  --groups_[entry.group].nodes;
  LeaveChunk(inNode);
}

void DetachedNodes::MoveNode(Node inNode, Group inGroup) {
  Entry& entry = EntryOf(inNode);
  groups_[entry.group].handles -= entry.handles;
  --groups_[entry.group].nodes;
  entry.group = inGroup;
  groups_[inGroup].handles += entry.handles;
  ++groups_[inGroup].nodes;
}

DetachedNodes::Chunk& DetachedNodes::ChunkFor(Node inNode) {
  const std::uint32_t number = inNode >> kChunkBits;
  if (number >= chunks_.size()) chunks_.resize(number + 1);
  if (!chunks_[number]) chunks_[number] = spare_ ? std::move(spare_) : std::make_unique<Chunk>();
  return *chunks_[number];
}

void DetachedNodes::LeaveChunk(Node inNode) {
  std::unique_ptr<Chunk>& chunk = chunks_[inNode >> kChunkBits];
  if (--chunk->used == 0) spare_ = std::move(chunk);
}
