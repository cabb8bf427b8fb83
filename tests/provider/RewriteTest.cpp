// Rewriting the record file, and failures to rewrite it.

#include <gmock/gmock.h>

#include <algorithm>
#include <stdexcept>

#include "RecordKinds.h"

namespace {

using namespace providerTest;

template <class Kind>
class Rewrite : public RecordStore<Kind> {
protected:
    using Base = typename Kind::Base;

    static void change(Base& base, const std::string& text) { base.setProperty(Kind::text, text); }

    /** Returns a file with one record "A" that contains the string. */
    static std::string fileWith(const std::string& text) {
        std::string record = Kind::defaultRecord;
        record.replace(record.find('*'), 1, text);
        return "1\nA\n" + record;
    }

    /** Expects that the destructor logged the failure to rewrite the file at error level. */
    static void expectRewriteFailureLogged() {
        const auto records = recordsOf(Words<Kind>::sourceFile, std::string("~") + Kind::name + "Base");
        const auto failure =
            std::find_if(records.begin(), records.end(), [](const LogRecord& record) { return record.level == 3000; });
        ASSERT_NE(failure, records.end());
        EXPECT_EQ(withoutLine(failure->text), message(Words<Kind>::cannotOpen, Words<Kind>::sourceFile));
    }
};

TYPED_TEST_SUITE(Rewrite, RecordKinds, KindNames);

TYPED_TEST(Rewrite, HappensWhenACursorWithChangesIsDestroyed) {
    this->fill({"A"});
    {
        typename TypeParam::Base base;
        this->change(base, "ACME");
        EXPECT_FALSE(std::filesystem::exists(this->path()));
    }
    EXPECT_EQ(this->file(), this->fileWith("ACME"));
}

TYPED_TEST(Rewrite, DoesNotHappenAfterReading) {
    this->fill({"A"});
    write(this->path(), "edited by another program");
    {
        typename TypeParam::Base base;
        EXPECT_TRUE(hasCurrent(base));
        EXPECT_EQ(this->identifier(base), "A");
        TypeParam::select(base, "A");
        ++base;
        EXPECT_FALSE(hasCurrent(base));
    }
    EXPECT_EQ(this->file(), "edited by another program");
}

TYPED_TEST(Rewrite, DoesNotHappenAfterARejectedChange) {
    this->fill({"A"});
    {
        typename TypeParam::Base base;
        EXPECT_THROW(base.setProperty(TypeParam::number, std::string("text")), InstrumentationException);
        EXPECT_THROW(base.setProperty(TypeParam::text, 5U), InstrumentationException);
        EXPECT_THROW(TypeParam::create(base, "A"), InstrumentationException);
        ++base;
        EXPECT_THROW(TypeParam::remove(base), InstrumentationException);
    }
    EXPECT_FALSE(std::filesystem::exists(this->path()));
}

TYPED_TEST(Rewrite, HappensOnceForManyChanges) {
    this->fill({"A"});
    agentEnvironment::forgetLog();
    {
        typename TypeParam::Base base;
        this->change(base, "first");
        this->change(base, "second");
        base.setProperty(TypeParam::number, 5U);
        TypeParam::create(base, "B");
        TypeParam::remove(base);
    }
    EXPECT_THAT(logMessagesOf(Words<TypeParam>::sourceFile, "flushCache"),
                testing::ElementsAre(entering("flushCache", Words<TypeParam>::sourceFile),
                                     variable(Words<TypeParam>::countName, "1", Words<TypeParam>::sourceFile),
                                     exiting("flushCache", Words<TypeParam>::sourceFile)));
}

TYPED_TEST(Rewrite, HappensAfterAChangeToTheSameValue) {
    this->fill({"A"});
    {
        typename TypeParam::Base base;
        base.setProperty(TypeParam::number, 0U);
    }
    EXPECT_EQ(this->file(), std::string("1\nA\n") + TypeParam::defaultRecord);
}

TYPED_TEST(Rewrite, HappensAfterDeletionOfTheOnlyRecord) {
    this->fill({"A"});
    {
        typename TypeParam::Base base;
        TypeParam::remove(base);
    }
    EXPECT_EQ(this->file(), "0\n");
}

TYPED_TEST(Rewrite, ReplacesTheContentOfTheFile) {
    this->fill({"A"});
    write(this->path(), std::string(5000, 'x'));
    {
        typename TypeParam::Base base;
        this->change(base, "ACME");
    }
    EXPECT_EQ(this->file(), this->fileWith("ACME"));
}

TYPED_TEST(Rewrite, IncludesChangesByOtherCursors) {
    this->fill({"A"});
    typename TypeParam::Base longLived;
    this->change(longLived, "ACME");
    {
        typename TypeParam::Base base;
        base.setProperty(TypeParam::number, 0U);
    }
    EXPECT_EQ(this->file(), this->fileWith("ACME"));
}

TYPED_TEST(Rewrite, IsReadByTheNextLoad) {
    {
        typename TypeParam::Base base;
        TypeParam::create(base, "lease 1");
        this->change(base, "ACME Leasing Co");
        base.setProperty(TypeParam::number, 36U);
        TypeParam::create(base, "lease 2");
    }
    typename TypeParam::Cache reloaded;
    EXPECT_EQ(TypeParam::count(reloaded), 2U);
    ASSERT_EQ(reloaded.table.size(), 2U);
    EXPECT_EQ(reloaded.table[0].InstanceID, "lease 1");
    EXPECT_EQ(reloaded.table[0].*TypeParam::textMember, "ACME Leasing Co");
    EXPECT_EQ(reloaded.table[0].*TypeParam::numberMember, 36U);
    EXPECT_EQ(reloaded.table[1].InstanceID, "lease 2");
}

TYPED_TEST(Rewrite, ThatFailsThrowsFromTheDestructor) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    EXPECT_EQ(thrown<InstrumentationException>([&] {
                  typename TypeParam::Base base;
                  this->change(base, "ACME");
              }),
              Words<TypeParam>::cannotOpen);
}

TYPED_TEST(Rewrite, ThatFailsKeepsTheChangeInTheTable) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    EXPECT_THROW(
        {
            typename TypeParam::Base base;
            this->change(base, "ACME");
            TypeParam::create(base, "B");
        },
        InstrumentationException);
    EXPECT_EQ(this->table().at(0).*TypeParam::textMember, "ACME");
    EXPECT_EQ(this->count(), 2U);
    std::filesystem::remove(this->path());
    {
        typename TypeParam::Base base;
        TypeParam::select(base, "B");
        TypeParam::remove(base);
    }
    EXPECT_EQ(this->file(), this->fileWith("ACME"));
}

TYPED_TEST(Rewrite, ThatFailsIsTriedOnceAndLoggedAtErrorLevel) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    agentEnvironment::forgetLog();
    EXPECT_THROW(
        {
            typename TypeParam::Base base;
            this->change(base, "ACME");
        },
        InstrumentationException);
    const auto records = recordsOf(Words<TypeParam>::sourceFile, "flushCache");
    ASSERT_EQ(records.size(), 3U);
    EXPECT_EQ(withoutLine(records[2].text), message(Words<TypeParam>::cannotOpen, Words<TypeParam>::sourceFile));
    EXPECT_EQ(records[2].level, 3000);
}

TYPED_TEST(Rewrite, WithoutADataDirectoryFails) {
    this->fill({"A"});
    std::filesystem::remove_all(agentEnvironment::dataDirectory());
    EXPECT_EQ(thrown<InstrumentationException>([&] {
                  typename TypeParam::Base base;
                  this->change(base, "ACME");
              }),
              Words<TypeParam>::cannotOpen);
}

TYPED_TEST(Rewrite, ThatFailsDuringUnwindingIsOnlyLogged) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    agentEnvironment::forgetLog();
    EXPECT_EQ(thrown<std::runtime_error>([&] {
                  typename TypeParam::Base base;
                  this->change(base, "ACME");
                  throw std::runtime_error("the first one");
              }),
              "the first one");
    this->expectRewriteFailureLogged();
    EXPECT_EQ(this->table().at(0).*TypeParam::textMember, "ACME");
}

/** Runs an action while an unrelated exception unwinds the stack, as can happen in an object manager. */
template <class Action>
void whileUnwinding(Action action) {
    struct AtEnd {
        Action& action;
        ~AtEnd() { action(); }
    };
    try {
        const AtEnd atEnd{action};
        throw std::logic_error("the object manager's");
    } catch (const std::logic_error& failure) {
        EXPECT_STREQ(failure.what(), "the object manager's");
    }
}

TYPED_TEST(Rewrite, ThatFailsForACursorCreatedDuringUnwindingThrows) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    std::string failure;
    whileUnwinding([&] {
        failure = thrown<InstrumentationException>([&] {
            typename TypeParam::Base base;
            this->change(base, "ACME");
        });
    });
    EXPECT_EQ(failure, Words<TypeParam>::cannotOpen);
    EXPECT_EQ(this->table().at(0).*TypeParam::textMember, "ACME");
}

TYPED_TEST(Rewrite, ThatFailsDuringNestedUnwindingIsOnlyLogged) {
    this->fill({"A"});
    blockWithDirectory(this->path());
    agentEnvironment::forgetLog();
    std::string failure;
    whileUnwinding([&] {
        failure = thrown<std::runtime_error>([&] {
            typename TypeParam::Base base;
            this->change(base, "ACME");
            throw std::runtime_error("the first one");
        });
    });
    EXPECT_EQ(failure, "the first one");
    this->expectRewriteFailureLogged();
}

TYPED_TEST(Rewrite, HappensDuringUnwinding) {
    this->fill({"A"});
    EXPECT_EQ(thrown<std::runtime_error>([&] {
                  typename TypeParam::Base base;
                  this->change(base, "ACME");
                  throw std::runtime_error("the first one");
              }),
              "the first one");
    EXPECT_EQ(this->file(), this->fileWith("ACME"));
}

TYPED_TEST(Rewrite, ByFlushCacheThrowsTheSameException) {
    blockWithDirectory(this->path());
    EXPECT_EQ(thrown<InstrumentationException>([] { TypeParam::cache().flushCache(); }), Words<TypeParam>::cannotOpen);
}

using BothStores = RecordStore<LeaseKind>;

TEST_F(BothStores, ShareNoData) {
    {
        LeaseBase lease;
        lease.createLease("same");
        WarrantyBase warranty;
        EXPECT_FALSE(hasCurrent(warranty));
        warranty.createWarranty("same");
    }
    EXPECT_EQ(contentOf(agentEnvironment::dataDirectory() / "Lease.dat"),
              std::string("1\nsame\n") + LeaseKind::defaultRecord);
    EXPECT_EQ(contentOf(agentEnvironment::dataDirectory() / "Warranty.dat"),
              std::string("1\nsame\n") + WarrantyKind::defaultRecord);
    WarrantyBase::cache.table.clear();
    WarrantyBase::cache.recordCountWarranty = 0;
}

}  // namespace
