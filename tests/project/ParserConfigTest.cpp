#include <gtest/gtest.h>

#include "CHdlPropertyIterator.h"
#include "CParserConfigBase.h"
#include "Prjrep/RefCounting.h"
#include "TestHost.h"

using namespace test_host;

namespace {

class ParserConfig : public PipelineTest {
 protected:
  void SetUp() override {
    config_ = Prjrep::CreateInstanceAs<CitI::IInterface>(Vad::ClassIds::CParserConfigBase());
    ASSERT_TRUE(config_);
    object_ = Prjrep::ObjectCast<Vad::CParserConfigBase>(config_.Get());
    properties_ = Prjrep::QueryAs<Vad::IPropertyInstanceSet>(config_.Get());
    ASSERT_NE(object_, nullptr);
    ASSERT_NE(properties_, nullptr);
  }

  void Add(std::string_view name, std::string_view value) {
    ASSERT_EQ(properties_->Add(Host::PropertyInstance::Create(name, value).Get()), CitI::kOk);
  }

  std::vector<std::string> NamesInIteration() {
    std::vector<std::string> names;
    Prjrep::AutoRelease<Vad::IPropertyInstanceIterator> it;
    EXPECT_EQ(properties_->CreateIterator(it.Out()), CitI::kOk);
    for (; !it->IsDone(); it->Next()) {
      Port::StringBase name;
      it->Current()->GetName(&name);
      names.push_back(name.str());
    }
    return names;
  }

  Prjrep::AutoPtr<CitI::IInterface> config_;
  Vad::CParserConfigBase* object_ = nullptr;
  Vad::IPropertyInstanceSet* properties_ = nullptr;
};

TEST_F(ParserConfig, SignatureListsEveryPropertyInByteOrderOfItsName) {
  Port::StringBase signature = "stale";
  object_->GetSignature(signature);
  EXPECT_EQ(signature, "");

  Add("b", "2");
  Add("B", "upper");
  Add("a", "");
  object_->GetSignature(signature);
  EXPECT_EQ(signature, "****B=upper********a=********b=2****");
  EXPECT_EQ(signature.str().find("stale"), std::string::npos);
  // Added under the same name: replaced, not added.
  Add("a", "1");
  EXPECT_EQ(properties_->GetCount(), 3u);
  object_->GetSignature(signature);
  EXPECT_EQ(signature, "****B=upper********a=1********b=2****");
}

TEST_F(ParserConfig, PropertyValueIsEmptyForAnAbsentNameAndAlwaysSucceeds) {
  Add("PROP_DevFamilyPMName", "kestrel");
  Port::StringBase value = "old";
  EXPECT_EQ(object_->GetPropertyValue("PROP_DevFamilyPMName", value), CitI::kOk);
  EXPECT_EQ(value, "kestrel");
  EXPECT_EQ(object_->GetPropertyValue("prop_devfamilypmname", value), CitI::kOk);
  EXPECT_EQ(value, "");
  EXPECT_EQ(properties_->Add(nullptr), CitI::kFail);
  auto* parserConfig = Prjrep::QueryAs<Vad::IHdlParserConfig>(config_.Get());
  EXPECT_EQ(parserConfig->Reserved2(), CitI::kNotImpl);
  EXPECT_EQ(parserConfig->Reserved3(), CitI::kNotImpl);
  EXPECT_EQ(parserConfig->Reserved4(), CitI::kNotImpl);
}

TEST_F(ParserConfig, IteratorWalksInNameOrderAndSurvivesRemovalBesideIt) {
  Add("c", "3");
  Add("a", "1");
  Add("b", "2");
  EXPECT_EQ(NamesInIteration(), (std::vector<std::string>{"a", "b", "c"}));
  EXPECT_EQ(properties_->CreateIterator(nullptr), CitI::kInvalidArg);

  Prjrep::AutoRelease<Vad::IPropertyInstanceIterator> it;
  ASSERT_EQ(properties_->CreateIterator(it.Out()), CitI::kOk);
  // The iterator is this configuration's own, found again through the implementation identity.
  EXPECT_NE(Prjrep::ImplementationCast<Vad::CHdlPropertyIterator>(it.Get()), nullptr);
  ASSERT_EQ(it->Next(), CitI::kOk);  // on "b"
  ASSERT_EQ(properties_->Remove(it.Get()), CitI::kOk);
  Port::StringBase name;
  it->Current()->GetName(&name);
  EXPECT_EQ(name, "c");
  EXPECT_EQ(NamesInIteration(), (std::vector<std::string>{"a", "c"}));

  // Removing what stands behind the iterator moves it on to the next name.
  Prjrep::AutoRelease<Vad::IPropertyInstanceIterator> other;
  ASSERT_EQ(properties_->CreateIterator(other.Out()), CitI::kOk);
  ASSERT_EQ(properties_->Remove(other.Get()), CitI::kOk);  // removes "a", other moves to "c"
  ASSERT_EQ(properties_->Remove(other.Get()), CitI::kOk);  // removes "c"
  EXPECT_TRUE(it->IsDone());
  EXPECT_EQ(it->Current(), nullptr);
  EXPECT_EQ(it->Next(), CitI::kFail);
  EXPECT_EQ(properties_->Remove(it.Get()), CitI::kFail);
  EXPECT_EQ(properties_->Remove(nullptr), CitI::kFail);
  EXPECT_EQ(properties_->GetCount(), 0u);
}

TEST_F(ParserConfig, IteratorKeepsItsConfigurationAliveAndStartsOverWithFirst) {
  Add("x", "1");
  Prjrep::AutoRelease<Vad::IPropertyInstanceIterator> it;
  ASSERT_EQ(properties_->CreateIterator(it.Out()), CitI::kOk);
  config_ = nullptr;
  properties_ = nullptr;
  ASSERT_NE(it->Current(), nullptr);
  EXPECT_EQ(it->Next(), CitI::kOk);
  EXPECT_TRUE(it->IsDone());
  EXPECT_EQ(it->First(), CitI::kOk);
  EXPECT_FALSE(it->IsDone());
}

TEST_F(ParserConfig, ClearReleasesEveryInstance) {
  auto instance = Host::PropertyInstance::Create("p", "v");
  ASSERT_EQ(properties_->Add(instance.Get()), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(instance.Get()), 2u);
  EXPECT_EQ(properties_->Clear(), CitI::kOk);
  EXPECT_EQ(Prjrep::RefCountOf(instance.Get()), 1u);
  EXPECT_EQ(properties_->GetCount(), 0u);
}

TEST_F(ParserConfig, HostPropertyInstancesComeFromTheRegistry) {
  auto instance = Prjrep::CreateInstanceAs<Vad::IPropertyInstance>(Host::ClassIds::PropertyInstance());
  ASSERT_TRUE(instance);
  EXPECT_EQ(instance->SetName(""), CitI::kInvalidArg);
  EXPECT_EQ(instance->SetName("PROP_Parse_Target"), CitI::kOk);
  EXPECT_EQ(instance->SetValue("synthesis"), CitI::kOk);
  EXPECT_EQ(instance->GetName(nullptr), CitI::kInvalidArg);
  ASSERT_EQ(properties_->Add(instance.Get()), CitI::kOk);
  Port::StringBase value;
  object_->GetPropertyValue("PROP_Parse_Target", value);
  EXPECT_EQ(value, "synthesis");
}

}  // namespace
