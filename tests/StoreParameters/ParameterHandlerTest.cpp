#include "ParameterFixture.h"
#include "StoreParameters/VStoreParameterBuilder.h"
#include "StoreParameters/VStoreParameterHandler.h"

#include <gtest/gtest.h>

#include <array>

namespace
{

using namespace ParameterTest;

/// A handler with two parameters, present through a number at its root.
class Handler : public VStoreParameterHandler
{
public:
    Handler(std::shared_ptr<TQL::IStore> i_pStore, const char* i_pRoot)
        : VStoreParameterHandler(std::move(i_pStore), EntryPath(i_pRoot), i_pRoot, "Demo")
    {
    }
    TQL::IResult DeclareParameters(VStoreParameterBuilder& io_rBuilder) override
    {
        const std::array<std::uint8_t, 1> one{1};
        const StoreValue value(&TQL::IO::GetUniquePodSchema(TQL::EType::UInt8), one);
        EntryHandle parameter;
        return TQL::CombineResults({io_rBuilder.Writer().SetVerifiedValue(GetStore().GetEntry(GetRootPath()), value),
                                    io_rBuilder.AddParameter(Define("Low"), parameter),
                                    io_rBuilder.AddParameter(Define("High"), parameter)});
    }
    std::string GetDisplayName() const override { return GetName(); }
    using VStoreParameterHandler::LoadParameters;
    TQL::IResult LoadParameters(const TQL::IStoreReader&, TQL::ChangeFlags i_Changed) override
    {
        m_Loaded = i_Changed;
        return TQL::Result::Ok;
    }
    TQL::ChangeFlags m_Loaded;
};

void Build(Handler& io_rHandler, TQL::IStore& io_rStore)
{
    const TQL::ScopedWrite write(io_rStore);
    VStoreParameterBuilder builder(*write, io_rHandler.GetRootPath());
    EXPECT_EQ(io_rHandler.BuildParameters(builder), TQL::Result::Ok);
}

TEST(ParameterHandler, IsPresentFromItsRootValueUntilItIsRemoved)
{
    const auto pStore = MakeStore();
    TestSupport::LogGuard log;
    const auto pHandler = TQL::MakeShared<Handler>(pStore, "Channel");
    const auto pGroup = pHandler->GetGroup();
    EXPECT_TRUE(pGroup->IsEmpty());
    EXPECT_EQ(TQL::ScopedWrite(*pStore)->EnableFlags(pStore->GetEntry(EntryPath("Channel")), 1), TQL::Result::Ok);
    EXPECT_FALSE(pHandler->IsPresent(*TQL::ScopedRead(*pStore))) << "the root exists, but has no value";
    EXPECT_EQ(pHandler->Remove(*TQL::ScopedWrite(*pStore)), TQL::Result::OkButNoEffect);

    Build(*pHandler, *pStore);
    EXPECT_TRUE(pHandler->IsPresent(*TQL::ScopedRead(*pStore)));
    EXPECT_EQ(pHandler->GetGroup(), pGroup);
    ASSERT_EQ(pGroup->GetParameters().size(), 2u);
    const EntryHandle low = pGroup->GetParameters().front();
    EXPECT_EQ(pStore->GetEntryPath(low).Text(), "Channel/Low");
    EXPECT_TRUE(pHandler->LoadParameters(*TQL::ScopedRead(*pStore)).IsSuccess());
    EXPECT_TRUE((pHandler->m_Loaded & TQL::EChangeFlags::Attributes) == TQL::EChangeFlags::Attributes);

    EXPECT_EQ(pHandler->RemoveAndClear(*TQL::ScopedWrite(*pStore)), TQL::Result::Ok);
    EXPECT_FALSE(TQL::ScopedRead(*pStore)->Exists(low));
    EXPECT_TRUE(pGroup->IsEmpty());
}

TEST(ParameterHandler, OnlyASecondActiveOneOfAPathIsAnError)
{
    const auto pStore = MakeStore();
    const auto pOther = MakeStore();
    TestSupport::LogGuard log;
    auto pFirst = TQL::MakeShared<Handler>(pStore, "A");
    const auto pElsewhere = TQL::MakeShared<Handler>(pStore, "B");
    const auto pInOther = TQL::MakeShared<Handler>(pOther, "A");
    EXPECT_EQ(TakeLog(log), "");

    auto pSecond = TQL::MakeShared<Handler>(pStore, "A");
    EXPECT_EQ(TakeLog(log), "2 A store parameter handler 'A' of type 'Demo' has been created while another active "
                            "handler instance already exists, TQL::IStoreParameterHandler::Remove() must be called on "
                            "any existing parameter handlers before creating a replacement.\n");
    Build(*pSecond, *pStore);
    EXPECT_TRUE(pSecond->IsPresent(*TQL::ScopedRead(*pStore)));

    EXPECT_EQ(pFirst->Remove(*TQL::ScopedWrite(*pStore)), TQL::Result::Ok);
    pSecond.reset();
    const auto pThird = TQL::MakeShared<Handler>(pStore, "A");
    EXPECT_EQ(TakeLog(log), "") << "the first is removed, the second gone";
    pFirst.reset();
    const auto pFourth = TQL::MakeShared<Handler>(pStore, "A");
    EXPECT_EQ(log.Take().size(), 1u) << "the third is still the active one";
}

} // namespace
