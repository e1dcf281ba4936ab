// Properties, property holders, the type library and the small helpers.

#include "HostTestSupport.h"
#include "ModelText.h"
#include "framework/Nlw_Util.h"
#include "model/Nlw_Nl.h"
#include "model/Vdm_Property.h"
#include "port/PM.h"

namespace {

TEST(VdmProperty, TypesAndTexts) {
    for (const nlwtest::Row& c : nlwtest::Table("property_types")) {
        std::unique_ptr<Vdm_Property> p(nlwtest::NewProperty(c[0], "P", c[1]));
        EXPECT_EQ(p->GetType(), std::stoi(c[2])) << c[3];
        EXPECT_STREQ(p->GetPropertyTypeName(), c[3].c_str());
        EXPECT_STREQ(p->GetString(), nlwtest::Opt(c[4])) << c[3];
    }
    Vdm_Property unknown("O", 42);
    EXPECT_EQ(unknown.GetType(), 42);
    EXPECT_STREQ(unknown.GetPropertyTypeName(), "unknown");
    EXPECT_EQ(unknown.GetString(), nullptr);
}

TEST(VdmProperty, ListsOwnOrBorrowTheirElements) {
    std::unique_ptr<Vdm_Property> list(Vdm_Property::NewList("params"));
    Vdm_Property* a = list->CreatePropertyString("INIT", "16'hABCD");
    Vdm_Property* b = list->Add(Vdm_Property::NewInt("WIDTH", 4));
    ASSERT_EQ(list->GetCount(), 2u);
    EXPECT_EQ(list->GetElement(0), a);
    EXPECT_EQ(list->GetElement(1), b);
    EXPECT_STREQ(a->GetString(), "16'hABCD");
    {
        // Deleting a borrowing list leaves the elements to their owner; the
        // sanitizer build would report a double free otherwise.
        std::unique_ptr<Vdm_Property> view(Vdm_Property::NewBorrowingList("params"));
        view->Add(b);
        view->ClearElements();
        view->Add(a);
    }
    EXPECT_EQ(b->GetInt32(), 4);
}

TEST(VdmPropertyHolder, LookupReplaceRemove) {
    Vdm_PropertyHolder h;
    EXPECT_EQ(h.GetProperties(), nullptr);
    EXPECT_EQ(h.GetPropertyByName("A"), nullptr);
    h.AddProperty(Vdm_Property::NewInt("A", 1));
    h.AddProperty(Vdm_Property::NewString("B", "b"));
    h.AddProperty(Vdm_Property::NewInt("C", 3));
    h.AddProperty(Vdm_Property::NewInt("A", 10));  // replaces, keeps its place
    ASSERT_EQ(h.GetProperties()->size(), 3u);
    EXPECT_STREQ((*h.GetProperties())[0]->GetName(), "A");
    EXPECT_EQ(h.GetPropertyByName("A")->GetInt32(), 10);
    EXPECT_EQ(h.GetPropertyByName("a"), nullptr);  // exact names
    Vdm_Property* same = h.GetPropertyByName("C");
    h.AddProperty(same);  // adding the held property again changes nothing
    EXPECT_EQ(h.GetPropertyByName("C"), same);
    h.RemoveProperty("B");
    h.RemoveProperty("none");
    ASSERT_EQ(h.GetProperties()->size(), 2u);
    EXPECT_STREQ((*h.GetProperties())[1]->GetName(), "C");
}

TEST(NlwUtil, IntAndStringProperties) {
    Vdm_PropertyHolder h;
    const std::vector<nlwtest::Row> cases = nlwtest::Table("int_props");
    for (const nlwtest::Row& c : cases)
        if (c[0] != "-") h.AddProperty(nlwtest::NewProperty(c[0], c[1].c_str(), c[2]));
    for (const nlwtest::Row& c : cases)
        EXPECT_EQ(Nlw_Util::GetInt32Prop(&h, c[1].c_str(), 99), std::stoi(c[3])) << c[1];
    EXPECT_EQ(Nlw_Util::GetInt32Prop(nullptr, "CONN", 5), 5);
    EXPECT_STREQ(Nlw_Util::GetStringProp(&h, "PINNAME"), "P12");
    EXPECT_EQ(Nlw_Util::GetStringProp(&h, "CONN"), nullptr);
    EXPECT_EQ(Nlw_Util::GetStringProp(&h, "NONE"), nullptr);
    EXPECT_EQ(Nlw_Util::GetStringProp(nullptr, "PINNAME"), nullptr);
}

TEST(NlwUtil, TimeStampSources) {
    {
        nlwtest::ScopedEnv env("NLW_TIMESTAMP", "Thu Jan  1 00:00:00 2026");
        EXPECT_STREQ(Nlw_Util::GetTimeStampString(1), "Thu Jan  1 00:00:00 2026");
        Nlw_Util::SetFixedTimeStamp("fixed");
        EXPECT_STREQ(Nlw_Util::GetTimeStampString(1), "fixed");
        Nlw_Util::SetFixedTimeStamp(nullptr);
        EXPECT_STREQ(Nlw_Util::GetTimeStampString(1), "Thu Jan  1 00:00:00 2026");
    }
    nlwtest::ScopedEnv env("NLW_TIMESTAMP", nullptr);
    std::string now = Nlw_Util::GetTimeStampString(1);
    // "Sun Dec  6 10:51:33 2026": day, month, space-padded day of month.
    ASSERT_EQ(now.size(), 24u) << now;
    EXPECT_EQ(now.substr(3, 1) + now.substr(7, 1) + now.substr(13, 1) + now.substr(16, 1), "  ::");
    // Every file of a run carries the same stamp.
    EXPECT_EQ(now, Nlw_Util::GetTimeStampString(1));
}

TEST(LdmTypeLib, BlocksAndGroups) {
    Ldm_TypeLib lib;
    Ldm_TypeBlock* lut = lib.AddBlock("X_LUT4");
    EXPECT_EQ(lib.AddBlock("X_LUT4"), lut);
    EXPECT_EQ(lib.GetBlockByName("X_LUT4"), lut);
    EXPECT_EQ(lib.GetBlockByName("x_lut4"), nullptr);
    EXPECT_EQ(lib.GetBlockByName(nullptr), nullptr);
    lut->AddDefinition("Config_General_Data", Vdm_Property::NewTypeDef("INIT", {"16'h0000"}));
    lut->AddDefinition("Other", Vdm_Property::NewInt("N", 1));
    lut->AddDefinition("Config_General_Data", Vdm_Property::NewTypeDef("MODE", {"A"}));
    const auto& defs = lut->GetPropertyCItr("Config_General_Data");
    ASSERT_EQ(defs.size(), 2u);
    EXPECT_STREQ(defs[0]->GetName(), "INIT");
    EXPECT_STREQ(defs[1]->GetName(), "MODE");
    EXPECT_TRUE(lut->GetPropertyCItr("Missing").empty());
}

}  // namespace
