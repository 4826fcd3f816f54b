#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <limits>
#include <string>
#include <vector>

#include "AllocationProbe.h"
#include "Port/FileArchive.h"
#include "Port/SafeCount.h"
#include "Prjrep/Casts.h"
#include "RavA/Factory.h"
#include "ScopedTempDir.h"

namespace {

using Port::FileArchive;
using Port::StringBase;
using Port::XUID;
using ArchivePtr = Prjrep::AutoPtr<Prjrep::IArchive>;
using NodePtr = Prjrep::AutoPtr<Prjrep::IPersist>;

const XUID kNodeClass{0x7E57A4C100000001ull, 0x9000000000000001ull};
const XUID kOtherNodeClass{0x7E57A4C100000002ull, 0x9000000000000002ull};
// Its Save writes one value more than its Load reads.
const XUID kSloppyNodeClass{0x7E57A4C100000003ull, 0x9000000000000003ull};
const XUID kUnregisteredClass{0x7E57A4C100000004ull, 0x9000000000000004ull};

// A persistent object that saves itself the way design objects do: values, its parent and a
// sibling as references, then its owned children nested.
class Node final : public Prjrep::IPersist {
 public:
  explicit Node(const XUID& classId) : classId_(classId), instanceId_(XUID::New()) {}

  std::int32_t number = 0;
  std::int64_t wide = 0;
  bool flag = false;
  StringBase text;
  XUID tag;
  Node* parent = nullptr;   // plain back pointer
  Node* sibling = nullptr;  // plain reference, may point forward in the archive
  std::vector<NodePtr> children;
  CitI::Result saveResult = CitI::kOk;

  void Adopt(Node* child) {
    children.emplace_back(child);
    child->parent = this;
  }

  CitI::IInterface* QueryInterface(const XUID& id) override {
    if (id == Prjrep::IRefCountV1::Iid() || id == Prjrep::IRefCount::Iid()) return &refCount_;
    if (id == Prjrep::IPersist::Iid() || id == CitI::IInterface::Iid()) return this;
    return nullptr;
  }
  CitI::Result Save(Prjrep::IArchive* archive) override {
    if (saveResult != CitI::kOk) return saveResult;
    CitI::Result result = archive->WriteInt(number);
    if (result == CitI::kOk) result = archive->WriteInt64(wide);
    if (result == CitI::kOk) result = archive->WriteBool(flag);
    if (result == CitI::kOk) result = archive->WriteString(text);
    if (result == CitI::kOk) result = archive->WriteXUID(tag);
    if (result == CitI::kOk) result = archive->WriteObjectRef(parent);
    if (result == CitI::kOk) result = archive->WriteObjectRef(sibling);
    if (result == CitI::kOk) result = archive->WriteInt(static_cast<std::int32_t>(children.size()));
    for (const NodePtr& child : children) {
      if (result == CitI::kOk) result = archive->WriteObject(child.Get());
    }
    if (result == CitI::kOk && classId_ == kSloppyNodeClass) result = archive->WriteInt(0);
    return result;
  }
  CitI::Result Load(Prjrep::IArchive* archive) override {
    CitI::Result result = archive->ReadInt(&number);
    if (result == CitI::kOk) result = archive->ReadInt64(&wide);
    if (result == CitI::kOk) result = archive->ReadBool(&flag);
    if (result == CitI::kOk) result = archive->ReadString(&text);
    if (result == CitI::kOk) result = archive->ReadXUID(&tag);
    if (result == CitI::kOk) result = ReadNodeRef(archive, &parent);
    if (result == CitI::kOk) result = ReadNodeRef(archive, &sibling);
    std::int32_t count = 0;
    if (result == CitI::kOk) result = archive->ReadInt(&count);
    for (std::int32_t i = 0; result == CitI::kOk && i < count; ++i) {
      Prjrep::AutoPtr<CitI::IInterface> child;
      result = archive->ReadObject(child.Out());
      Node* node = Prjrep::ObjectCast<Node>(child.Get());
      if (result == CitI::kOk && node) {
        if (!node->parent) node->parent = this;
        children.emplace_back(node);
      }
    }
    return result;
  }
  CitI::Result GetClassXUID(XUID* id) override {
    *id = classId_;
    return CitI::kOk;
  }
  CitI::Result GetInstanceXUID(XUID* id) override {
    *id = instanceId_;
    return CitI::kOk;
  }
  CitI::Result SetInstanceXUID(const XUID& id) override {
    instanceId_ = id;
    return CitI::kOk;
  }
  CitI::Result SetOwner(CitI::IInterface*) override { return CitI::kNotImpl; }
  CitI::Result GetOwner(CitI::IInterface**) override { return CitI::kNotImpl; }

  const XUID& InstanceId() const { return instanceId_; }
  const XUID& ClassId() const { return classId_; }

 private:
  static CitI::Result ReadNodeRef(Prjrep::IArchive* archive, Node** node) {
    CitI::IInterface* object = nullptr;
    CitI::Result result = archive->ReadObjectRef(&object);
    *node = Prjrep::ObjectCast<Node>(object);
    return result;
  }

  Prjrep::TRefCountHelper<Node> refCount_{this};
  XUID classId_;
  XUID instanceId_;
};

class NodeFactory final : public RavA::TFactory {
 public:
  static void Register(const XUID& classId) {
    Prjrep::AutoRelease<CitI::IFactory> factory(new NodeFactory(classId));
    RavA::Factory::RegisterFactory(classId, factory.Get());
  }
  CitI::IInterface* QueryInterface(const XUID& id) override {
    if (id == CommonI::IRefCount::Iid()) return &refCount_;
    return TFactory::QueryInterface(id);
  }
  CitI::IInterface* CreateInstance(const XUID& classId) override {
    return classId == classId_ ? new Node(classId) : nullptr;
  }

 private:
  explicit NodeFactory(const XUID& classId) : classId_(classId) {}
  XUID classId_;
  std::int32_t count_ = 1;
  NodeFactory* self_ = this;
  CommonI::TRefCountHelper<NodeFactory> refCount_{&count_, &self_};
};

NodePtr NewNode(const XUID& classId = kNodeClass) {
  Prjrep::AutoRelease<Prjrep::IPersist> created(new Node(classId));
  return created;
}

Node* AsNode(CitI::IInterface* object) { return Prjrep::ObjectCast<Node>(object); }
FileArchive* Impl(const ArchivePtr& archive) { return Prjrep::ObjectCast<FileArchive>(archive.Get()); }

// Root R owns A, B and C; A owns A1. A refers forward to B, A1 forward to C; B refers back to A
// and C back to the root.
struct Graph {
  NodePtr root = NewNode(), a = NewNode(kOtherNodeClass), b = NewNode(), c = NewNode(), a1 = NewNode();
  Graph() {
    Node* nodes[] = {AsNode(root.Get()), AsNode(a.Get()), AsNode(b.Get()), AsNode(c.Get()), AsNode(a1.Get())};
    for (int i = 0; i < 5; ++i) {
      nodes[i]->number = i * 1000 - 7;
      nodes[i]->wide = (std::int64_t{1} << 40) + i;
      nodes[i]->flag = i % 2 == 0;
      nodes[i]->text = "node " + std::to_string(i);
      nodes[i]->tag = XUID(i, ~std::uint64_t{0});
    }
    nodes[0]->Adopt(nodes[1]);
    nodes[0]->Adopt(nodes[2]);
    nodes[0]->Adopt(nodes[3]);
    nodes[1]->Adopt(nodes[4]);
    nodes[1]->sibling = nodes[2];
    nodes[4]->sibling = nodes[3];
    nodes[2]->sibling = nodes[1];
    nodes[3]->sibling = nodes[0];
  }
  Node* Root() const { return AsNode(root.Get()); }
};

std::string Written(Prjrep::IPersist* object, std::int32_t version = FileArchive::kCurrentVersion) {
  ArchivePtr archive = FileArchive::CreateInMemory(version);
  EXPECT_EQ(archive->WriteObject(object), CitI::kOk) << Impl(archive)->LastError().c_str();
  EXPECT_EQ(Impl(archive)->Close(), CitI::kOk);
  return std::string(Impl(archive)->Bytes());
}

ArchivePtr Reader(std::string_view bytes) {
  StringBase error;
  ArchivePtr archive = FileArchive::OpenFromBytes(bytes, &error);
  EXPECT_TRUE(archive) << error.c_str();
  return archive;
}

bool Contains(const StringBase& text, std::string_view part) { return text.Find(part) != StringBase::npos; }

void ExpectSameValues(const Node& loaded, const Node& original) {
  EXPECT_EQ(loaded.ClassId(), original.ClassId());
  EXPECT_EQ(loaded.InstanceId(), original.InstanceId());
  EXPECT_EQ(loaded.number, original.number);
  EXPECT_EQ(loaded.wide, original.wide);
  EXPECT_EQ(loaded.flag, original.flag);
  EXPECT_EQ(loaded.text, original.text);
  EXPECT_EQ(loaded.tag, original.tag);
}

// Checks the loaded copy of a Graph: same values and identifiers, and every reference pointing
// at the loaded object of the same instance.
void ExpectGraphRestored(Node* root, const Graph& original) {
  ASSERT_TRUE(root);
  ASSERT_EQ(root->children.size(), 3u);
  Node* a = AsNode(root->children[0].Get());
  Node* b = AsNode(root->children[1].Get());
  Node* c = AsNode(root->children[2].Get());
  ASSERT_EQ(a->children.size(), 1u);
  Node* a1 = AsNode(a->children[0].Get());
  ExpectSameValues(*root, *original.Root());
  ExpectSameValues(*a, *AsNode(original.a.Get()));
  ExpectSameValues(*b, *AsNode(original.b.Get()));
  ExpectSameValues(*c, *AsNode(original.c.Get()));
  ExpectSameValues(*a1, *AsNode(original.a1.Get()));
  EXPECT_EQ(root->parent, nullptr);
  EXPECT_EQ(a->parent, root);
  EXPECT_EQ(a1->parent, a);
  EXPECT_EQ(a->sibling, b);
  EXPECT_EQ(a1->sibling, c);
  EXPECT_EQ(b->sibling, a);
  EXPECT_EQ(c->sibling, root);
}

NodePtr ReadRoot(Prjrep::IArchive* archive) {
  Prjrep::AutoPtr<CitI::IInterface> root;
  EXPECT_EQ(archive->ReadObject(root.Out()), CitI::kOk);
  return NodePtr(root.Get());
}

// Reads the root object of `bytes` and closes the archive: "unopened", "unread" (then the close
// fails too), "unclosed" or "loaded"; every object made on the way is gone afterwards.
std::string Load(std::string_view bytes) {
  const long alive = Port::LiveObjectCount();
  std::string outcome = "unopened";
  {
    StringBase error;
    ArchivePtr reader = FileArchive::OpenFromBytes(bytes, &error);
    EXPECT_EQ(bool(reader), error.IsEmpty());
    if (reader) {
      Prjrep::AutoPtr<CitI::IInterface> root;
      const bool read = reader->ReadObject(root.Out()) == CitI::kOk;
      const bool closed = Impl(reader)->Close() == CitI::kOk;
      EXPECT_TRUE(read || !closed);
      EXPECT_EQ(Impl(reader)->LastError().IsEmpty(), read && closed);
      outcome = !read ? "unread" : closed ? "loaded" : "unclosed";
    }
  }
  EXPECT_EQ(Port::LiveObjectCount(), alive);
  return outcome;
}

class FileArchiveTest : public testing::Test {
 protected:
  void SetUp() override {
    for (const XUID& id : {kNodeClass, kOtherNodeClass, kSloppyNodeClass}) NodeFactory::Register(id);
  }
  void TearDown() override {
    for (const XUID& id : {kNodeClass, kOtherNodeClass, kSloppyNodeClass})
      RavA::Factory::UnregisterFactory(id);
  }
  std::string PathOf(const char* name) const { return dir_.Path(name); }
  std::vector<std::string> FilesInDir() const {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(dir_.path()))
      names.push_back(entry.path().filename());
    return names;
  }
  static std::string Content(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), {});
  }
  static void Put(const std::string& path, std::string_view content) {
    std::ofstream(path, std::ios::binary) << content;
  }

  ScopedTempDir dir_;
};

TEST_F(FileArchiveTest, ValuesOfEveryKindRoundTrip) {
  const std::int32_t ints[] = {std::numeric_limits<std::int32_t>::min(), -1, 0, 1,
                               std::numeric_limits<std::int32_t>::max()};
  const std::int64_t wides[] = {std::numeric_limits<std::int64_t>::min(), -1, 0,
                                std::numeric_limits<std::int64_t>::max()};
  std::string megabyte(1 << 20, '\0');
  for (std::size_t i = 0; i < megabyte.size(); ++i) megabyte[i] = static_cast<char>(i * 7);
  const StringBase strings[] = {StringBase(""), StringBase("plain"), StringBase(std::string("a\0b\0", 4)),
                                StringBase(megabyte)};
  const XUID ids[] = {XUID(), XUID(~0ull, ~0ull), XUID::New()};

  ArchivePtr writer = FileArchive::CreateInMemory();
  for (std::int32_t value : ints) ASSERT_EQ(writer->WriteInt(value), CitI::kOk);
  for (std::int64_t value : wides) ASSERT_EQ(writer->WriteInt64(value), CitI::kOk);
  ASSERT_EQ(writer->WriteBool(true), CitI::kOk);
  ASSERT_EQ(writer->WriteBool(false), CitI::kOk);
  for (const StringBase& value : strings) ASSERT_EQ(writer->WriteString(value), CitI::kOk);
  for (const XUID& value : ids) ASSERT_EQ(writer->WriteXUID(value), CitI::kOk);
  ASSERT_EQ(Impl(writer)->Close(), CitI::kOk);

  ArchivePtr reader = Reader(Impl(writer)->Bytes());
  for (std::int32_t expected : ints) {
    std::int32_t value = 42;
    EXPECT_EQ(reader->ReadInt(&value), CitI::kOk);
    EXPECT_EQ(value, expected);
  }
  for (std::int64_t expected : wides) {
    std::int64_t value = 42;
    EXPECT_EQ(reader->ReadInt64(&value), CitI::kOk);
    EXPECT_EQ(value, expected);
  }
  bool first = false, second = true;
  EXPECT_EQ(reader->ReadBool(&first), CitI::kOk);
  EXPECT_EQ(reader->ReadBool(&second), CitI::kOk);
  EXPECT_TRUE(first);
  EXPECT_FALSE(second);
  for (const StringBase& expected : strings) {
    StringBase value("old");
    EXPECT_EQ(reader->ReadString(&value), CitI::kOk);
    EXPECT_TRUE(value == expected) << "length " << expected.Length();
  }
  for (const XUID& expected : ids) {
    XUID value(1, 2);
    EXPECT_EQ(reader->ReadXUID(&value), CitI::kOk);
    EXPECT_EQ(value, expected);
  }
  std::int32_t past = 0;
  EXPECT_NE(reader->ReadInt(&past), CitI::kOk);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "ends")) << Impl(reader)->LastError().c_str();
}

TEST_F(FileArchiveTest, FirstFailureStopsTheArchive) {
  ArchivePtr writer = FileArchive::CreateInMemory();
  ASSERT_EQ(writer->WriteInt(5), CitI::kOk);
  ASSERT_EQ(writer->WriteString("after"), CitI::kOk);
  std::int32_t wrongDirection = 0;
  EXPECT_EQ(writer->ReadInt(nullptr), CitI::kInvalidArg);  // refused without harm
  EXPECT_EQ(writer->WriteBool(true), CitI::kOk);
  EXPECT_NE(writer->ReadInt(&wrongDirection), CitI::kOk);
  EXPECT_NE(writer->WriteInt(1), CitI::kOk);
  std::string bytes(Impl(writer)->Bytes());
  EXPECT_NE(Impl(writer)->Close(), CitI::kOk);

  ArchivePtr reader = Reader(bytes);
  StringBase text;
  EXPECT_EQ(reader->ReadString(&text), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "expected a string but found an int"))
      << Impl(reader)->LastError().c_str();
  std::int32_t value = 0;
  EXPECT_EQ(reader->ReadInt(&value), CitI::kFail);  // the int is there, but the archive has stopped
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "expected a string"));
  EXPECT_EQ(reader->WriteInt(1), CitI::kFail);
  EXPECT_EQ(Impl(reader)->Close(), CitI::kFail);
  EXPECT_EQ(Impl(reader)->Close(), CitI::kFail);
}

TEST_F(FileArchiveTest, OwnedObjectsAndReferencesAreRestoredToTheSameObjects) {
  Graph original;
  std::string bytes = Written(original.Root());
  ArchivePtr reader = Reader(bytes);
  NodePtr root = ReadRoot(reader.Get());
  ExpectGraphRestored(AsNode(root.Get()), original);
  // The archive holds one reference on every object until it is closed.
  Node* a = AsNode(AsNode(root.Get())->children[0].Get());
  EXPECT_EQ(Prjrep::RefCountOf(root.Get()), 2u);
  EXPECT_EQ(Prjrep::RefCountOf(a), 2u);
  EXPECT_EQ(Impl(reader)->Close(), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(root.Get()), 1u);
  EXPECT_EQ(Prjrep::RefCountOf(a), 1u);
  CitI::IInterface* afterClose = nullptr;
  EXPECT_NE(reader->ReadObject(&afterClose), CitI::kOk);
  EXPECT_EQ(afterClose, nullptr);
}

TEST_F(FileArchiveTest, FileIsReplacedOnlyByASuccessfulClose) {
  const std::string path = PathOf("project.qar");
  Put(path, "old");
  Graph original;
  {
    ArchivePtr abandoned = FileArchive::CreateForWrite(path.c_str());
    ASSERT_EQ(abandoned->WriteObject(original.Root()), CitI::kOk);
  }
  EXPECT_EQ(Content(path), "old");
  EXPECT_EQ(FilesInDir(), std::vector<std::string>{"project.qar"});

  AsNode(original.b.Get())->saveResult = 7;
  ArchivePtr failing = FileArchive::CreateForWrite(path.c_str());
  EXPECT_EQ(failing->WriteObject(original.Root()), 7);
  EXPECT_TRUE(Contains(Impl(failing)->LastError(), "result 7")) << Impl(failing)->LastError().c_str();
  EXPECT_NE(Impl(failing)->Close(), CitI::kOk);
  EXPECT_EQ(Content(path), "old");
  AsNode(original.b.Get())->saveResult = CitI::kOk;

  StringBase error("stale");
  ArchivePtr writer = FileArchive::CreateForWrite(path.c_str(), 9, &error);
  ASSERT_TRUE(writer);
  EXPECT_TRUE(error.IsEmpty());
  ASSERT_EQ(writer->WriteObject(original.Root()), CitI::kOk);
  EXPECT_EQ(Content(path), "old");
  ASSERT_EQ(Impl(writer)->Close(), CitI::kOk);
  EXPECT_EQ(FilesInDir(), std::vector<std::string>{"project.qar"});

  ArchivePtr reader = FileArchive::OpenForRead(path.c_str(), &error);
  ASSERT_TRUE(reader) << error.c_str();
  NodePtr root = ReadRoot(reader.Get());
  ExpectGraphRestored(AsNode(root.Get()), original);
  EXPECT_EQ(Impl(reader)->Close(), CitI::kOk);
}

TEST_F(FileArchiveTest, UnusablePlacesAndHeadersAreRefusedWithAReason) {
  StringBase error;
  EXPECT_FALSE(FileArchive::CreateForWrite(PathOf("missing/dir.qar").c_str(), 9, &error));
  EXPECT_TRUE(Contains(error, "missing/dir.qar")) << error.c_str();
  EXPECT_FALSE(FileArchive::CreateForWrite(PathOf("zero.qar").c_str(), 0, &error));
  EXPECT_FALSE(FileArchive::CreateInMemory(-3, &error));
  EXPECT_FALSE(error.IsEmpty());

  EXPECT_FALSE(FileArchive::OpenForRead(PathOf("absent.qar").c_str(), &error));
  EXPECT_TRUE(Contains(error, "absent.qar")) << error.c_str();
  EXPECT_FALSE(FileArchive::OpenForRead(dir_.path().c_str(), &error));
  EXPECT_FALSE(error.IsEmpty());
  ASSERT_EQ(::mkfifo(PathOf("pipe.qar").c_str(), 0600), 0);
  EXPECT_FALSE(
      FileArchive::OpenForRead(PathOf("pipe.qar").c_str(), &error));  // and does not wait for a writer
  Put(PathOf("empty.qar"), "");
  EXPECT_FALSE(FileArchive::OpenForRead(PathOf("empty.qar").c_str(), &error));
  EXPECT_TRUE(Contains(error, "too short")) << error.c_str();
  Put(PathOf("text.qar"), "entity counter is end entity;");
  EXPECT_FALSE(FileArchive::OpenForRead(PathOf("text.qar").c_str(), &error));
  EXPECT_TRUE(Contains(error, "not an archive")) << error.c_str();

  ArchivePtr writer = FileArchive::CreateInMemory();
  std::string zeroVersion(Impl(writer)->Bytes());
  zeroVersion.replace(Port::kArchiveMagic.size(), 4, std::string(4, '\0'));
  EXPECT_FALSE(FileArchive::OpenFromBytes(zeroVersion, &error));
  EXPECT_TRUE(Contains(error, "version")) << error.c_str();
}

TEST_F(FileArchiveTest, VersionIsWrittenAndReadBack) {
  std::int32_t version = 0;
  EXPECT_EQ(FileArchive::CreateInMemory()->GetVersion(&version), CitI::kOk);
  EXPECT_EQ(version, 9);
  for (std::int32_t written : {2, 5, 9}) {
    const std::string path = PathOf("versioned.qar");
    ArchivePtr writer = FileArchive::CreateForWrite(path.c_str(), written);
    ASSERT_EQ(writer->GetVersion(&version), CitI::kOk);
    EXPECT_EQ(version, written);
    ASSERT_EQ(Impl(writer)->Close(), CitI::kOk);
    StringBase error;
    ArchivePtr reader = FileArchive::OpenForRead(path.c_str(), &error);
    ASSERT_TRUE(reader) << error.c_str();
    ASSERT_EQ(reader->GetVersion(&version), CitI::kOk);
    EXPECT_EQ(version, written);
  }
}

TEST_F(FileArchiveTest, InstanceWrittenTwiceAsOwnedIsRefused) {
  NodePtr root = NewNode();
  NodePtr child = NewNode();
  AsNode(root.Get())->Adopt(AsNode(child.Get()));
  AsNode(root.Get())->Adopt(AsNode(child.Get()));
  ArchivePtr writer = FileArchive::CreateInMemory();
  EXPECT_EQ(writer->WriteObject(root.Get()), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(writer)->LastError(), "written twice")) << Impl(writer)->LastError().c_str();

  // Ownership in a cycle is the same mistake; it must not recurse without end.
  AsNode(child.Get())->children.clear();
  AsNode(child.Get())->Adopt(AsNode(root.Get()));
  ArchivePtr cyclic = FileArchive::CreateInMemory();
  EXPECT_EQ(cyclic->WriteObject(root.Get()), CitI::kFail);
  AsNode(child.Get())->children.clear();
}

TEST_F(FileArchiveTest, RecordsThatDoNotMatchTheirObjectsFail) {
  NodePtr unknown = NewNode(kUnregisteredClass);
  ArchivePtr reader = Reader(Written(unknown.Get()));
  CitI::IInterface* object = nullptr;
  EXPECT_EQ(reader->ReadObject(&object), CitI::kFail);
  EXPECT_EQ(object, nullptr);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "no factory")) << Impl(reader)->LastError().c_str();

  NodePtr sloppy = NewNode(kSloppyNodeClass);
  reader = Reader(Written(sloppy.Get()));
  EXPECT_EQ(reader->ReadObject(&object), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "did not load all")) << Impl(reader)->LastError().c_str();

  // The same instance written by two archives, once as each class.
  NodePtr first = NewNode(kNodeClass);
  NodePtr second = NewNode(kOtherNodeClass);
  AsNode(second.Get())->SetInstanceXUID(AsNode(first.Get())->InstanceId());
  ArchivePtr writer = FileArchive::CreateInMemory();
  ASSERT_EQ(writer->WriteObjectRef(first.Get()), CitI::kOk);
  ASSERT_EQ(writer->WriteObject(second.Get()), CitI::kOk);
  reader = Reader(Impl(writer)->Bytes());
  EXPECT_EQ(reader->ReadObjectRef(&object), CitI::kOk);
  EXPECT_EQ(reader->ReadObject(&object), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "both as class")) << Impl(reader)->LastError().c_str();

  std::string once = Written(first.Get());
  reader = Reader(once + once.substr(Port::kArchiveHeaderSize));
  Prjrep::AutoPtr<CitI::IInterface> loaded;
  EXPECT_EQ(reader->ReadObject(loaded.Out()), CitI::kOk);
  EXPECT_EQ(reader->ReadObject(&object), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "second owned record"))
      << Impl(reader)->LastError().c_str();
}

TEST_F(FileArchiveTest, ReferenceWithoutItsObjectFailsAtClose) {
  NodePtr elsewhere = NewNode();
  ArchivePtr writer = FileArchive::CreateInMemory();
  ASSERT_EQ(writer->WriteObjectRef(elsewhere.Get()), CitI::kOk);
  ASSERT_EQ(writer->WriteObjectRef(nullptr), CitI::kOk);
  ArchivePtr reader = Reader(Impl(writer)->Bytes());
  CitI::IInterface* object = nullptr;
  ASSERT_EQ(reader->ReadObjectRef(&object), CitI::kOk);
  ASSERT_TRUE(AsNode(object));
  EXPECT_EQ(AsNode(object)->InstanceId(), AsNode(elsewhere.Get())->InstanceId());
  EXPECT_EQ(reader->ReadObjectRef(&object), CitI::kOk);
  EXPECT_EQ(object, nullptr);
  EXPECT_EQ(Impl(reader)->Close(), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "never appeared")) << Impl(reader)->LastError().c_str();
}

TEST_F(FileArchiveTest, NestingIsBounded) {
  std::vector<NodePtr> chain;
  chain.push_back(NewNode());
  for (int depth = 1; depth < FileArchive::kDefaultMaxDepth; ++depth) {
    chain.push_back(NewNode());
    AsNode(chain[depth - 1].Get())->Adopt(AsNode(chain.back().Get()));
  }
  ArchivePtr reader = Reader(Written(chain.front().Get()));
  EXPECT_TRUE(ReadRoot(reader.Get()));
  reader = Reader(Written(chain.front().Get()));
  Impl(reader)->SetMaxDepth(100);
  CitI::IInterface* object = nullptr;
  EXPECT_EQ(reader->ReadObject(&object), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(reader)->LastError(), "deeper than 100")) << Impl(reader)->LastError().c_str();

  NodePtr tooDeep = NewNode();
  AsNode(chain.back().Get())->Adopt(AsNode(tooDeep.Get()));
  ArchivePtr writer = FileArchive::CreateInMemory();
  EXPECT_EQ(writer->WriteObject(chain.front().Get()), CitI::kFail);
  EXPECT_TRUE(Contains(Impl(writer)->LastError(), "deeper")) << Impl(writer)->LastError().c_str();
}

TEST_F(FileArchiveTest, TruncatedOrFlippedArchivesFailCleanlyOrLoadWithoutLeaks) {
  Graph original;
  const std::string bytes = Written(original.Root());
  for (std::size_t length = 0; length < bytes.size(); ++length) {
    ASSERT_EQ(Load(bytes.substr(0, length)), length < Port::kArchiveHeaderSize ? "unopened" : "unread")
        << length;
  }
  EXPECT_EQ(Load(bytes), "loaded");

  int failures = 0;
  for (std::size_t position = 0; position < bytes.size(); ++position) {
    for (int bit = 0; bit < 8; ++bit) {
      std::string flipped = bytes;
      flipped[position] = static_cast<char>(flipped[position] ^ (1 << bit));
      const std::string outcome = Load(flipped);
      if (outcome == "unopened") {
        EXPECT_LT(position, Port::kArchiveHeaderSize);
      }
      if (outcome != "loaded") ++failures;
    }
  }
  // Every byte of the magic and every tag byte must be caught; most identifier bits too.
  EXPECT_GT(failures, static_cast<int>(bytes.size()));
}

TEST_F(FileArchiveTest, HugeStringLengthFailsWithoutAllocating) {
  ArchivePtr writer = FileArchive::CreateInMemory();
  ASSERT_EQ(writer->WriteString("abc"), CitI::kOk);
  std::string bytes(Impl(writer)->Bytes());
  for (std::uint32_t length : {0xFFFFFFFFu, 0x7FFFFFFFu, 4u}) {
    for (int i = 0; i < 4; ++i) bytes[bytes.size() - 7 + i] = static_cast<char>(length >> (8 * i));
    ArchivePtr reader = Reader(bytes);
    StringBase value;
    AllocationProbe::Start();
    CitI::Result result = reader->ReadString(&value);
    std::size_t largest = AllocationProbe::Stop();
    EXPECT_EQ(result, CitI::kFail) << length;
    EXPECT_TRUE(Contains(Impl(reader)->LastError(), "past the end")) << Impl(reader)->LastError().c_str();
    EXPECT_LT(largest, std::size_t{4096}) << length;
    EXPECT_TRUE(value.IsEmpty());
  }
}

}  // namespace
