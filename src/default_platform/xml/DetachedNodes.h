// Which nodes outside the tree are still held.
#ifndef ZOR_DEFAULT_PLATFORM_XML_DETACHEDNODES_H
#define ZOR_DEFAULT_PLATFORM_XML_DETACHEDNODES_H

#include <cstdint>
#include <memory>
#include <vector>

/// Nodes that were made but not yet put into the document's tree are kept in groups: the nodes that
/// can be reached from one another, and what was taken out of them. A group counts its handles;
/// when the last one goes, its nodes can be used again. Each node counts its handles too, so that a
/// node that leaves its group takes its share along.
class DetachedNodes {
 public:
  using Node = std::uint32_t;
  using Group = std::uint32_t;

  /// A new, empty group.
  Group NewGroup();
  void AddNode(Node inNode, Group inGroup);
  void RemoveNode(Node inNode);
  /// Puts a node of another group into this one, with its handles.
  void MoveNode(Node inNode, Group inGroup);
  void FreeGroup(Group inGroup) noexcept;

  void Hold(Node inNode) {
    Entry& entry = EntryOf(inNode);
    ++entry.handles;
    ++groups_[entry.group].handles;
  }
  /// @return whether that was the group's last handle.
  bool Release(Node inNode) {
    Entry& entry = EntryOf(inNode);
    --entry.handles;
    return --groups_[entry.group].handles == 0;
  }

  Group GroupOf(Node inNode) const { return EntryOf(inNode).group; }
  /// The nodes from which all others of the group are found, kept by the tree.
  std::vector<Node>& RootsOf(Group inGroup) { return groups_[inGroup].roots; }
  const std::vector<Node>& RootsOf(Group inGroup) const { return groups_[inGroup].roots; }
  std::uint32_t SizeOf(Group inGroup) const { return groups_[inGroup].nodes; }
  std::uint64_t HandlesOf(Group inGroup) const { return groups_[inGroup].handles; }

 private:
  struct Entry {
    Group group = 0;
    std::uint32_t handles = 0;
  };
  struct GroupRecord {
    std::uint64_t handles = 0;
    std::uint32_t nodes = 0;
    std::vector<Node> roots;
  };
  static constexpr std::uint32_t kChunkBits = 12;
  static constexpr std::uint32_t kChunkSize = 1u << kChunkBits;
  struct Chunk {
    std::uint32_t used = 0;
    Entry entries[kChunkSize];
  };

  Entry& EntryOf(Node inNode) const {
    return chunks_[inNode >> kChunkBits]->entries[inNode & (kChunkSize - 1)];
  }
  Chunk& ChunkFor(Node inNode) {
    const std::uint32_t number = inNode >> kChunkBits;
    return number < chunks_.size() && chunks_[number] ? *chunks_[number] : NewChunk(number);
  }
  Chunk& NewChunk(std::uint32_t inNumber);

  // Only the chunks that hold detached nodes exist; most documents have none.
  std::vector<std::unique_ptr<Chunk>> chunks_;
  std::unique_ptr<Chunk> spare_;
  std::vector<GroupRecord> groups_;
  std::vector<Group> freeGroups_;
};

inline void DetachedNodes::AddNode(Node inNode, Group inGroup) {
  Chunk& chunk = ChunkFor(inNode);
  ++chunk.used;
  chunk.entries[inNode & (kChunkSize - 1)] = Entry{inGroup, 0};
  ++groups_[inGroup].nodes;
}

inline void DetachedNodes::RemoveNode(Node inNode) {
  std::unique_ptr<Chunk>& chunk = chunks_[inNode >> kChunkBits];
  const Entry entry = chunk->entries[inNode & (kChunkSize - 1)];
  GroupRecord& group = groups_[entry.group];
  group.handles -= entry.handles;
  --group.nodes;
  if (--chunk->used == 0) spare_ = std::move(chunk);
}

#endif
